#include "vexmap/trigonometry.h"

#include <algorithm>
#include <array>

#include "vexmap/floating_point.h"
#include "vexmap/log.h"

namespace quorvel::vexmap {
namespace {

constexpr int TABLE_SIZE = 4096;

// Sine then cosine, end to end, with the cosine's extra entry at the very end.
std::array<float, 2 * TABLE_SIZE + 1> const TABLES = [] {
    std::array<float, 2 * TABLE_SIZE + 1> tables{};
    double const pi = std::acos(-1.0);
    for (int i = 0; i < TABLE_SIZE; ++i) {
        double const angle = -pi + 2.0 * pi * i / TABLE_SIZE;
        tables[std::size_t(i)] = float(std::sin(angle));
        tables[std::size_t(TABLE_SIZE + i)] = float(std::cos(angle));
    }
    tables[2 * TABLE_SIZE] = -1.0f;
    return tables;
}();

}  // namespace

float const* const Trigonometry::SineTable = TABLES.data();
float const* const Trigonometry::CosineTable = TABLES.data() + TABLE_SIZE;

Trigonometry::Trigonometry() = default;

Trigonometry::Trigonometry(Trigonometry const&) = default;

Trigonometry& Trigonometry::operator=(Trigonometry const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n",
                  "Trigonometry");
    }
    return *this;
}

Trigonometry::~Trigonometry() = default;

// floor(x / 2pi) whole turns, with the product, the sum and the difference each rounded to
// float in this order.
float Trigonometry::normalise_angle(float x) {
    float const v = x + PI;
    float const turns = FloatingPoint::floor(ONE_OVER_TWO_PI * v) * -TWO_PI;
    float const shifted = turns + v;
    return shifted - PI;
}

// 651.8986 is 4096 / 2pi; the clamp reaches 4096, one past the sine table, on purpose.
int Trigonometry::TableIndex(float x) {
    double const index = std::nearbyint(std::fma(double(x), 651.8986, 2048.0));
    return int(std::clamp(index, 0.0, double(TABLE_SIZE)));
}

float Trigonometry::fast_sin(float x) {
    return FloatingPoint::is_finite(x) ? SineTable[TableIndex(x)] : x;
}

float Trigonometry::fast_cos(float x) {
    return FloatingPoint::is_finite(x) ? CosineTable[TableIndex(x)] : x;
}

std::pair<float, float> Trigonometry::fast_sin_and_cos(float x) {
    if (!FloatingPoint::is_finite(x)) {
        return {x, x};
    }
    int const index = TableIndex(x);
    return {SineTable[index], CosineTable[index]};
}

}  // namespace quorvel::vexmap
