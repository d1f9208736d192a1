#ifndef VETRA_FAULTCORE_EXCEPTIONS_H
#define VETRA_FAULTCORE_EXCEPTIONS_H

#include <cstdint>
#include <exception>
#include <memory>
#include <string>

#include "vetra/export.h"

/// The three location arguments that end every constructor below: source file, signature of the
/// throwing function, line.
#if defined(__GNUC__)
#define VETRA_HERE __FILE__, __PRETTY_FUNCTION__, static_cast<std::uint32_t>(__LINE__)
#else
#define VETRA_HERE __FILE__, __func__, static_cast<std::uint32_t>(__LINE__)
#endif

namespace vetra {

/// Root of the failures that the library raises.
///
///     Exception
///       DataException            arguments and data
///         ParameterException     an argument has a value that can't be used
///         DataTypeException      a stream or object of the wrong kind
///         FormatException        text that doesn't have the expected form
///       IOException              files and devices
///         DeviceException
///         FileException
///           FileAccessException
///           FileNotFoundException
///
/// An exception keeps every text that it was given. Copying one shares the texts and never throws.
/// The accessors of parts that a class doesn't take give an empty text.
class VETRA_EXPORT Exception : public std::exception {
 public:
    Exception(const std::string& sMessage, const std::string& sFile, const std::string& sFunction,
              std::uint32_t nLine);

    // Copies only: a moved-from exception still has its texts.
    Exception(const Exception&) noexcept = default;
    Exception& operator=(const Exception&) noexcept = default;
    ~Exception() override = default;

    /// One readable text with every part that is not empty: message, argument name, got, expected,
    /// file name, then function and source position.
    const char* what() const noexcept override;

    /// What went wrong.
    const std::string& GetMessage() const noexcept;
    /// Path of the source file that raised the failure; empty when it carries no location.
    const std::string& GetFile() const noexcept;
    /// Signature of the function that raised the failure; empty when it carries no location.
    const std::string& GetFunction() const noexcept;
    /// Line in `GetFile`; 0 when the failure carries no location.
    std::uint32_t GetLine() const noexcept;

 protected:
    struct Parts {
        std::string sMessage;
        std::string sArgument;
        std::string sGot;
        std::string sExpected;
        std::string sFileName;
        std::string sFile;
        std::string sFunction;
        std::uint32_t nLine = 0;
        int nType = 0;
        std::string sWhat;
    };

    explicit Exception(Parts oParts);
    const Parts& GetParts() const noexcept { return *mpoParts; }

 private:
    std::shared_ptr<const Parts> mpoParts;
};

class VETRA_EXPORT DataException : public Exception {
 public:
    using Exception::Exception;
};

/// An argument, or a value that stands for one, can't be used.
class VETRA_EXPORT ParameterException : public DataException {
 public:
    /// Why the argument was refused.
    enum Type : int {
        eInvalid = 1,      ///< not one of the values that can be used
        eOutOfRange = 6,   ///< below or above the allowed range
        eWrongLength = 8,  ///< a text or list of the wrong length
    };

    ParameterException(const std::string& sArgument, Type eType, const std::string& sGot,
                       const std::string& sExpected, const std::string& sMessage,
                       const std::string& sFile, const std::string& sFunction, std::uint32_t nLine);

    const std::string& GetArgument() const noexcept;
    Type GetType() const noexcept;
    const std::string& GetGot() const noexcept;
    const std::string& GetExpected() const noexcept;
};

class VETRA_EXPORT DataTypeException : public DataException {
 public:
    DataTypeException(const std::string& sGot, const std::string& sExpected,
                      const std::string& sMessage, const std::string& sFile,
                      const std::string& sFunction, std::uint32_t nLine);

    const std::string& GetGot() const noexcept;
    const std::string& GetExpected() const noexcept;
};

class VETRA_EXPORT FormatException : public DataException {
 public:
    FormatException(const std::string& sGot, const std::string& sMessage,
                    const std::string& sExpected, const std::string& sFile,
                    const std::string& sFunction, std::uint32_t nLine);

    const std::string& GetGot() const noexcept;
    const std::string& GetExpected() const noexcept;
};

class VETRA_EXPORT IOException : public Exception {
 protected:
    using Exception::Exception;
};

class VETRA_EXPORT DeviceException : public IOException {
 public:
    DeviceException(const std::string& sMessage, const std::string& sFile,
                    const std::string& sFunction, std::uint32_t nLine);
};

class VETRA_EXPORT FileException : public IOException {
 public:
    /// The file or directory that the operation was about.
    const std::string& GetFileName() const noexcept;

 protected:
    using IOException::IOException;
};

class VETRA_EXPORT FileAccessException : public FileException {
 public:
    /// What could not be done with the file.
    enum Type : int {
        eCannotRead = 1,    ///< opening or reading
        eCannotDelete = 8,  ///< deleting
    };

    FileAccessException(const std::string& sFileName, const Type& eType,
                        const std::string& sMessage, const std::string& sFile,
                        const std::string& sFunction, std::uint32_t nLine);

    Type GetType() const noexcept;
};

class VETRA_EXPORT FileNotFoundException : public FileException {
 public:
    FileNotFoundException(const std::string& sFileName, const std::string& sMessage,
                          const std::string& sFile, const std::string& sFunction,
                          std::uint32_t nLine);
};

}  // namespace vetra

#endif  // VETRA_FAULTCORE_EXCEPTIONS_H
