#pragma once

#include <string>
#include <vector>

#include "plugin_host.h"

namespace vexmap_host {

/// What the plug-in tells a client about one dewarper kind, and, for a kind that cannot be used
/// here, why.
struct KindEntry {
    int mode = 0;
    std::string name;
    bool has_circle = false;
    bool has_lenses = false;
    bool has_position = false;
    bool available = false;
    std::string reason;               // why it is not available; empty when it is
    std::vector<std::string> lenses;  // of an available kind with a lens list, in number order
};

/// The kinds a loaded plug-in registers, asked as a client asks: names by mode, features,
/// whether each is loaded and its lenses. Holds copies; the plug-in must outlive nothing here.
class KindCatalogue {
public:
    explicit KindCatalogue(PluginHost const& host);
    KindCatalogue(KindCatalogue const&) = default;
    KindCatalogue& operator=(KindCatalogue const&) = default;
    virtual ~KindCatalogue() = default;

    std::vector<KindEntry> const& Kinds() const { return kinds; }
    /// The kind of a display name, compared without regard to case; null when there is none.
    KindEntry const* FindByName(std::string const& name) const;
    KindEntry const* FindByMode(int mode) const;
    /// "ImmerVision, Sentry360, ..." in mode order, for messages.
    std::string NameList() const;
    /// The library a vendor kind opens, by file name as the loader looks for it; "" for a kind
    /// that needs none.
    static std::string LibraryOf(int mode);

private:
    std::vector<KindEntry> kinds;
};

}  // namespace vexmap_host
