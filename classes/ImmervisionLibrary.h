#pragma once

#include "SharedLibrary.h"
#include "VendorLibrary.h"
#include "vendor/IMV_CameraInterface.h"

/// The type of a non-static member function of `C` as the C++ ABI calls it: a plain function
/// whose first argument is the object.
template <typename Member>
struct ThisFirst;

template <typename R, typename C, typename... A>
struct ThisFirst<R (C::*)(A...)> {
    using Type = R (*)(C*, A...);
};

template <typename Member>
using ThisFirstFunction = typename ThisFirst<Member>::Type;

/// The entry points of libIMV1 that `ImmervisionDewarper` calls, bound at run time by their
/// mangled names. Members take the object first; the constructor and destructor are the
/// complete-object ones, which build and tear down an object in storage the caller owns.
struct ImmervisionFunctions {
    static constexpr char const* FILE_NAME = "libIMV1.so.2";

    using Constructor = void (*)(IMV_CameraInterface*);
    using Destructor = void (*)(IMV_CameraInterface*);

    Constructor Construct;
    Destructor Destroy;
    decltype(&IMV_CameraInterface::StaticGetLensDescription) StaticGetLensDescription;
    decltype(&IMV_CameraInterface::StaticGetLensDescriptionCount) StaticGetLensDescriptionCount;
    ThisFirstFunction<decltype(&IMV_CameraInterface::SetLens)> SetLens;
    ThisFirstFunction<decltype(&IMV_CameraInterface::SetVideoParams)> SetVideoParams;
    ThisFirstFunction<decltype(&IMV_CameraInterface::SetZoomLimits)> SetZoomLimits;
    ThisFirstFunction<decltype(&IMV_CameraInterface::SetPosition)> SetPosition;
    ThisFirstFunction<decltype(&IMV_CameraInterface::Update)> Update;
    ThisFirstFunction<decltype(&IMV_CameraInterface::GetErrorString)> GetErrorString;

    /// True when every entry point was found.
    bool Bind(SharedLibrary const& library);
};

/// The one libIMV1 of the process, shared by every ImmerVision dewarper.
extern VendorLibrary<ImmervisionFunctions> ImmervisionLibraryInstance;
