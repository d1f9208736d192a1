#include "rasterjob/targetfile.h"

#include <stdlib.h>

#include <cerrno>
#include <fstream>
#include <system_error>
#include <utility>

#include "gdalraster/errors.h"

namespace vetra::tool {

namespace fs = std::filesystem;

namespace {

[[noreturn]] void ThrowWith(const std::string& sWhat, const std::error_code& oError) {
    throw RunError(sWhat + ": " + oError.message());
}

// Names under which GDAL finds side files of an image: those that it writes, and world files.
std::vector<fs::path> GetSideFileNames(const fs::path& oPath) {
    std::vector<fs::path> oNames;
    for (const char* pszSuffix : {".aux.xml", ".msk", ".ovr", ".msk.ovr"}) {
        oNames.push_back(oPath.string() + pszSuffix);
    }
    const std::string sExtension = oPath.extension();
    std::vector<std::string> oWorld = {".wld", sExtension + "w"};
    if (sExtension.size() >= 3) {
        oWorld.push_back({'.', sExtension[1], sExtension.back(), 'w'});
    }
    for (const std::string& sWorld : oWorld) {
        oNames.push_back(fs::path(oPath).replace_extension(sWorld));
    }
    return oNames;
}

}  // namespace

fs::path ResolveTarget(const std::string& sPath) {
    if (sPath.starts_with("/vsi")) {
        throw RunError("the target " + sPath + " is not in the file system");
    }
    std::error_code oError;
    fs::path oPath = fs::weakly_canonical(fs::absolute(sPath), oError);
    if (oError) {
        ThrowWith("can't use the target " + sPath, oError);
    }
    if (!oPath.has_filename() || (fs::exists(oPath, oError) && !fs::is_regular_file(oPath))) {
        throw RunError("the target " + sPath + " is not a file");
    }
    return oPath;
}

fs::path ResolveTarget(const std::string& sPath, SourceRaster& oSource) {
    fs::path oPath = ResolveTarget(sPath);
    if (oSource.Owns(oPath)) {
        throw RunError("the target " + sPath + " is a file of the source");
    }
    return oPath;
}

TargetFile::TargetFile(fs::path oPath) : moPath(std::move(oPath)) {
    std::string sFolder = moPath.parent_path() / ".vetra-XXXXXX";
    if (mkdtemp(sFolder.data()) == nullptr) {
        ThrowWith("can't write into the folder " + moPath.parent_path().string(),
                  std::error_code(errno, std::generic_category()));
    }
    moFolder = sFolder;
    moStage = moFolder / "stage";
    std::error_code oError;
    if (!fs::create_directory(moStage, oError)) {
        fs::remove_all(moFolder, oError);
        throw RunError("can't write into the folder " + moPath.parent_path().string());
    }
}

TargetFile::~TargetFile() {
    std::error_code oError;
    fs::remove_all(moFolder, oError);
}

std::vector<std::string> TargetFile::GetSideFiles() const {
    std::vector<std::string> oNames;
    for (const fs::directory_entry& oEntry : fs::directory_iterator(moFolder)) {
        if (oEntry.is_regular_file() && oEntry.path() != GetPath()) {
            oNames.push_back(oEntry.path().filename());
        }
    }
    return oNames;
}

void TargetFile::Commit() {
    std::error_code oError;
    fs::remove_all(moStage, oError);
    if (!fs::exists(GetPath(), oError)) {
        throw RunError("the format's driver has left no file");
    }
    const auto Move = [&](const fs::path& oFrom) {
        const fs::path oTo = moPath.parent_path() / oFrom.filename();
        fs::rename(oFrom, oTo, oError);
        if (oError) {
            ThrowWith("can't write " + oTo.string(), oError);
        }
    };
    for (const std::string& sName : GetSideFiles()) {
        Move(moFolder / sName);
    }
    Move(GetPath());
}

void TargetFile::Commit(SourceRaster& oSource) {
    std::vector<fs::path> oStale = GetSideFileNames(moPath);
    for (const std::string& sName : GetSideFiles()) {
        std::erase(oStale, moPath.parent_path() / sName);
    }
    Commit();
    std::error_code oError;
    for (const fs::path& oPath : oStale) {
        if (!oSource.Owns(oPath)) {
            fs::remove(oPath, oError);
        }
    }
}

void WriteTextFile(const fs::path& oPath, const std::string& sText) {
    TargetFile oTarget(oPath);
    std::ofstream oFile(oTarget.GetPath(), std::ios::binary);
    oFile << sText;
    oFile.close();
    if (!oFile) {
        throw RunError("can't write " + oPath.string());
    }
    oTarget.Commit();
}

}  // namespace vetra::tool
