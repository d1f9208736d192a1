#ifndef VETRA_TESTS_SUPPORT_SCRATCHFOLDER_H
#define VETRA_TESTS_SUPPORT_SCRATCHFOLDER_H

#include <stdlib.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <stdexcept>
#include <string>

namespace vetra::tests {

/// A new folder for temporary files, deleted with the object.
class ScratchFolder {
 public:
    explicit ScratchFolder(
        const std::filesystem::path& oParent = std::filesystem::temp_directory_path()) {
        std::string sFolder = oParent / "vetra-test-XXXXXX";
        if (mkdtemp(sFolder.data()) == nullptr) {
            throw std::runtime_error("no folder for temporary files");
        }
        moFolder = sFolder;
    }
    ~ScratchFolder() { std::filesystem::remove_all(moFolder); }

    ScratchFolder(const ScratchFolder&) = delete;
    ScratchFolder& operator=(const ScratchFolder&) = delete;

    const std::filesystem::path& GetPath() const { return moFolder; }
    std::string Path(const std::string& sName) const { return moFolder / sName; }

    /// Writes a file, byte by byte as given. Returns its path.
    std::string Write(const std::string& sName, const std::string& sBytes) const {
        std::ofstream(Path(sName), std::ios::binary) << sBytes;
        return Path(sName);
    }

    std::string Read(const std::string& sName) const {
        std::ifstream oFile(Path(sName), std::ios::binary);
        return {std::istreambuf_iterator<char>(oFile), {}};
    }

 private:
    std::filesystem::path moFolder;
};

}  // namespace vetra::tests

#endif  // VETRA_TESTS_SUPPORT_SCRATCHFOLDER_H
