#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>

#include "tests/base/utils/string/literaljson.h"

// The reader gives the tree, or the failure, of the literal reading.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* pabyData, std::size_t nSize) {
    const std::string sText(reinterpret_cast<const char*>(pabyData), nSize);
    if (vetra::tests::literal::ReadDocument(sText) != vetra::tests::literal::ReadLiterally(sText)) {
        std::abort();
    }
    return 0;
}
