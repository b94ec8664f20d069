#include "ImmervisionLibrary.h"

VendorLibrary<ImmervisionFunctions> ImmervisionLibraryInstance;

// libIMV1 is a C++ class and the plug-in does not link it, so its members are found by their
// Itanium ABI names. A non-virtual member receives the object as a hidden first argument on every
// Linux compiler, so calling the symbol as a plain function with the object first is the very call
// a linked caller makes. C1 and D1 are the complete-object constructor and destructor. The first
// missing name ends the binding: the table is then thrown away whole.
bool ImmervisionFunctions::Bind(SharedLibrary const& library) {
    return library.Bind("_ZN19IMV_CameraInterfaceC1Ev", Construct) &&
           library.Bind("_ZN19IMV_CameraInterfaceD1Ev", Destroy) &&
           library.Bind("_ZN19IMV_CameraInterface24StaticGetLensDescriptionEv",
                        StaticGetLensDescription) &&
           library.Bind("_ZN19IMV_CameraInterface29StaticGetLensDescriptionCountEv",
                        StaticGetLensDescriptionCount) &&
           library.Bind("_ZN19IMV_CameraInterface7SetLensEPc", SetLens) &&
           library.Bind("_ZN19IMV_CameraInterface14SetVideoParamsEP10IMV_BufferS1_mmm",
                        SetVideoParams) &&
           library.Bind("_ZN19IMV_CameraInterface13SetZoomLimitsEff", SetZoomLimits) &&
           library.Bind("_ZN19IMV_CameraInterface11SetPositionEPfS0_S0_mm", SetPosition) &&
           library.Bind("_ZN19IMV_CameraInterface6UpdateEv", Update) &&
           library.Bind("_ZN19IMV_CameraInterface14GetErrorStringEi", GetErrorString);
}
