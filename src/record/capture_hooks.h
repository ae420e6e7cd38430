#pragma once
#include <cstddef>
#include <cstdint>

#include "render/audio_format.h"

namespace ondrel {

// The record hook: a buffer of interleaved stereo 16-bit samples, its start time in
// microseconds, its byte count and format. Called on the capture node's service thread.
using RecordHook = void (*)(void* cookie, int64_t when, const void* data, size_t bytes,
                            const AudioFormat& format);

// What a notification carries besides its code.
struct NotifyArgs {
    int64_t count = 0;             // code 8: errors in a row; code 10: the time-out that expired
    int32_t error = 0;             // code 8: the last port error
    int32_t message = 0;           // code 8: the code of the last message read
    const void* buffer = nullptr;  // code 8: the message buffer
    const char* name = nullptr;    // code 5: the input's name
};
using NotifyHook = void (*)(void* cookie, int32_t code, const NotifyArgs& args);

// Notification codes.
inline constexpr int32_t kNotifyWillStop = 2;       // the node is about to stop
inline constexpr int32_t kNotifyConnected = 5;      // an input was connected
inline constexpr int32_t kNotifyDisconnected = 6;   // the input was disconnected
inline constexpr int32_t kNotifyServiceEnded = 8;   // the service loop ended
inline constexpr int32_t kNotifyHooksReplaced = 9;  // sent to the old hooks
inline constexpr int32_t kNotifyTimedOut = 10;      // the service loop timed out

}  // namespace ondrel
