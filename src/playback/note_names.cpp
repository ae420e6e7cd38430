#include "playback/note_names.h"

namespace ondrel {

const char* const tnot[12] = {"C ", "C#", "D ", "D#", "E ", "F ", "F#", "G ", "G#", "A ", "A#", "B "};

void const_midit(int note, char* text) {
    if (note < 0) note = 0;
    const char* name = tnot[note % 12];
    text[0] = name[0];
    text[1] = name[1];
    if (note >= 24) {
        text[2] = ' ';
        text[3] = static_cast<char>('0' + (note - 24) / 12 % 10);
    } else {
        text[2] = '-';
        text[3] = static_cast<char>('0' + 2 - note / 12);
    }
    text[4] = 0;
}

}  // namespace ondrel
