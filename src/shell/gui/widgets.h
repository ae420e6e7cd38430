#pragma once
#include <cstdint>
#include <string>

namespace ondrel {

class Program;

// Small controls that report a value only once the user has finished typing or dragging,
// so that one change makes one undo step.

// A number field: true with value set when a new value in [low, high] was entered.
bool number_field(const char* label, int current, int& value, int low, int high, float width = 70);
// A slider: true with value set when the drag ended on a new value.
bool slider_field(const char* label, int current, int& value, int low, int high, float width = 140);
// A text field: true with text set when a new text was entered.
bool text_field(const char* label, const std::string& current, std::string& text, size_t max_len,
                float width = 200);
// A field edited as hexadecimal or decimal digits with an "any" box, for search masks;
// true when it changed.
bool mask_field(const char* label, bool& any, int& value, int high);

// A button that posts a command of the table, greyed while the command cannot be chosen,
// lit (green) when lit is set, with the command's shortcut as its tooltip.
void command_button(Program& p, uint32_t code, const char* label, bool lit = false);
// A level meter: label, then a bar for value in 0..1, red from 1 on.
void level_meter(const char* label, float value, float width = 90);

}  // namespace ondrel
