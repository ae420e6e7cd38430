#pragma once

namespace ondrel {

class Program;

// "About Ondrel Tracker..." and "Documentation": text windows, open while their flags are.
void draw_text_windows(Program& p);

// The program's documentation (docs/USER_GUIDE.md, built into the program).
extern const char* const kDocumentationText;

}  // namespace ondrel
