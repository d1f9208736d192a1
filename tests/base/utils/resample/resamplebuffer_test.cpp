#include "vetra/base/utils/resample/resamplebuffer.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <limits>
#include <new>
#include <vector>

#include "tests/support/refusal.h"

namespace vetra::utils {
namespace {

using tests::ExpectRefusal;
using tests::Refusal;
using namespace gobs;

constexpr int kMax = std::numeric_limits<int>::max();

TEST(ResampleBuffer, AllocatesZerosAndAnAllOnesMask) {
    for (int nCode = eDT_8U; nCode < eDT_UNKNOWN; ++nCode) {
        const auto eType = static_cast<NativeDataTypeCode>(nCode);
        if (eType == eDT_C16U) {
            continue;
        }
        SCOPED_TRACE(DataTypeAdapter::TypeToString(eType));
        ResampleBuffer oBuffer(eType, 5, 3, 2);
        EXPECT_EQ(oBuffer.GetDatatype(), eType);
        EXPECT_EQ(oBuffer.GetNumCols(), 5);
        EXPECT_EQ(oBuffer.GetNumRows(), 3);
        EXPECT_EQ(oBuffer.GetNumChan(), 2);
        EXPECT_TRUE(oBuffer.GetOwnerFlag());
        const int nBytes = 5 * 3 * 2 * DataTypeAdapter::ByteSize(eType);
        EXPECT_EQ(std::count(oBuffer.GetBuf(), oBuffer.GetBuf() + nBytes, 0), nBytes);
        EXPECT_EQ(std::count(oBuffer.GetMask(), oBuffer.GetMask() + 15, 1), 15);
    }
}

constexpr int kBytes = 3 * 2 * 2;
constexpr int kPix = 3 * 2;

// A 16U image of 3 x 2 pixels, all bytes nFill, masked or not; a view is one on static arrays.
ResampleBuffer Make(bool bOwner, bool bMask, unsigned char nFill) {
    static unsigned char abyViewed[256][kBytes + kPix];
    unsigned char* pabyBuf = bOwner ? new unsigned char[kBytes] : abyViewed[nFill];
    unsigned char* pabyMask = bOwner ? new unsigned char[kPix] : abyViewed[nFill] + kBytes;
    std::fill_n(pabyBuf, kBytes, nFill);
    std::fill_n(pabyMask, kPix, nFill);
    if (!bMask && bOwner) {
        delete[] pabyMask;
    }
    return ResampleBuffer(eDT_16U, 3, 2, 1, pabyBuf, bMask ? pabyMask : nullptr, bOwner);
}

// An owner's copy shares nothing, a view's copy shares everything.
void ExpectCopy(const ResampleBuffer& oCopy, const ResampleBuffer& oSource, unsigned char nFill) {
    const bool bOwner = oSource.GetOwnerFlag();
    EXPECT_EQ(oCopy.GetOwnerFlag(), bOwner);
    ASSERT_TRUE(oCopy.GetDatatype() == eDT_16U && oCopy.GetNumCols() == 3 &&
                oCopy.GetNumRows() == 2 && oCopy.GetNumChan() == 1);
    EXPECT_EQ(std::count(oCopy.GetBuf(), oCopy.GetBuf() + kBytes, nFill), kBytes);
    EXPECT_EQ(oCopy.GetBuf() == oSource.GetBuf(), !bOwner);
    ASSERT_EQ(oCopy.GetMask() == nullptr, oSource.GetMask() == nullptr);
    if (oCopy.GetMask() != nullptr) {
        EXPECT_EQ(std::count(oCopy.GetMask(), oCopy.GetMask() + kPix, nFill), kPix);
        EXPECT_EQ(oCopy.GetMask() == oSource.GetMask(), !bOwner);
    }
}

TEST(ResampleBuffer, CopiesAndAssignments) {
    for (int i = 0; i < 16; ++i) {
        SCOPED_TRACE(i);
        ResampleBuffer oSource = Make(i & 1, i & 2, 17);
        const ResampleBuffer oBefore(oSource);
        ExpectCopy(oBefore, oSource, 17);
        ResampleBuffer oTarget = Make(i & 4, i & 8, 18);
        oTarget = oSource;
        ExpectCopy(oTarget, oSource, 17);
        const unsigned char* pabyBuf = oSource.GetBuf();
        const ResampleBuffer& oItself = oSource;
        oSource = oItself;
        EXPECT_EQ(oSource.GetBuf(), pabyBuf);
        ExpectCopy(oBefore, oSource, 17);
    }
}

TEST(ResampleBuffer, RefusalsInOrder) {
    const Refusal oType{"eType", 1, "", "valid NativeDataTypeCode",
                        "eType is not recognized (potentially uninitialized)"};
    const auto fnCount = [](const char* pszArgument, const char* pszGot, const char* pszWhat) {
        return Refusal{pszArgument, 6, pszGot, "> 0",
                       std::string("Number of ") + pszWhat + " must be at least 1"};
    };
    const struct {
        int nCode, nCols, nRows, nChan;
        Refusal oRefusal;
    } aoCases[] = {
        {10, 0, 0, 0, oType},
        {15, 1, 1, 1, oType},
        {16, 1, 1, 1, oType},
        {-1, 1, 1, 1, oType},
        {kMax, 1, 1, 1, oType},
        {0, 0, 0, 0, fnCount("nNumCols", "0", "columns")},
        {14, -kMax - 1, 1, 1, fnCount("nNumCols", "-2147483648", "columns")},
        {9, 1, 0, -1, fnCount("nNumRows", "0", "rows")},
        {11, 1, 1, -7, fnCount("nNumChan", "-7", "channels")},
    };
    std::vector<unsigned char> abyKept(16, 1);  // an array that a failing constructor must not free
    for (const auto& oCase : aoCases) {
        const auto eType = static_cast<NativeDataTypeCode>(oCase.nCode);
        ExpectRefusal(oCase.oRefusal,
                      [&] { ResampleBuffer(eType, oCase.nCols, oCase.nRows, oCase.nChan); });
        for (unsigned char* pabyBuf : {abyKept.data(), static_cast<unsigned char*>(nullptr)}) {
            ExpectRefusal(oCase.oRefusal, [&] {
                ResampleBuffer(eType, oCase.nCols, oCase.nRows, oCase.nChan, pabyBuf,
                               abyKept.data(), true);
            });
        }
    }
    ExpectRefusal({"pabyBuf", 1, "NULL", "non-NULL",
                   "Raster buffer must be a valid pointer (NULL not allowed)"},
                  [&] { ResampleBuffer(eDT_8U, 4, 4, 1, nullptr, abyKept.data(), true); });
}

TEST(ResampleBuffer, SizesBeyond64BitsAreAnAllocationFailure) {
    EXPECT_THROW(ResampleBuffer(eDT_C64R, kMax, kMax, kMax), std::bad_alloc);
    EXPECT_THROW(ResampleBuffer(eDT_64R, 1 << 30, 1 << 30, 1 << 30), std::bad_alloc);
    unsigned char nByte = 0;
    EXPECT_EQ(ResampleBuffer(eDT_C64R, kMax, kMax, kMax, &nByte, nullptr, false).GetNumRows(),
              kMax);
}

}  // namespace
}  // namespace vetra::utils
