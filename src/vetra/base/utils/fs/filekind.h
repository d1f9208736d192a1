#ifndef VETRA_BASE_UTILS_FS_FILEKIND_H
#define VETRA_BASE_UTILS_FS_FILEKIND_H

#include <fcntl.h>
#include <sys/stat.h>

#include <string>

namespace vetra::utils {

enum class FileKind { eNothing, eFile, eDirectory };

/// The C library would take the path up to a zero byte, and find or delete another file.
inline bool HasZero(const std::string& sPath) { return sPath.find('\0') != std::string::npos; }

/// What a path is, seen from the open folder \p nFolder; arguments as for `fstatat`.
inline FileKind KindOf(int nFolder, const char* pszPath, int nFlags) {
    struct stat oStatus;
    if (fstatat(nFolder, pszPath, &oStatus, nFlags) != 0) {
        return FileKind::eNothing;
    }
    return S_ISDIR(oStatus.st_mode) ? FileKind::eDirectory : FileKind::eFile;
}

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_FS_FILEKIND_H
