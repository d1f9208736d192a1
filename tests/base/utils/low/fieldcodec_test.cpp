#include "vetra/base/utils/low/fieldcodec.h"

#include <gtest/gtest.h>
#include <sys/mman.h>

#include <algorithm>
#include <cstring>
#include <string>
#include <vector>

#include "tests/support/scratchfolder.h"
#include "vetra/base/utils/low/fileposition.h"

namespace vetra {
namespace {

using Bytes = std::vector<unsigned char>;

Bytes ToBytes(const std::string& s) { return Bytes(s.begin(), s.end()); }

TEST(FieldCodec, ByteOrder) {
    Bytes vbyField(4);
    EncodeUint32(0x01020304, vbyField.data(), 0, NeedsByteSwap(eEC_BIG));
    EXPECT_EQ(vbyField, (Bytes{1, 2, 3, 4}));
    EncodeUint32(0x01020304, vbyField.data(), 0, NeedsByteSwap(eEC_LITTLE));
    EXPECT_EQ(vbyField, (Bytes{4, 3, 2, 1}));
    EXPECT_FALSE(NeedsByteSwap(GetEndian()));

    Bytes vbyOut = ToBytes("....");
    swapbyte(vbyOut.data(), "abc", 3);
    swapbyte(vbyOut.data(), "xyz", 0);
    swapbyte(vbyOut.data(), "xyz", -1);
    EXPECT_EQ(vbyOut, ToBytes("cba."));
    swapbytes(vbyOut.data(), 3);
    swapbytes(vbyOut.data(), 1);
    swapbytes(vbyOut.data(), 0);
    EXPECT_EQ(vbyOut, ToBytes("abc."));
    swapbytes(vbyOut.data(), 4);
    EXPECT_EQ(vbyOut, ToBytes(".cba"));
}

// A number is its bytes as they are in memory, or these in reverse order, at any alignment, with
// nothing written around them. A signalling NaN and a negative zero keep their bits.
template <typename T, typename Decode, typename Encode>
void CheckNumber(Decode fnDecode, Encode fnEncode) {
    for (const unsigned long long nBits : {0x0102030405060708ull, 0xfff4000000000001ull,
                                           0x8000000080008000ull, 0x7fa000017fa00001ull}) {
        T value;
        std::memcpy(&value, &nBits, sizeof value);
        Bytes vbyField(sizeof value);
        std::memcpy(vbyField.data(), &value, sizeof value);
        for (const bool bSwap : {false, true}) {
            for (unsigned int nOffset = 0; nOffset < 9; ++nOffset) {
                Bytes vbyBuffer(24, 0xee);
                fnEncode(value, vbyBuffer.data(), nOffset, bSwap);
                Bytes vbyExpected(24, 0xee);
                std::copy(vbyField.begin(), vbyField.end(), vbyExpected.begin() + nOffset);
                EXPECT_EQ(vbyBuffer, vbyExpected);
                const T decoded = fnDecode(vbyBuffer.data(), nOffset, bSwap);
                EXPECT_EQ(std::memcmp(&decoded, &value, sizeof value), 0);
            }
            std::reverse(vbyField.begin(), vbyField.end());
        }
    }
}

TEST(FieldCodec, Numbers) {
    CheckNumber<short>(DecodeInt16, EncodeInt16);
    CheckNumber<unsigned short>(DecodeUint16, EncodeUint16);
    CheckNumber<int>(DecodeInt32, EncodeInt32);
    CheckNumber<unsigned int>(DecodeUint32, EncodeUint32);
    CheckNumber<float>(DecodeFloat, EncodeFloat);
    CheckNumber<double>(DecodeDouble, EncodeDouble);
}

template <typename T, typename DecodeArray, typename EncodeArray, typename Encode>
void CheckArray(DecodeArray fnDecodeArray, EncodeArray fnEncodeArray, Encode fnEncode) {
    for (const unsigned int nCount : {0u, 1u, 100u}) {
        for (const bool bSwap : {false, true}) {
            std::vector<T> vValues(nCount);
            Bytes vbyExpected(nCount * sizeof(T) + 8, 0xee);
            Bytes vbyBuffer = vbyExpected;
            for (unsigned int i = 0; i < nCount; ++i) {
                vValues[i] = static_cast<T>(i * 12345671u);
                fnEncode(vValues[i], vbyExpected.data() + i * sizeof(T), 3, bSwap);
            }
            fnEncodeArray(vValues.data(), nCount, vbyBuffer.data(), 3, bSwap);
            EXPECT_EQ(vbyBuffer, vbyExpected);
            std::vector<T> vDecoded(nCount);
            fnDecodeArray(vDecoded.data(), nCount, vbyBuffer.data(), 3, bSwap);
            EXPECT_EQ(vDecoded, vValues);
        }
    }
}

TEST(FieldCodec, Arrays) {
    CheckArray<int>(DecodeInt32Array, EncodeInt32Array, EncodeInt32);
    CheckArray<unsigned int>(DecodeUint32Array, EncodeUint32Array, EncodeUint32);
    CheckArray<double>(DecodeDoubleArray, EncodeDoubleArray, EncodeDouble);
}

TEST(FieldCodec, ArraysReachBeyond4GiB) {
    const std::size_t nBytes = (std::size_t{4} << 30) + (1 << 20);
    void* pMemory = mmap(nullptr, nBytes, PROT_READ | PROT_WRITE,
                         MAP_PRIVATE | MAP_ANONYMOUS | MAP_NORESERVE, -1, 0);
    if (pMemory == MAP_FAILED) {
        GTEST_SKIP() << "no 4 GiB of addresses";
    }
    unsigned char* pabyBuffer = static_cast<unsigned char*>(pMemory);
    const double adfValues[] = {1.0, 2.0, 3.0};
    EncodeDoubleArray(adfValues, 3, pabyBuffer, 0xfffffff5u, true);
    EXPECT_EQ(DecodeDouble(pabyBuffer + (std::size_t{1} << 32), 5, true), 3.0);
    double adfDecoded[3];
    DecodeDoubleArray(adfDecoded, 3, pabyBuffer, 0xfffffff5u, true);
    EXPECT_TRUE(std::equal(adfValues, adfValues + 3, adfDecoded));
    munmap(pMemory, nBytes);
}

TEST(FieldCodec, BytesAndText) {
    struct Case {
        unsigned int nFrom;
        unsigned int nTo;
        const char* pszExpected;
    };
    const unsigned int nNegative = 0x80000000u;
    for (const Case& o : {Case{3, 5, "abc  ##"},
                          {5, 3, "abc####"},
                          {0, 2, "  #####"},
                          {3, 0, "#######"},
                          {nNegative, 2, "  #####"},
                          {3, nNegative, "#######"}}) {
        Bytes vbyOut = ToBytes("#######");
        DecodeByteArray(vbyOut.data(), o.nTo, ToBytes("-abcdef").data(), 1, o.nFrom);
        EXPECT_EQ(vbyOut, ToBytes(o.pszExpected));
        vbyOut = ToBytes("-#######");
        EncodeByteArray(ToBytes("abcdef").data(), o.nFrom, vbyOut.data(), 1, o.nTo);
        EXPECT_EQ(vbyOut, ToBytes(std::string("-") + o.pszExpected));
    }

    Bytes vbyField = ToBytes("######");
    EncodeString("ab", vbyField.data(), 1, 4);
    EXPECT_EQ(vbyField, ToBytes(std::string("#ab\0\0#", 6)));
    EXPECT_EQ(DecodeString(vbyField.data(), 1, 4), "ab");
    EncodeString("abcdef", vbyField.data(), 1, 4);
    EXPECT_EQ(vbyField, ToBytes("#abcd#"));
    EncodeString("", vbyField.data(), 0, nNegative);
    EXPECT_EQ(vbyField, ToBytes("#abcd#"));
    EXPECT_EQ(DecodeString(vbyField.data(), 1, nNegative), "");
    EXPECT_EQ(DecodeString(nullptr, 0, 0), "");
    EXPECT_EQ(DecodeString(ToBytes(std::string(" a \0b", 5)).data(), 0, 5), "a");
}

TEST(FilePosition, Beyond4GiB) {
    const tests::ScratchFolder oScratch;
    const long long nFar = (5LL << 30) + 7;
    std::FILE* poFile = std::fopen(oScratch.Write("sparse", "start").c_str(), "r+b");
    ASSERT_NE(poFile, nullptr);
    EXPECT_EQ(FSeek(poFile, nFar, SEEK_SET), 0);
    EXPECT_EQ(FTell(poFile), nFar);
    std::fputs("end", poFile);
    EXPECT_EQ(FSeek(poFile, -3 - nFar, SEEK_END), 0);
    EXPECT_EQ(std::fgetc(poFile), 's');
    EXPECT_EQ(FSeek(poFile, nFar - 1, SEEK_CUR), 0);
    EXPECT_EQ(std::fgetc(poFile), 'e');
    EXPECT_EQ(FTell(poFile), nFar + 1);
    EXPECT_NE(FSeek(poFile, -1, SEEK_SET), 0);
    EXPECT_NE(FSeek(poFile, 0, 99), 0);
    EXPECT_EQ(FTell(poFile), nFar + 1);
    std::fclose(poFile);

    std::FILE* poPipe = popen("true", "r");
    EXPECT_NE(FSeek(poPipe, 0, SEEK_SET), 0);
    EXPECT_EQ(FTell(poPipe), -1);
    pclose(poPipe);
}

}  // namespace
}  // namespace vetra
