#include "vexmap/batch_trigonometry.h"

#include "vexmap/batch_lanes.h"
#include "vexmap/log.h"

namespace quorvel::vexmap {

BatchTrigonometry::BatchTrigonometry() = default;

BatchTrigonometry::BatchTrigonometry(BatchTrigonometry const&) = default;

BatchTrigonometry& BatchTrigonometry::operator=(BatchTrigonometry const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n",
                  "BatchTrigonometry");
    }
    return *this;
}

BatchTrigonometry::~BatchTrigonometry() = default;

void BatchTrigonometry::sin(float const* x, float* out, int count) {
    BatchLanes::Widest().sin(x, out, count);
}

void BatchTrigonometry::cos(float const* x, float* out, int count) {
    BatchLanes::Widest().cos(x, out, count);
}

void BatchTrigonometry::tan(float const* x, float* out, int count) {
    BatchLanes::Widest().tan(x, out, count);
}

void BatchTrigonometry::atan(float const* x, float* out, int count) {
    BatchLanes::Widest().atan(x, out, count);
}

void BatchTrigonometry::atan(float const* y, float const* x, float* out, int count) {
    BatchLanes::Widest().atan2(y, x, out, count);
}

void BatchTrigonometry::asin(float const* x, float* out, int count) {
    BatchLanes::Widest().asin(x, out, count);
}

void BatchTrigonometry::acos(float const* x, float* out, int count) {
    BatchLanes::Widest().acos(x, out, count);
}

void BatchTrigonometry::sinh(float const* x, float* out, int count) {
    BatchLanes::Widest().sinh(x, out, count);
}

void BatchTrigonometry::log(float const* x, float* out, int count) {
    BatchLanes::Widest().log(x, out, count);
}

void BatchTrigonometry::hypot(float const* x, float const* y, float* out, int count) {
    BatchLanes::Widest().hypot(x, y, out, count);
}

char const* BatchTrigonometry::GetLanesName() {
    return BatchLanes::Widest().name;
}

}  // namespace quorvel::vexmap
