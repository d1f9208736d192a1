#ifndef VETRA_BASE_UTILS_MATH_FOURIER_FFTCOMPLEX_H
#define VETRA_BASE_UTILS_MATH_FOURIER_FFTCOMPLEX_H

/// One complex sample. An array of N samples is also an array of 2 N floats, interleaved.
struct FFTComplex {
    float re;  ///< real part
    float im;  ///< imaginary part
};

#endif  // VETRA_BASE_UTILS_MATH_FOURIER_FFTCOMPLEX_H
