#include "vexmap/defaults.h"

namespace quorvel::vexmap {

Defaults::Defaults() = default;

Defaults::Defaults(Defaults const&) = default;

Defaults& Defaults::operator=(Defaults const&) {
    return *this;
}

Defaults::~Defaults() = default;

}  // namespace quorvel::vexmap
