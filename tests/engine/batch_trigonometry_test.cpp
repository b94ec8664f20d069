#include "vexmap/batch_trigonometry.h"

#include <cstdint>
#include <cstring>
#include <limits>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "available_lanes.h"
#include "vexmap/batch_lanes.h"
#include "vexmap/floating_point.h"
#include "vexmap/trigonometry.h"

namespace quorvel::vexmap {
namespace {

constexpr float INF = std::numeric_limits<float>::infinity();
constexpr float NAN_VALUE = std::numeric_limits<float>::quiet_NaN();
// The library's vector functions are within one unit in the last place of the exact value, and
// so is the C library: the two are at most two units apart.
constexpr int64_t ULP_TOLERANCE = 2;

uint32_t Bits(float value) {
    uint32_t bits = 0;
    memcpy(&bits, &value, sizeof bits);
    return bits;
}

// Distance in units in the last place along the ordered line of floats; NaN only matches NaN.
int64_t UlpDistance(float a, float b) {
    if (a != a || b != b) {
        return (a != a) == (b != b) ? 0 : std::numeric_limits<int64_t>::max();
    }
    auto ordered = [](float v) {
        int64_t const bits = int64_t(Bits(v));
        return bits & 0x80000000 ? 0x80000000 - bits : bits;
    };
    int64_t const d = ordered(a) - ordered(b);
    return d < 0 ? -d : d;
}

// Angles and ratios over the ranges a map build meets, with an odd count so that every width
// has a tail, and the edge values.
std::vector<float> Samples(float low, float high) {
    std::vector<float> values;
    int const count = 20011;
    for (int i = 0; i < count; ++i) {
        values.push_back(low + (high - low) * float(i) / float(count - 1));
    }
    for (float const edge : {0.0f, -0.0f, 1.0f, -1.0f, 1.0000001f, -1.0000001f, 2.0f, INF, -INF,
                             NAN_VALUE, 1e-30f, -1e-30f}) {
        values.push_back(edge);
    }
    return values;
}

class BatchLanesTest : public testing::TestWithParam<BatchLanes const*> {};

void ExpectUnaryNear(BatchLanes::Unary batch, float (*scalar)(float), float low, float high,
                     int64_t tolerance) {
    std::vector<float> const x = Samples(low, high);
    std::vector<float> out(x.size());
    batch(x.data(), out.data(), int(x.size()));
    for (std::size_t i = 0; i < x.size(); ++i) {
        ASSERT_LE(UlpDistance(out[i], scalar(x[i])), tolerance)
            << "at " << x[i] << ": " << out[i] << " against " << scalar(x[i]);
    }
}

TEST_P(BatchLanesTest, SineAndCosineAreThoseOfTrigonometryWithinTwoUlp) {
    ExpectUnaryNear(
        GetParam()->sin, [](float v) { return Trigonometry::sin(v); }, -7.0f, 7.0f, ULP_TOLERANCE);
    ExpectUnaryNear(
        GetParam()->cos, [](float v) { return Trigonometry::cos(v); }, -7.0f, 7.0f, ULP_TOLERANCE);
}

TEST_P(BatchLanesTest, TangentAndArctangentAreThoseOfTrigonometryWithinTwoUlp) {
    ExpectUnaryNear(
        GetParam()->tan, [](float v) { return Trigonometry::tan(v); }, -1.5f, 1.5f, ULP_TOLERANCE);
    ExpectUnaryNear(
        GetParam()->atan, [](float v) { return Trigonometry::atan(v); }, -50.0f, 50.0f,
        ULP_TOLERANCE);
}

TEST_P(BatchLanesTest, SinhAndLogarithmAreThoseOfTrigonometryWithinTwoUlp) {
    ExpectUnaryNear(
        GetParam()->sinh, [](float v) { return Trigonometry::sinh(v); }, -5.0f, 5.0f,
        ULP_TOLERANCE);
    ExpectUnaryNear(
        GetParam()->log, [](float v) { return FloatingPoint::log(v); }, 1e-3f, 100.0f,
        ULP_TOLERANCE);
}

// The guards are exact: at and beyond the ends of the domain the end of the range, bit for bit.
TEST_P(BatchLanesTest, GuardedArcsineAndArccosineAreExactAtAndBeyondTheEnds) {
    ExpectUnaryNear(
        GetParam()->asin, [](float v) { return Trigonometry::asin(v); }, -1.5f, 1.5f,
        ULP_TOLERANCE);
    ExpectUnaryNear(
        GetParam()->acos, [](float v) { return Trigonometry::acos(v); }, -1.5f, 1.5f,
        ULP_TOLERANCE);
    float const x[5] = {1.0f, 1.0000001f, -1.0f, -2.0f, 7.0f};
    float asin_out[5];
    float acos_out[5];
    GetParam()->asin(x, asin_out, 5);
    GetParam()->acos(x, acos_out, 5);
    for (int i = 0; i < 5; ++i) {
        EXPECT_EQ(Bits(asin_out[i]), Bits(Trigonometry::asin(x[i]))) << x[i];
        EXPECT_EQ(Bits(acos_out[i]), Bits(Trigonometry::acos(x[i]))) << x[i];
    }
}

TEST_P(BatchLanesTest, ArctangentOfTwoIsThatOfTrigonometryWithinTwoUlpInEveryQuadrant) {
    std::vector<float> y;
    std::vector<float> x;
    for (int i = -120; i <= 120; ++i) {
        for (int k = -120; k <= 120; ++k) {
            y.push_back(float(i) * 13.7f);
            x.push_back(float(k) * 9.1f);
        }
    }
    std::vector<float> out(y.size());
    GetParam()->atan2(y.data(), x.data(), out.data(), int(y.size()));
    for (std::size_t i = 0; i < y.size(); ++i) {
        ASSERT_LE(UlpDistance(out[i], Trigonometry::atan(y[i], x[i])), ULP_TOLERANCE)
            << "at (" << y[i] << ", " << x[i] << ")";
    }
}

// The length is the C library's bit for bit, infinities beside NaN included.
TEST_P(BatchLanesTest, HypotIsTheLibrarysBitForBit) {
    std::vector<float> x = Samples(-3000.0f, 3000.0f);
    std::vector<float> y(x.rbegin(), x.rend());
    x.push_back(INF);
    y.push_back(NAN_VALUE);
    x.push_back(NAN_VALUE);
    y.push_back(-INF);
    x.push_back(NAN_VALUE);
    y.push_back(1.0f);
    x.push_back(3e38f);
    y.push_back(3e38f);
    std::vector<float> out(x.size());
    GetParam()->hypot(x.data(), y.data(), out.data(), int(x.size()));
    for (std::size_t i = 0; i < x.size(); ++i) {
        float const expected = std::hypot(x[i], y[i]);
        if (expected != expected) {
            EXPECT_NE(out[i], out[i]) << x[i] << ", " << y[i];
        } else {
            ASSERT_EQ(Bits(out[i]), Bits(expected)) << x[i] << ", " << y[i];
        }
    }
}

// Every count from none to several packs, in place, touches exactly its own elements.
TEST_P(BatchLanesTest, EveryCountWorksInPlaceAndWritesNothingBeyondIt) {
    for (int count = 0; count <= 40; ++count) {
        std::vector<float> values(std::size_t(count) + 4, 0.5f);
        for (int i = 0; i < count; ++i) {
            values[std::size_t(i)] = 0.01f * float(i);
        }
        GetParam()->sin(values.data(), values.data(), count);
        for (int i = 0; i < count; ++i) {
            ASSERT_LE(UlpDistance(values[std::size_t(i)], Trigonometry::sin(0.01f * float(i))),
                      ULP_TOLERANCE);
        }
        for (std::size_t i = std::size_t(count); i < values.size(); ++i) {
            ASSERT_EQ(values[i], 0.5f) << "count " << count;
        }
    }
}

// XINUSE, the state components that hold something: bit 2 the upper halves of registers 0 to 15,
// bit 6 the upper halves of their 512-bit forms, bit 7 registers 16 to 31. Zero when the processor
// cannot tell.
uint64_t StateInUse() {
    uint32_t eax = 0xD;
    uint32_t ebx = 0;
    uint32_t ecx = 1;
    uint32_t edx = 0;
    asm volatile("cpuid" : "+a"(eax), "=b"(ebx), "+c"(ecx), "=d"(edx));
    if ((eax & 4u) == 0) {
        return 0;
    }
    uint32_t low = 0;
    uint32_t high = 0;
    asm volatile("xgetbv" : "=a"(low), "=d"(high) : "c"(1));
    return (uint64_t(high) << 32) | low;
}

// With the wide registers' upper parts in use, a processor runs the plain SSE code that follows
// (the host's own among it) several times slower: every function leaves them clean.
class WideLanesTest : public testing::TestWithParam<BatchLanes const*> {};

// Under AddressSanitizer the instrumentation clears a large stack frame's shadow through the C
// library after the function's own clean-up, and the library's string functions use registers 16
// to 31 on purpose: those are watched in the other builds only.
#if defined(__SANITIZE_ADDRESS__)
constexpr bool INSTRUMENTED = true;
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
constexpr bool INSTRUMENTED = true;
#else
constexpr bool INSTRUMENTED = false;
#endif
#else
constexpr bool INSTRUMENTED = false;
#endif

TEST_P(WideLanesTest, EveryFunctionLeavesTheWideRegistersClean) {
    bool const watch_high = std::string(GetParam()->name) == "avx512" && !INSTRUMENTED;
    uint64_t const high_registers = watch_high ? 1u << 7 : 0;
    uint64_t const watched = (1u << 2) | (1u << 6) | high_registers;
    std::vector<float> x(40, 0.25f);
    std::vector<float> y(40, 0.5f);
    std::vector<float> out(40);
    std::vector<float> work(4 * 40);
    std::vector<unsigned short> entries(16 * 40);
    float parameters[10] = {1, 0, 0, 0, 1, 0, 0, 0, 1, 500};
    BatchLanes const& lanes = *GetParam();
    auto expect_clean = [&](char const* what) { EXPECT_EQ(0u, StateInUse() & watched) << what; };
    for (BatchLanes::Unary const unary : {lanes.sin, lanes.cos, lanes.tan, lanes.atan, lanes.asin,
                                          lanes.acos, lanes.sinh, lanes.log}) {
        unary(x.data(), out.data(), 40);
        expect_clean("a function of one argument");
    }
    lanes.atan2(y.data(), x.data(), out.data(), 40);
    expect_clean("atan2");
    lanes.hypot(y.data(), x.data(), out.data(), 40);
    expect_clean("hypot");
    lanes.store_eighth_spans(entries.data(), x.data(), y.data(), 40, 100.0f, 100.0f);
    expect_clean("store_eighth_spans");
    for (int kind = 0; kind < BatchLanes::CHAIN_KIND_COUNT; ++kind) {
        lanes.chain[kind](parameters, x.data(), y.data(), 40, work.data());
        expect_clean("a chain kernel");
    }
    std::vector<unsigned short> const table(4 * 32, 3);
    std::vector<unsigned char> const frame(96 * 3 / 2, 9);
    std::vector<unsigned char> picture(64 * 3);
    lanes.remap_yuv420_blocks(BatchLanes::Yuv420Row{
        table.data(), table.data() + 64, 16, frame.data(), frame.data() + 64, frame.data() + 80, 8,
        8, 64, 4, picture.data(), picture.data() + 32, picture.data() + 64, picture.data() + 96});
    expect_clean("remap_yuv420_blocks");
}

INSTANTIATE_TEST_SUITE_P(EveryLaneWidthOfThisProcessor, BatchLanesTest,
                         testing::ValuesIn(AvailableLanes()), LanesName);

std::vector<BatchLanes const*> WideLanes() {
    std::vector<BatchLanes const*> lanes = AvailableLanes();
    lanes.erase(lanes.begin());
    return lanes;
}

// An SSE2-only processor has no wide lanes to test.
GTEST_ALLOW_UNINSTANTIATED_PARAMETERIZED_TEST(WideLanesTest);
INSTANTIATE_TEST_SUITE_P(EveryWideLaneWidthOfThisProcessor, WideLanesTest,
                         testing::ValuesIn(WideLanes()), LanesName);

TEST(BatchTrigonometry, UsesTheWidestLanesThisProcessorRuns) {
    EXPECT_STREQ(BatchTrigonometry::GetLanesName(), AvailableLanes().back()->name);
}

TEST(BatchTrigonometry, WorksThroughTheWidestLanes) {
    float const x[3] = {0.0f, 0.5f, 1.0f};
    float out[3];
    BatchTrigonometry::atan(x, out, 3);
    for (int i = 0; i < 3; ++i) {
        EXPECT_LE(UlpDistance(out[i], Trigonometry::atan(x[i])), ULP_TOLERANCE);
    }
}

}  // namespace
}  // namespace quorvel::vexmap
