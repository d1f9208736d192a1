#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <stdexcept>
#include <vector>

#include "tests/fuzz/memoryfile.h"
#include "vetra/base/utils/resample/algorithm/kernelfile.h"
#include "vetra/faultcore/exceptions.h"

// What is read without a failure has as many weights as its sizes say.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* pabyData, std::size_t nSize) {
    const vetra::tests::MemoryFile oFile(pabyData, nSize);
    int nCols = 0;
    int nRows = 0;
    int nSubPixels = 0;
    std::vector<double> vdfWeights;
    try {
        LoadKernelFile(oFile.GetPath(), nCols, nRows, nSubPixels, vdfWeights);
    } catch (const vetra::Exception&) {
        return 0;
    } catch (const std::length_error&) {
        return 0;
    }
    if ((std::int64_t{nCols} + nRows) * (std::int64_t{nSubPixels} + 1) !=
        static_cast<std::int64_t>(vdfWeights.size())) {
        std::abort();
    }
    return 0;
}
