#include "VivotekLibrary.h"

VendorLibrary<VivotekFunctions> VivotekLibraryInstance;

// The first missing name ends the binding: the table is then thrown away whole.
bool VivotekFunctions::Bind(SharedLibrary const& library) {
    return library.Bind("Fisheye_Initial", Fisheye_Initial) &&
           library.Bind("Fisheye_Release", Fisheye_Release) &&
           library.Bind("Fisheye_SetModelName", Fisheye_SetModelName) &&
           library.Bind("Fisheye_SetOption", Fisheye_SetOption) &&
           library.Bind("Fisheye_OneFrame", Fisheye_OneFrame);
}
