#pragma once
#include <cstdint>
#include <cstdio>
#include <string>

#include "song/alerts.h"

namespace ondrel {

// ErrorAlert: "Cannot ACTION: TEXT.\n[CODE]" printed and shown with the one button "Stop".
// Returns the text.
std::string ErrorAlert(AlertSink* alerts, std::FILE* diagnostics, const char* action, int32_t error);

}  // namespace ondrel
