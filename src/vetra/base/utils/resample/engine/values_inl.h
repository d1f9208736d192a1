// The values stage of windows: methods over source samples. Included inside a level's namespace;
// see stages_inl.h.

// A method on the roots of the samples, its value squared.
template <typename Method>
struct Squared {
    static constexpr int kSize = Method::kSize;

    template <typename Window>
    static F64 Value(const Window& oWindow, F64 dx, F64 dy) {
        const F64 value = Method::Value(RootReader<Window>{oWindow}, dx, dy);
        return value * value;
    }
};

// Which bits a NaN gets from arithmetic depends on the processor and on the order of operands,
// which a compiler may exchange.
inline F64 WithOneNaN(F64 value) { return Select(value == value, value, Set1(__builtin_nan(""))); }

// Methods that make numbers of whole numbers.
template <typename Method>
inline constexpr bool kKeepsNumbers = false;
template <>
inline constexpr bool kKeepsNumbers<Bilinear> = true;
template <>
inline constexpr bool kKeepsNumbers<Cubic> = true;
template <>
inline constexpr bool kKeepsNumbers<Separable<Lagrange4Filter>> = true;

template <typename Method, typename T>
inline void StoreValue(double* p, F64 value) {
    Store(p, kKeepsNumbers<Method> && !kIsFloating<T> ? value : WithOneNaN(value));
}

// Calls fnGroup with the first pixel of each group of eight that has a window, the window reader
// and the fractions.
template <typename T, bool kSingleChannel, typename Function>
inline void ForEachGroup(const WindowSpan& oSpan, const T* pSrc, const Function& fnGroup) {
    for (int i = 0; i < oSpan.nPix; i += kLanes) {
        if (oSpan.pabyMode != nullptr && !AnyByteEquals(oSpan.pabyMode + i, 1)) {
            continue;
        }
        fnGroup(i, WindowReader<T, kSingleChannel>{pSrc, oSpan.panOffset + i, oSpan},
                Load(oSpan.padfFracCol + i), Load(oSpan.padfFracRow + i));
    }
}

template <typename Method, typename T, bool kSingleChannel>
void ValuesLoop(const WindowSpan& oSpan, const T* pSrc, double* padfValue) {
    ForEachGroup<T, kSingleChannel>(
        oSpan, pSrc, [&](int i, const WindowReader<T, kSingleChannel>& oWindow, F64 dx, F64 dy) {
            if constexpr (sizeof(T) == 1 && kSingleChannel && Method::kSize == 2) {
                const PairGroup* poGroup =
                    oSpan.poGroups != nullptr ? oSpan.poGroups + i / kLanes : nullptr;
                if (poGroup != nullptr && poGroup->nOffset >= 0) {
                    const GroupReader<T> oGroup{pSrc, poGroup, oSpan.nPitch};
                    StoreValue<Method, T>(padfValue + i, Method::Value(oGroup, dx, dy));
                    return;
                }
            }
            StoreValue<Method, T>(padfValue + i, Method::Value(oWindow, dx, dy));
        });
}

template <typename Method, typename T>
VETRA_STAGE void Values(const WindowSpan& oSpan, const void* pSrc, double* padfValue) {
    const T* p = static_cast<const T*>(pSrc);
    oSpan.nChan == 1 ? ValuesLoop<Method, T, true>(oSpan, p, padfValue)
                     : ValuesLoop<Method, T, false>(oSpan, p, padfValue);
}

// A method that makes one complex value out of the samples of two channels.
template <typename Method, typename T>
VETRA_STAGE void ComplexValues(const WindowSpan& oSpan, const void* pSrc, double* padfValue) {
    ForEachGroup<T, false>(oSpan, static_cast<const T*>(pSrc),
                           [&](int i, const WindowReader<T, false>& oWindow, F64 dx, F64 dy) {
                               F64 re;
                               F64 im;
                               Method::Value(oWindow, dx, dy, re, im);
                               StoreValue<Method, T>(padfValue + i, re);
                               StoreValue<Method, T>(padfValue + kSpanArray + i, im);
                           });
}

// Bilinear values of all channels.
template <int kNumChan, typename T>
VETRA_STAGE void BilinearPixels(const WindowSpan& oSpan, const void* pSrc, double* padfValue) {
    ForEachGroup<T, false>(oSpan, static_cast<const T*>(pSrc),
                           [&](int i, const WindowReader<T, false>& oWindow, F64 dx, F64 dy) {
                               F64 value[kNumChan];
                               Bilinear::Values(oWindow, dx, dy, value);
                               for (int c = 0; c < kNumChan; ++c) {
                                   StoreValue<Bilinear, T>(padfValue + c * kSpanArray + i,
                                                           value[c]);
                               }
                           });
}

template <typename T, bool kNonNegative>
VETRA_STAGE void NearestValues(const void* pSrc, const std::int64_t* panOffset,
                               const unsigned char* pabyMode, int nPix, double* padfValue) {
    const T* p = static_cast<const T*>(pSrc);
    const auto fnNearest = [&](int i) {
        const F64 sample = Gather(p, panOffset + i);
        // Not as a Select: Clang 14 makes a maximum of that which takes the sign of -0.0 away.
        return kNonNegative ? ZeroWhere(Set1(0.0) > sample, sample) : sample;
    };
    if (pabyMode == nullptr) {
        for (int i = 0; i < nPix; i += kLanes) {
            Store(padfValue + i, fnNearest(i));
        }
        return;
    }
    const GroupList oGroups(nPix, [&](int i) { return AnyByteEquals(pabyMode + i, 2); });
    for (const int i : oGroups) {
        Store(padfValue + i,
              Select(BytesEqual(pabyMode + i, 2), fnNearest(i), Load(padfValue + i)));
    }
}
