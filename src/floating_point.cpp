#include "vexmap/floating_point.h"

namespace quorvel::vexmap {

FloatingPoint::FloatingPoint() = default;

FloatingPoint::FloatingPoint(FloatingPoint const&) = default;

FloatingPoint& FloatingPoint::operator=(FloatingPoint const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n",
                  "FloatingPoint");
    }
    return *this;
}

FloatingPoint::~FloatingPoint() = default;

void FloatingPoint::WarnNegativeRoot() {
    Log::warn(__LINE__, __FILE__, "sqrt",
              "Attempted square root of a negative value. Returning root of absolute.\n");
}

}  // namespace quorvel::vexmap
