#pragma once

namespace ondrel {

// The analysis windows of the analyser's transform: each fills n values, periodic (the
// denominator is n, not n - 1).
void BlackmanHarris4T(int n, double* w);
void Cosine(int n, double* w);  // the square of the Hanning window
void Hamming(int n, double* w);
void HalfCycleSine(int n, double* w);  // the cube of a half sine
void Hanning(int n, double* w);
void Triangle(int n, double* w);
void Rosenfeld(int n, double* w);

}  // namespace ondrel
