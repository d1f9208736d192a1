#include "vetra/base/utils/low/copypixel.h"

#include <gtest/gtest.h>
#include <sys/mman.h>

#include <algorithm>
#include <cmath>
#include <cstring>
#include <limits>
#include <random>
#include <string>
#include <tuple>
#include <vector>

#include "tests/support/refusal.h"

namespace vetra::utils::low {
namespace {

using gobs::DataTypeAdapter;
using gobs::NativeDataTypeCode;
using tests::ExpectRefusal;
using Bytes = std::vector<unsigned char>;

// Copy types by their code, with their complex form.
template <NativeDataTypeCode eCode, typename Sample,
          NativeDataTypeCode eComplex = gobs::eDT_UNKNOWN>
struct CopyType {
    using T = Sample;
    static constexpr NativeDataTypeCode kCode = eCode;
    static constexpr NativeDataTypeCode kComplex = eComplex;
};
using CopyTypes =
    std::tuple<CopyType<gobs::eDT_8U, unsigned char>, CopyType<gobs::eDT_8S, signed char>,
               CopyType<gobs::eDT_16U, unsigned short>,
               CopyType<gobs::eDT_16S, short, gobs::eDT_C16S>, CopyType<gobs::eDT_32U, unsigned>,
               CopyType<gobs::eDT_32S, int, gobs::eDT_C32S>,
               CopyType<gobs::eDT_32R, float, gobs::eDT_C32R>,
               CopyType<gobs::eDT_64R, double, gobs::eDT_C64R>>;

// Calls fnCheck with each pair of copy types.
template <typename Function>
void ForAllPairs(Function fnCheck) {
    std::apply(
        [&]<typename... In>(In...) {
            (std::apply([&]<typename... Out>(Out...) { (fnCheck(In{}, Out{}), ...); }, CopyTypes{}),
             ...);
        },
        CopyTypes{});
}

// Values of Tin that have a defined value as Tout: any bits, or floating values whose whole part
// is in range.
template <typename Tin, typename Tout>
std::vector<Tin> Values(std::size_t nCount) {
    std::mt19937_64 oRandom(nCount);
    std::vector<Tin> vValues(nCount);
    for (std::size_t i = 0; i < nCount; ++i) {
        if constexpr (std::is_integral_v<Tin>) {
            vValues[i] = static_cast<Tin>(oRandom());
        } else {
            using Limits = std::numeric_limits<Tout>;
            const double dfLow = std::is_integral_v<Tout> ? double(Limits::lowest()) - 0.9 : -1e30;
            const double dfHigh = std::is_integral_v<Tout> ? double(Limits::max()) + 0.9 : 1e30;
            std::uniform_real_distribution<double> oUniform(dfLow, dfHigh);
            const double df = i % 2 == 0 ? oUniform(oRandom) : std::fmod(oUniform(oRandom), 128.0);
            vValues[i] = static_cast<Tin>(std::clamp(df, dfLow, std::nexttoward(dfHigh, 0)));
            // A float may have been rounded out of the range.
            if (!(double(vValues[i]) > dfLow - 0.1 && double(vValues[i]) < dfHigh)) {
                vValues[i] = Tin(0.75);
            }
        }
    }
    return vValues;
}

template <typename T>
Bytes ToBytes(const std::vector<T>& vValues) {
    Bytes vbyBytes(vValues.size() * sizeof(T));
    if (!vValues.empty()) {
        std::memcpy(vbyBytes.data(), vValues.data(), vbyBytes.size());
    }
    return vbyBytes;
}

// What a function writes to a target at an odd address, whose neighbourhood it must leave alone.
template <typename Function>
Bytes Written(std::size_t nBytes, Function fnWrite) {
    Bytes vbyBuffer(nBytes + 18, 0xee);
    fnWrite(vbyBuffer.data() + 9);
    EXPECT_TRUE(
        std::all_of(vbyBuffer.begin(), vbyBuffer.begin() + 9, [](int n) { return n == 0xee; }));
    EXPECT_TRUE(std::all_of(vbyBuffer.end() - 9, vbyBuffer.end(), [](int n) { return n == 0xee; }));
    return Bytes(vbyBuffer.begin() + 9, vbyBuffer.end() - 9);
}

TEST(CopyPixel, AllPairsOfTypes) {
    ForAllPairs([]<typename In, typename Out>(In, Out) {
        using Tin = typename In::T;
        using Tout = typename Out::T;
        const bool bComplex =
            In::kComplex != gobs::eDT_UNKNOWN && Out::kComplex != gobs::eDT_UNKNOWN;
        SCOPED_TRACE(DataTypeAdapter::TypeToString(In::kCode) + " to " +
                     DataTypeAdapter::TypeToString(Out::kCode));
        for (const unsigned int nCount : {0u, 1u, 2u, 6u, 16u, 34u, 1000u}) {
            const std::vector<Tin> vIn = Values<Tin, Tout>(nCount);
            std::vector<Tout> vOut(nCount);
            for (unsigned int i = 0; i < nCount; ++i) {
                vOut[i] = static_cast<Tout>(vIn[i]);
            }
            const Bytes vbyExpected = ToBytes(vOut);
            Bytes vbyIn = ToBytes(vIn);
            vbyIn.insert(vbyIn.begin(), 0);  // to an odd address
            const unsigned char* pabyIn = vbyIn.data() + 1;
            const std::size_t nBytes = vbyExpected.size();

            EXPECT_EQ(Written(nBytes,
                              [&](unsigned char* p) {
                                  CopyPixel(p, pabyIn, Out::kCode, In::kCode, nCount);
                              }),
                      vbyExpected);
            EXPECT_EQ(
                Written(nBytes,
                        [&](unsigned char* p) { TCopyPixel(p, vIn.data(), Out::kCode, nCount); }),
                vbyExpected);
            EXPECT_EQ(Written(nBytes,
                              [&](unsigned char* p) {
                                  for (unsigned int i = nCount; i-- > 0;) {
                                      CopyPixelValue(p, pabyIn + i * sizeof(Tin), Out::kCode,
                                                     In::kCode, i);
                                  }
                              }),
                      vbyExpected);
            EXPECT_EQ(Written(nBytes,
                              [&](unsigned char* p) {
                                  for (unsigned int i = 0; i < nCount; ++i) {
                                      TCopyPixelValue(p, vIn[i], Out::kCode, i);
                                  }
                              }),
                      vbyExpected);
            if (bComplex && nCount % 2 == 0) {
                EXPECT_EQ(Written(nBytes,
                                  [&](unsigned char* p) {
                                      CopyPixel(p, pabyIn, Out::kComplex, In::kComplex, nCount / 2);
                                  }),
                          vbyExpected);
                EXPECT_EQ(Written(nBytes,
                                  [&](unsigned char* p) {
                                      for (unsigned int i = 0; i < nCount / 2; ++i) {
                                          CopyPixelValue(p, pabyIn + 2 * i * sizeof(Tin),
                                                         Out::kComplex, In::kComplex, i);
                                      }
                                  }),
                          vbyExpected);
            }
            for (const unsigned int nNumPix : {0u, 1u, 2u, 61u}) {
                Bytes vbyPixels;
                for (unsigned int k = 0; k < nNumPix; ++k) {
                    vbyPixels.insert(vbyPixels.end(), vbyExpected.begin(), vbyExpected.end());
                }
                EXPECT_EQ(Written(nBytes * nNumPix,
                                  [&](unsigned char* p) {
                                      CopyPixelToRaster(p, pabyIn, Out::kCode, In::kCode, nCount,
                                                        nNumPix);
                                  }),
                          vbyPixels);
                EXPECT_EQ(Written(nBytes * nNumPix,
                                  [&](unsigned char* p) {
                                      TCopyPixelToRaster(p, vIn.data(), Out::kCode, nCount,
                                                         nNumPix);
                                  }),
                          vbyPixels);
                if (bComplex && nCount % 2 == 0) {
                    EXPECT_EQ(Written(nBytes * nNumPix,
                                      [&](unsigned char* p) {
                                          CopyPixelToRaster(p, pabyIn, Out::kComplex, In::kComplex,
                                                            nCount / 2, nNumPix);
                                      }),
                              vbyPixels);
                }
            }
        }
    });
}

TEST(CopyPixel, OneType) {
    Bytes vbyIn(16 * 33 + 1);
    std::mt19937 oRandom(1);
    std::generate(vbyIn.begin(), vbyIn.end(),
                  [&] { return static_cast<unsigned char>(oRandom()); });
    for (int n = 0; n < gobs::eDT_UNKNOWN; ++n) {
        const auto eType = static_cast<NativeDataTypeCode>(n);
        if (eType == gobs::eDT_C16U) {
            continue;
        }
        const std::size_t nBytes = 33u * static_cast<std::size_t>(DataTypeAdapter::ByteSize(eType));
        const auto it = vbyIn.begin() + 1;
        EXPECT_EQ(Written(nBytes, [&](unsigned char* p) { CopyPixel(p, &*it, eType, 33); }),
                  Bytes(it, it + static_cast<std::ptrdiff_t>(nBytes)));
    }
    CopyPixel(nullptr, nullptr, gobs::eDT_64R, 0);
}

TEST(CopyPixel, NothingSaturatesOrRounds) {
    const float afIn[] = {3.9f, 200.5f, -0.9f};
    unsigned char abyOut[3];
    TCopyPixel(abyOut, afIn, gobs::eDT_8U, 3);
    EXPECT_EQ(Bytes(abyOut, abyOut + 3), (Bytes{3, 200, 0}));
    TCopyPixelValue(abyOut, short{300}, gobs::eDT_8U, 1);
    EXPECT_EQ(abyOut[1], 44);
    const signed char nMinusOne = -1;
    unsigned int nWide = 0;
    TCopyPixelValue(reinterpret_cast<unsigned char*>(&nWide), nMinusOne, gobs::eDT_32U, 0);
    EXPECT_EQ(nWide, 4294967295u);
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
    CopyPixelValue(pabyOut, reinterpret_cast<const unsigned char*>(afIn), gobs::eDT_C16S,
                   gobs::eDT_C32R, 0xffffffffu);
    short anOut[2];
    std::memcpy(anOut, pabyOut + nOffset, 4);
    EXPECT_EQ(anOut[0], -7);
    EXPECT_EQ(anOut[1], 8);
    munmap(pMemory, nOffset + 4);
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
    const Function aoFunctions[] = {
        {"CopyPixel", "TTCopyPixel",
         [](auto p, auto q, auto o, auto i) { CopyPixel(p, q, o, i, 2); }},
        {"CopyPixelValue", "TCopyPixelValue",
         [](auto p, auto q, auto o, auto i) { CopyPixelValue(p, q, o, i, 1); }},
        {"CopyPixelToRaster", "TTCopyPixelToRaster",
         [](auto p, auto q, auto o, auto i) { CopyPixelToRaster(p, q, o, i, 1, 2); }}};
    using namespace gobs;
    for (const Function& oFunction : aoFunctions) {
        const auto fnExpect = [&](NativeDataTypeCode eOut, NativeDataTypeCode eIn,
                                  const std::string& sArgument, const std::string& sMessage) {
            SCOPED_TRACE(std::to_string(eIn) + " to " + std::to_string(eOut));
            ExpectRefusal({sArgument, 1, "", "", sMessage},
                          [&] { oFunction.pfnCopy(vbyOut.data(), vbyIn.data(), eOut, eIn); });
        };
        for (const auto& [eOut, eIn] : {std::pair{eDT_C32R, eDT_32R},
                                        {eDT_32R, eDT_C32R},
                                        {eDT_64S, eDT_C16S},
                                        {eDT_C16S, eDT_C16U}}) {
            fnExpect(eOut, eIn, "eTypeIn && eTypeOut",
                     "Cannot " + oFunction.sName + "() between complex and non-complex datatypes");
        }
        for (const NativeDataTypeCode eBad :
             {eDT_64U, eDT_64S, eDT_C16U, static_cast<NativeDataTypeCode>(-1),
              static_cast<NativeDataTypeCode>(16)}) {
            fnExpect(eDT_32R, eBad, "eTypeIn",
                     oFunction.sName + "(): input datatype is unrecognized");
            fnExpect(eBad, eBad, "eTypeIn", oFunction.sName + "(): input datatype is unrecognized");
            fnExpect(eBad, eDT_32R, "eTypeIn",
                     "Unrecognized datatype in " + oFunction.sTemplateName + "()");
        }
        fnExpect(eDT_8U, eDT_UNKNOWN, "eDataType", "");
        fnExpect(eDT_UNKNOWN, eDT_8U, "eDataType", "");
    }
    ExpectRefusal({"eTypeIn", 1, "", "", "Unrecognized datatype in TTCopyPixel()"},
                  [&] { TCopyPixel(vbyOut.data(), vbyIn.data(), eDT_C16S, 0); });
    EXPECT_THROW(CopyPixel(vbyOut.data(), vbyIn.data(), eDT_C16U, 1), ParameterException);
    EXPECT_EQ(vbyOut, Bytes(64, 0xee));
}

}  // namespace
}  // namespace vetra::utils::low
