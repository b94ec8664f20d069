#pragma once

#include <cstdarg>
#include <exception>
#include <ostream>
#include <string>

#include "vexmap/code_location.h"

namespace quorvel::vexmap {

/// The one exception of the engine: a finished text that tells where a failure arose, its errno
/// code by name and what went wrong, as in `(SetView@src/dewarp:985) [Error EINVAL (22)] - Invalid
/// view`. Thrown by value; a value, any thread.
class Error : public std::exception {
public:
    Error();  // an empty text
    Error(Error const& other);
    Error(CodeLocation const& location, int code);
    Error(CodeLocation const& location, char const* format, ...)
        __attribute__((format(printf, 3, 4)));
    Error(CodeLocation const& location, char const* format, va_list arguments);
    Error(CodeLocation const& location, int code, char const* format, ...)
        __attribute__((format(printf, 4, 5)));
    Error(CodeLocation const& location, int code, char const* format, va_list arguments);
    Error(int code, char const* format, ...) __attribute__((format(printf, 3, 4)));
    Error(int code, char const* format, va_list arguments);
    explicit Error(char const* format, ...) __attribute__((format(printf, 2, 3)));
    Error(char const* format, va_list arguments);
    Error& operator=(Error const& other);
    ~Error() override;

    char const* what() const noexcept override;
    /// Words about a code; this class has none for any code.
    virtual std::string Description(int code) const;
    /// The errno name of a code on this platform, "" for the one unnamed row, or
    /// "<UNKNOWN SYMBOL>".
    virtual std::string Symbol(int code) const;

    /// "Error NAME (code)", with the description behind it when there is one; "" when the code
    /// has neither.
    std::string FormatError(int code) const;

    std::string FormatMessage(CodeLocation const& location, int code) const;
    std::string FormatMessage(CodeLocation const& location, char const* format,
                              va_list arguments) const;
    std::string FormatMessage(CodeLocation const& location, int code, char const* format,
                              va_list arguments) const;
    std::string FormatMessage(int code, char const* format, va_list arguments) const;
    static std::string FormatMessage(char const* format, ...) __attribute__((format(printf, 1, 2)));
    /// printf expansion into a buffer that grows until the text fits; "" if memory runs out.
    static std::string FormatMessage(char const* format, va_list arguments);

    static void SetLastError(int code);

private:
    std::string m_sText;
};

std::ostream& operator<<(std::ostream& stream, Error const& error);

}  // namespace quorvel::vexmap
