#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>

#include "tests/fuzz/memoryfile.h"
#include "vetra/base/utils/string/basicparser.h"
#include "vetra/faultcore/exceptions.h"

// The key is what stands ahead of the first zero byte, the file what stands behind it.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* pabyData, std::size_t nSize) {
    const std::uint8_t* const pabyEnd = pabyData + nSize;
    const std::uint8_t* const pabyZero = std::find(pabyData, pabyEnd, std::uint8_t{0});
    const std::string sKey(pabyData, pabyZero);
    const std::uint8_t* const pabyFile = pabyZero == pabyEnd ? pabyEnd : pabyZero + 1;
    const std::size_t nFileSize = static_cast<std::size_t>(pabyEnd - pabyFile);
    const vetra::tests::MemoryFile oFile(pabyFile, nFileSize);
    try {
        BasicParser oParser(oFile.GetPath());
        std::string sValue = "kept";
        const bool bFound = oParser.Find(sKey, sValue);
        if (nFileSize == 0 || (bFound && sValue.empty()) ||
            (!bFound && sValue != "kept" && !sValue.empty()) ||
            (bFound && sValue.find_first_of(" =;:,\n\0", 0, 7) != std::string::npos)) {
            std::abort();
        }
    } catch (const vetra::FileAccessException&) {
        if (nFileSize != 0) {
            std::abort();
        }
    }
    return 0;
}
