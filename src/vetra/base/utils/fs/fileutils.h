#ifndef VETRA_BASE_UTILS_FS_FILEUTILS_H
#define VETRA_BASE_UTILS_FS_FILEUTILS_H

#include <string>
#include <vector>

#include "vetra/export.h"

/// \file
/// A path is a sequence of bytes, with "/" between its parts. A path that holds a zero byte names
/// nothing. Links are followed: a link is what it leads to, and one that leads nowhere doesn't
/// exist. Everything that exists and is no directory counts as a file, pipes and devices too.

/// Whether the path exists and is no directory.
VETRA_EXPORT bool IsFile(const std::string& path);

/// Whether the path exists and is a directory.
VETRA_EXPORT bool IsDirectory(const std::string& path);

/// Whether the process may read a file.
/// \throws FileNotFoundException when the path is not a file (`IsFile`).
VETRA_EXPORT bool CanRead(const std::string& path);

/// Whether the process may write to a file.
/// \throws FileNotFoundException when the path is not a file (`IsFile`).
VETRA_EXPORT bool CanWrite(const std::string& path);

/// The text behind the last point of the path, wherever that stands: "d/file" for "dir.d/file".
/// Empty when there is no point.
VETRA_EXPORT std::string GetExtension(const std::string& path);

/// The path up to its last point, without the point: "dir/a" for "dir/a.txt", "dir" for
/// "dir.d/file". The whole path when there is no point.
VETRA_EXPORT std::string GetName(const std::string& path);

/// Deletes a file; of a link, the link. A path that doesn't exist is no failure.
/// \throws FileAccessException when the path is still there, a directory always.
VETRA_EXPORT void RemoveFile(const std::string& path);

/// The files of a directory whose names end with a suffix.
///
/// Links to directories are not entered, and directories that can't be read are passed over.
///
/// \param directory  without the final separator: results are \p directory + "/" + name, so an
///                   empty one is the root
/// \param suffix     compared byte by byte; an empty one matches nothing
/// \param recurse    whether subdirectories are searched too
/// \return the paths: those of the subdirectory visited last, and so on back to the first one,
///         then the directory's own. Nothing is sorted. Empty when the directory can't be read.
VETRA_EXPORT std::vector<std::string> FindFiles(const std::string& directory,
                                                const std::string& suffix, const bool& recurse);

/// The files of a directory whose names match a pattern.
///
/// Links to directories are not entered, and directories that can't be read are passed over.
///
/// \param directory  with or without the final separator; an empty one is the current directory,
///                   and results are then relative to it
/// \param pattern    for the whole name: "*" stands for any bytes, also none, "?" for one byte, and
///                   all else, brackets too, for itself, upper and lower case apart. "*.*" stands
///                   for every name. Points in front are not special.
/// \param recurse    whether subdirectories are searched too
/// \return the paths: the directory's own, then those of its subdirectories in the order of
///         listing. Nothing is sorted. Empty when the directory can't be read.
VETRA_EXPORT std::vector<std::string> FindFilesByWildcard(const std::string& directory,
                                                          const std::string& pattern, bool recurse);

#endif  // VETRA_BASE_UTILS_FS_FILEUTILS_H
