#include "vetra/base/utils/low/copypixel.h"

#include <gtest/gtest.h>
#include <sys/mman.h>

#include <algorithm>
#include <cstring>
#include <limits>
#include <random>
#include <string>
#include <tuple>
#include <vector>

#include "tests/support/refusal.h"

namespace vetra::utils::low {
namespace {

using namespace gobs;
using tests::ExpectRefusal;
using Bytes = std::vector<unsigned char>;

template <NativeDataTypeCode eCode, typename Sample, NativeDataTypeCode eComplexCode = eDT_UNKNOWN>
struct CopyType {
    using T = Sample;
    static constexpr NativeDataTypeCode kCode = eCode;
    static constexpr NativeDataTypeCode kComplex = eComplexCode;
};
using CopyTypes =
    std::tuple<CopyType<eDT_8U, unsigned char>, CopyType<eDT_8S, signed char>,
               CopyType<eDT_16U, unsigned short>, CopyType<eDT_16S, short, eDT_C16S>,
               CopyType<eDT_32U, unsigned>, CopyType<eDT_32S, int, eDT_C32S>,
               CopyType<eDT_32R, float, eDT_C32R>, CopyType<eDT_64R, double, eDT_C64R>>;

// Random values of Tin that have a value as Tout: any bits, or floating values in range.
template <typename Tin, typename Tout>
std::vector<Tin> Values(std::size_t nCount) {
    using Limits = std::numeric_limits<Tout>;
    const bool bInteger = std::is_integral_v<Tout>;
    std::mt19937_64 oRandom(nCount);
    std::uniform_real_distribution<double> oUniform(
        bInteger ? 0.99 * static_cast<double>(Limits::lowest()) : -1e30,
        bInteger ? 0.99 * static_cast<double>(Limits::max()) : 1e30);
    std::vector<Tin> vValues(nCount);
    for (Tin& value : vValues) {
        value = static_cast<Tin>(std::is_integral_v<Tin> ? 0.0 : oUniform(oRandom));
        if constexpr (std::is_integral_v<Tin>) {
            value = static_cast<Tin>(oRandom());
        }
    }
    return vValues;
}

template <typename T>
Bytes ToBytes(const std::vector<T>& vValues) {
    const auto* pabyBytes = reinterpret_cast<const unsigned char*>(vValues.data());
    return Bytes(pabyBytes, pabyBytes + vValues.size() * sizeof(T));
}

// Expects a function to write this at an odd address, and nothing around it.
template <typename Function>
void ExpectWritten(const Bytes& vbyExpected, Function fnWrite) {
    Bytes vbyBuffer(vbyExpected.size() + 18, 0xee);
    fnWrite(vbyBuffer.data() + 9);
    Bytes vbyAll(vbyBuffer.size(), 0xee);
    std::copy(vbyExpected.begin(), vbyExpected.end(), vbyAll.begin() + 9);
    EXPECT_EQ(vbyBuffer, vbyAll);
}

// All three functions, as samples of a type or as half as many complex ones.
void CheckFunctions(const Bytes& vbyIn, const Bytes& vbyExpected, NativeDataTypeCode eOut,
                    NativeDataTypeCode eIn, unsigned int nCount) {
    SCOPED_TRACE(DataTypeAdapter::TypeToString(eIn) + " to " + DataTypeAdapter::TypeToString(eOut));
    Bytes vbyOdd(vbyIn.size() + 1);
    std::copy(vbyIn.begin(), vbyIn.end(), vbyOdd.begin() + 1);
    const unsigned char* pabyIn = vbyOdd.data() + 1;
    ExpectWritten(vbyExpected, [&](unsigned char* p) { CopyPixel(p, pabyIn, eOut, eIn, nCount); });
    ExpectWritten(vbyExpected, [&](unsigned char* p) {
        const auto nSize = static_cast<unsigned int>(DataTypeAdapter::ByteSize(eIn));
        for (unsigned int i = nCount; i-- > 0;) {
            CopyPixelValue(p, pabyIn + i * nSize, eOut, eIn, i);
        }
    });
    Bytes vbyPixels;
    for (const unsigned int nNumPix : {0u, 1u, 62u}) {
        while (vbyPixels.size() < nNumPix * vbyExpected.size()) {
            vbyPixels.insert(vbyPixels.end(), vbyExpected.begin(), vbyExpected.end());
        }
        ExpectWritten(vbyPixels, [&](unsigned char* p) {
            CopyPixelToRaster(p, pabyIn, eOut, eIn, nCount, nNumPix);
        });
    }
}

template <typename In, typename Out>
void CheckPair() {
    for (const unsigned int nCount : {0u, 2u, 6u, 34u, 1000u}) {
        const auto vIn = Values<typename In::T, typename Out::T>(nCount);
        std::vector<typename Out::T> vOut(nCount);
        std::transform(vIn.begin(), vIn.end(), vOut.begin(),
                       [](auto value) { return static_cast<typename Out::T>(value); });
        CheckFunctions(ToBytes(vIn), ToBytes(vOut), Out::kCode, In::kCode, nCount);
        if (In::kComplex != eDT_UNKNOWN && Out::kComplex != eDT_UNKNOWN) {
            CheckFunctions(ToBytes(vIn), ToBytes(vOut), Out::kComplex, In::kComplex, nCount / 2);
        }
    }
}

template <typename In, typename... Out>
void CheckTargets(std::tuple<Out...>) {
    (CheckPair<In, Out>(), ...);
}

TEST(CopyPixel, AllPairsOfTypes) {
    std::apply([](auto... in) { (CheckTargets<decltype(in)>(CopyTypes{}), ...); }, CopyTypes{});
}

TEST(CopyPixel, NothingSaturatesOrRounds) {
    const float afIn[] = {3.9f, 200.5f, -0.9f};
    unsigned char abyOut[3];
    TCopyPixel(abyOut, afIn, eDT_8U, 3);
    EXPECT_EQ(Bytes(abyOut, abyOut + 3), (Bytes{3, 200, 0}));
    TCopyPixelValue(abyOut, short{300}, eDT_8U, 1);
    EXPECT_EQ(abyOut[1], 44);
    const signed char nMinusOne = -1;
    unsigned int anWide[2];
    TCopyPixelToRaster(reinterpret_cast<unsigned char*>(anWide), &nMinusOne, eDT_32U, 1, 2);
    EXPECT_EQ(anWide[1], 4294967295u);
}

TEST(CopyPixel, IndicesBeyond32Bits) {
    // Sample 2^32 - 1 of a complex target is behind 16 GiB.
    const std::size_t nOffset = std::size_t{0xffffffffu} * 4;
    void* pMemory = mmap(nullptr, nOffset + 4, PROT_READ | PROT_WRITE,
                         MAP_PRIVATE | MAP_ANONYMOUS | MAP_NORESERVE, -1, 0);
    if (pMemory == MAP_FAILED) {
        GTEST_SKIP() << "no 16 GiB of addresses";
    }
    unsigned char* pabyOut = static_cast<unsigned char*>(pMemory);
    const float afIn[] = {-7.0f, 8.0f};
    CopyPixelValue(pabyOut, reinterpret_cast<const unsigned char*>(afIn), eDT_C16S, eDT_C32R,
                   0xffffffffu);
    short anOut[2];
    std::memcpy(anOut, pabyOut + nOffset, 4);
    EXPECT_EQ(anOut[0], -7);
    EXPECT_EQ(anOut[1], 8);
    munmap(pMemory, nOffset + 4);
}

TEST(CopyPixel, OneTypeMovesAnyTypeWithASize) {
    const Bytes vbyIn{1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15, 16};
    ExpectWritten(vbyIn, [&](unsigned char* p) { CopyPixel(p, vbyIn.data(), eDT_64S, 2); });
    ExpectWritten(vbyIn, [&](unsigned char* p) { CopyPixel(p, vbyIn.data(), eDT_C64R, 1); });
    CopyPixel(nullptr, nullptr, eDT_64R, 0);
    EXPECT_THROW(CopyPixel(nullptr, nullptr, eDT_C16U, 1), ParameterException);
}

TEST(CopyPixel, RefusedTypes) {
    const Bytes vbyIn(64, 1);
    Bytes vbyOut(64, 0xee);
    struct Function {
        std::string sName;
        std::string sTemplateName;
        void (*pfnCopy)(unsigned char*, const unsigned char*, NativeDataTypeCode,
                        NativeDataTypeCode);
    };
    for (const Function& oFunction :
         {Function{"CopyPixel", "TTCopyPixel",
                   [](auto p, auto q, auto o, auto i) { CopyPixel(p, q, o, i, 2); }},
          Function{"CopyPixelValue", "TCopyPixelValue",
                   [](auto p, auto q, auto o, auto i) { CopyPixelValue(p, q, o, i, 1); }},
          Function{"CopyPixelToRaster", "TTCopyPixelToRaster",
                   [](auto p, auto q, auto o, auto i) { CopyPixelToRaster(p, q, o, i, 1, 2); }}}) {
        const auto fnExpect = [&](NativeDataTypeCode eOut, NativeDataTypeCode eIn,
                                  const std::string& sArgument, const std::string& sMessage) {
            ExpectRefusal({sArgument, 1, "", "", sMessage},
                          [&] { oFunction.pfnCopy(vbyOut.data(), vbyIn.data(), eOut, eIn); });
        };
        const std::string sMixed =
            "Cannot " + oFunction.sName + "() between complex and non-complex datatypes";
        fnExpect(eDT_C32R, eDT_32R, "eTypeIn && eTypeOut", sMixed);
        fnExpect(eDT_64S, eDT_C16S, "eTypeIn && eTypeOut", sMixed);
        for (const auto eBad : {eDT_64U, eDT_64S, eDT_C16U, static_cast<NativeDataTypeCode>(-1)}) {
            fnExpect(eDT_32R, eBad, "eTypeIn",
                     oFunction.sName + "(): input datatype is unrecognized");
            fnExpect(eBad, eDT_32R, "eTypeIn",
                     "Unrecognized datatype in " + oFunction.sTemplateName + "()");
        }
        fnExpect(eDT_UNKNOWN, eDT_8U, "eDataType", "");
    }
    EXPECT_EQ(vbyOut, Bytes(64, 0xee));
}

}  // namespace
}  // namespace vetra::utils::low
