#include "vetra/base/utils/fs/fileutils.h"

#include <unistd.h>

#include <algorithm>
#include <string_view>
#include <utility>

#include "vetra/base/utils/fs/filekind.h"
#include "vetra/base/utils/fs/folderlisting.h"
#include "vetra/faultcore/exceptions.h"

namespace {

using vetra::utils::FileKind;
using vetra::utils::FolderEntry;
using vetra::utils::HasZero;
using vetra::utils::KindOf;

FileKind KindOf(const std::string& sPath) {
    return HasZero(sPath) ? FileKind::eNothing : KindOf(AT_FDCWD, sPath.c_str(), 0);
}

bool Permits(const std::string& sPath, int nMode) {
    if (!IsFile(sPath)) {
        throw vetra::FileNotFoundException(sPath, "", "", "", 0);
    }
    return access(sPath.c_str(), nMode) == 0;
}

// Calls fnVisit(prefix, entries) for a folder, then for each of its subfolders and all below it.
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
        std::vector<FolderEntry> voEntries;
        vetra::utils::ListFolder(sPrefix, voEntries);
        fnVisit(sPrefix, voEntries);
        for (auto it = voEntries.rbegin(); bRecurse && it != voEntries.rend(); ++it) {
            if (it->bFolder) {
                vsPrefixes.push_back(sPrefix + it->sName + '/');
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

bool IsFile(const std::string& path) { return KindOf(path) == FileKind::eFile; }
bool IsDirectory(const std::string& path) { return KindOf(path) == FileKind::eDirectory; }

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
    if (KindOf(AT_FDCWD, path.c_str(), AT_SYMLINK_NOFOLLOW) != FileKind::eNothing) {
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
         [&](const std::string& sPrefix, const std::vector<FolderEntry>& voEntries) {
             for (auto it = voEntries.rbegin(); it != voEntries.rend(); ++it) {
                 if (!it->bFolder && EndsWith(it->sName, suffix)) {
                     vsFound.push_back(sPrefix + it->sName);
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
         [&](const std::string& sPrefix, const std::vector<FolderEntry>& voEntries) {
             for (const FolderEntry& oEntry : voEntries) {
                 if (!oEntry.bFolder && Matches(oEntry.sName, pattern)) {
                     vsFound.push_back(sPrefix + oEntry.sName);
                 }
             }
         });
    return vsFound;
}
