// The store stage, and copies. Included inside a level's namespace; see stages_inl.h.

// A rounded double as a 64-bit integer; it saturates, and a NaN gives the lowest value.
template <typename T>
inline T ToInteger64(double df) {
    constexpr bool bSigned = T(-1) < T(0);
    constexpr double dfEnd = bSigned ? 0x1p63 : 0x1p64;
    constexpr T lowest = bSigned ? static_cast<T>(T(1) << 63) : T(0);
    if (!(df > (bSigned ? -dfEnd : 0.0))) {
        return lowest;
    }
    return df >= dfEnd ? static_cast<T>(~lowest) : static_cast<T>(df);
}

template <typename T>
void StoreFloating(const double* padfValue, int nPix, const StoreLimits<T>& oLimits, T* p) {
    const F64 low = Set1(static_cast<double>(oLimits.low));
    const F64 high = Set1(static_cast<double>(oLimits.high));
    for (int i = 0; i < nPix; i += kLanes) {
        const F64 v = Load(padfValue + i);
        StoreSamples(p + i, Select(v < low, low, Select(v > high, high, v)));
    }
    if (oLimits.bAvoid) {
        const double dfBackground = static_cast<double>(oLimits.background);
        const double dfTolerance = static_cast<double>(oLimits.tolerance);
        for (int i = 0; i < nPix; ++i) {
            const double dfDistance = __builtin_fabs(static_cast<double>(p[i]) - dfBackground);
            p[i] = dfDistance < dfTolerance ? oLimits.replacement : p[i];
        }
    }
}

template <typename T>
void StoreInteger(const double* padfValue, int nPix, const StoreLimits<T>& oLimits, T* p) {
    const F64 low = Set1(static_cast<double>(oLimits.low));
    const F64 high = Set1(static_cast<double>(oLimits.high));
    const F64 background = Set1(static_cast<double>(oLimits.background));
    const F64 replacement = Set1(static_cast<double>(oLimits.replacement));
    for (int i = 0; i < nPix; i += kLanes) {
        F64 v = RoundEven(Load(padfValue + i));
        // In this order: the limits can be crossed. A NaN takes the low limit.
        v = Select(low <= v, Select(v > high, high, v), low);
        if (oLimits.bAvoid) {
            v = Select(v == background, replacement, v);
        }
        StoreSamples(p + i, v);
    }
}

// Limits of 64-bit integers may have no double of their own: clamped as integers.
template <typename T>
void StoreInteger64(const double* padfValue, int nPix, const StoreLimits<T>& oLimits, T* p) {
    for (int i = 0; i < nPix; i += kLanes) {
        double adf[kLanes];
        Store(adf, RoundEven(Load(padfValue + i)));
        for (int k = 0; k < kLanes; ++k) {
            T v = ToInteger64<T>(adf[k]);
            v = v < oLimits.low ? oLimits.low : v > oLimits.high ? oLimits.high : v;
            p[i + k] = oLimits.bAvoid && v == oLimits.background ? oLimits.replacement : v;
        }
    }
}

template <typename T>
VETRA_STAGE void StoreValues(const double* padfValue, int nPix, const void* pLimits,
                             void* pSamples) {
    const StoreLimits<T>& oLimits = *static_cast<const StoreLimits<T>*>(pLimits);
    T* p = static_cast<T*>(pSamples);
    if constexpr (kIsFloating<T>) {
        StoreFloating(padfValue, nPix, oLimits, p);
    } else if constexpr (sizeof(T) == 8) {
        StoreInteger64(padfValue, nPix, oLimits, p);
    } else {
        StoreInteger(padfValue, nPix, oLimits, p);
    }
}

template <int kNumChan, typename T>
VETRA_STAGE void Interleave(const void* pSamples, int nPix, void* pTgt) {
    const T* __restrict p = static_cast<const T*>(pSamples);
    T* __restrict t = static_cast<T*>(pTgt);
    for (int i = 0; i < nPix; ++i) {
        for (int c = 0; c < kNumChan; ++c) {
            t[i * kNumChan + c] = p[c * kSpanArray + i];
        }
    }
}

// Pixels of a few channels, each in one or two moves.
template <int kNumChan, typename T>
inline void CopyWholePixels(const T* p, const std::int64_t* panOffset, int nPix, T* t) {
    for (int i = 0; i < nPix; ++i) {
        __builtin_memcpy(t + i * kNumChan, p + panOffset[i], kNumChan * sizeof(T));
    }
}

template <typename T>
VETRA_STAGE void CopyPixels(const void* pSrc, const std::int64_t* panOffset, int nPix, int nChan,
                            void* pTgt) {
    const T* p = static_cast<const T*>(pSrc);
    T* t = static_cast<T*>(pTgt);
    if (nChan == 1) {
        int i = 0;
        for (; i + kLanes <= nPix; i += kLanes) {
            CopySamples(t + i, p, panOffset + i);
        }
        for (; i < nPix; ++i) {
            t[i] = p[panOffset[i]];
        }
        return;
    }
    if (nChan == 3) {
        return CopyWholePixels<3>(p, panOffset, nPix, t);
    }
    if (nChan == 4) {
        return CopyWholePixels<4>(p, panOffset, nPix, t);
    }
    for (int i = 0; i < nPix; ++i) {
        const T* pPixel = p + panOffset[i];
        for (int c = 0; c < nChan; ++c) {
            *t++ = pPixel[c];
        }
    }
}

template <typename T>
VETRA_STAGE void FillInvalid(const unsigned char* pabyMask, const std::int64_t* panOffset, int nPix,
                             const void* pBackground, void* pTgt) {
    const T background = *static_cast<const T*>(pBackground);
    T* t = static_cast<T*>(pTgt);
    for (int i = 0; i < nPix; i += kLanes) {
        const unsigned nInvalid = ByteBits(pabyMask, panOffset + i, 0);
        for (int k = i; nInvalid != 0 && k < nPix && k < i + kLanes; ++k) {
            t[k] = (nInvalid >> (k - i) & 1u) != 0 ? background : t[k];
        }
    }
}

template <typename T>
VETRA_STAGE void ClampSamples(void* pSamples, std::int64_t nSamples, const void* pLimits) {
    const StoreLimits<T> oLimits = *static_cast<const StoreLimits<T>*>(pLimits);
    T* p = static_cast<T*>(pSamples);
    for (std::int64_t i = 0; i < nSamples; ++i) {
        const T v = p[i];
        p[i] = v < oLimits.low ? oLimits.low : v > oLimits.high ? oLimits.high : v;
    }
    if (oLimits.bAvoid) {
        for (std::int64_t i = 0; i < nSamples; ++i) {
            p[i] = p[i] == oLimits.background ? oLimits.replacement : p[i];
        }
    }
}
