#pragma once

// Control of the libIMV1 stand-in from the tests that link it: what the library was asked, and
// what it answers next.

#include <string>
#include <vector>

#include "vendor/IMV_CameraInterface.h"

namespace imv1_standin {

/// One call into the library as it arrived. Only the fields of the call's own arguments are set.
struct Call {
    std::string function;          // the member's name; "~IMV_CameraInterface" for the destructor
    void const* object = nullptr;  // `this`; null for the two static functions
    char const* rpl = nullptr;     // SetLens: the pointer passed
    IMV_Buffer input{};   // SetVideoParams and Update: the input record as it was at the call
    IMV_Buffer output{};  // the same for the output record
    IMV_Buffer const* inputAddress = nullptr;  // SetVideoParams: the records' addresses
    IMV_Buffer const* outputAddress = nullptr;
    unsigned long colorFormat = 0;
    unsigned long viewType = 0;
    unsigned long position = 0;
    float min = 0.0f;  // SetZoomLimits
    float max = 0.0f;
    float pan = 0.0f;  // SetPosition: the values read through the pointers
    float tilt = 0.0f;
    float zoom = 0.0f;
    unsigned long fourth = 0;  // SetPosition: the two trailing arguments
    unsigned long fifth = 0;
    int code = 0;  // GetErrorString
};

/// Forgets the calls, the results, the write-back and any lens list a test set. Live objects stay.
void Reset();

/// Forgets the calls only.
void ClearCalls();

std::vector<Call> const& Calls();
std::vector<std::string> CallNames();

/// Every later call of the member `function` returns `code` and does nothing else; 0 restores it.
void SetResult(std::string const& function, int code);

/// Every later successful SetPosition writes these values back through its three pointers.
void WriteBackPosition(float pan, float tilt, float zoom);

/// Replaces the lens list with these RPL numbers, null ones included; the strings must outlive
/// the list. The default list is "A8TRT", null, "B5SST", "C7SST", "C8WWT", "D2SST".
void SetLenses(std::vector<char const*> const& rplNumbers);

/// Camera objects constructed and not yet destroyed.
int LiveObjects();

}  // namespace imv1_standin
