#ifndef VETRA_FAULTCORE_EXCEPTIONS_H
#define VETRA_FAULTCORE_EXCEPTIONS_H

#include <cstdint>
#include <exception>
#include <memory>
#include <string>

#include "vetra/export.h"

/// \file
/// The failures that the library raises.

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
    /// \param sMessage   what went wrong
    /// \param sFile      source file that raises the failure, or empty
    /// \param sFunction  signature of the function that raises it, or empty
    /// \param nLine      line in that file, or 0
    Exception(const std::string& sMessage, const std::string& sFile, const std::string& sFunction,
              std::uint32_t nLine);

    /// Shares the texts. There are copies only: a moved-from exception still has its texts.
    Exception(const Exception&) noexcept = default;
    /// As the copy constructor.
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
    /// All that an exception can hold; what a class has no use for is empty.
    struct Parts {
        std::string sMessage;     ///< what went wrong
        std::string sArgument;    ///< name of an argument
        std::string sGot;         ///< what was given
        std::string sExpected;    ///< what could be used
        std::string sFileName;    ///< file or directory that the operation was about
        std::string sFile;        ///< source file that raised the failure
        std::string sFunction;    ///< function that raised the failure
        std::uint32_t nLine = 0;  ///< line in the source file
        int nType = 0;            ///< the `Type` of the class
        std::string sWhat;        ///< text of `what`, made from the others
    };

    /// Composes the text of `what`; \p oParts need not hold it.
    explicit Exception(Parts oParts);
    /// The parts, shared by all copies.
    const Parts& GetParts() const noexcept { return *mpoParts; }

 private:
    std::shared_ptr<const Parts> mpoParts;
};

/// An argument, or data that were read, can't be used.
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

    /// \param sArgument  name of the argument
    /// \param eType      why it was refused
    /// \param sGot       the value that was given, as text
    /// \param sExpected  what could be used
    /// \param sMessage   what went wrong
    /// \param sFile      source file that raises the failure, or empty
    /// \param sFunction  signature of the function that raises it, or empty
    /// \param nLine      line in that file, or 0
    ParameterException(const std::string& sArgument, Type eType, const std::string& sGot,
                       const std::string& sExpected, const std::string& sMessage,
                       const std::string& sFile, const std::string& sFunction, std::uint32_t nLine);

    /// Name of the argument.
    const std::string& GetArgument() const noexcept;
    /// Why the argument was refused.
    Type GetType() const noexcept;
    /// What was given, as text.
    const std::string& GetGot() const noexcept;
    /// What could be used.
    const std::string& GetExpected() const noexcept;
};

/// A stream or object holds another kind of data than the caller asks for.
class VETRA_EXPORT DataTypeException : public DataException {
 public:
    /// \param sGot       kind of the data
    /// \param sExpected  kind that is asked for
    /// \param sMessage   what went wrong
    /// \param sFile      source file that raises the failure, or empty
    /// \param sFunction  signature of the function that raises it, or empty
    /// \param nLine      line in that file, or 0
    DataTypeException(const std::string& sGot, const std::string& sExpected,
                      const std::string& sMessage, const std::string& sFile,
                      const std::string& sFunction, std::uint32_t nLine);

    /// What was given, as text.
    const std::string& GetGot() const noexcept;
    /// What could be used.
    const std::string& GetExpected() const noexcept;
};

/// A text doesn't have the expected form.
class VETRA_EXPORT FormatException : public DataException {
 public:
    /// \param sGot       the text, or the part of it that can't be read
    /// \param sMessage   what went wrong
    /// \param sExpected  the form that can be read
    /// \param sFile      source file that raises the failure, or empty
    /// \param sFunction  signature of the function that raises it, or empty
    /// \param nLine      line in that file, or 0
    FormatException(const std::string& sGot, const std::string& sMessage,
                    const std::string& sExpected, const std::string& sFile,
                    const std::string& sFunction, std::uint32_t nLine);

    /// What was given, as text.
    const std::string& GetGot() const noexcept;
    /// What could be used.
    const std::string& GetExpected() const noexcept;
};

/// A file or a device failed; the classes below say which.
class VETRA_EXPORT IOException : public Exception {
 protected:
    using Exception::Exception;
};

/// A device, or the system below it, failed.
class VETRA_EXPORT DeviceException : public IOException {
 public:
    /// \param sMessage   what went wrong
    /// \param sFile      source file that raises the failure, or empty
    /// \param sFunction  signature of the function that raises it, or empty
    /// \param nLine      line in that file, or 0
    DeviceException(const std::string& sMessage, const std::string& sFile,
                    const std::string& sFunction, std::uint32_t nLine);
};

/// An operation on a file or a directory failed.
class VETRA_EXPORT FileException : public IOException {
 public:
    /// The file or directory that the operation was about.
    const std::string& GetFileName() const noexcept;

 protected:
    using IOException::IOException;
};

/// A file is there, or should be, and can't be read or deleted.
class VETRA_EXPORT FileAccessException : public FileException {
 public:
    /// What could not be done with the file.
    enum Type : int {
        eCannotRead = 1,    ///< opening or reading
        eCannotDelete = 8,  ///< deleting
    };

    /// \param sFileName  the file or directory
    /// \param eType      what could not be done
    /// \param sMessage   what went wrong
    /// \param sFile      source file that raises the failure, or empty
    /// \param sFunction  signature of the function that raises it, or empty
    /// \param nLine      line in that file, or 0
    FileAccessException(const std::string& sFileName, const Type& eType,
                        const std::string& sMessage, const std::string& sFile,
                        const std::string& sFunction, std::uint32_t nLine);

    /// What could not be done with the file.
    Type GetType() const noexcept;
};

/// There is no file or directory under a name.
class VETRA_EXPORT FileNotFoundException : public FileException {
 public:
    /// \param sFileName  the name
    /// \param sMessage   what went wrong
    /// \param sFile      source file that raises the failure, or empty
    /// \param sFunction  signature of the function that raises it, or empty
    /// \param nLine      line in that file, or 0
    FileNotFoundException(const std::string& sFileName, const std::string& sMessage,
                          const std::string& sFile, const std::string& sFunction,
                          std::uint32_t nLine);
};

}  // namespace vetra

#endif  // VETRA_FAULTCORE_EXCEPTIONS_H
