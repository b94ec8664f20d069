#include "GeoFisheyeDLL.h"

#include <new>

#include "GeoFisheyeAdapter.h"
#include "GeoFisheyeLibrary.h"

// An absent library shows here, as no adapter, so that no caller reaches into it.
IFishEye* IFishEye_Create() {
    if (!GeoFisheyeLibraryInstance.IsOpen()) {
        return nullptr;
    }
    return new (std::nothrow) GeoFisheyeAdapter;
}

bool IFishEye_Release(IFishEye* fishEye) {
    delete fishEye;
    return true;
}
