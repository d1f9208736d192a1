#ifndef VETRA_TESTS_BASE_UTILS_RESAMPLE_ENGINE_RANDOMIMAGES_H
#define VETRA_TESTS_BASE_UTILS_RESAMPLE_ENGINE_RANDOMIMAGES_H

#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <cstring>
#include <initializer_list>
#include <memory>
#include <random>
#include <string>
#include <vector>

#include "vetra/base/utils/resample/irasterresampler.h"
#include "vetra/base/utils/resample/postfm/ibufpostfm.h"
#include "vetra/base/utils/resample/resamplebuffer.h"

// What the tests of the engine sample: random images with guards around them, methods, and a
// transform that knows no bounds.

/// Bytes around every array that show stray writes. AddressSanitizer sees reads too, but only where
/// nothing is allocated.
#if defined(__has_feature)
#if __has_feature(address_sanitizer)
#define VETRA_TEST_ASAN
#endif
#endif
#if defined(VETRA_TEST_ASAN) || defined(__SANITIZE_ADDRESS__)
constexpr int kGuard = 0;
#else
constexpr int kGuard = 64;
#endif
constexpr unsigned char kGuardByte = 0xa5;

class Random {
 public:
    explicit Random(unsigned nSeed) : moEngine(nSeed) {}

    int Int(int nLow, int nHigh) {
        return std::uniform_int_distribution<int>(nLow, nHigh)(moEngine);
    }
    double Real(double dfLow, double dfHigh) {
        return std::uniform_real_distribution<double>(dfLow, dfHigh)(moEngine);
    }
    bool Chance(double df) { return Real(0, 1) < df; }
    std::uint64_t Bits() { return moEngine(); }
    template <typename T>
    T Pick(std::initializer_list<T> loItems) {
        return loItems.begin()[Int(0, static_cast<int>(loItems.size()) - 1)];
    }

 private:
    std::mt19937_64 moEngine;
};

class GuardedBytes {
 public:
    explicit GuardedBytes(std::size_t nBytes)
        : mnBytes(nBytes), mpabyAll(new unsigned char[nBytes + 2 * kGuard]) {
        std::memset(mpabyAll.get(), kGuardByte, nBytes + 2 * kGuard);
    }
    unsigned char* Get() { return mpabyAll.get() + kGuard; }
    std::size_t Size() const { return mnBytes; }
    bool GuardsHold() const {
        for (int i = 0; i < kGuard; ++i) {
            if (mpabyAll[static_cast<std::size_t>(i)] != kGuardByte ||
                mpabyAll[kGuard + mnBytes + static_cast<std::size_t>(i)] != kGuardByte) {
                return false;
            }
        }
        return true;
    }

 private:
    std::size_t mnBytes;
    std::unique_ptr<unsigned char[]> mpabyAll;
};

/// Samples that lie close together, spread over the whole range, or are special. A complex type
/// takes twice nCount numbers.
void FillSamples(Random& oRandom, vetra::gobs::NativeDataTypeCode eType, unsigned char* pabyBuf,
                 std::size_t nCount);

/// A transform as a caller might write it, with some impossible positions.
class OddTfm : public vetra::utils::IBufPosTfm {
 public:
    OddTfm(int nCols, int nRows, double dfScale)
        : mnCols(nCols), mnRows(nRows), mdfScale(dfScale) {}
    int GetNumCols() const override { return mnCols; }
    int GetNumRows() const override { return mnRows; }
    long long GetNumPix() const override { return static_cast<long long>(mnCols) * mnRows; }
    void GetSrcPos(long long nIdx, double& dfCol, double& dfRow) const override {
        dfCol = std::fmod(static_cast<double>(nIdx) * 0.7369, 40.0) * mdfScale - 2.0;
        dfRow = std::fmod(static_cast<double>(nIdx) * 1.1731, 30.0) * mdfScale - 2.0;
        switch (nIdx % 23) {
            case 3:
                dfCol = NAN;
                break;
            case 7:
                dfRow = INFINITY;
                break;
            case 11:
                dfCol = -1e300;
                break;
            case 13:
                dfRow = 3e9;
                break;
            case 17:
                dfCol = -2147483648.5;
                break;
            case 19:
                dfCol = std::floor(dfCol) + 0.49999999999999994;
                break;
            default:
                break;
        }
    }
    OddTfm* Clone() const override { return new OddTfm(*this); }

 private:
    int mnCols;
    int mnRows;
    double mdfScale;
};

/// The transform's class, for messages.
const char* TransformName(const vetra::utils::IBufPosTfm& oTfm);

/// One image with guards around samples and mask.
struct Image {
    Image(vetra::gobs::NativeDataTypeCode eType, int nCols, int nRows, int nChan, bool bMask)
        : nSamples(static_cast<std::size_t>(nCols) * static_cast<std::size_t>(nRows) *
                   static_cast<std::size_t>(nChan)),
          oSamples(nSamples *
                   static_cast<std::size_t>(vetra::gobs::DataTypeAdapter::ByteSize(eType))),
          oMask(static_cast<std::size_t>(nCols) * static_cast<std::size_t>(nRows)),
          oBuffer(eType, nCols, nRows, nChan, oSamples.Get(), bMask ? oMask.Get() : nullptr,
                  false) {}

    std::size_t nSamples;
    GuardedBytes oSamples;
    GuardedBytes oMask;
    vetra::utils::ResampleBuffer oBuffer;
};

/// The same memory as real samples.
vetra::utils::ResampleBuffer RealView(vetra::utils::ResampleBuffer& oBuffer);

/// A resampler of each method.
std::unique_ptr<vetra::utils::IRasterResampler> MakeResampler(ResampleMethod eMethod);

std::vector<ResampleMethod> AllMethods();

/// For test names.
std::string MethodName(const testing::TestParamInfo<ResampleMethod>& oInfo);

#endif  // VETRA_TESTS_BASE_UTILS_RESAMPLE_ENGINE_RANDOMIMAGES_H
