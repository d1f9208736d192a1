#ifndef VETRA_APPS_GDALRASTER_ERRORS_H
#define VETRA_APPS_GDALRASTER_ERRORS_H

#include <stdexcept>
#include <string>
#include <vector>

namespace vetra::tool {

/// A run that can't go on. The text is for the user.
class RunError : public std::runtime_error {
 public:
    using std::runtime_error::runtime_error;
};

/// Arguments that can't be used. The text is for the user.
class UsageError : public std::runtime_error {
 public:
    using std::runtime_error::runtime_error;
};

/// The text as one line: every run of white space and control characters becomes one blank.
std::string OneLine(const std::string& sText);

/// What GDAL reports, on whatever thread, from `Collect` on: kept instead of printed.
class GdalMessages {
 public:
    static void Collect();
    /// From now on failures on this thread tell what could not be done, whoever finds them: where
    /// threads read and write at once, either may be the first to look.
    static void Attribute(const std::string& sWhat);
    /// Forgets the failures, not the warnings.
    static void ForgetFailures();
    /// The first failure since then, which names the cause where later ones are its consequences;
    /// empty when there was none.
    static std::string GetFailure();
    /// Turns a failure into a warning that begins with \p sWhat.
    static void Demote(const std::string& sWhat);
    /// Throws when there was a failure. \param sWhat  what could not be done, unless its thread
    /// said
    static void ThrowIfFailed(const std::string& sWhat);
    /// Throws in any case, with the failure if there was one.
    [[noreturn]] static void Throw(const std::string& sWhat);
    /// All warnings, each once.
    static std::vector<std::string> GetWarnings();
};

}  // namespace vetra::tool

#endif  // VETRA_APPS_GDALRASTER_ERRORS_H
