#include "DewarperRegistry.h"

#include <cstring>
#include <new>
#include <type_traits>

#include "BrenviaDewarper.h"
#include "CameraTable.h"
#include "GeoFisheyeLibrary.h"
#include "GeovisionDewarper.h"
#include "ImmervisionDewarper.h"
#include "ImmervisionLibrary.h"
#include "Sentry360Dewarper.h"
#include "VivotekDewarper.h"
#include "VivotekLibrary.h"

namespace {

// The vendors' Linux libraries are x86-64 builds against glibc, which needs a kernel of 3.2 or
// later; below that their libraries cannot exist, and the kinds that need them are not offered.
constexpr OperatingSystemVersion IMMERVISION_MINIMUM = {3, 2};
constexpr OperatingSystemVersion VIVOTEK_MINIMUM = {3, 2};

// What a kind opens before its first dewarper: nothing for the kinds whose code is all in the
// plug-in, the vendor's library for the others.
template <typename T>
struct KindLibrary {
    static bool Acquire() { return true; }
    static void Release() {}
};

template <typename Functions, VendorLibrary<Functions>& library>
struct VendorKindLibrary {
    static bool Acquire() { return library.Acquire(); }
    static void Release() { library.Release(); }
};

template <>
struct KindLibrary<ImmervisionDewarper>
    : VendorKindLibrary<ImmervisionFunctions, ImmervisionLibraryInstance> {};
template <>
struct KindLibrary<VivotekDewarper> : VendorKindLibrary<VivotekFunctions, VivotekLibraryInstance> {
};
template <>
struct KindLibrary<GeovisionDewarper>
    : VendorKindLibrary<GeoFisheyeFunctions, GeoFisheyeLibraryInstance> {};

}  // namespace

DewarperRegistry DewarperRegistryInstance;

DewarperRegistry::DewarpInfo::DewarpInfo()
    : dll(nullptr),
      name(""),
      hasPosition(false),
      hasLenses(false),
      hasCircle(false),
      cameraSpecific(false),
      loaded(false) {}

DewarperRegistry::DewarpInfo::DewarpInfo(DewarpInfo const& other) = default;

DewarperRegistry::DewarpInfo& DewarperRegistry::DewarpInfo::operator=(DewarpInfo const& other) =
    default;

DewarperRegistry::DewarpInfo::~DewarpInfo() = default;

template <typename T>
void DewarperRegistry::Register(char const* dll, char const* name, bool hasPosition, bool hasLenses,
                                bool hasCircle, bool cameraSpecific,
                                DewarperType::DewarperTypes type) {
    class DewarpInfoT : public DewarpInfo {
    public:
        IDewarper* Create(DewarpParams_t const& params) override {
            return new (std::nothrow) T(params);
        }
        // A vendor kind opens its library here, on demand, and holds one reference to it until
        // unloaded (see VendorLibrary): without the library the kind is listed but not loaded,
        // and no dewarper of it is made.
        bool DelayLoad() override {
            if (!holdsLibrary) {
                holdsLibrary = KindLibrary<T>::Acquire();
            }
            return holdsLibrary;
        }
        void DelayUnload() override { ReleaseLibrary(); }
        void ForceUnload() override { ReleaseLibrary(); }
        int GetDefaultLens(int mode, char const* make, char const* model) override {
            if constexpr (std::is_same_v<T, ImmervisionDewarper>) {
                // The default is found in the library's lens list, so a host that asks before
                // it asked whether the kind is loaded gets the library opened here.
                if (!DelayLoad()) {
                    return 0;
                }
                return ImmervisionDewarper::GetDefaultLens(mode, make, model);
            } else {
                return 0;
            }
        }

    private:
        void ReleaseLibrary() {
            if (holdsLibrary) {
                KindLibrary<T>::Release();
                holdsLibrary = false;
            }
        }

        bool holdsLibrary = false;
    };
    DewarpInfo* const info = new DewarpInfoT;
    info->dll = dll;
    info->name = name;
    info->hasPosition = hasPosition;
    info->hasLenses = hasLenses;
    info->hasCircle = hasCircle;
    info->cameraSpecific = cameraSpecific;
    info->loaded = false;
    kinds[type] = info;
}

DewarperRegistry::DewarperRegistry() : DewarperRegistry(OperatingSystemVersion::Running) {}

// The version is read once for each gate, as the gates are independent.
DewarperRegistry::DewarperRegistry(OperatingSystemVersion (*readVersion)()) {
    Register<Sentry360Dewarper>("360API.dll", "Sentry360", true, false, true, true,
                                DewarperType::DewarperSentry360);
    OperatingSystemVersion version = readVersion();
    if (version.AtLeast(IMMERVISION_MINIMUM.major, IMMERVISION_MINIMUM.minor)) {
        Register<ImmervisionDewarper>("IMV1.dll", "ImmerVision", true, true, false, false,
                                      DewarperType::DewarperImmervision);
        Register<ImmervisionDewarper>("IMV1.dll", "Samsung", true, true, false, true,
                                      DewarperType::DewarperSamsung);
    }
    version = readVersion();
    if (version.AtLeast(VIVOTEK_MINIMUM.major, VIVOTEK_MINIMUM.minor)) {
        Register<VivotekDewarper>("fisheyesw.dll", "Vivotek", true, true, false, true,
                                  DewarperType::DewarperVivotek);
    }
    Register<GeovisionDewarper>("GeoFESDK.dll", "Geovision", true, false, false, true,
                                DewarperType::DewarperGeovision);
    Register<BrenviaDewarper>(nullptr, "Brenvia", true, false, false, true,
                              DewarperType::DewarperBrenvia);
}

DewarperRegistry::~DewarperRegistry() {
    for (auto const& entry : lensDewarpers) {
        delete entry.second;
    }
    for (auto const& entry : kinds) {
        entry.second->DelayUnload();
    }
    for (auto const& entry : kinds) {
        entry.second->ForceUnload();
        delete entry.second;
    }
    lensDewarpers.clear();
    kinds.clear();
}

DewarperRegistry::DewarpInfo* DewarperRegistry::Find(int mode) const {
    auto const found = kinds.find(mode);
    return found == kinds.end() ? nullptr : found->second;
}

bool DewarperRegistry::IsCameraSpecific(int mode) {
    DewarpInfo const* const info = Find(mode);
    return info != nullptr && info->cameraSpecific;
}

void DewarperRegistry::GetSupportedFeatures(int mode, bool& hasLenses, bool& hasCircle,
                                            bool& hasPosition) {
    DewarpInfo const* const info = Find(mode);
    hasLenses = info != nullptr && info->hasLenses;
    hasCircle = info != nullptr && info->hasCircle;
    hasPosition = info != nullptr && info->hasPosition;
}

// A failed load is not remembered, so the next call tries again.
bool DewarperRegistry::IsLoaded(int mode) {
    DewarpInfo* const info = Find(mode);
    if (info == nullptr) {
        return false;
    }
    if (!info->loaded) {
        info->loaded = info->DelayLoad();
    }
    return info->loaded;
}

char const* DewarperRegistry::GetName(int mode) {
    DewarpInfo const* const info = Find(mode);
    return info == nullptr ? "" : info->name;
}

// The lens list is an operation of a dewarper, so one hidden dewarper per kind is kept to answer
// it. It never sees a frame.
int DewarperRegistry::GetLens(int mode, int lens, char* buffer, unsigned long size) {
    DewarpInfo const* const info = Find(mode);
    if (info == nullptr || !info->hasLenses) {
        return 0;
    }
    try {
        IDewarper*& dewarper = lensDewarpers[mode];
        if (dewarper == nullptr) {
            DewarpParams_t const params;
            dewarper = CreateDewarper(mode, params);
            if (dewarper == nullptr) {
                return 0;
            }
        }
        return dewarper->GetLens(lens, buffer, size);
    } catch (std::bad_alloc const&) {
        return 0;  // the map could not grow; nothing may leave the library
    }
}

int DewarperRegistry::GetModeCount() {
    return MODE_COUNT;
}

int DewarperRegistry::GetModeByName(char const* name) {
    if (name == nullptr) {
        return DewarperType::DewarperNone;
    }
    for (auto const& entry : kinds) {
        if (strcmp(entry.second->name, name) == 0) {
            return entry.first;
        }
    }
    return DewarperType::DewarperNone;
}

int DewarperRegistry::GetModeByCamera(char const* make, char const* model, char const* url) {
    return CameraTable::ModeOf(make, model, url);
}

int DewarperRegistry::GetDefaultLens(int mode, char const* make, char const* model) {
    DewarpInfo* const info = Find(mode);
    return info == nullptr ? 0 : info->GetDefaultLens(mode, make, model);
}

IDewarper* DewarperRegistry::Create(DewarperType::DewarperTypes type,
                                    DewarpParams_t const& params) {
    DewarpInfo* const info = Find(type);
    if (info == nullptr) {
        return nullptr;
    }
    IDewarper* const dewarper = info->Create(params);
    if (dewarper != nullptr) {
        dewarper->SetDewarperType(type);
    }
    return dewarper;
}

IDewarper* DewarperRegistry::LoadAndCreate(int type, DewarpParams_t const& params) {
    DewarpInfo* const info = Find(type);
    if (info == nullptr) {
        return nullptr;
    }
    if (!info->loaded) {
        info->loaded = info->DelayLoad();
        if (!info->loaded) {
            return nullptr;
        }
    }
    return Create(static_cast<DewarperType::DewarperTypes>(type), params);
}
