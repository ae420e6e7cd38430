#pragma once
#include <string>

#include "song/sample.h"

namespace ondrel {

// calcfft: the dominant frequency of a sound and the note nearest to it.
struct SoundPitch {
    bool found = false;     // false for an empty or silent sound
    double frequency = 0;   // Hz
    int note = -1;          // MIDI numbering, 69 = A at 440 Hz
    double cents = 0;       // how far the frequency is above (or below) that note
    std::string note_name;  // as the program writes notes: "A  3" for 69
};

// A 4096-point transform, Hamming window, of the sound's first 4096 frames (the channels
// averaged); the largest bin above DC, placed between its neighbours by the parabola
// through their log magnitudes, at the sound's own rate.
SoundPitch calcfft(const p_s& sound);

// A note's name in four characters, as the program writes them: "C#" and the like, then the
// octave, note 24 being octave 0 ("C  0"); notes below 24 get a minus sign ("C -1").
std::string note_text(int note);

}  // namespace ondrel
