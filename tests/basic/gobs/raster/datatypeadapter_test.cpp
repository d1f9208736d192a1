#include "vetra/basic/gobs/raster/datatypeadapter.h"

#include <gtest/gtest.h>

#include <limits>

#include "tests/support/refusal.h"

namespace vetra::gobs {
namespace {

using tests::ExpectRefusal;

TEST(DataTypeAdapter, Table) {
    const struct {
        NativeDataTypeCode eType;
        int nCode;
        const char* pszText;
        int nBytes;
        bool bComplex;
        NativeDataTypeCode eScalar;
    } aoRows[] = {
        {eDT_8U, 0, "8U", 1, false, eDT_8U},        {eDT_8S, 1, "8S", 1, false, eDT_8S},
        {eDT_16U, 2, "16U", 2, false, eDT_16U},     {eDT_16S, 3, "16S", 2, false, eDT_16S},
        {eDT_32U, 4, "32U", 4, false, eDT_32U},     {eDT_32S, 5, "32S", 4, false, eDT_32S},
        {eDT_32R, 6, "32R", 4, false, eDT_32R},     {eDT_64U, 7, "64U", 8, false, eDT_64U},
        {eDT_64S, 8, "64S", 8, false, eDT_64S},     {eDT_64R, 9, "64R", 8, false, eDT_64R},
        {eDT_C16U, 10, "C16U", 0, false, eDT_C16U}, {eDT_C16S, 11, "C16S", 4, true, eDT_16S},
        {eDT_C32S, 12, "C32S", 8, true, eDT_32S},   {eDT_C32R, 13, "C32R", 8, true, eDT_32R},
        {eDT_C64R, 14, "C64R", 16, true, eDT_64R},
    };
    for (const auto& oRow : aoRows) {
        SCOPED_TRACE(oRow.pszText);
        EXPECT_EQ(oRow.eType, oRow.nCode);
        EXPECT_EQ(DataTypeAdapter::TypeToString(oRow.eType), oRow.pszText);
        EXPECT_EQ(DataTypeAdapter::IsComplex(oRow.eType), oRow.bComplex);
        EXPECT_EQ(DataTypeAdapter::ComplexToScalar(oRow.eType), oRow.eScalar);
        if (oRow.nBytes != 0) {
            EXPECT_EQ(DataTypeAdapter::ByteSize(oRow.eType), oRow.nBytes);
        }
    }
}

TEST(DataTypeAdapter, CodesWithoutMeaning) {
    constexpr int kLowest = std::numeric_limits<int>::min();
    constexpr int kHighest = std::numeric_limits<int>::max();
    for (const int nCode : {10, 15, 16, -1, 1000, kLowest, kHighest}) {
        SCOPED_TRACE(nCode);
        const auto eType = static_cast<NativeDataTypeCode>(nCode);
        ExpectRefusal(
            {"eDataType", 1, "", "", "Could not determine byte size for provided datatype"},
            [&] { DataTypeAdapter::ByteSize(eType); });
        EXPECT_EQ(DataTypeAdapter::ComplexToScalar(eType), eType);
        if (nCode != 10) {
            ExpectRefusal({"eDataType", 1, "", "",
                           "Cannot evaluate TypeToString() for the provided datatype"},
                          [&] { DataTypeAdapter::TypeToString(eType); });
        }
        if (nCode != 15) {
            EXPECT_FALSE(DataTypeAdapter::IsComplex(eType));
        }
    }
    ExpectRefusal({"eDataType", 1, "", "", ""}, [] { DataTypeAdapter::IsComplex(eDT_UNKNOWN); });
}

}  // namespace
}  // namespace vetra::gobs
