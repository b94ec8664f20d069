#pragma once

#include "SharedLibrary.h"

/// A closed vendor library, opened on demand and shared by every user in the process.
///
/// The plug-in is not linked against the vendors' libraries: a host on a machine without them must
/// still load it, list every kind and use the in-house ones. So a vendor kind opens its library
/// when the registry first asks whether the kind is loaded, and resolves every function its
/// dewarper calls. A missing library or symbol makes the kind "not loaded", and the dewarper never
/// calls into a library that is not open.
///
/// `Functions` is the vendor's table of function pointers: a default-constructible aggregate with
/// `static constexpr char const* FILE_NAME` (the library's name on Linux) and
/// `bool Bind(SharedLibrary const&)`, true when every pointer was found.
///
/// Users take and drop references; the library closes with the last one. Not locked: the registry
/// that takes the references runs on one thread at a time, and dewarpers only read.
template <typename Functions>
class VendorLibrary {
public:
    constexpr VendorLibrary() noexcept : library(), functions(), users(0) {}
    VendorLibrary(VendorLibrary const&) = delete;
    VendorLibrary& operator=(VendorLibrary const&) = delete;

    /// Takes a reference, opening the library and binding its functions for the first one. False,
    /// and no reference taken, when the library or any of its functions is missing.
    bool Acquire(char const* fileName = Functions::FILE_NAME) {
        if (users == 0) {
            if (!library.Open(fileName)) {
                return false;
            }
            Functions bound{};
            if (!bound.Bind(library)) {
                library.Close();
                return false;
            }
            functions = bound;
        }
        ++users;
        return true;
    }

    /// Drops a reference; the last one closes the library. Nothing when none is held.
    void Release() {
        if (users == 0) {
            return;
        }
        --users;
        if (users == 0) {
            functions = Functions{};
            library.Close();
        }
    }

    bool IsOpen() const { return users > 0; }

    /// The bound functions; every pointer is null while the library is not open.
    Functions const& Api() const { return functions; }

private:
    SharedLibrary library;
    Functions functions;
    int users;
};
