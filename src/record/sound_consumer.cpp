#include "record/sound_consumer.h"

#include <pthread.h>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <limits>

namespace ondrel {

namespace {
// What the node does when no hook is set: nothing.
void own_record(void*, int64_t, const void*, size_t, const AudioFormat&) {}
void own_notify(void*, int32_t, const NotifyArgs&) {}
}  // namespace

std::string error_text(int32_t error) {
    switch (error) {
        case kErrorBadDestination: return "Bad media destination";
        case kErrorBadFormat: return "Bad media format";
        default: return error > 0 ? std::strerror(error) : "Unknown error";
    }
}

SoundConsumer::SoundConsumer(const char* name, RecordHook record, NotifyHook notify, void* cookie,
                             std::unique_ptr<ControlPort> port, int64_t reply_timeout_us)
    : name_(name && *name ? name : "SoundConsumer"),
      port_(port ? std::move(port) : std::make_unique<LocalPort>()),
      reply_timeout_us_(reply_timeout_us),
      record_(record ? record : own_record),
      notify_(notify ? notify : own_notify),
      cookie_(cookie) {
    service_ = std::thread([this] { ServiceThread(); });
}

SoundConsumer::~SoundConsumer() {
    PortMessage quit;
    quit.code = kPortQuit;
    port_->write(std::move(quit));
    service_.join();
}

int64_t SoundConsumer::Timeout(int64_t current) {
    if (current < 1000000) return 1000000;
    return current > std::numeric_limits<int64_t>::max() / 2 ? current : current * 2;
}

void SoundConsumer::ServiceThread() {
    pthread_setname_np(pthread_self(), "SoundConsumer");
    service_id_.store(std::this_thread::get_id(), std::memory_order_release);
    int errors = 0;
    for (;;) {
        timeout_ = Timeout(timeout_);
        PortMessage m;
        int32_t error = 0;
        const ControlPort::Read r = port_->read(m, timeout_, error);
        if (r == ControlPort::Read::TimedOut) {
            NotifyArgs args;
            args.count = timeout_;
            tell(kNotifyTimedOut, args);
            continue;
        }
        if (r == ControlPort::Read::Failed) {
            std::fprintf(stderr, "SoundConsumer: error %#010lx\n", static_cast<unsigned long>(error));
            if (++errors < 4) continue;
            NotifyArgs args;
            args.count = errors;
            args.error = error;
            args.message = m.code;
            args.buffer = &m;
            tell(kNotifyServiceEnded, args);
            break;
        }
        timeout_ = 0;
        errors = 0;
        if (m.code == kPortQuit) {
            tell(kNotifyServiceEnded, NotifyArgs{});
            break;
        }
        if (m.code == kPortSetHooks) {
            install_hooks(m);
            if (m.reply) m.reply->reply(0);
            continue;
        }
        const int32_t status = HandleMessage(m);
        if (m.reply) m.reply->reply(status);
        port_->recycle(m);
    }
    // Nobody reads any more: commands fail at once rather than wait for a reply.
    port_->close();
    serving_.store(false, std::memory_order_release);
}

void SoundConsumer::install_hooks(const PortMessage& m) {
    tell(kNotifyHooksReplaced, NotifyArgs{});
    record_ = m.record ? m.record : own_record;
    notify_ = m.notify ? m.notify : own_notify;
    cookie_ = m.cookie;
}

int32_t SoundConsumer::command(PortMessage m) {
    if (std::this_thread::get_id() == service_id_.load(std::memory_order_acquire)) {
        if (m.code != kPortSetHooks) return HandleMessage(m);
        install_hooks(m);
        return 0;
    }
    auto reply = std::make_shared<ReplyPort>(m.code == kPortSetHooks ? "SetHooks reply" : "command reply");
    m.reply = reply;
    if (const int32_t error = port_->write(std::move(m))) return error;
    return reply->wait(reply_timeout_us_);
}

int32_t SoundConsumer::SetHooks(RecordHook record, NotifyHook notify, void* cookie) {
    PortMessage m;
    m.code = kPortSetHooks;
    m.record = record;
    m.notify = notify;
    m.cookie = cookie;
    return command(std::move(m));
}

int32_t SoundConsumer::Connect(int32_t source, int32_t destination, const MediaFormat& format,
                               const std::string& input_name) {
    PortMessage m;
    m.code = kPortConnect;
    m.source = source;
    m.destination = destination;
    m.format = format;
    m.name = input_name;
    return command(std::move(m));
}

int32_t SoundConsumer::Disconnect(int32_t source, int32_t destination) {
    PortMessage m;
    m.code = kPortDisconnect;
    m.source = source;
    m.destination = destination;
    return command(std::move(m));
}

int32_t SoundConsumer::SetTimeSource(const CaptureClock* clock) {
    PortMessage m;
    m.code = kPortSetTimeSource;
    m.clock = clock;
    return command(std::move(m));
}

int32_t SoundConsumer::Start(int64_t performance_time) {
    PortMessage m;
    m.code = kPortStart;
    m.time = performance_time;
    return command(std::move(m));
}

int32_t SoundConsumer::Stop() {
    PortMessage m;
    m.code = kPortStop;
    return command(std::move(m));
}

void SoundConsumer::deliver(const int16_t* frames, size_t bytes, int64_t start_us) {
    port_->post_buffer(frames, bytes, start_us);
}

MediaFormat SoundConsumer::preferred_format() {
    return MediaFormat{MediaType::RawAudio, 44100.0f, 2, kFormatShort};
}

int32_t SoundConsumer::AcceptFormat(int32_t destination, MediaFormat& format) const {
    if (destination != kDestination) return kErrorBadDestination;
    if (format.type == MediaType::Unspecified) format = MediaFormat{MediaType::RawAudio, 0, 0, 0};
    if (format.type != MediaType::RawAudio) {
        format = MediaFormat{MediaType::RawAudio, 0, 0, 0};
        return kErrorBadFormat;
    }
    if (!raw_formats_compatible(format, preferred_format())) {
        format = preferred_format();
        return kErrorBadFormat;
    }
    return 0;
}

int32_t SoundConsumer::HandleMessage(PortMessage& m) {
    switch (m.code) {
        case kPortBuffer: BufferReceived(m); return 0;
        case kPortConnect: return Connected(m);
        case kPortDisconnect: return Disconnected(m);
        case kPortSetTimeSource: time_source_ = m.clock; return 0;
        case kPortStart:
            running_ = true;
            awaiting_first_ = true;
            start_time_ = m.time;
            return 0;
        case kPortStop: running_ = false; return 0;
        default: return EINVAL;
    }
}

int32_t SoundConsumer::Connected(const PortMessage& m) {
    if (source_ != 0 || m.destination != kDestination || m.source == 0) return kErrorBadDestination;
    MediaFormat format = m.format;
    if (const int32_t error = AcceptFormat(m.destination, format)) return error;
    source_ = m.source;
    // Wildcards take the node's own values: that is what its buffers are read as.
    const MediaFormat preferred = preferred_format();
    format_ = MediaFormat{MediaType::RawAudio, format.frame_rate ? format.frame_rate : preferred.frame_rate,
                          format.channel_count ? format.channel_count : preferred.channel_count,
                          format.format ? format.format : preferred.format};
    std::snprintf(input_name_, sizeof input_name_, "%s", m.name.c_str());
    NotifyArgs args;
    args.name = input_name_;
    tell(kNotifyConnected, args);
    return 0;
}

int32_t SoundConsumer::Disconnected(const PortMessage& m) {
    if (source_ == 0 || m.source != source_ || m.destination != kDestination) return kErrorBadDestination;
    tell(kNotifyDisconnected, NotifyArgs{});
    source_ = 0;
    running_ = false;
    return 0;
}

void SoundConsumer::BufferReceived(const PortMessage& m) {
    if (!running_ || source_ == 0) return;
    if (awaiting_first_) {
        // Buffers from before the start time are not the recording's.
        if (m.time < start_time_) return;
        awaiting_first_ = false;
        time_offset_ = start_time_;
    }
    const AudioFormat format{format_.frame_rate, format_.channel_count, format_.format};
    record_(cookie_, m.time - time_offset_, m.data, m.bytes, format);
}

}  // namespace ondrel
