#pragma once

#include <stdexcept>
#include <string>

namespace vexmap_host {

/// A failure of the work the tool reports as one line on standard error, with exit status 1.
class ToolError : public std::runtime_error {
public:
    explicit ToolError(std::string const& message) : std::runtime_error(message) {}
};

/// An option or argument that cannot be used as given, found before any work: exit status 2.
class UsageError : public ToolError {
public:
    explicit UsageError(std::string const& message) : ToolError(message) {}
};

}  // namespace vexmap_host
