#include "vexmap/error.h"

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <memory>

#include "vexmap/log.h"

namespace quorvel::vexmap {
namespace {

constexpr char const* UNKNOWN_SYMBOL = "<UNKNOWN SYMBOL>";

struct SymbolRow {
    int value;         // the code of the name on this platform
    char const* name;  // null for a row without a name
};

constexpr SymbolRow NO_NAME{0, nullptr};

// The 102 rows of the table, in the numbering in which row n names the code n. On this platform
// the codes of the names differ, so each row carries the value its name has here and the lookup
// goes by value. Row 65 names its code with the empty string.
constexpr SymbolRow SYMBOLS[102] = {
    {EPERM, "EPERM"},
    {ENOENT, "ENOENT"},
    {ESRCH, "ESRCH"},
    {EINTR, "EINTR"},
    {EIO, "EIO"},
    {ENXIO, "ENXIO"},
    {E2BIG, "E2BIG"},
    {ENOEXEC, "ENOEXEC"},
    {EBADF, "EBADF"},
    {ECHILD, "ECHILD"},
    {EDEADLK, "EDEADLK"},
    {ENOMEM, "ENOMEM"},
    {EACCES, "EACCES"},
    {EFAULT, "EFAULT"},
    {ENOTBLK, "ENOTBLK"},
    {EBUSY, "EBUSY"},
    {EEXIST, "EEXIST"},
    {EXDEV, "EXDEV"},
    {ENODEV, "ENODEV"},
    {ENOTDIR, "ENOTDIR"},
    {EISDIR, "EISDIR"},
    {EINVAL, "EINVAL"},
    {ENFILE, "ENFILE"},
    {EMFILE, "EMFILE"},
    {ENOTTY, "ENOTTY"},
    {ETXTBSY, "ETXTBSY"},
    {EFBIG, "EFBIG"},
    {ENOSPC, "ENOSPC"},
    {ESPIPE, "ESPIPE"},
    {EROFS, "EROFS"},
    {EMLINK, "EMLINK"},
    {EPIPE, "EPIPE"},
    {EDOM, "EDOM"},
    {ERANGE, "ERANGE"},
    {EAGAIN, "EAGAIN"},
    {EINPROGRESS, "EINPROGRESS"},
    {EALREADY, "EALREADY"},
    {ENOTSOCK, "ENOTSOCK"},
    {EDESTADDRREQ, "EDESTADDRREQ"},
    {EMSGSIZE, "EMSGSIZE"},
    {EPROTOTYPE, "EPROTOTYPE"},
    {ENOPROTOOPT, "ENOPROTOOPT"},
    {EPROTONOSUPPORT, "EPROTONOSUPPORT"},
    {ESOCKTNOSUPPORT, "ESOCKTNOSUPPORT"},
    {ENOTSUP, "ENOTSUP"},
    {EPFNOSUPPORT, "EPFNOSUPPORT"},
    {EAFNOSUPPORT, "EAFNOSUPPORT"},
    {EADDRINUSE, "EADDRINUSE"},
    {EADDRNOTAVAIL, "EADDRNOTAVAIL"},
    {ENETDOWN, "ENETDOWN"},
    {ENETUNREACH, "ENETUNREACH"},
    {ENETRESET, "ENETRESET"},
    {ECONNABORTED, "ECONNABORTED"},
    {ECONNRESET, "ECONNRESET"},
    {ENOBUFS, "ENOBUFS"},
    {EISCONN, "EISCONN"},
    {ENOTCONN, "ENOTCONN"},
    {ESHUTDOWN, "ESHUTDOWN"},
    NO_NAME,  // 59
    {ETIMEDOUT, "ETIMEDOUT"},
    {ECONNREFUSED, "ECONNREFUSED"},
    {ELOOP, "ELOOP"},
    {ENAMETOOLONG, "ENAMETOOLONG"},
    {EHOSTDOWN, "EHOSTDOWN"},
    {EHOSTUNREACH, ""},  // 65
    {ENOTEMPTY, "ENOTEMPTY"},
    NO_NAME,  // 67
    {EUSERS, "EUSERS"},
    {EDQUOT, "EDQUOT"},
    {ESTALE, "ESTALE"},
    {EREMOTE, "EREMOTE"},
    NO_NAME,  // 72
    NO_NAME,
    NO_NAME,
    NO_NAME,
    NO_NAME,  // 76
    {ENOLCK, "ENOLCK"},
    {ENOSYS, "ENOSYS"},
    NO_NAME,  // 79
    NO_NAME,
    NO_NAME,
    NO_NAME,
    NO_NAME,  // 83
    {EOVERFLOW, "EOVERFLOW"},
    NO_NAME,  // 85
    NO_NAME,
    NO_NAME,
    NO_NAME,  // 88
    {ECANCELED, "ECANCELED"},
    {EIDRM, "EIDRM"},
    {ENOMSG, "ENOMSG"},
    {EILSEQ, "EILSEQ"},
    NO_NAME,  // 93
    {EBADMSG, "EBADMSG"},
    {EMULTIHOP, "EMULTIHOP"},
    {ENODATA, "ENODATA"},
    {ENOLINK, "ENOLINK"},
    {ENOSR, "ENOSR"},
    {ENOSTR, "ENOSTR"},
    {EPROTO, "EPROTO"},
    {ETIME, "ETIME"},
    {EOPNOTSUPP, "EOPNOTSUPP"},
};

std::string Bracketed(std::string const& code_text) {
    return "[" + code_text + "]";
}

}  // namespace

Error::Error() = default;

Error::Error(Error const& other) = default;

Error::Error(CodeLocation const& location, int code) : m_sText(FormatMessage(location, code)) {}

Error::Error(CodeLocation const& location, char const* format, ...) {
    va_list arguments;
    va_start(arguments, format);
    m_sText = FormatMessage(location, format, arguments);
    va_end(arguments);
}

Error::Error(CodeLocation const& location, char const* format, va_list arguments)
    : m_sText(FormatMessage(location, format, arguments)) {}

Error::Error(CodeLocation const& location, int code, char const* format, ...) {
    va_list arguments;
    va_start(arguments, format);
    m_sText = FormatMessage(location, code, format, arguments);
    va_end(arguments);
}

Error::Error(CodeLocation const& location, int code, char const* format, va_list arguments)
    : m_sText(FormatMessage(location, code, format, arguments)) {}

Error::Error(int code, char const* format, ...) {
    va_list arguments;
    va_start(arguments, format);
    m_sText = FormatMessage(code, format, arguments);
    va_end(arguments);
}

Error::Error(int code, char const* format, va_list arguments)
    : m_sText(FormatMessage(code, format, arguments)) {}

Error::Error(char const* format, ...) {
    va_list arguments;
    va_start(arguments, format);
    m_sText = FormatMessage(format, arguments);
    va_end(arguments);
}

Error::Error(char const* format, va_list arguments) : m_sText(FormatMessage(format, arguments)) {}

Error& Error::operator=(Error const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "Error::operator=", "Self assignment of %s object\n",
                  "Error");
        return *this;
    }
    m_sText = other.m_sText;
    return *this;
}

Error::~Error() = default;

char const* Error::what() const noexcept {
    return m_sText.c_str();
}

std::string Error::Description(int) const {
    return std::string();
}

// Searched from the end: where two names share a value here (ENOTSUP and EOPNOTSUPP), the later
// row, the name the C library itself reports, wins.
std::string Error::Symbol(int code) const {
    if (code > 0) {
        for (auto row = std::rbegin(SYMBOLS); row != std::rend(SYMBOLS); ++row) {
            if (row->name != nullptr && row->value == code) {
                return row->name;
            }
        }
    }
    return UNKNOWN_SYMBOL;
}

std::string Error::FormatError(int code) const {
    std::string const symbol = Symbol(code);
    std::string const description = Description(code);
    std::string const number = std::to_string(code);
    if (!symbol.empty()) {
        std::string const named = "Error " + symbol + " (" + number + ")";
        return description.empty() ? named : named + " " + description;
    }
    return description.empty() ? std::string() : "Error (" + number + ") " + description;
}

std::string Error::FormatMessage(CodeLocation const& location, int code) const {
    return "(" + location.Text() + ") " + Bracketed(FormatError(code));
}

std::string Error::FormatMessage(CodeLocation const& location, char const* format,
                                 va_list arguments) const {
    return "(" + location.Text() + ") - " + FormatMessage(format, arguments);
}

std::string Error::FormatMessage(CodeLocation const& location, int code, char const* format,
                                 va_list arguments) const {
    return FormatMessage(location, code) + " - " + FormatMessage(format, arguments);
}

std::string Error::FormatMessage(int code, char const* format, va_list arguments) const {
    return Bracketed(FormatError(code)) + " - " + FormatMessage(format, arguments);
}

std::string Error::FormatMessage(char const* format, ...) {
    va_list arguments;
    va_start(arguments, format);
    std::string text = FormatMessage(format, arguments);
    va_end(arguments);
    return text;
}

// Each pass expands a copy of the arguments, so a second pass after growing the buffer sees them
// from the start.
std::string Error::FormatMessage(char const* format, va_list arguments) {
    if (format == nullptr) {
        return std::string();
    }
    std::size_t size = 256;
    std::unique_ptr<char, decltype(&free)> buffer(static_cast<char*>(malloc(size)), &free);
    while (buffer != nullptr) {
        va_list pass;
        va_copy(pass, arguments);
        int const written = vsnprintf(buffer.get(), size, format, pass);
        va_end(pass);
        if (written < 0) {
            break;
        }
        if (std::size_t(written) < size) {
            return std::string(buffer.get(), std::size_t(written));
        }
        size = std::size_t(written) + 1;
        char* const grown = static_cast<char*>(realloc(buffer.get(), size));
        if (grown == nullptr) {
            break;
        }
        buffer.release();
        buffer.reset(grown);
    }
    return std::string();
}

void Error::SetLastError(int code) {
    errno = code;
}

std::ostream& operator<<(std::ostream& stream, Error const& error) {
    return stream << error.what();
}

}  // namespace quorvel::vexmap
