#include "DewarpWrapper.h"

#include "DewarperRegistry.h"

IDewarper::~IDewarper() = default;

IDewarpRegister::~IDewarpRegister() = default;

IDewarpRegister* GetRegister() {
    return &DewarperRegistryInstance;
}

IDewarper* CreateDewarper(int type, DewarpParams_t const& params) {
    return DewarperRegistryInstance.LoadAndCreate(type, params);
}

bool DewarperLoaded(int type) {
    return DewarperRegistryInstance.IsLoaded(type);
}

void DeleteDewarper(IDewarper* dewarper) {
    delete dewarper;
}
