#pragma once

#include <string>

#include "host_interfaces.h"

namespace vexmap_host {

/// The plug-in opened with dlopen and its four exported functions, as a client holds them. Closes
/// the library on destruction; dewarpers made through it must be deleted before that.
class PluginHost {
public:
    explicit PluginHost(std::string const& path);  // throws ToolError if it cannot be opened
    PluginHost(PluginHost const&) = delete;
    PluginHost& operator=(PluginHost const&) = delete;
    virtual ~PluginHost();

    DewarpRegister& Register() const { return *registry; }
    Dewarper* CreateDewarper(int mode, DewarpParams const& params) const;
    bool DewarperLoaded(int mode) const;
    void DeleteDewarper(Dewarper* dewarper) const;

private:
    void* library;
    DewarpRegister* registry;
    CreateDewarperFunction create;
    DewarperLoadedFunction loaded;
    DeleteDewarperFunction destroy;
};

}  // namespace vexmap_host
