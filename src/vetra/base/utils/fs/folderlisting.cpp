#include "vetra/base/utils/fs/folderlisting.h"

#include <dirent.h>

#include <cerrno>
#include <memory>
#include <string_view>

#include "vetra/base/utils/fs/filekind.h"

namespace vetra::utils {

namespace {

struct CloseFolder {
    void operator()(DIR* poFolder) const { closedir(poFolder); }
};

}  // namespace

bool ListFolder(const std::string& sFolder, std::vector<FolderEntry>& voEntries) {
    if (HasZero(sFolder)) {
        return false;
    }
    const std::unique_ptr<DIR, CloseFolder> poFolder(
        opendir(sFolder.empty() ? "." : sFolder.c_str()));
    if (poFolder == nullptr) {
        return false;
    }
    const int nFolder = dirfd(poFolder.get());
    while (true) {
        errno = 0;  // the only thing that tells a failure from the end
        const dirent* poEntry = readdir(poFolder.get());
        if (poEntry == nullptr) {
            return errno == 0;
        }
        const std::string_view sName = poEntry->d_name;
        if (sName == "." || sName == "..") {
            continue;
        }
        const bool bKnown = poEntry->d_type != DT_UNKNOWN;
        const bool bFolder =
            bKnown ? poEntry->d_type == DT_DIR
                   : KindOf(nFolder, poEntry->d_name, AT_SYMLINK_NOFOLLOW) == FileKind::eDirectory;
        if (bFolder || (bKnown && poEntry->d_type != DT_LNK) ||
            KindOf(nFolder, poEntry->d_name, 0) == FileKind::eFile) {
            voEntries.push_back({std::string(sName), bFolder});
        }
    }
}

}  // namespace vetra::utils
