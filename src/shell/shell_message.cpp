#include "shell/shell_message.h"

namespace ondrel {

std::string code_text(uint32_t code) {
    std::string text(4, ' ');
    for (int i = 0; i < 4; ++i) text[static_cast<size_t>(i)] = static_cast<char>(code >> (24 - 8 * i));
    return text;
}

}  // namespace ondrel
