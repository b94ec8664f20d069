#pragma once

#include <algorithm>
#include <cctype>
#include <string>

namespace vexmap_host {

/// ASCII lower case: names of kinds and file extensions are plain ASCII.
inline std::string Lowercase(std::string text) {
    std::transform(text.begin(), text.end(), text.begin(),
                   [](unsigned char c) { return char(std::tolower(c)); });
    return text;
}

/// The extension of the last part of a path, lower case and without its dot; "" when it has
/// none. A leading dot names a hidden file, not an extension.
inline std::string ExtensionOf(std::string const& path) {
    std::size_t const slash = path.rfind('/');
    std::size_t const start = slash == std::string::npos ? 0 : slash + 1;
    std::size_t const dot = path.rfind('.');
    return dot == std::string::npos || dot <= start ? "" : Lowercase(path.substr(dot + 1));
}

}  // namespace vexmap_host
