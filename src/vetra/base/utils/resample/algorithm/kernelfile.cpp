#include "vetra/base/utils/resample/algorithm/kernelfile.h"

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <limits>
#include <ostream>
#include <stdexcept>
#include <system_error>

#include "vetra/base/utils/fs/fileutils.h"
#include "vetra/base/utils/string/stringutils.h"
#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"

namespace {

// The longest header, and the longest line that a failure shows whole.
constexpr std::size_t kMaxLine = std::size_t{1} << 16;
constexpr std::size_t kMaxField = std::size_t{1} << 20;

// The text of a kernel file. Only a field and the start of its line are held: neither a line
// without end nor a file of rubbish takes memory.
class KernelText {
 public:
    enum class Field { eNumber, eOther, eNone };

    explicit KernelText(const std::string& sFile) {
        // A pipe or a device may have no end, or keep the process waiting.
        std::error_code oIgnored;
        if (std::filesystem::is_regular_file(sFile, oIgnored)) {
            moStream.open(sFile);
        }
    }

    bool IsGood() const { return moStream.is_open() && moStream.good(); }

    /// The first line; false, and the line cut, when it is too long.
    bool ReadHeader(std::string& sLine) {
        sLine = RestOfLine();
        if (mbLineEnded && !sLine.empty() && sLine.back() == '\r') {
            sLine.pop_back();
        }
        return mbLineEnded;
    }

    /// The next field of the weights.
    Field ReadField(std::string& sField) {
        sField.clear();
        for (;;) {
            if (mbLineEnded) {
                if (mbFileEnded) {
                    return Field::eNone;
                }
                msLine.clear();
                mbLineEnded = false;
                mbFirstField = true;
            }
            const char c = Next();
            if (c == '#' && msLine.size() == 1) {
                while (!mbLineEnded) {
                    Next();
                }
            } else if (c != ',' && !mbLineEnded) {
                sField += c;
                if (sField.size() > kMaxField) {
                    return Field::eOther;
                }
            } else {
                // Blanks at the ends of a line belong to no field.
                const bool bAtEnd = mbFirstField || mbLineEnded;
                mbFirstField = false;
                if (IsNumeric(sField)) {
                    return Field::eNumber;
                }
                if (!sField.empty() && !(bAtEnd && TrimWhitespace(sField).empty())) {
                    return Field::eOther;
                }
                sField.clear();
            }
        }
    }

    /// The line of the last field, trimmed.
    std::string ShowLine() { return TrimWhitespace(RestOfLine()); }

 private:
    /// The line, read up to its end; cut when it is too long.
    std::string RestOfLine() {
        while (!mbLineEnded && msLine.size() <= kMaxLine) {
            Next();
        }
        return msLine.size() <= kMaxLine ? msLine : msLine.substr(0, kMaxLine) + "...";
    }

    /// The next byte of the line; a line feed where the line ends.
    char Next() {
        if (mnNext == mnFilled) {
            moStream.read(machBuffer, sizeof machBuffer);
            mnFilled = static_cast<std::size_t>(moStream.gcount());
            mnNext = 0;
        }
        mbFileEnded = mnFilled == 0;
        const char c = mbFileEnded ? '\n' : machBuffer[mnNext++];
        mbLineEnded = c == '\n';
        // One byte more than is shown says that the line is too long.
        if (!mbLineEnded && msLine.size() <= kMaxLine) {
            msLine += c;
        }
        return c;
    }

    std::ifstream moStream;
    char machBuffer[1 << 16];
    std::size_t mnNext = 0;
    std::size_t mnFilled = 0;
    std::string msLine;
    bool mbLineEnded = false;
    bool mbFileEnded = false;
    bool mbFirstField = true;
};

// atoi, with the nearest int for a number beyond its range.
int HeaderNumber(const std::string& sField) {
    constexpr long kMin = std::numeric_limits<int>::min();
    constexpr long kMax = std::numeric_limits<int>::max();
    return static_cast<int>(std::clamp(std::strtol(sField.c_str(), nullptr, 10), kMin, kMax));
}

// Any three ints fit: at most 2^32 x 2^31.
std::int64_t NumWeights(int nCols, int nRows, int nSubPixels) {
    return (std::int64_t{nCols} + nRows) * (std::int64_t{nSubPixels} + 1);
}

// Refuses to write what a table doesn't hold.
void CheckBuffer(int nCols, int nRowTaps, int nSubPixels, const std::vector<double>& vdfWeights,
                 const char* pszFile, const char* pszFunction, std::uint32_t nLine) {
    if (nCols < 1 || nRowTaps < 0 || nSubPixels < 0 ||
        static_cast<std::uint64_t>(NumWeights(nCols, nRowTaps, nSubPixels)) > vdfWeights.size()) {
        throw vetra::DataException("Kernel buffer has incorrect number of weights.", pszFile,
                                   pszFunction, nLine);
    }
}

}  // namespace

void LoadKernelFile(std::string sFile, int& nCols, int& nRows, int& nSubPixels,
                    std::vector<double>& vdfWeights) {
    vdfWeights.clear();
    if (!IsFile(sFile)) {
        throw vetra::FileNotFoundException(sFile, "File not found", VETRA_HERE);
    }
    KernelText oText(sFile);
    if (!oText.IsGood()) {
        throw vetra::DataTypeException("", "", "Invalid stream", "", "", 0);
    }
    nCols = 0;
    nRows = 0;
    nSubPixels = 0;

    std::string sHeader;
    const bool bWhole = oText.ReadHeader(sHeader);
    const std::vector<std::string> vsHeader = TokenizeString(sHeader, ",", true, true);
    const bool bSingleKernel = vsHeader.size() == 2;
    if (!bWhole || (!bSingleKernel && vsHeader.size() != 3)) {
        throw vetra::FormatException(sHeader, "Invalid input line format read from input file.",
                                     "   Expected format: KernelSize,NumSubPixels OR "
                                     "NumCols,NumRows,NumSubPixels",
                                     VETRA_HERE);
    }
    nCols = HeaderNumber(vsHeader.front());
    nRows = bSingleKernel ? 0 : HeaderNumber(vsHeader[1]);
    nSubPixels = HeaderNumber(vsHeader.back());
    const std::int64_t nTotal = NumWeights(nCols, nRows, nSubPixels);
    // A negative number becomes a large one.
    if (static_cast<std::uint64_t>(nTotal) > vdfWeights.max_size()) {
        throw std::length_error("vector<T> too long");
    }

    std::int64_t nCount = 0;
    std::string sField;
    KernelText::Field eField = oText.ReadField(sField);
    for (; eField == KernelText::Field::eNumber; eField = oText.ReadField(sField)) {
        // What is too much is read to its end, for a later failure, and not kept.
        if (nCount < nTotal) {
            vdfWeights.push_back(TextToDouble(sField));
        }
        ++nCount;
    }
    if (eField == KernelText::Field::eOther) {
        throw vetra::FormatException(
            oText.ShowLine(), "Invalid input line format read from input file.",
            "Expected format: numericValue_1,...,numericValue_KernelSize", VETRA_HERE);
    }
    if (nCount != nTotal) {
        throw vetra::DataException("Resampler kernel file does not have correct number of weights.",
                                   VETRA_HERE);
    }
    if (bSingleKernel) {
        nRows = nCols;
        const std::size_t nColWeights = vdfWeights.size();
        vdfWeights.resize(2 * nColWeights);
        std::copy_n(vdfWeights.begin(), nColWeights,
                    vdfWeights.begin() + static_cast<std::ptrdiff_t>(nColWeights));
    }
}

void SaveKernelFile(std::string sFile, int nCols, int nRows, int nSubPixels,
                    std::vector<double>& vdfWeights, bool bSingleKernel) {
    CheckBuffer(nCols, bSingleKernel ? 0 : nRows, nSubPixels, vdfWeights, VETRA_HERE);
    // The C library would open the path up to a zero byte, another file.
    if (sFile.find('\0') != std::string::npos) {
        return;
    }
    std::ofstream oStream(sFile);
    SaveKernelFile(oStream, nCols, nRows, nSubPixels, vdfWeights, bSingleKernel);
}

void SaveKernelFile(std::ostream& oStream, int nCols, int nRows, int nSubPixels,
                    const std::vector<double>& vdfWeights, bool bSingleKernel) {
    const int nRowTaps = bSingleKernel ? 0 : nRows;
    CheckBuffer(nCols, nRowTaps, nSubPixels, vdfWeights, VETRA_HERE);
    std::string sLine = FormatString("%d,", nCols);
    if (!bSingleKernel) {
        sLine += FormatString("%d,", nRowTaps);
    }
    sLine += FormatString("%d\n", nSubPixels);
    // Without the stream's formatting.
    oStream.write(sLine.data(), static_cast<std::streamsize>(sLine.size()));
    std::size_t nNext = 0;
    for (const int nTaps :
         bSingleKernel ? std::vector<int>{nCols} : std::vector<int>{nCols, nRowTaps}) {
        for (std::int64_t nPhase = 0; nPhase <= nSubPixels; ++nPhase) {
            sLine.clear();
            for (int nTap = 0; nTap < nTaps; ++nTap) {
                sLine += FormatString(nTap > 0 ? ",%.14e" : "%.14e", vdfWeights[nNext++]);
            }
            sLine += '\n';
            oStream.write(sLine.data(), static_cast<std::streamsize>(sLine.size()));
        }
    }
}
