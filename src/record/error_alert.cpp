#include "record/error_alert.h"

#include "record/sound_consumer.h"

namespace ondrel {

std::string ErrorAlert(AlertSink* alerts, std::FILE* diagnostics, const char* action, int32_t error) {
    char text[512];
    std::snprintf(text, sizeof text, "Cannot %s: %s.\n[%lx]", action, error_text(error).c_str(),
                  static_cast<unsigned long>(static_cast<uint32_t>(error)));
    if (diagnostics) {
        std::fputs(text, diagnostics);
        std::fflush(diagnostics);
    }
    if (alerts) alerts->show(Alert{"Recording", text, {"Stop"}});
    return text;
}

}  // namespace ondrel
