#ifndef VETRA_BASE_UTILS_FS_FILELISTER_H
#define VETRA_BASE_UTILS_FS_FILELISTER_H

#include <string>
#include <utility>
#include <vector>

#include "vetra/export.h"

/// Pairs of companion files in a directory tree, such as a data file and its header: two files in
/// one directory, each with its extension, that have the same name without it.
///
/// A file is of the first kind when its name contains the first extension anywhere, and of the
/// second kind when it contains the second one and not the first. Its common name is its name
/// without as many bytes at the end as its extension has, wherever in the name the extension
/// stands: "a.hdr.bak" is of the kind ".hdr", with the common name "a.hdr". Names are compared byte
/// by byte.
///
/// A file is paired with the earliest found file of the other kind, in the same directory and with
/// the same common name, that has no partner yet.
class VETRA_EXPORT FileLister {
 public:
    /// Searches at once, in time linear in the number of files.
    ///
    /// Directories are searched in the order in which the system lists their entries, and each
    /// subdirectory where it is met. Links to directories are not entered. A link to a file is a
    /// file, and so are pipes and devices; a link that leads nowhere is not.
    ///
    /// \param directory        the root, without the final separator: a path is \p directory, "/"
    ///                         and what is below it, so an empty one is the system's root
    /// \param firstExtension   of the first files of the pairs, with its point if that is to count;
    ///                         an empty one is contained in every name
    /// \param secondExtension  of the second files
    /// \throws FileAccessException with the name of the directory, when the root or a directory
    ///         below it can't be listed
    FileLister(const std::string& directory, const std::string& firstExtension,
               const std::string& secondExtension);

    /// Copies search nothing: they have the pairs that were found.
    FileLister(const FileLister&) = default;
    /// As the copy constructor.
    FileLister& operator=(const FileLister&) = default;
    ~FileLister() = default;

    /// The paths of each pair, first and second file, in the order in which the earlier file of
    /// each pair was found. Nothing is sorted.
    std::vector<std::pair<std::string, std::string>> GetFiles() const { return mvFiles; }

    /// Writes a line per pair to the standard output: the first path, a blank, the second path,
    /// a blank.
    void Display() const;

 private:
    using Pair = std::pair<std::string, std::string>;
    struct Folder;

    void Search();
    void Search(const std::string& sDirectory);
    int CheckExtension(const std::string& sName) const;
    int IsTheFile(const std::string& sDirectory, const std::string& sName, Pair* poPair) const;
    int DoesExist(const Pair& oPair, Folder& oFolder);
    void CleanUp();

    std::vector<Pair> mvFiles;
    std::string msFirstExtension;
    std::string msSecondExtension;
    std::string msDirectory;
};

#endif  // VETRA_BASE_UTILS_FS_FILELISTER_H
