#include "vetra/basic/gobs/raster/datatypeadapter.h"

#include <iterator>

#include "vetra/faultcore/exceptions.h"

namespace vetra::gobs {

namespace {

struct TypeRow {
    const char* pszText;
    int nBytes;  // 0: no size
};

// Indexed by type code.
constexpr TypeRow kaTypes[] = {
    {"8U", 1},   {"8S", 1},   {"16U", 2},  {"16S", 2},  {"32U", 4},
    {"32S", 4},  {"32R", 4},  {"64U", 8},  {"64S", 8},  {"64R", 8},
    {"C16U", 0}, {"C16S", 4}, {"C32S", 8}, {"C32R", 8}, {"C64R", 16},
};
static_assert(std::size(kaTypes) == eDT_UNKNOWN);

const TypeRow* FindType(NativeDataTypeCode eDataType) {
    return eDataType >= 0 && eDataType < eDT_UNKNOWN ? &kaTypes[eDataType] : nullptr;
}

}  // namespace

int DataTypeAdapter::ByteSize(NativeDataTypeCode eDataType) {
    const TypeRow* poType = FindType(eDataType);
    if (poType == nullptr || poType->nBytes == 0) {
        throw ParameterException("eDataType", ParameterException::eInvalid, "", "",
                                 "Could not determine byte size for provided datatype", VETRA_HERE);
    }
    return poType->nBytes;
}

bool DataTypeAdapter::IsComplex(NativeDataTypeCode eDataType) {
    if (eDataType == eDT_UNKNOWN) {
        throw ParameterException("eDataType", ParameterException::eInvalid, "", "", "", VETRA_HERE);
    }
    return eDataType >= eDT_C16S && eDataType <= eDT_C64R;
}

NativeDataTypeCode DataTypeAdapter::ComplexToScalar(NativeDataTypeCode eDataType) {
    switch (eDataType) {
        case eDT_C16S:
            return eDT_16S;
        case eDT_C32S:
            return eDT_32S;
        case eDT_C32R:
            return eDT_32R;
        case eDT_C64R:
            return eDT_64R;
        default:
            return eDataType;
    }
}

std::string DataTypeAdapter::TypeToString(NativeDataTypeCode eDataType) {
    const TypeRow* poType = FindType(eDataType);
    if (poType == nullptr) {
        throw ParameterException("eDataType", ParameterException::eInvalid, "", "",
                                 "Cannot evaluate TypeToString() for the provided datatype",
                                 VETRA_HERE);
    }
    return poType->pszText;
}

}  // namespace vetra::gobs
