#include "plugin_host.h"

#include <dlfcn.h>

#include "tool_error.h"

namespace vexmap_host {
namespace {

template <typename Function>
Function Resolve(void* library, char const* name) {
    void* const symbol = dlsym(library, name);
    if (symbol == nullptr) {
        dlclose(library);
        throw ToolError(std::string("the plug-in does not export ") + name);
    }
    return reinterpret_cast<Function>(symbol);
}

}  // namespace

PluginHost::PluginHost(std::string const& path)
    : library(dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL)),
      registry(nullptr),
      create(nullptr),
      loaded(nullptr),
      destroy(nullptr) {
    if (library == nullptr) {
        char const* const reason = dlerror();
        throw ToolError("cannot load the plug-in " + path + ": " +
                        (reason != nullptr ? reason : "unknown reason"));
    }
    registry = Resolve<GetRegisterFunction>(library, "GetRegister")();
    create = Resolve<CreateDewarperFunction>(library, "CreateDewarper");
    loaded = Resolve<DewarperLoadedFunction>(library, "DewarperLoaded");
    destroy = Resolve<DeleteDewarperFunction>(library, "DeleteDewarper");
}

PluginHost::~PluginHost() {
    dlclose(library);
}

Dewarper* PluginHost::CreateDewarper(int mode, DewarpParams const& params) const {
    return create(mode, params);
}

bool PluginHost::DewarperLoaded(int mode) const {
    return loaded(mode);
}

void PluginHost::DeleteDewarper(Dewarper* dewarper) const {
    destroy(dewarper);
}

}  // namespace vexmap_host
