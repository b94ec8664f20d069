#pragma once

// The body of every BatchLanes table, written once over a lane type L, which gives Pack, WIDTH,
// Load, Store, Fill, the comparisons and Select, Hypot and the library's vector functions. Only
// the three lane files include it, each with its L in an unnamed namespace: every instance then
// stays inside the file compiled for its instructions, and none can stand in for another's.

#include "vexmap/batch_lanes.h"

namespace quorvel::vexmap::lane_kernels {

constexpr float HALF_PI = __builtin_bit_cast(float, 0x3FC90FDBu);  // Trigonometry::HALF_PI
constexpr float PI = __builtin_bit_cast(float, 0x40490FDBu);       // Trigonometry::PI

// Whole packs straight from the arrays; the last part through a padded copy, with zeros in the
// lanes beyond the count.
template <class L, typename Function>
inline void ApplyUnary(float const* x, float* out, int count, Function function) {
    int i = 0;
    for (; i + L::WIDTH <= count; i += L::WIDTH) {
        L::Store(out + i, function(L::Load(x + i)));
    }
    if (i < count) {
        float in_tail[L::WIDTH] = {};
        float out_tail[L::WIDTH];
        for (int k = 0; i + k < count; ++k) {
            in_tail[k] = x[i + k];
        }
        L::Store(out_tail, function(L::Load(in_tail)));
        for (int k = 0; i + k < count; ++k) {
            out[i + k] = out_tail[k];
        }
    }
}

template <class L, typename Function>
inline void ApplyBinary(float const* a, float const* b, float* out, int count, Function function) {
    int i = 0;
    for (; i + L::WIDTH <= count; i += L::WIDTH) {
        L::Store(out + i, function(L::Load(a + i), L::Load(b + i)));
    }
    if (i < count) {
        float a_tail[L::WIDTH] = {};
        float b_tail[L::WIDTH] = {};
        float out_tail[L::WIDTH];
        for (int k = 0; i + k < count; ++k) {
            a_tail[k] = a[i + k];
            b_tail[k] = b[i + k];
        }
        L::Store(out_tail, function(L::Load(a_tail), L::Load(b_tail)));
        for (int k = 0; i + k < count; ++k) {
            out[i + k] = out_tail[k];
        }
    }
}

template <class L>
struct Kernels {
    static void Sin(float const* x, float* out, int count) {
        ApplyUnary<L>(x, out, count, [](auto v) { return L::Sin(v); });
    }
    static void Cos(float const* x, float* out, int count) {
        ApplyUnary<L>(x, out, count, [](auto v) { return L::Cos(v); });
    }
    static void Tan(float const* x, float* out, int count) {
        ApplyUnary<L>(x, out, count, [](auto v) { return L::Tan(v); });
    }
    static void Atan(float const* x, float* out, int count) {
        ApplyUnary<L>(x, out, count, [](auto v) { return L::Atan(v); });
    }
    static void Atan2(float const* y, float const* x, float* out, int count) {
        ApplyBinary<L>(y, x, out, count, [](auto a, auto b) { return L::Atan2(a, b); });
    }
    // At or beyond the ends of the domain the end of the range; NaN fails both tests.
    static void Asin(float const* x, float* out, int count) {
        ApplyUnary<L>(x, out, count, [](auto v) {
            auto const inside =
                L::Select(L::GreaterEqual(v, L::Fill(1.0f)), L::Fill(HALF_PI), L::Asin(v));
            return L::Select(L::LessEqual(v, L::Fill(-1.0f)), L::Fill(-HALF_PI), inside);
        });
    }
    static void Acos(float const* x, float* out, int count) {
        ApplyUnary<L>(x, out, count, [](auto v) {
            auto const inside =
                L::Select(L::GreaterEqual(v, L::Fill(1.0f)), L::Fill(0.0f), L::Acos(v));
            return L::Select(L::LessEqual(v, L::Fill(-1.0f)), L::Fill(PI), inside);
        });
    }
    static void Sinh(float const* x, float* out, int count) {
        ApplyUnary<L>(x, out, count, [](auto v) { return L::Sinh(v); });
    }
    static void Log(float const* x, float* out, int count) {
        ApplyUnary<L>(x, out, count, [](auto v) { return L::Log(v); });
    }
    // An infinite side makes the length infinite even beside a NaN, as the C library has it.
    static void Hypot(float const* x, float const* y, float* out, int count) {
        ApplyBinary<L>(x, y, out, count, [](auto a, auto b) {
            auto const infinite = L::Or(L::IsInfinite(a), L::IsInfinite(b));
            return L::Select(infinite, L::Fill(__builtin_inff()), L::Hypot(a, b));
        });
    }

    static constexpr BatchLanes Table(char const* name, bool (*supported)()) {
        return BatchLanes{
            name,   supported,           &Sin, &Cos, &Tan, &Atan, &Atan2, &Asin, &Acos, &Sinh, &Log,
            &Hypot, &L::StoreEighthSpans};
    }
};

}  // namespace quorvel::vexmap::lane_kernels
