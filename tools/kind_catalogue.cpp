#include "kind_catalogue.h"

#include <cstring>
#include <dlfcn.h>

#include "path_text.h"

namespace vexmap_host {
namespace {

// The plug-in says only that a kind is not loaded. Opening its library here, the way the plug-in
// does, gets the loader's own words: missing, not a library, or missing a library of its own.
std::string WhyNotLoaded(int mode) {
    std::string const file = KindCatalogue::LibraryOf(mode);
    if (file.empty()) {
        return "the plug-in cannot load it";
    }
    dlerror();
    void* const library = dlopen(file.c_str(), RTLD_LAZY | RTLD_LOCAL);
    if (library != nullptr) {
        dlclose(library);
        return "its library " + file + " loads but lacks what the plug-in calls";
    }
    char const* const error = dlerror();
    std::string const reason = error != nullptr ? error : "";
    if (reason.find("No such file or directory") != std::string::npos) {
        return "its library " + file + " is not installed";
    }
    return "its library " + file + " does not load: " + reason;
}

std::vector<std::string> LensNames(DewarpRegister& registry, int mode) {
    std::vector<std::string> names;
    for (int lens = 0;; ++lens) {
        char name[256] = {};
        if (registry.GetLens(mode, lens, name, sizeof name) <= 0) {
            return names;
        }
        names.emplace_back(name, strnlen(name, sizeof name));
    }
}

}  // namespace

KindCatalogue::KindCatalogue(PluginHost const& host) {
    DewarpRegister& registry = host.Register();
    for (int mode = 0; mode < registry.GetModeCount(); ++mode) {
        KindEntry kind;
        kind.mode = mode;
        kind.name = registry.GetName(mode);
        if (kind.name.empty()) {
            continue;
        }
        registry.GetSupportedFeatures(mode, kind.has_lenses, kind.has_circle, kind.has_position);
        kind.available = host.DewarperLoaded(mode);
        if (!kind.available) {
            kind.reason = WhyNotLoaded(mode);
        } else if (kind.has_lenses) {
            kind.lenses = LensNames(registry, mode);
        }
        kinds.push_back(std::move(kind));
    }
}

KindEntry const* KindCatalogue::FindByName(std::string const& name) const {
    for (KindEntry const& kind : kinds) {
        if (Lowercase(kind.name) == Lowercase(name)) {
            return &kind;
        }
    }
    return nullptr;
}

KindEntry const* KindCatalogue::FindByMode(int mode) const {
    for (KindEntry const& kind : kinds) {
        if (kind.mode == mode) {
            return &kind;
        }
    }
    return nullptr;
}

std::string KindCatalogue::NameList() const {
    std::string text;
    for (KindEntry const& kind : kinds) {
        text += (text.empty() ? "" : ", ") + kind.name;
    }
    return text;
}

std::string KindCatalogue::LibraryOf(int mode) {
    switch (mode) {
        case 1:
        case 7:
            return "libIMV1.so.2";
        case 3:
            return "libfisheyesw.so.3";
        case 9:
            return "libgeofisheye.so.1";
        default:
            return "";
    }
}

}  // namespace vexmap_host
