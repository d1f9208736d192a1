#include "vetra/base/utils/fs/filelister.h"

#include <cstdio>
#include <list>
#include <unordered_map>

#include "vetra/base/utils/fs/folderlisting.h"
#include "vetra/faultcore/exceptions.h"

/// A folder that the search is in.
struct FileLister::Folder {
    explicit Folder(const std::string& sFolder) : sPath(sFolder) {
        if (!vetra::utils::ListFolder(sPath + '/', voEntries)) {
            throw vetra::FileAccessException(sPath, vetra::FileAccessException::eCannotRead,
                                             "Error when trying to open this dir", VETRA_HERE);
        }
    }

    std::string sPath;
    std::vector<vetra::utils::FolderEntry> voEntries;
    std::size_t nNext = 0;
    /// Where in the list the folder's half pairs are, in the order of the list, by the path without
    /// the extension. Those of one common name are all of one kind: others would be partners.
    std::unordered_map<std::string, std::list<std::size_t>> oHalves;
};

FileLister::FileLister(const std::string& directory, const std::string& firstExtension,
                       const std::string& secondExtension)
    : msFirstExtension(firstExtension), msSecondExtension(secondExtension), msDirectory(directory) {
    Search();
}

void FileLister::Display() const {
    for (const Pair& oPair : mvFiles) {
        std::printf("%s %s \n", oPair.first.c_str(), oPair.second.c_str());
    }
}

void FileLister::Search() {
    Search(msDirectory);
    CleanUp();
}

// Folders on the way down are a list and not calls within calls, and each is closed before the next
// one is opened: neither the stack nor the number of open files limits the depth.
void FileLister::Search(const std::string& sDirectory) {
    std::list<Folder> oFolders;
    oFolders.emplace_back(sDirectory);
    while (!oFolders.empty()) {
        Folder& oFolder = oFolders.back();
        if (oFolder.nNext == oFolder.voEntries.size()) {
            oFolders.pop_back();
            continue;
        }
        const vetra::utils::FolderEntry& oEntry = oFolder.voEntries[oFolder.nNext++];
        if (oEntry.bFolder) {
            oFolders.emplace_back(oFolder.sPath + '/' + oEntry.sName);
            continue;
        }
        Pair oPair;
        if (IsTheFile(oFolder.sPath, oEntry.sName, &oPair) == 1 && DoesExist(oPair, oFolder) == 0) {
            mvFiles.push_back(std::move(oPair));
        }
    }
}

// The kind of a name: 1, 2, or 0 for neither.
int FileLister::CheckExtension(const std::string& sName) const {
    if (sName.find(msFirstExtension) != std::string::npos) {
        return 1;
    }
    return sName.find(msSecondExtension) != std::string::npos ? 2 : 0;
}

// Sets the half of a pair that a file is, and gives 1; gives 0 for a file of neither kind.
int FileLister::IsTheFile(const std::string& sDirectory, const std::string& sName,
                          Pair* poPair) const {
    *poPair = Pair();
    const int nKind = CheckExtension(sName);
    if (nKind != 0) {
        (nKind == 1 ? poPair->first : poPair->second) = sDirectory + '/' + sName;
    }
    return nKind != 0 ? 1 : 0;
}

// Puts a half pair to the first entry that lacks it, and gives 1. Gives 0 when there is none; the
// half is then the next entry of the list.
int FileLister::DoesExist(const Pair& oPair, Folder& oFolder) {
    const bool bFirst = !oPair.first.empty();
    std::string sCommonName = bFirst ? oPair.first : oPair.second;
    // The name contains the extension, so it is no shorter.
    sCommonName.resize(sCommonName.size() - (bFirst ? msFirstExtension : msSecondExtension).size());
    std::list<std::size_t>& onHalves = oFolder.oHalves[sCommonName];
    if (!onHalves.empty()) {
        Pair& oEntry = mvFiles[onHalves.front()];
        std::string& sPlace = bFirst ? oEntry.first : oEntry.second;
        if (sPlace.empty()) {
            sPlace = bFirst ? oPair.first : oPair.second;
            onHalves.pop_front();
            return 1;
        }
    }
    onHalves.push_back(mvFiles.size());
    return 0;
}

void FileLister::CleanUp() {
    std::erase_if(mvFiles,
                  [](const Pair& oPair) { return oPair.first.empty() || oPair.second.empty(); });
}
