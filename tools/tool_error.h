#pragma once

#include <stdexcept>
#include <string>

namespace vexmap_host {

/// A failure the tool reports as one line on standard error, with a non-zero exit status.
class ToolError : public std::runtime_error {
public:
    explicit ToolError(std::string const& message) : std::runtime_error(message) {}
};

}  // namespace vexmap_host
