#pragma once

#include "SharedLibrary.h"
#include "VendorLibrary.h"
#include "vendor/fisheyesw.h"

/// The five functions of libfisheyesw that `VivotekDewarper` calls, bound at run time.
struct VivotekFunctions {
    static constexpr char const* FILE_NAME = "libfisheyesw.so.3";

    decltype(&::Fisheye_Initial) Fisheye_Initial;
    decltype(&::Fisheye_Release) Fisheye_Release;
    decltype(&::Fisheye_SetModelName) Fisheye_SetModelName;
    decltype(&::Fisheye_SetOption) Fisheye_SetOption;
    decltype(&::Fisheye_OneFrame) Fisheye_OneFrame;

    /// True when every function was found.
    bool Bind(SharedLibrary const& library);
};

/// The one libfisheyesw of the process, shared by every Vivotek dewarper.
extern VendorLibrary<VivotekFunctions> VivotekLibraryInstance;
