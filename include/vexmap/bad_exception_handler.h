#pragma once

#include <exception>

namespace quorvel::vexmap {

/// The guard of each inner function of the call surface: an `Error` or another `std::exception`
/// passes, and anything else thrown is described in the log by its type and leaves as a
/// `std::bad_exception`, which the outer function turns into a result. The guard changes no
/// process-wide state, so guarded calls on several threads do not disturb each other.
class BadExceptionHandler {
public:
    BadExceptionHandler();
    BadExceptionHandler(BadExceptionHandler const& other);
    BadExceptionHandler& operator=(BadExceptionHandler const& other);  // copies nothing
    virtual ~BadExceptionHandler();

    template <typename Inner>
    static auto Run(Inner&& inner) -> decltype(inner()) {
        try {
            return inner();
        } catch (std::exception const&) {
            throw;
        } catch (...) {
            UnexpectedHandler();
        }
    }

    /// Called inside a handler: logs the exception in flight by the first type it matches, then
    /// throws `std::bad_exception` in its place.
    [[noreturn]] static void UnexpectedHandler();
};

}  // namespace quorvel::vexmap
