// TEMPORARY until the settings branch lands its attribute code.
#include "shell/command_handlers.h"
#include "shell/program.h"

namespace ondrel {
void restore_editor_position(Program&) {}
void store_editor_position(Program&) {}
void keep_recovery_copies(Program&) {}
}  // namespace ondrel
