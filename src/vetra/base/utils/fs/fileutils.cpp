#include "vetra/base/utils/fs/fileutils.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <memory>
#include <string_view>
#include <utility>

#include "vetra/faultcore/exceptions.h"

namespace {

enum class Kind { eNothing, eFile, eDirectory };

// The C library would take the path up to a zero byte, and find or delete another file.
bool HasZero(const std::string& sPath) { return sPath.find('\0') != std::string::npos; }

Kind KindOf(int nFolder, const char* pszPath, int nFlags) {
    struct stat oStatus;
    if (fstatat(nFolder, pszPath, &oStatus, nFlags) != 0) {
        return Kind::eNothing;
    }
    return S_ISDIR(oStatus.st_mode) ? Kind::eDirectory : Kind::eFile;
}

Kind KindOf(const std::string& sPath) {
    return HasZero(sPath) ? Kind::eNothing : KindOf(AT_FDCWD, sPath.c_str(), 0);
}

bool Permits(const std::string& sPath, int nMode) {
    if (!IsFile(sPath)) {
        throw vetra::FileNotFoundException(sPath, "", "", "", 0);
    }
    return access(sPath.c_str(), nMode) == 0;
}

struct Listing {
    std::vector<std::string> vsFiles;
    std::vector<std::string> vsFolders;
};

struct CloseFolder {
    void operator()(DIR* poFolder) const { closedir(poFolder); }
};

// The names in a folder, in the order in which the system gives them; of the folders only those
// that may be entered.
Listing List(const std::string& sFolder) {
    Listing oListing;
    if (HasZero(sFolder)) {
        return oListing;
    }
    const std::unique_ptr<DIR, CloseFolder> poFolder(
        opendir(sFolder.empty() ? "." : sFolder.c_str()));
    if (poFolder == nullptr) {
        return oListing;
    }
    while (const dirent* poEntry = readdir(poFolder.get())) {
        const std::string sName = poEntry->d_name;
        if (sName == "." || sName == "..") {
            continue;
        }
        const int nFolder = dirfd(poFolder.get());
        const bool bKnown = poEntry->d_type != DT_UNKNOWN;
        const bool bFolder =
            bKnown ? poEntry->d_type == DT_DIR
                   : KindOf(nFolder, poEntry->d_name, AT_SYMLINK_NOFOLLOW) == Kind::eDirectory;
        if (bFolder) {
            oListing.vsFolders.push_back(sName);
        } else if ((bKnown && poEntry->d_type != DT_LNK) ||
                   KindOf(nFolder, poEntry->d_name, 0) == Kind::eFile) {
            oListing.vsFiles.push_back(sName);
        }
    }
    return oListing;
}

// Calls fnVisit(prefix, file names) for a folder, then for each of its subfolders and all below it.
// A prefix is what stands ahead of the names in a folder's paths.
//
// The folders still to visit are a list and not calls within calls, and one folder is open at a
// time: neither the stack nor the number of open files limits the depth. A path that is too long
// for the system can't be read, like any other.
template <typename Visit>
void Walk(const std::string& sRoot, bool bRecurse, Visit fnVisit) {
    std::vector<std::string> vsPrefixes{sRoot};
    while (!vsPrefixes.empty()) {
        const std::string sPrefix = std::move(vsPrefixes.back());
        vsPrefixes.pop_back();
        const Listing oListing = List(sPrefix);
        fnVisit(sPrefix, oListing.vsFiles);
        if (bRecurse) {
            for (auto it = oListing.vsFolders.rbegin(); it != oListing.vsFolders.rend(); ++it) {
                vsPrefixes.push_back(sPrefix + *it + '/');
            }
        }
    }
}

bool Matches(std::string_view sName, std::string_view sPattern) {
    if (sPattern == "*.*") {
        return true;
    }
    std::size_t nName = 0;
    std::size_t nPattern = 0;
    // Behind the last star, and where in the name its rest was tried last. Earlier stars need no
    // second try: what they could give up, the last one can take.
    std::size_t nBehindStar = std::string_view::npos;
    std::size_t nTried = 0;
    while (nName < sName.size()) {
        if (nPattern < sPattern.size() && sPattern[nPattern] == '*') {
            nBehindStar = ++nPattern;
            nTried = nName;
        } else if (nPattern < sPattern.size() &&
                   (sPattern[nPattern] == '?' || sPattern[nPattern] == sName[nName])) {
            ++nPattern;
            ++nName;
        } else if (nBehindStar != std::string_view::npos) {
            nPattern = nBehindStar;
            nName = ++nTried;
        } else {
            return false;
        }
    }
    return sPattern.find_first_not_of('*', nPattern) == std::string_view::npos;
}

bool EndsWith(std::string_view sName, std::string_view sSuffix) {
    return sName.size() >= sSuffix.size() && sName.substr(sName.size() - sSuffix.size()) == sSuffix;
}

}  // namespace

bool IsFile(const std::string& path) { return KindOf(path) == Kind::eFile; }
bool IsDirectory(const std::string& path) { return KindOf(path) == Kind::eDirectory; }

bool CanRead(const std::string& path) { return Permits(path, R_OK); }
bool CanWrite(const std::string& path) { return Permits(path, W_OK); }

std::string GetExtension(const std::string& path) {
    const std::size_t nPoint = path.rfind('.');
    return nPoint == std::string::npos ? std::string() : path.substr(nPoint + 1);
}

std::string GetName(const std::string& path) { return path.substr(0, path.rfind('.')); }

void RemoveFile(const std::string& path) {
    if (HasZero(path) || unlink(path.c_str()) == 0) {
        return;
    }
    // Not followed: a link that leads nowhere can be in the way too.
    if (KindOf(AT_FDCWD, path.c_str(), AT_SYMLINK_NOFOLLOW) != Kind::eNothing) {
        throw vetra::FileAccessException(path, vetra::FileAccessException::eCannotDelete,
                                         "File cannot be deleted", VETRA_HERE);
    }
}

std::vector<std::string> FindFiles(const std::string& directory, const std::string& suffix,
                                   const bool& recurse) {
    std::vector<std::string> vsFound;
    if (suffix.empty()) {
        return vsFound;
    }
    // The order is that of the walk backwards, each directory's own files forwards.
    Walk(directory + '/', recurse,
         [&](const std::string& sPrefix, const std::vector<std::string>& vsFiles) {
             for (auto it = vsFiles.rbegin(); it != vsFiles.rend(); ++it) {
                 if (EndsWith(*it, suffix)) {
                     vsFound.push_back(sPrefix + *it);
                 }
             }
         });
    std::reverse(vsFound.begin(), vsFound.end());
    return vsFound;
}

std::vector<std::string> FindFilesByWildcard(const std::string& directory,
                                             const std::string& pattern, bool recurse) {
    std::vector<std::string> vsFound;
    const bool bClosed = directory.empty() || directory.back() == '/';
    Walk(bClosed ? directory : directory + '/', recurse,
         [&](const std::string& sPrefix, const std::vector<std::string>& vsFiles) {
             for (const std::string& sName : vsFiles) {
                 if (Matches(sName, pattern)) {
                     vsFound.push_back(sPrefix + sName);
                 }
             }
         });
    return vsFound;
}
