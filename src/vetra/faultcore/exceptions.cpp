#include "vetra/faultcore/exceptions.h"

#include <utility>

namespace vetra {

namespace {

// Appends `sLabel + sText` behind a separator, or nothing when sText is empty.
void AppendPart(std::string& sWhat, const char* pszSeparator, const char* pszLabel,
                const std::string& sText) {
    if (sText.empty()) {
        return;
    }
    if (!sWhat.empty()) {
        sWhat += pszSeparator;
    }
    sWhat += pszLabel;
    sWhat += sText;
}

}  // namespace

Exception::Exception(Parts oParts) {
    std::string& sWhat = oParts.sWhat;
    AppendPart(sWhat, "; ", "", oParts.sMessage);
    AppendPart(sWhat, "; ", "argument: ", oParts.sArgument);
    AppendPart(sWhat, "; ", "got: ", oParts.sGot);
    AppendPart(sWhat, "; ", "expected: ", oParts.sExpected);
    AppendPart(sWhat, "; ", "file: ", oParts.sFileName);
    AppendPart(sWhat, " ", "in ", oParts.sFunction);
    std::string sPosition = oParts.sFile;
    if (!sPosition.empty() && oParts.nLine != 0) {
        sPosition += ':' + std::to_string(oParts.nLine);
    }
    AppendPart(sWhat, " ", "at ", sPosition);
    mpoParts = std::make_shared<const Parts>(std::move(oParts));
}

Exception::Exception(const std::string& sMessage, const std::string& sFile,
                     const std::string& sFunction, std::uint32_t nLine)
    : Exception(Parts{sMessage, {}, {}, {}, {}, sFile, sFunction, nLine, 0, {}}) {}

const char* Exception::what() const noexcept { return mpoParts->sWhat.c_str(); }
const std::string& Exception::GetMessage() const noexcept { return mpoParts->sMessage; }
const std::string& Exception::GetFile() const noexcept { return mpoParts->sFile; }
const std::string& Exception::GetFunction() const noexcept { return mpoParts->sFunction; }
std::uint32_t Exception::GetLine() const noexcept { return mpoParts->nLine; }

ParameterException::ParameterException(const std::string& sArgument, Type eType,
                                       const std::string& sGot, const std::string& sExpected,
                                       const std::string& sMessage, const std::string& sFile,
                                       const std::string& sFunction, std::uint32_t nLine)
    : DataException(
          Parts{sMessage, sArgument, sGot, sExpected, {}, sFile, sFunction, nLine, eType, {}}) {}

const std::string& ParameterException::GetArgument() const noexcept { return GetParts().sArgument; }
ParameterException::Type ParameterException::GetType() const noexcept {
    return static_cast<Type>(GetParts().nType);
}
const std::string& ParameterException::GetGot() const noexcept { return GetParts().sGot; }
const std::string& ParameterException::GetExpected() const noexcept { return GetParts().sExpected; }

DataTypeException::DataTypeException(const std::string& sGot, const std::string& sExpected,
                                     const std::string& sMessage, const std::string& sFile,
                                     const std::string& sFunction, std::uint32_t nLine)
    : DataException(Parts{sMessage, {}, sGot, sExpected, {}, sFile, sFunction, nLine, 0, {}}) {}

const std::string& DataTypeException::GetGot() const noexcept { return GetParts().sGot; }
const std::string& DataTypeException::GetExpected() const noexcept { return GetParts().sExpected; }

FormatException::FormatException(const std::string& sGot, const std::string& sMessage,
                                 const std::string& sExpected, const std::string& sFile,
                                 const std::string& sFunction, std::uint32_t nLine)
    : DataException(Parts{sMessage, {}, sGot, sExpected, {}, sFile, sFunction, nLine, 0, {}}) {}

const std::string& FormatException::GetGot() const noexcept { return GetParts().sGot; }
const std::string& FormatException::GetExpected() const noexcept { return GetParts().sExpected; }

DeviceException::DeviceException(const std::string& sMessage, const std::string& sFile,
                                 const std::string& sFunction, std::uint32_t nLine)
    : IOException(sMessage, sFile, sFunction, nLine) {}

const std::string& FileException::GetFileName() const noexcept { return GetParts().sFileName; }

FileAccessException::FileAccessException(const std::string& sFileName, const Type& eType,
                                         const std::string& sMessage, const std::string& sFile,
                                         const std::string& sFunction, std::uint32_t nLine)
    : FileException(Parts{sMessage, {}, {}, {}, sFileName, sFile, sFunction, nLine, eType, {}}) {}

FileAccessException::Type FileAccessException::GetType() const noexcept {
    return static_cast<Type>(GetParts().nType);
}

FileNotFoundException::FileNotFoundException(const std::string& sFileName,
                                             const std::string& sMessage, const std::string& sFile,
                                             const std::string& sFunction, std::uint32_t nLine)
    : FileException(Parts{sMessage, {}, {}, {}, sFileName, sFile, sFunction, nLine, 0, {}}) {}

}  // namespace vetra
