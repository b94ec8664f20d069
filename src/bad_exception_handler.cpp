#include "vexmap/bad_exception_handler.h"

#include <string>

#include "vexmap/log.h"

namespace quorvel::vexmap {
namespace {

// Every line of the table goes through here, so each arm names only its format and argument.
template <typename... Arguments>
void Describe(char const* format, Arguments... arguments) {
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wformat-security"
#pragma GCC diagnostic ignored "-Wformat-nonliteral"
    Log::err(__LINE__, __FILE__, "UnexpectedHandler", format, arguments...);
#pragma GCC diagnostic pop
}

void const* Address(void const* pointer) {
    return pointer;
}

}  // namespace

BadExceptionHandler::BadExceptionHandler() = default;

BadExceptionHandler::BadExceptionHandler(BadExceptionHandler const&) = default;

BadExceptionHandler& BadExceptionHandler::operator=(BadExceptionHandler const&) {
    return *this;
}

BadExceptionHandler::~BadExceptionHandler() = default;

// The arms are tried in order; the words are the log's own, the unsigned short pointer's line
// without "pointer" included.
void BadExceptionHandler::UnexpectedHandler() {
    try {
        throw;
    } catch (char value) {
        Describe("Caught unexpected char exception - %c\n", int(value));
    } catch (unsigned char value) {
        Describe("Caught unexpected char exception - 0x%02X\n", unsigned(value));
    } catch (short value) {
        Describe("Caught unexpected short integer exception - %d\n", int(value));
    } catch (unsigned short value) {
        Describe("Caught unexpected unsigned short integer exception - %u\n", unsigned(value));
    } catch (int value) {
        Describe("Caught unexpected integer exception - %d\n", value);
    } catch (unsigned int value) {
        Describe("Caught unexpected unsigned integer exception - %u\n", value);
    } catch (long value) {
        Describe("Caught unexpected long integer exception - %ld\n", value);
    } catch (unsigned long value) {
        Describe("Caught unexpected unsigned long integer exception - %lu\n", value);
    } catch (long long value) {
        Describe("Caught unexpected long-long integer exception - %lld\n", value);
    } catch (unsigned long long value) {
        Describe("Caught unexpected unsigned long-long integer exception - %llu\n", value);
    } catch (char const* value) {
        Describe("Caught unexpected char pointer exception - %p\n", Address(value));
    } catch (unsigned char const* value) {
        Describe("Caught unexpected unsigned char pointer exception - %p\n", Address(value));
    } catch (short const* value) {
        Describe("Caught unexpected short integer pointer exception - %p\n", Address(value));
    } catch (unsigned short const* value) {
        Describe("Caught unexpected unsigned short integer exception - %p\n", Address(value));
    } catch (int const* value) {
        Describe("Caught unexpected integer pointer exception - %p\n", Address(value));
    } catch (unsigned int const* value) {
        Describe("Caught unexpected unsigned integer pointer exception - %p\n", Address(value));
    } catch (long const* value) {
        Describe("Caught unexpected long integer pointer exception - %p\n", Address(value));
    } catch (unsigned long const* value) {
        Describe("Caught unexpected unsigned long integer pointer exception - %p\n",
                 Address(value));
    } catch (long long const* value) {
        Describe("Caught unexpected long-long integer pointer exception - %p\n", Address(value));
    } catch (unsigned long long const* value) {
        Describe("Caught unexpected unsigned long-long integer pointer exception - %p\n",
                 Address(value));
    } catch (float value) {
        Describe("Caught unexpected float exception - %f\n", double(value));
    } catch (double value) {
        Describe("Caught unexpected double exception - %f\n", value);
    } catch (long double value) {
        Describe("Caught unexpected long-double exception - %Lf\n", value);
    } catch (float const* value) {
        Describe("Caught unexpected float pointer exception - %p\n", Address(value));
    } catch (double const* value) {
        Describe("Caught unexpected double pointer exception - %p\n", Address(value));
    } catch (long double const* value) {
        Describe("Caught unexpected long-double pointer exception - %p\n", Address(value));
    } catch (void const* value) {
        Describe("Caught unexpected void pointer exception - %p\n", value);
    } catch (std::string const& value) {
        Describe("Caught unexpected string exception - %s\n", value.c_str());
    } catch (std::exception const& value) {
        Describe("Caught unexpected standard exception - %s\n", value.what());
    } catch (...) {
        Describe("Caught unexpected exception\n");
    }
    throw std::bad_exception();
}

}  // namespace quorvel::vexmap
