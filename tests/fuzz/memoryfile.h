#ifndef VETRA_TESTS_FUZZ_MEMORYFILE_H
#define VETRA_TESTS_FUZZ_MEMORYFILE_H

#include <sys/mman.h>
#include <unistd.h>

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>

namespace vetra::tests {

/// A regular file without a disk below it, for readers that take a path.
class MemoryFile {
 public:
    MemoryFile(const std::uint8_t* pabyData, std::size_t nSize)
        : mnFile(memfd_create("fuzz", MFD_CLOEXEC)) {
        if (mnFile < 0 || write(mnFile, pabyData, nSize) != static_cast<ssize_t>(nSize)) {
            std::abort();
        }
    }
    ~MemoryFile() { close(mnFile); }
    MemoryFile(const MemoryFile&) = delete;
    MemoryFile& operator=(const MemoryFile&) = delete;

    std::string GetPath() const { return "/proc/self/fd/" + std::to_string(mnFile); }

 private:
    int mnFile;
};

}  // namespace vetra::tests

#endif  // VETRA_TESTS_FUZZ_MEMORYFILE_H
