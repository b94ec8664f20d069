#pragma once

// Control of the libfisheyesw stand-in from the tests that link it: what the library was asked,
// and what it answers next.

#include <string>
#include <vector>

#include "vendor/fisheyesw.h"

namespace fisheyesw_standin {

/// One call into the library as it arrived. Only the fields of the call's own arguments are set.
struct Call {
    std::string function;
    void* handle = nullptr;  // the object; for Fisheye_Initial the one it made, if any
    void* const* handleAddress = nullptr;  // Fisheye_Initial and Fisheye_Release
    unsigned int version = 0;              // Fisheye_Initial
    char const* namePointer = nullptr;     // Fisheye_SetModelName
    std::string name;
    Fisheye_Option option{};  // Fisheye_SetOption: the whole record as passed
};

/// Forgets the calls and the results. Live objects stay.
void Reset();

/// Forgets the calls only.
void ClearCalls();

std::vector<Call> const& Calls();
std::vector<std::string> CallNames();

/// The records of the Fisheye_SetOption calls, in order.
std::vector<Fisheye_Option> Options();

/// Every later call of `function` returns `code` and does nothing else; 0 restores it.
void SetResult(std::string const& function, int code);

/// Objects made by Fisheye_Initial and not yet released.
int LiveObjects();

}  // namespace fisheyesw_standin
