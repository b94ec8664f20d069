#include <cstdlib>
#include <cstring>

#include "DewarpWrapper.h"

namespace {
char* CopyOfText(char const* text) {
    return text == nullptr ? nullptr : strdup(text);
}
}  // namespace

DewarpParams_t::DewarpParams_t()
    : lens(0),
      position(0),
      panoramaOffset(0),
      circleX(0),
      circleY(0),
      circleRadius(0),
      extra(nullptr) {}

DewarpParams_t::DewarpParams_t(DewarpParams_t const& other)
    : lens(other.lens),
      position(other.position),
      panoramaOffset(other.panoramaOffset),
      circleX(other.circleX),
      circleY(other.circleY),
      circleRadius(other.circleRadius),
      extra(CopyOfText(other.extra)) {}

DewarpParams_t& DewarpParams_t::operator=(DewarpParams_t const& other) {
    if (this == &other) {
        return *this;
    }
    lens = other.lens;
    position = other.position;
    panoramaOffset = other.panoramaOffset;
    circleX = other.circleX;
    circleY = other.circleY;
    circleRadius = other.circleRadius;
    char* const copy = CopyOfText(other.extra);
    free(extra);
    extra = copy;
    return *this;
}

DewarpParams_t::~DewarpParams_t() {
    free(extra);
    extra = nullptr;
}
