#ifndef VETRA_BASE_UTILS_FS_FOLDERLISTING_H
#define VETRA_BASE_UTILS_FS_FOLDERLISTING_H

#include <string>
#include <vector>

namespace vetra::utils {

struct FolderEntry {
    std::string sName;
    bool bFolder;
};

/// Appends the entries of a folder, in the order in which the system gives them: files, links to
/// files, and folders that may be entered. Left out are ".", "..", links to folders and links that
/// lead nowhere.
///
/// The folder is closed again on return.
///
/// \param sFolder  an empty path is the current folder
/// \return false when the folder can't be read, or not to its end
bool ListFolder(const std::string& sFolder, std::vector<FolderEntry>& voEntries);

}  // namespace vetra::utils

#endif  // VETRA_BASE_UTILS_FS_FOLDERLISTING_H
