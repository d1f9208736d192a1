#ifndef VETRA_APPS_RASTERJOB_TARGETFILE_H
#define VETRA_APPS_RASTERJOB_TARGETFILE_H

#include <filesystem>
#include <string>
#include <vector>

#include "gdalraster/sourceraster.h"

namespace vetra::tool {

/// The file that a path names as a target: that at the end of its links.
/// \throws RunError when something other than a file is there.
std::filesystem::path ResolveTarget(const std::string& sPath);
/// \throws RunError also when it is a file of the source.
std::filesystem::path ResolveTarget(const std::string& sPath, SourceRaster& oSource);

/// Lets a file, for instance an image with all its side files, grow in a hidden folder beside its
/// later place, and moves it there when it is whole. Until then nothing at the target's name
/// changes.
class TargetFile {
 public:
    /// \throws RunError when no folder can be made beside the target.
    explicit TargetFile(std::filesystem::path oPath);
    TargetFile(const TargetFile&) = delete;
    TargetFile& operator=(const TargetFile&) = delete;
    /// Removes the folder with whatever is in it.
    ~TargetFile();

    /// Where to write the file: the target's name in the folder.
    std::string GetPath() const { return moFolder / moPath.filename(); }
    /// Where to write a file that the target is made from. \param sName  one for each such file
    std::string GetStagePath(const std::string& sName) const { return moStage / sName; }
    /// Moves the file and others that are written beside it to their place.
    void Commit();
    /// As above, and side files of an image that was there before go: they would be taken for those
    /// of the new one.
    /// \param oSource  its files are kept
    void Commit(SourceRaster& oSource);

 private:
    // Names of the other files in the folder.
    std::vector<std::string> GetSideFiles() const;

    std::filesystem::path moPath;
    std::filesystem::path moFolder;
    std::filesystem::path moStage;
};

/// Writes a text file, whole or not at all.
/// \throws RunError
void WriteTextFile(const std::filesystem::path& oPath, const std::string& sText);

}  // namespace vetra::tool

#endif  // VETRA_APPS_RASTERJOB_TARGETFILE_H
