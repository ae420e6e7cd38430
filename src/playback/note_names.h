#pragma once

namespace ondrel {

// The twelve two-character note names.
extern const char* const tnot[12];

// Writes a note's name in four characters and a NUL: "C# 3"; octaves below 0 as "C -1".
void const_midit(int note, char* text);

}  // namespace ondrel
