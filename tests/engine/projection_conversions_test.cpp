#include <cmath>
#include <cstddef>
#include <cstdint>
#include <iomanip>
#include <limits>
#include <ostream>
#include <set>
#include <sstream>
#include <string>
#include <type_traits>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "vexmap/projection.h"
#include "vexmap/trigonometry.h"
#include "vexmap/vector_3d.h"

namespace quorvel::vexmap {
namespace {

// Tolerances in focal lengths, scaled by f + |expected|: a float conversion of a few steps
// against its closed form in double, and two float conversions one after the other.
constexpr double CLOSED_FORM_TOLERANCE = 4e-6;
constexpr double ROUND_TRIP_TOLERANCE = 1e-5;
// What float rounding leaves of a zero at a formula's centre, in focal lengths.
constexpr double NOISE_TOLERANCE = 1e-6;
constexpr double PI_DOUBLE = 3.14159265358979323846;
constexpr double HALF_PI_DOUBLE = PI_DOUBLE / 2.0;
constexpr float NAN_VALUE = std::numeric_limits<float>::quiet_NaN();
constexpr float INFINITY_VALUE = std::numeric_limits<float>::infinity();

uint32_t Bits(float value) {
    return __builtin_bit_cast(uint32_t, value);
}

// Equal bit for bit, or NaN both.
bool SameFloat(float a, float b) {
    return (std::isnan(a) && std::isnan(b)) || Bits(a) == Bits(b);
}

bool SamePoint(Vector2d const& a, Vector2d const& b) {
    return SameFloat(a.x, b.x) && SameFloat(a.y, b.y);
}

std::string Show(Vector2d const& p) {
    std::ostringstream text;
    text << std::setprecision(9) << '(' << p.x << ", " << p.y << ')';
    return text.str();
}

struct Pair {
    double x;
    double y;
};

// A direction in space for the closed forms: x right, y up, z along the axis of view.
struct Direction {
    double x;
    double y;
    double z;
};

Direction OfLongitudeAndLatitude(double longitude, double latitude) {
    return {std::cos(latitude) * std::sin(longitude), std::sin(latitude),
            std::cos(latitude) * std::cos(longitude)};
}

// An equidistant fisheye point: its radius over f is the angle off the axis of view.
Direction OfFisheye(double x, double y, double f) {
    double const r = std::hypot(x, y);
    double const angle = r / f;
    return {std::sin(angle) * x / r, std::sin(angle) * y / r, std::cos(angle)};
}

// A cylindrical point lies on the cylinder of radius 1 round the vertical axis.
Direction OfCylindrical(double x, double y, double f) {
    return {std::sin(x / f), y / f, std::cos(x / f)};
}

Pair FisheyeOf(Direction const& d, double f) {
    double const h = std::hypot(d.x, d.y);
    double const angle = std::atan2(h, d.z);
    return {f * angle * d.x / h, f * angle * d.y / h};
}

Pair EquirectangularOf(Direction const& d, double f) {
    return {f * std::atan2(d.x, d.z), f * std::atan2(d.y, std::hypot(d.x, d.z))};
}

Pair RectilinearOf(Direction const& d, double f) {
    return {f * d.x / d.z, f * d.y / d.z};
}

Pair AtRadius(double x, double y, double radius) {
    double const r = std::hypot(x, y);
    return {radius * x / r, radius * y / r};
}

double Square(double value) {
    return value * value;
}

double Gudermannian(double u) {
    return 2.0 * std::atan(std::exp(u)) - HALF_PI_DOUBLE;
}

// Miller's projection: y = 1.25·ln(tan(pi/4 + 0.4·latitude)), in focal lengths.
double MillerHeight(double latitude) {
    return 1.25 * std::log(std::tan(PI_DOUBLE / 4.0 + 0.4 * latitude));
}

double MillerLatitude(double height) {
    return 2.5 * std::atan(std::exp(0.8 * height)) - 5.0 * PI_DOUBLE / 8.0;
}

// Whether a float result lies within tolerance·(f + |expected|) of the closed form.
testing::AssertionResult IsNear(Vector2d const& actual, Pair const& expected, float focal_length,
                                double tolerance) {
    double const f = double(focal_length);
    double const x_error = std::fabs(double(actual.x) - expected.x);
    double const y_error = std::fabs(double(actual.y) - expected.y);
    if (x_error <= tolerance * (f + std::fabs(expected.x)) &&
        y_error <= tolerance * (f + std::fabs(expected.y))) {
        return testing::AssertionSuccess();
    }
    return testing::AssertionFailure() << Show(actual) << " is not near " << std::setprecision(9)
                                       << '(' << expected.x << ", " << expected.y << ')';
}

Pair Of(Vector2d const& p) {
    return {double(p.x), double(p.y)};
}

Vector2d AtFocalLength(Pair const& point, float f) {
    return Vector2d(float(point.x * double(f)), float(point.y * double(f)));
}

// Sample points in focal lengths. In front: within 1.4 of the centre, inside a quarter turn.
std::vector<Pair> const& InFront() {
    static std::vector<Pair> const points = {{0.3, 0.2},   {-0.7, 0.5},  {1.1, -0.6},
                                             {-0.2, -1.2}, {0.05, 0.9},  {-1.3, -0.4},
                                             {0.0, 0.45},  {-0.35, 0.0}, {0.8, 0.75}};
    return points;
}

// Inside the unit disc.
std::vector<Pair> const& InsideTheDisc() {
    static std::vector<Pair> const points = {{0.3, 0.2}, {-0.5, 0.4},    {0.6, -0.7}, {-0.1, -0.8},
                                             {0.0, 0.5}, {-0.45, -0.05}, {0.7, 0.0},  {0.2, 0.95}};
    return points;
}

// Anywhere, the centre and points past the poles and the picture's edges included.
std::vector<Pair> const& Anywhere() {
    static std::vector<Pair> const points = {{0.0, 0.0},   {0.3, 0.2},   {-0.7, 0.5},  {1.1, -0.6},
                                             {-0.2, -1.2}, {2.5, 1.9},   {-3.5, -2.2}, {0.0, 1.6},
                                             {0.1, -1.8},  {5.0, 0.3},   {0.9, 0.0},   {0.0, -0.4},
                                             {-1.4, 3.9},  {1.0, 0.0},   {0.0, 1.0},   {-1.0, -0.7},
                                             {3.2, -0.1},  {1e-9, 1e-9}, {-0.0, 0.0}};
    return points;
}

std::vector<float> const& FocalLengths() {
    static std::vector<float> const lengths = {1.0f, 400.0f, 1234.5f};
    return lengths;
}

// Every conversion, with its source and target as its name spells them.

struct Member {
    char const* source;
    char const* target;
    ConversionFunction function;
};

void PrintTo(Member const& member, std::ostream* out) {
    *out << member.source << "To" << member.target;
}

std::string Name(Member const& member) {
    return std::string(member.source) + "To" + member.target;
}

// Only a member of exactly the conversion type passes.
template <typename Function>
Member Conversion(char const* source, char const* target, Function function) {
    static_assert(std::is_same<Function, ConversionFunction>::value,
                  "a conversion is a Vector2d (*)(Vector2d const&, float)");
    return Member{source, target, function};
}

// Names the member once: its source and target as strings, and its address.
#define CONVERSION(S, T) Conversion(#S, #T, &Projection::S##To##T)

std::vector<Member> const& Members() {
    static std::vector<Member> const members = {
        CONVERSION(Equirectangular, Equirectangular),
        CONVERSION(Equirectangular, Rectilinear),
        CONVERSION(Equirectangular, Stereographic),
        CONVERSION(Equirectangular, Orthographic),
        CONVERSION(Equirectangular, Equisolid),
        CONVERSION(Equirectangular, Cylindrical),
        CONVERSION(Equirectangular, Fisheye),
        CONVERSION(Equirectangular, Mercator),
        CONVERSION(Equirectangular, LambertCylindrical),
        CONVERSION(Equirectangular, MillerCylindrical),
        CONVERSION(Equirectangular, Pannini),
        CONVERSION(Equirectangular, Architectural),
        CONVERSION(Equirectangular, EquirectangularPannini),
        CONVERSION(Equirectangular, Mirror),
        CONVERSION(Equirectangular, Spherical),

        CONVERSION(Rectilinear, Equirectangular),
        CONVERSION(Rectilinear, Rectilinear),
        CONVERSION(Rectilinear, Stereographic),
        CONVERSION(Rectilinear, Orthographic),
        CONVERSION(Rectilinear, Equisolid),
        CONVERSION(Rectilinear, Cylindrical),
        CONVERSION(Rectilinear, Fisheye),
        CONVERSION(Rectilinear, Mercator),
        CONVERSION(Rectilinear, LambertCylindrical),
        CONVERSION(Rectilinear, MillerCylindrical),
        CONVERSION(Rectilinear, Pannini),
        CONVERSION(Rectilinear, Architectural),
        CONVERSION(Rectilinear, EquirectangularPannini),
        CONVERSION(Rectilinear, Mirror),
        CONVERSION(Rectilinear, Spherical),

        CONVERSION(Stereographic, Equirectangular),
        CONVERSION(Stereographic, Rectilinear),
        CONVERSION(Stereographic, Stereographic),
        CONVERSION(Stereographic, Orthographic),
        CONVERSION(Stereographic, Equisolid),
        CONVERSION(Stereographic, Cylindrical),
        CONVERSION(Stereographic, Fisheye),
        CONVERSION(Stereographic, Mercator),
        CONVERSION(Stereographic, LambertCylindrical),
        CONVERSION(Stereographic, MillerCylindrical),
        CONVERSION(Stereographic, Pannini),
        CONVERSION(Stereographic, Architectural),
        CONVERSION(Stereographic, EquirectangularPannini),
        CONVERSION(Stereographic, Mirror),
        CONVERSION(Stereographic, Spherical),

        CONVERSION(Orthographic, Equirectangular),
        CONVERSION(Orthographic, Rectilinear),
        CONVERSION(Orthographic, Stereographic),
        CONVERSION(Orthographic, Orthographic),
        CONVERSION(Orthographic, Equisolid),
        CONVERSION(Orthographic, Cylindrical),
        CONVERSION(Orthographic, Fisheye),
        CONVERSION(Orthographic, Mercator),
        CONVERSION(Orthographic, LambertCylindrical),
        CONVERSION(Orthographic, MillerCylindrical),
        CONVERSION(Orthographic, Pannini),
        CONVERSION(Orthographic, Architectural),
        CONVERSION(Orthographic, EquirectangularPannini),
        CONVERSION(Orthographic, Mirror),
        CONVERSION(Orthographic, Spherical),

        CONVERSION(Equisolid, Equirectangular),
        CONVERSION(Equisolid, Rectilinear),
        CONVERSION(Equisolid, Stereographic),
        CONVERSION(Equisolid, Orthographic),
        CONVERSION(Equisolid, Equisolid),
        CONVERSION(Equisolid, Cylindrical),
        CONVERSION(Equisolid, Fisheye),
        CONVERSION(Equisolid, Mercator),
        CONVERSION(Equisolid, LambertCylindrical),
        CONVERSION(Equisolid, MillerCylindrical),
        CONVERSION(Equisolid, Pannini),
        CONVERSION(Equisolid, Architectural),
        CONVERSION(Equisolid, EquirectangularPannini),
        CONVERSION(Equisolid, Mirror),
        CONVERSION(Equisolid, Spherical),

        CONVERSION(Cylindrical, Equirectangular),
        CONVERSION(Cylindrical, Rectilinear),
        CONVERSION(Cylindrical, Stereographic),
        CONVERSION(Cylindrical, Orthographic),
        CONVERSION(Cylindrical, Equisolid),
        CONVERSION(Cylindrical, Cylindrical),
        CONVERSION(Cylindrical, Fisheye),
        CONVERSION(Cylindrical, Mercator),
        CONVERSION(Cylindrical, LambertCylindrical),
        CONVERSION(Cylindrical, MillerCylindrical),
        CONVERSION(Cylindrical, Pannini),
        CONVERSION(Cylindrical, Architectural),
        CONVERSION(Cylindrical, EquirectangularPannini),
        CONVERSION(Cylindrical, Mirror),
        CONVERSION(Cylindrical, Spherical),

        CONVERSION(Fisheye, Equirectangular),
        CONVERSION(Fisheye, Rectilinear),
        CONVERSION(Fisheye, Stereographic),
        CONVERSION(Fisheye, Orthographic),
        CONVERSION(Fisheye, Equisolid),
        CONVERSION(Fisheye, Cylindrical),
        CONVERSION(Fisheye, Fisheye),
        CONVERSION(Fisheye, Mercator),
        CONVERSION(Fisheye, LambertCylindrical),
        CONVERSION(Fisheye, MillerCylindrical),
        CONVERSION(Fisheye, Pannini),
        CONVERSION(Fisheye, Architectural),
        CONVERSION(Fisheye, EquirectangularPannini),
        CONVERSION(Fisheye, Mirror),
        CONVERSION(Fisheye, Spherical),

        CONVERSION(Mercator, Equirectangular),
        CONVERSION(Mercator, Rectilinear),
        CONVERSION(Mercator, Stereographic),
        CONVERSION(Mercator, Orthographic),
        CONVERSION(Mercator, Equisolid),
        CONVERSION(Mercator, Cylindrical),
        CONVERSION(Mercator, Fisheye),
        CONVERSION(Mercator, Mercator),
        CONVERSION(Mercator, LambertCylindrical),
        CONVERSION(Mercator, MillerCylindrical),
        CONVERSION(Mercator, Pannini),
        CONVERSION(Mercator, Architectural),
        CONVERSION(Mercator, EquirectangularPannini),
        CONVERSION(Mercator, Mirror),
        CONVERSION(Mercator, Spherical),

        CONVERSION(LambertCylindrical, Equirectangular),
        CONVERSION(LambertCylindrical, Rectilinear),
        CONVERSION(LambertCylindrical, Stereographic),
        CONVERSION(LambertCylindrical, Orthographic),
        CONVERSION(LambertCylindrical, Equisolid),
        CONVERSION(LambertCylindrical, Cylindrical),
        CONVERSION(LambertCylindrical, Fisheye),
        CONVERSION(LambertCylindrical, Mercator),
        CONVERSION(LambertCylindrical, LambertCylindrical),
        CONVERSION(LambertCylindrical, MillerCylindrical),
        CONVERSION(LambertCylindrical, Pannini),
        CONVERSION(LambertCylindrical, Architectural),
        CONVERSION(LambertCylindrical, EquirectangularPannini),
        CONVERSION(LambertCylindrical, Mirror),
        CONVERSION(LambertCylindrical, Spherical),

        CONVERSION(MillerCylindrical, Equirectangular),
        CONVERSION(MillerCylindrical, Rectilinear),
        CONVERSION(MillerCylindrical, Stereographic),
        CONVERSION(MillerCylindrical, Orthographic),
        CONVERSION(MillerCylindrical, Equisolid),
        CONVERSION(MillerCylindrical, Cylindrical),
        CONVERSION(MillerCylindrical, Fisheye),
        CONVERSION(MillerCylindrical, Mercator),
        CONVERSION(MillerCylindrical, LambertCylindrical),
        CONVERSION(MillerCylindrical, MillerCylindrical),
        CONVERSION(MillerCylindrical, Pannini),
        CONVERSION(MillerCylindrical, Architectural),
        CONVERSION(MillerCylindrical, EquirectangularPannini),
        CONVERSION(MillerCylindrical, Mirror),
        CONVERSION(MillerCylindrical, Spherical),

        CONVERSION(Pannini, Equirectangular),
        CONVERSION(Pannini, Rectilinear),
        CONVERSION(Pannini, Stereographic),
        CONVERSION(Pannini, Orthographic),
        CONVERSION(Pannini, Equisolid),
        CONVERSION(Pannini, Cylindrical),
        CONVERSION(Pannini, Fisheye),
        CONVERSION(Pannini, Mercator),
        CONVERSION(Pannini, LambertCylindrical),
        CONVERSION(Pannini, MillerCylindrical),
        CONVERSION(Pannini, Pannini),
        CONVERSION(Pannini, Architectural),
        CONVERSION(Pannini, EquirectangularPannini),
        CONVERSION(Pannini, Mirror),
        CONVERSION(Pannini, Spherical),

        CONVERSION(Architectural, Equirectangular),
        CONVERSION(Architectural, Rectilinear),
        CONVERSION(Architectural, Stereographic),
        CONVERSION(Architectural, Orthographic),
        CONVERSION(Architectural, Equisolid),
        CONVERSION(Architectural, Cylindrical),
        CONVERSION(Architectural, Fisheye),
        CONVERSION(Architectural, Mercator),
        CONVERSION(Architectural, LambertCylindrical),
        CONVERSION(Architectural, MillerCylindrical),
        CONVERSION(Architectural, Pannini),
        CONVERSION(Architectural, Architectural),
        CONVERSION(Architectural, EquirectangularPannini),
        CONVERSION(Architectural, Mirror),
        CONVERSION(Architectural, Spherical),

        CONVERSION(EquirectangularPannini, Equirectangular),
        CONVERSION(EquirectangularPannini, Rectilinear),
        CONVERSION(EquirectangularPannini, Stereographic),
        CONVERSION(EquirectangularPannini, Orthographic),
        CONVERSION(EquirectangularPannini, Equisolid),
        CONVERSION(EquirectangularPannini, Cylindrical),
        CONVERSION(EquirectangularPannini, Fisheye),
        CONVERSION(EquirectangularPannini, Mercator),
        CONVERSION(EquirectangularPannini, LambertCylindrical),
        CONVERSION(EquirectangularPannini, MillerCylindrical),
        CONVERSION(EquirectangularPannini, Pannini),
        CONVERSION(EquirectangularPannini, Architectural),
        CONVERSION(EquirectangularPannini, EquirectangularPannini),
        CONVERSION(EquirectangularPannini, Mirror),
        CONVERSION(EquirectangularPannini, Spherical),

        CONVERSION(Mirror, Equirectangular),
        CONVERSION(Mirror, Rectilinear),
        CONVERSION(Mirror, Stereographic),
        CONVERSION(Mirror, Orthographic),
        CONVERSION(Mirror, Equisolid),
        CONVERSION(Mirror, Cylindrical),
        CONVERSION(Mirror, Fisheye),
        CONVERSION(Mirror, Mercator),
        CONVERSION(Mirror, LambertCylindrical),
        CONVERSION(Mirror, MillerCylindrical),
        CONVERSION(Mirror, Pannini),
        CONVERSION(Mirror, Architectural),
        CONVERSION(Mirror, EquirectangularPannini),
        CONVERSION(Mirror, Mirror),
        CONVERSION(Mirror, Spherical),

        CONVERSION(Spherical, Spherical),
    };
    return members;
}

#undef CONVERSION

ConversionFunction Find(std::string const& source, std::string const& target) {
    for (Member const& member : Members()) {
        if (source == member.source && target == member.target) {
            return member.function;
        }
    }
    return nullptr;
}

ConversionFunction FindByName(std::string const& name) {
    for (Member const& member : Members()) {
        if (name == Name(member)) {
            return member.function;
        }
    }
    return nullptr;
}

std::vector<std::string> const& Sources() {
    static std::vector<std::string> const names = {"Equirectangular",
                                                   "Rectilinear",
                                                   "Stereographic",
                                                   "Orthographic",
                                                   "Equisolid",
                                                   "Cylindrical",
                                                   "Fisheye",
                                                   "Mercator",
                                                   "LambertCylindrical",
                                                   "MillerCylindrical",
                                                   "Pannini",
                                                   "Architectural",
                                                   "EquirectangularPannini",
                                                   "Mirror"};
    return names;
}

// The conversion grid, group by group. A cell says the point is kept as it is, or converted by a
// formula of its own, or passes through the projections named on its way from the source X to
// the target Y.
using Route = std::vector<std::string>;
using Group = std::vector<std::string>;

Route const SAME = {"="};
Route const OWN = {"D"};

Route Through(char const* hub) {
    return {"X", hub, "Y"};
}

Route Through(char const* first_hub, char const* second_hub) {
    return {"X", first_hub, second_hub, "Y"};
}

Group const& Radial() {
    static Group const names = {"Orthographic", "Equisolid", "Mirror"};
    return names;
}

Group const& CylinderLike() {
    static Group const names = {"Mercator", "LambertCylindrical", "MillerCylindrical",
                                "Pannini",  "Architectural",      "EquirectangularPannini"};
    return names;
}

std::vector<Group> const& GridColumns() {
    static std::vector<Group> const columns = {
        {"Equirectangular"}, {"Rectilinear"}, {"Stereographic"}, {"Fisheye"}, Radial(),
        {"Cylindrical"},     {"Spherical"},   CylinderLike()};
    return columns;
}

struct GridRow {
    Group sources;
    std::vector<Route> cells;  // one a column
};

std::vector<GridRow> const& GridRows() {
    // clang-format off
    static std::vector<GridRow> const rows = {
        // to:  Equirectangular, Rectilinear, Stereographic, Fisheye,
        //      Orthographic..., Cylindrical, Spherical, Mercator...
        {{"Equirectangular"},
         {SAME, OWN, OWN, OWN,
          Through("Fisheye"), OWN, Through("Cylindrical"), OWN}},
        {{"Rectilinear"},
         {OWN, SAME, Through("Equirectangular"), OWN,
          Through("Fisheye"), OWN, Through("Cylindrical"), Through("Equirectangular")}},
        {{"Stereographic"},
         {OWN, Through("Equirectangular"), SAME, Through("Equirectangular"),
          Through("Equirectangular", "Fisheye"), Through("Equirectangular"),
          Through("Equirectangular", "Cylindrical"), Through("Equirectangular")}},
        {{"Fisheye"},
         {OWN, OWN, Through("Equirectangular"), SAME,
          OWN, OWN, Through("Cylindrical"), Through("Equirectangular")}},
        {{"Cylindrical"},
         {OWN, OWN, Through("Equirectangular"), OWN,
          Through("Fisheye"), SAME, OWN, Through("Equirectangular")}},
        {Radial(),
         {Through("Fisheye"), Through("Fisheye"), Through("Fisheye", "Equirectangular"), OWN,
          Through("Fisheye"), Through("Fisheye"), Through("Fisheye", "Cylindrical"),
          Through("Fisheye", "Equirectangular")}},
        {CylinderLike(),
         {OWN, Through("Equirectangular"), Through("Equirectangular"), Through("Equirectangular"),
          Through("Equirectangular", "Fisheye"), Through("Equirectangular"),
          Through("Equirectangular", "Cylindrical"), Through("Equirectangular")}},
    };
    // clang-format on
    return rows;
}

bool Contains(Group const& group, std::string const& name) {
    for (std::string const& member : group) {
        if (member == name) {
            return true;
        }
    }
    return false;
}

// The route of one conversion; empty when the grid has no cell for it.
Route ExpectedRoute(std::string const& source, std::string const& target) {
    if (source == target) {
        return SAME;  // the diagonal, and within a group a projection to itself
    }
    for (GridRow const& row : GridRows()) {
        if (!Contains(row.sources, source)) {
            continue;
        }
        for (std::size_t column = 0; column < GridColumns().size(); ++column) {
            if (Contains(GridColumns()[column], target)) {
                Route route = row.cells[column];
                for (std::string& stop : route) {
                    stop = stop == "X" ? source : stop == "Y" ? target : stop;
                }
                return route;
            }
        }
    }
    return {};
}

Route ExpectedRoute(Member const& member) {
    return ExpectedRoute(member.source, member.target);
}

bool IsComposed(Route const& route) {
    return route.size() >= 3;
}

std::vector<Member> MembersWhere(bool (*predicate)(Route const& route)) {
    std::vector<Member> chosen;
    for (Member const& member : Members()) {
        if (predicate(ExpectedRoute(member))) {
            chosen.push_back(member);
        }
    }
    return chosen;
}

std::string MemberName(testing::TestParamInfo<Member> const& param_info) {
    return Name(param_info.param);
}

TEST(Projection, HasAConversionForEveryOrderedPairAndSphericalToSpherical) {
    std::set<std::string> expected;
    for (std::string const& source : Sources()) {
        for (std::string const& target : Sources()) {
            expected.insert(source + "To" + target);
        }
        expected.insert(source + "ToSpherical");
    }
    expected.insert("SphericalToSpherical");
    std::set<std::string> actual;
    for (Member const& member : Members()) {
        EXPECT_TRUE(actual.insert(Name(member)).second) << Name(member) << " twice";
        EXPECT_NE(nullptr, member.function) << Name(member);
    }
    EXPECT_EQ(211u, Members().size());
    EXPECT_EQ(expected, actual);
}

TEST(Projection, GridHasFifteenCopiesThirtyThreeFormulasAndOneHundredSixtyThreeCompositions) {
    EXPECT_EQ(15u, MembersWhere([](Route const& route) { return route == SAME; }).size());
    EXPECT_EQ(33u, MembersWhere([](Route const& route) { return route == OWN; }).size());
    EXPECT_EQ(163u, MembersWhere(&IsComposed).size());
    EXPECT_TRUE(MembersWhere([](Route const& route) { return route.empty(); }).empty());
}

TEST(Projection, EveryStageOfACompositionIsAFormulaOfItsOwn) {
    for (Member const& member : MembersWhere(&IsComposed)) {
        Route const route = ExpectedRoute(member);
        for (std::size_t stop = 0; stop + 1 < route.size(); ++stop) {
            EXPECT_EQ(OWN, ExpectedRoute(route[stop], route[stop + 1]))
                << Name(member) << " through " << route[stop] << "To" << route[stop + 1];
        }
    }
}

class ProjectionCopyTest : public testing::TestWithParam<Member> {};

TEST_P(ProjectionCopyTest, GivesBackThePointBitForBit) {
    std::vector<Vector2d> const points = {
        Vector2d(0.0f, -0.0f),
        Vector2d(123.25f, -4567.5f),
        Vector2d(NAN_VALUE, 3.0f),
        Vector2d(-INFINITY_VALUE, NAN_VALUE),
        Vector2d(__builtin_bit_cast(float, 0x7FC12345u), __builtin_bit_cast(float, 0xFFC00001u)),
        Vector2d(__builtin_bit_cast(float, 0x00000001u), -1e38f)};
    for (float const f : {400.0f, 0.0f, NAN_VALUE}) {
        for (Vector2d const& p : points) {
            Vector2d const result = GetParam().function(p, f);
            EXPECT_EQ(Bits(p.x), Bits(result.x)) << Show(p) << " at " << f;
            EXPECT_EQ(Bits(p.y), Bits(result.y)) << Show(p) << " at " << f;
        }
    }
}

INSTANTIATE_TEST_SUITE_P(
    , ProjectionCopyTest,
    testing::ValuesIn(MembersWhere([](Route const& route) { return route == SAME; })), &MemberName);

class ProjectionCompositionTest : public testing::TestWithParam<Member> {};

TEST_P(ProjectionCompositionTest, EqualsItsStagesOneAfterAnotherBitForBit) {
    Route const route = ExpectedRoute(GetParam());
    std::vector<Vector2d> points;
    for (float const f : FocalLengths()) {
        for (Pair const& point : Anywhere()) {
            points.push_back(AtFocalLength(point, f));
        }
    }
    points.push_back(Vector2d(NAN_VALUE, 200.0f));
    points.push_back(Vector2d(100.0f, INFINITY_VALUE));
    points.push_back(Vector2d(-INFINITY_VALUE, -INFINITY_VALUE));
    for (float const f : FocalLengths()) {
        for (Vector2d const& p : points) {
            Vector2d expected = p;
            for (std::size_t stop = 0; stop + 1 < route.size(); ++stop) {
                expected = Find(route[stop], route[stop + 1])(expected, f);
            }
            Vector2d const actual = GetParam().function(p, f);
            EXPECT_TRUE(SamePoint(expected, actual))
                << Show(p) << " at " << f << ": " << Show(actual) << " against " << Show(expected);
        }
    }
}

INSTANTIATE_TEST_SUITE_P(, ProjectionCompositionTest, testing::ValuesIn(MembersWhere(&IsComposed)),
                         &MemberName);

// The conversions with a formula of their own, against the geometry they stand for.

struct ClosedFormRow {
    ConversionFunction function;
    char const* name;
    std::vector<Pair> const* points;
    Pair (*closed_form)(double x, double y, double f);
};

void PrintTo(ClosedFormRow const& row, std::ostream* out) {
    *out << row.name;
}

std::vector<ClosedFormRow> const& ClosedForms() {
    static std::vector<ClosedFormRow> const rows = {
        // Out of Equirectangular.
        {&Projection::EquirectangularToRectilinear, "EquirectangularToRectilinear", &InFront(),
         [](double x, double y, double f) {
             return RectilinearOf(OfLongitudeAndLatitude(x / f, y / f), f);
         }},
        {&Projection::EquirectangularToFisheye, "EquirectangularToFisheye", &InFront(),
         [](double x, double y, double f) {
             return FisheyeOf(OfLongitudeAndLatitude(x / f, y / f), f);
         }},
        {&Projection::EquirectangularToStereographic, "EquirectangularToStereographic", &InFront(),
         [](double x, double y, double f) {
             Direction const d = OfLongitudeAndLatitude(x / f, y / f);
             return Pair{2.0 * f * d.x / (1.0 + d.z), 2.0 * f * d.y / (1.0 + d.z)};
         }},
        {&Projection::EquirectangularToCylindrical, "EquirectangularToCylindrical", &InFront(),
         [](double x, double y, double f) {
             return Pair{x, f * std::tan(y / f)};
         }},
        {&Projection::EquirectangularToMercator, "EquirectangularToMercator", &InFront(),
         [](double x, double y, double f) {
             return Pair{x, f * std::log(std::tan(PI_DOUBLE / 4.0 + y / f / 2.0))};
         }},
        {&Projection::EquirectangularToLambertCylindrical, "EquirectangularToLambertCylindrical",
         &InsideTheDisc(),
         [](double x, double y, double f) {
             return Pair{x, f * std::asin(y / f)};
         }},
        {&Projection::EquirectangularToMillerCylindrical, "EquirectangularToMillerCylindrical",
         &InFront(),
         [](double x, double y, double f) {
             return Pair{x, f * MillerHeight(y / f)};
         }},
        {&Projection::EquirectangularToArchitectural, "EquirectangularToArchitectural",
         &InsideTheDisc(),
         [](double x, double y, double f) {
             return Pair{x, y < 0.0 ? f * MillerHeight(y / f) : f * std::asin(y / f)};
         }},
        {&Projection::EquirectangularToPannini, "EquirectangularToPannini", &InsideTheDisc(),
         [](double x, double y, double f) {
             double const half = x / f / 2.0;
             return Pair{2.0 * f * std::tan(half),
                         f * std::tan(std::tan(y / f)) / Square(std::cos(half))};
         }},
        {&Projection::EquirectangularToEquirectangularPannini,
         "EquirectangularToEquirectangularPannini", &InsideTheDisc(),
         [](double x, double y, double f) {
             double const half = x / f / 2.0;
             return Pair{2.0 * f * std::tan(half), f * std::tan(y / f) / Square(std::cos(half))};
         }},
        // Into Equirectangular.
        {&Projection::RectilinearToEquirectangular, "RectilinearToEquirectangular", &InFront(),
         [](double x, double y, double f) {
             return EquirectangularOf({x, y, f}, f);
         }},
        {&Projection::FisheyeToEquirectangular, "FisheyeToEquirectangular", &InFront(),
         [](double x, double y, double f) { return EquirectangularOf(OfFisheye(x, y, f), f); }},
        {&Projection::StereographicToEquirectangular, "StereographicToEquirectangular", &InFront(),
         [](double x, double y, double f) {
             double const q = std::hypot(x / f, y / f);
             double const c = 2.0 * std::atan(q / 2.0);
             Direction const d{x / f * std::sin(c) / q, y / f * std::sin(c) / q, std::cos(c)};
             // The latitude stays in radians.
             return Pair{f * std::atan2(d.x, d.z), std::asin(d.y)};
         }},
        {&Projection::CylindricalToEquirectangular, "CylindricalToEquirectangular", &InFront(),
         [](double x, double y, double f) { return EquirectangularOf(OfCylindrical(x, y, f), f); }},
        {&Projection::MercatorToEquirectangular, "MercatorToEquirectangular", &InFront(),
         [](double x, double y, double f) {
             return Pair{x, f * Gudermannian(y / f)};
         }},
        {&Projection::LambertCylindricalToEquirectangular, "LambertCylindricalToEquirectangular",
         &InFront(),
         [](double x, double y, double f) {
             return Pair{x, f * std::sin(y / f)};
         }},
        {&Projection::MillerCylindricalToEquirectangular, "MillerCylindricalToEquirectangular",
         &InFront(),
         [](double x, double y, double f) {
             return Pair{x, f * MillerLatitude(y / f)};
         }},
        {&Projection::ArchitecturalToEquirectangular, "ArchitecturalToEquirectangular", &InFront(),
         [](double x, double y, double f) {
             return Pair{x, y < 0.0 ? f * MillerLatitude(y / f) : f * std::sin(y / f)};
         }},
        {&Projection::PanniniToEquirectangular, "PanniniToEquirectangular", &InFront(),
         [](double x, double y, double f) {
             double const longitude = 2.0 * std::atan(x / f / 2.0);
             return Pair{f * longitude,
                         f * std::atan(std::atan(y / f * Square(std::cos(longitude / 2.0))))};
         }},
        {&Projection::EquirectangularPanniniToEquirectangular,
         "EquirectangularPanniniToEquirectangular", &InFront(),
         [](double x, double y, double f) {
             double const longitude = 2.0 * std::atan(x / f / 2.0);
             return Pair{f * longitude, f * std::atan(y / f * Square(std::cos(longitude / 2.0)))};
         }},
        // The radial family.
        {&Projection::FisheyeToOrthographic, "FisheyeToOrthographic", &InFront(),
         [](double x, double y, double f) {
             Direction const d = OfFisheye(x, y, f);
             return Pair{f * d.x, f * d.y};
         }},
        {&Projection::FisheyeToEquisolid, "FisheyeToEquisolid", &InFront(),
         [](double x, double y, double f) {
             return AtRadius(x, y, 2.0 * f * std::sin(std::hypot(x, y) / f / 2.0));
         }},
        {&Projection::FisheyeToMirror, "FisheyeToMirror", &InFront(),
         [](double x, double y, double f) {
             return AtRadius(x, y, f * std::sin(std::hypot(x, y) / f / 2.0));
         }},
        {&Projection::FisheyeToRectilinear, "FisheyeToRectilinear", &InFront(),
         [](double x, double y, double f) { return RectilinearOf(OfFisheye(x, y, f), f); }},
        {&Projection::OrthographicToFisheye, "OrthographicToFisheye", &InsideTheDisc(),
         [](double x, double y, double f) {
             return AtRadius(x, y, f * std::asin(std::hypot(x, y) / f));
         }},
        {&Projection::EquisolidToFisheye, "EquisolidToFisheye", &InsideTheDisc(),
         [](double x, double y, double f) {
             return AtRadius(x, y, 2.0 * f * std::asin(std::hypot(x, y) / f / 2.0));
         }},
        {&Projection::MirrorToFisheye, "MirrorToFisheye", &InsideTheDisc(),
         [](double x, double y, double f) {
             return AtRadius(x, y, 2.0 * f * std::asin(std::hypot(x, y) / f));
         }},
        {&Projection::RectilinearToFisheye, "RectilinearToFisheye", &InFront(),
         [](double x, double y, double f) {
             return FisheyeOf({x, y, f}, f);
         }},
        // With Cylindrical.
        {&Projection::CylindricalToRectilinear, "CylindricalToRectilinear", &InFront(),
         [](double x, double y, double f) { return RectilinearOf(OfCylindrical(x, y, f), f); }},
        {&Projection::RectilinearToCylindrical, "RectilinearToCylindrical", &InsideTheDisc(),
         [](double x, double y, double f) {
             return Pair{f * std::atan(x / f), y / std::acos(x / f)};
         }},
        {&Projection::CylindricalToFisheye, "CylindricalToFisheye", &InFront(),
         [](double x, double y, double f) { return FisheyeOf(OfCylindrical(x, y, f), f); }},
        {&Projection::FisheyeToCylindrical, "FisheyeToCylindrical", &InFront(),
         [](double x, double y, double f) {
             Direction const d = OfFisheye(x, y, f);
             return Pair{f * std::atan2(d.x, d.z), f * d.y / std::hypot(d.x, d.z)};
         }},
        {&Projection::CylindricalToSpherical, "CylindricalToSpherical", &InFront(),
         [](double x, double y, double f) {
             double const turn = -x / (HALF_PI_DOUBLE * f);
             double const radius = f * (HALF_PI_DOUBLE + std::atan(y / (HALF_PI_DOUBLE * f)));
             return Pair{radius * std::cos(turn), radius * std::sin(turn)};
         }},
    };
    return rows;
}

TEST(Projection, EveryFormulaOfTheGridHasAClosedFormTestAndNothingElseHasOne) {
    std::set<std::string> formulas;
    for (Member const& member : MembersWhere([](Route const& route) { return route == OWN; })) {
        formulas.insert(Name(member));
    }
    std::set<std::string> tested;
    for (ClosedFormRow const& row : ClosedForms()) {
        tested.insert(row.name);
        EXPECT_EQ(FindByName(row.name), row.function) << row.name;
    }
    EXPECT_EQ(formulas, tested);
}

class ProjectionFormulaTest : public testing::TestWithParam<ClosedFormRow> {};

TEST_P(ProjectionFormulaTest, MatchesItsClosedForm) {
    for (float const f : {400.0f, 1.75f}) {
        for (Pair const& point : *GetParam().points) {
            Vector2d const p = AtFocalLength(point, f);
            Pair const expected = GetParam().closed_form(double(p.x), double(p.y), double(f));
            EXPECT_TRUE(IsNear(GetParam().function(p, f), expected, f, CLOSED_FORM_TOLERANCE))
                << Show(p) << " at " << f;
        }
    }
}

INSTANTIATE_TEST_SUITE_P(, ProjectionFormulaTest, testing::ValuesIn(ClosedForms()),
                         [](testing::TestParamInfo<ClosedFormRow> const& param_info) {
                             return std::string(param_info.param.name);
                         });

// Pairs that undo each other within a domain, over a grid of points in focal lengths.

struct RoundTripRow {
    char const* name;
    ConversionFunction there;
    ConversionFunction back;
    bool polar;  // a and b are a radius and an angle, else x and y
    double a_from;
    double a_to;
    double b_from;
    double b_to;
};

void PrintTo(RoundTripRow const& row, std::ostream* out) {
    *out << row.name;
}

class ProjectionRoundTripTest : public testing::TestWithParam<RoundTripRow> {};

TEST_P(ProjectionRoundTripTest, ComesBackWithinFloatPrecision) {
    RoundTripRow const& row = GetParam();
    int const steps = 6;  // an even count keeps the grid off the centre
    for (float const f : {400.0f, 1.75f}) {
        for (int i = 0; i < steps; ++i) {
            for (int j = 0; j < steps; ++j) {
                double const a = row.a_from + (row.a_to - row.a_from) * i / (steps - 1);
                double const b = row.b_from + (row.b_to - row.b_from) * j / (steps - 1);
                Pair const point = row.polar ? Pair{a * std::cos(b), a * std::sin(b)} : Pair{a, b};
                Vector2d const p = AtFocalLength(point, f);
                Vector2d const back = row.back(row.there(p, f), f);
                EXPECT_TRUE(IsNear(back, Of(p), f, ROUND_TRIP_TOLERANCE))
                    << Show(p) << " at " << f << " by way of " << Show(row.there(p, f));
            }
        }
    }
}

INSTANTIATE_TEST_SUITE_P(
    , ProjectionRoundTripTest,
    testing::Values(
        RoundTripRow{"EquirectangularThroughCylindrical", &Projection::EquirectangularToCylindrical,
                     &Projection::CylindricalToEquirectangular, false, -3.0, 3.0, -1.4, 1.4},
        RoundTripRow{"EquirectangularThroughMercator", &Projection::EquirectangularToMercator,
                     &Projection::MercatorToEquirectangular, false, -3.0, 3.0, -1.4, 1.4},
        RoundTripRow{"EquirectangularThroughMillerCylindrical",
                     &Projection::EquirectangularToMillerCylindrical,
                     &Projection::MillerCylindricalToEquirectangular, false, -3.0, 3.0, -1.4, 1.4},
        RoundTripRow{"EquirectangularThroughLambertCylindricalUpToOneFocalLength",
                     &Projection::EquirectangularToLambertCylindrical,
                     &Projection::LambertCylindricalToEquirectangular, false, -3.0, 3.0, -1.0, 1.0},
        RoundTripRow{"EquirectangularThroughArchitecturalBetweenMinusOneAndAHalfAndOne",
                     &Projection::EquirectangularToArchitectural,
                     &Projection::ArchitecturalToEquirectangular, false, -3.0, 3.0, -1.49, 0.99},
        RoundTripRow{"EquirectangularThroughPannini", &Projection::EquirectangularToPannini,
                     &Projection::PanniniToEquirectangular, false, -2.5, 2.5, -0.9, 0.9},
        RoundTripRow{"EquirectangularThroughEquirectangularPannini",
                     &Projection::EquirectangularToEquirectangularPannini,
                     &Projection::EquirectangularPanniniToEquirectangular, false, -2.5, 2.5, -1.4,
                     1.4},
        RoundTripRow{"EquirectangularThroughFisheyeInFront", &Projection::EquirectangularToFisheye,
                     &Projection::FisheyeToEquirectangular, false, -1.5, 1.5, -1.5, 1.5},
        RoundTripRow{"FisheyeThroughEquirectangularInFront", &Projection::FisheyeToEquirectangular,
                     &Projection::EquirectangularToFisheye, true, 0.05, 1.5, -3.0, 3.0},
        RoundTripRow{"EquirectangularThroughRectilinearInFront",
                     &Projection::EquirectangularToRectilinear,
                     &Projection::RectilinearToEquirectangular, false, -1.4, 1.4, -1.2, 1.2},
        RoundTripRow{"RectilinearThroughEquirectangular", &Projection::RectilinearToEquirectangular,
                     &Projection::EquirectangularToRectilinear, false, -3.0, 3.0, -3.0, 3.0},
        RoundTripRow{"RectilinearThroughFisheye", &Projection::RectilinearToFisheye,
                     &Projection::FisheyeToRectilinear, false, -3.0, 3.0, -3.0, 3.0},
        RoundTripRow{"FisheyeThroughRectilinearInFront", &Projection::FisheyeToRectilinear,
                     &Projection::RectilinearToFisheye, true, 0.05, 1.4, -3.0, 3.0},
        RoundTripRow{"FisheyeThroughOrthographicInFront", &Projection::FisheyeToOrthographic,
                     &Projection::OrthographicToFisheye, true, 0.05, 1.4, -3.0, 3.0},
        RoundTripRow{"OrthographicThroughFisheyeInsideTheDisc", &Projection::OrthographicToFisheye,
                     &Projection::FisheyeToOrthographic, true, 0.05, 0.98, -3.0, 3.0},
        RoundTripRow{"FisheyeThroughEquisolid", &Projection::FisheyeToEquisolid,
                     &Projection::EquisolidToFisheye, true, 0.05, 2.8, -3.0, 3.0},
        RoundTripRow{"EquisolidThroughFisheyeInsideTheDisc", &Projection::EquisolidToFisheye,
                     &Projection::FisheyeToEquisolid, true, 0.05, 1.96, -3.0, 3.0},
        RoundTripRow{"FisheyeThroughMirror", &Projection::FisheyeToMirror,
                     &Projection::MirrorToFisheye, true, 0.05, 2.8, -3.0, 3.0},
        RoundTripRow{"MirrorThroughFisheyeInsideTheDisc", &Projection::MirrorToFisheye,
                     &Projection::FisheyeToMirror, true, 0.05, 0.98, -3.0, 3.0},
        RoundTripRow{"FisheyeThroughCylindricalInFront", &Projection::FisheyeToCylindrical,
                     &Projection::CylindricalToFisheye, true, 0.05, 1.45, -3.0, 3.0},
        RoundTripRow{"CylindricalThroughFisheyeInFront", &Projection::CylindricalToFisheye,
                     &Projection::FisheyeToCylindrical, false, -1.4, 1.4, -3.0, 3.0}),
    [](testing::TestParamInfo<RoundTripRow> const& param_info) {
        return std::string(param_info.param.name);
    });

// Pairs that do not undo each other, and stay that way.

TEST(Projection, StereographicRoundTripLeavesTheLatitudeInRadians) {
    float const f = 400.0f;
    Vector2d const p(0.3f * f, 0.5f * f);
    Vector2d const back = Projection::StereographicToEquirectangular(
        Projection::EquirectangularToStereographic(p, f), f);
    EXPECT_TRUE(IsNear(back, {double(p.x), 0.5}, f, ROUND_TRIP_TOLERANCE));
    EXPECT_GT(std::fabs(back.y - p.y), 100.0f);
}

TEST(Projection, LambertRoundTripDoesNotHoldBeyondOneFocalLength) {
    float const f = 400.0f;
    Vector2d const p(0.2f * f, 1.3f * f);
    float const latitude = Projection::EquirectangularToLambertCylindrical(p, f).y;
    EXPECT_EQ(f * Trigonometry::HALF_PI, latitude);  // the arcsine saturates
    Vector2d const back = Projection::LambertCylindricalToEquirectangular(
        Projection::EquirectangularToLambertCylindrical(p, f), f);
    EXPECT_TRUE(IsNear(back, {double(p.x), double(f)}, f, ROUND_TRIP_TOLERANCE));
}

TEST(Projection, RectilinearToCylindricalIsNotTheReverseOfCylindricalToRectilinear) {
    float const f = 400.0f;
    Vector2d const p(0.5f * f, 0.3f * f);
    Vector2d const rectilinear = Projection::CylindricalToRectilinear(p, f);
    Vector2d const back = Projection::RectilinearToCylindrical(rectilinear, f);
    // The longitude comes back; the height is divided by the arccosine of x / f instead of being
    // multiplied by the cosine of the longitude.
    double const x = double(rectilinear.x) / double(f);
    EXPECT_TRUE(IsNear(back, {double(p.x), double(rectilinear.y) / std::acos(x)}, f,
                       CLOSED_FORM_TOLERANCE));
    EXPECT_NEAR(double(p.x), double(back.x), ROUND_TRIP_TOLERANCE * double(f));
    EXPECT_GT(std::fabs(back.y - p.y), 10.0f);
}

TEST(Projection, EquirectangularBehindTheViewerComesBackFromRectilinearInFront) {
    float const f = 400.0f;
    Vector2d const behind(2.5f * f, 0.3f * f);
    Vector2d const back = Projection::RectilinearToEquirectangular(
        Projection::EquirectangularToRectilinear(behind, f), f);
    // The direction opposite through the centre of view, seen in front.
    EXPECT_TRUE(
        IsNear(back, {(2.5 - PI_DOUBLE) * double(f), -0.3 * double(f)}, f, ROUND_TRIP_TOLERANCE));
}

// Singular and out-of-range points.

TEST(Projection, EquirectangularToEquirectangularGivesBackAnyPointNanIncluded) {
    for (Vector2d const& p : {Vector2d(NAN_VALUE, NAN_VALUE), Vector2d(1.0f, NAN_VALUE),
                              Vector2d(__builtin_bit_cast(float, 0xFFC0BEEFu), -2.0f),
                              Vector2d(-INFINITY_VALUE, 7.5f)}) {
        Vector2d const result = Projection::EquirectangularToEquirectangular(p, 400.0f);
        EXPECT_EQ(Bits(p.x), Bits(result.x));
        EXPECT_EQ(Bits(p.y), Bits(result.y));
    }
}

TEST(Projection, EquirectangularToRectilinearShowsAPointBehindTheViewerInFront) {
    float const f = 400.0f;
    Vector2d const straight_behind =
        Projection::EquirectangularToRectilinear(Vector2d(Trigonometry::PI * f, 0.0f), f);
    EXPECT_TRUE(straight_behind.Valid());
    EXPECT_TRUE(IsNear(straight_behind, {0.0, 0.0}, f, NOISE_TOLERANCE));
    Vector2d const behind_and_up =
        Projection::EquirectangularToRectilinear(Vector2d(Trigonometry::PI * f, 0.3f * f), f);
    EXPECT_TRUE(IsNear(behind_and_up, {0.0, -double(f) * std::tan(0.3)}, f, CLOSED_FORM_TOLERANCE));
}

TEST(Projection, EquirectangularToRectilinearCarriesAPointOverThePoleToTheFarSide) {
    // Latitude pi/2 + 0.3 is colatitude 0.3 on the far side: longitude 0.2 + pi.
    float const f = 400.0f;
    Vector2d const over_the_pole(0.2f * f, (Trigonometry::HALF_PI + 0.3f) * f);
    double const longitude = 0.2 + PI_DOUBLE;
    EXPECT_TRUE(
        IsNear(Projection::EquirectangularToRectilinear(over_the_pole, f),
               {double(f) * std::tan(longitude), double(f) / (std::tan(0.3) * std::cos(longitude))},
               f, CLOSED_FORM_TOLERANCE));
    // Past the far pole the colatitude folds back below PI.
    Vector2d const past_the_far_pole(0.2f * f, -(Trigonometry::HALF_PI + 0.3f) * f);
    double const colatitude = PI_DOUBLE - 0.3;
    EXPECT_TRUE(IsNear(
        Projection::EquirectangularToRectilinear(past_the_far_pole, f),
        {double(f) * std::tan(longitude), double(f) / (std::tan(colatitude) * std::cos(longitude))},
        f, CLOSED_FORM_TOLERANCE));
}

TEST(Projection, EquirectangularToFisheyeOfTheCentreIsFloatNoiseNotNan) {
    for (float const f : FocalLengths()) {
        Vector2d const centre = Projection::EquirectangularToFisheye(Vector2d(0.0f, 0.0f), f);
        EXPECT_TRUE(centre.Valid()) << Show(centre);
        EXPECT_TRUE(IsNear(centre, {0.0, 0.0}, f, NOISE_TOLERANCE));
    }
}

TEST(Projection, FisheyeToEquirectangularOfTheCentreIsTheCentre) {
    Vector2d const centre = Projection::FisheyeToEquirectangular(Vector2d(0.0f, 0.0f), 400.0f);
    EXPECT_EQ(0.0f, centre.x);
    EXPECT_EQ(0.0f, centre.y);
}

TEST(Projection, RectilinearToFisheyeOfTheCentreIsTheCentre) {
    Vector2d const centre = Projection::RectilinearToFisheye(Vector2d(0.0f, 0.0f), 400.0f);
    EXPECT_EQ(0.0f, centre.x);
    EXPECT_EQ(0.0f, centre.y);
}

TEST(Projection, StereographicCentreHasNoImage) {
    Vector2d const equirectangular =
        Projection::StereographicToEquirectangular(Vector2d(0.0f, 0.0f), 400.0f);
    EXPECT_EQ(Bits(Vector2d::InvalidVector.x), Bits(equirectangular.x));
    EXPECT_EQ(Bits(Vector2d::InvalidVector.y), Bits(equirectangular.y));
    Vector2d const rectilinear =
        Projection::StereographicToRectilinear(Vector2d(0.0f, 0.0f), 400.0f);
    EXPECT_TRUE(std::isnan(rectilinear.x));
    EXPECT_TRUE(std::isnan(rectilinear.y));
}

TEST(Projection, StereographicCentreHasNoImageInAnyTarget) {
    for (Member const& member : Members()) {
        if (std::string(member.source) == "Stereographic" &&
            std::string(member.target) != "Stereographic") {
            Vector2d const result = member.function(Vector2d(0.0f, 0.0f), 400.0f);
            EXPECT_TRUE(std::isnan(result.x) && std::isnan(result.y))
                << Name(member) << ": " << Show(result);
        }
    }
}

TEST(Projection, StereographicPointWithinTheSmallestStepOfTheCentreHasNoImageEither) {
    float const f = 400.0f;
    Vector2d const near_centre(Trigonometry::EPSILON * f * 0.5f, 0.0f);
    EXPECT_TRUE(std::isnan(Projection::StereographicToEquirectangular(near_centre, f).y));
    Vector2d const off_centre(Trigonometry::EPSILON * f * 4.0f, 0.0f);
    EXPECT_FALSE(std::isnan(Projection::StereographicToEquirectangular(off_centre, f).y));
}

TEST(Projection, StereographicToEquirectangularGivesTheLatitudeInRadiansWhateverTheFocalLength) {
    // The point (0.3, 0.5) focal lengths off centre: c = 2·atan(q / 2).
    double const q = std::hypot(0.3, 0.5);
    double const c = 2.0 * std::atan(q / 2.0);
    double const latitude = std::asin(0.5 * std::sin(c) / q);
    double const longitude = std::atan2(0.3 * std::sin(c), q * std::cos(c));
    for (float const f : {1.0f, 2.0f, 400.0f, 1234.5f}) {
        Vector2d const result =
            Projection::StereographicToEquirectangular(Vector2d(0.3f * f, 0.5f * f), f);
        EXPECT_NEAR(latitude, double(result.y), CLOSED_FORM_TOLERANCE) << f;
        EXPECT_NEAR(longitude * double(f), double(result.x), CLOSED_FORM_TOLERANCE * double(f))
            << f;
    }
}

TEST(Projection, CylindricalToFisheyeOfTheCentreIsNan) {
    Vector2d const centre = Projection::CylindricalToFisheye(Vector2d(0.0f, 0.0f), 400.0f);
    EXPECT_TRUE(std::isnan(centre.x));
    EXPECT_TRUE(std::isnan(centre.y));
    // And nothing after it brings the point back.
    EXPECT_FALSE(Projection::CylindricalToOrthographic(Vector2d(0.0f, 0.0f), 400.0f).Valid());
}

TEST(Projection, RectilinearToCylindricalAtXEqualToTheFocalLengthGivesAnInfiniteHeight) {
    float const f = 400.0f;
    for (float const y : {1.0f, 250.0f, -3.5f, 1e-20f}) {
        Vector2d const result = Projection::RectilinearToCylindrical(Vector2d(f, y), f);
        EXPECT_EQ(y > 0.0f ? INFINITY_VALUE : -INFINITY_VALUE, result.y) << y;
        EXPECT_TRUE(std::isfinite(result.x));
    }
}

TEST(Projection, OrthographicToFisheyeOfTwiceTheFocalLengthLandsOnTheEdgeOfTheDisc) {
    float const f = 400.0f;
    Vector2d const on_axis = Projection::OrthographicToFisheye(Vector2d(2.0f * f, 0.0f), f);
    EXPECT_EQ(f * Trigonometry::HALF_PI, on_axis.x);
    EXPECT_EQ(0.0f, on_axis.y);
    Vector2d const diagonal = Projection::OrthographicToFisheye(Vector2d(1.2f * f, -1.6f * f), f);
    EXPECT_NEAR(double(f) * HALF_PI_DOUBLE, double(diagonal.Length()),
                CLOSED_FORM_TOLERANCE * double(f));
}

TEST(Projection, RadialConversionsSaturateAtTheEdgeOfTheirDiscs) {
    float const f = 400.0f;
    Vector2d const outside(3.0f * f, 0.0f);
    EXPECT_EQ(2.0f * f * Trigonometry::HALF_PI, Projection::EquisolidToFisheye(outside, f).x);
    EXPECT_EQ(2.0f * f * Trigonometry::HALF_PI, Projection::MirrorToFisheye(outside, f).x);
}

TEST(Projection, FisheyeToOrthographicFoldsAPointBeyondAQuarterTurnIntoTheDisc) {
    float const f = 400.0f;
    Vector2d const beyond = Projection::FisheyeToOrthographic(Vector2d(0.0f, 2.5f * f), f);
    Vector2d const mirror =
        Projection::FisheyeToOrthographic(Vector2d(0.0f, float((PI_DOUBLE - 2.5) * double(f))), f);
    EXPECT_NEAR(double(mirror.y), double(beyond.y), CLOSED_FORM_TOLERANCE * double(f));
}

TEST(Projection, FisheyeToRectilinearBeyondAQuarterTurnHoldsTheAngleAtTheFloatHalfPi) {
    float const f = 400.0f;
    Vector2d const result = Projection::FisheyeToRectilinear(Vector2d(2.0f * f, 0.0f), f);
    // The tangent of the float HALF_PI, about -2.3e7: far out on the opposite side. Float tan
    // and a compile-time fold may differ in the last place here, so not bit for bit.
    double const held = double(f) * std::tan(double(Trigonometry::HALF_PI));
    EXPECT_TRUE(IsNear(result, {held, 0.0}, f, CLOSED_FORM_TOLERANCE));
    EXPECT_LT(result.x, -1e6f * f);
    EXPECT_FALSE(IsNear(result, {double(f) * std::tan(2.0), 0.0}, f, 1.0));
}

TEST(Projection, EquirectangularToArchitecturalAtTheHorizonTakesTheLambertBranch) {
    float const f = 400.0f;
    Vector2d const horizon(123.0f, 0.0f);
    Vector2d const result = Projection::EquirectangularToArchitectural(horizon, f);
    EXPECT_TRUE(SamePoint(Projection::EquirectangularToLambertCylindrical(horizon, f), result));
    EXPECT_EQ(0.0f, result.y);
    EXPECT_EQ(123.0f, result.x);
    // A horizon of -0 is no lower: it keeps its sign through the arcsine, where Miller's
    // logarithm would give +0.
    Vector2d const negative_zero(123.0f, -0.0f);
    EXPECT_TRUE(SamePoint(Projection::EquirectangularToLambertCylindrical(negative_zero, f),
                          Projection::EquirectangularToArchitectural(negative_zero, f)));
    EXPECT_EQ(0x80000000u, Bits(Projection::EquirectangularToArchitectural(negative_zero, f).y));
}

TEST(Projection, ArchitecturalIsMillerBelowTheHorizonAndLambertAbove) {
    float const f = 400.0f;
    // Close to the horizon the two differ only in the cube of the latitude, but not bit for bit.
    for (float const height : {-0.4f, -0.05f, 0.05f, 0.4f}) {
        Vector2d const p(10.0f, height * f);
        bool const below = height < 0.0f;
        EXPECT_TRUE(SamePoint(below ? Projection::EquirectangularToMillerCylindrical(p, f)
                                    : Projection::EquirectangularToLambertCylindrical(p, f),
                              Projection::EquirectangularToArchitectural(p, f)))
            << height;
        EXPECT_TRUE(SamePoint(below ? Projection::MillerCylindricalToEquirectangular(p, f)
                                    : Projection::LambertCylindricalToEquirectangular(p, f),
                              Projection::ArchitecturalToEquirectangular(p, f)))
            << height;
        EXPECT_FALSE(SamePoint(Projection::MillerCylindricalToEquirectangular(p, f),
                               Projection::LambertCylindricalToEquirectangular(p, f)))
            << height;
    }
    Vector2d const horizon(10.0f, 0.0f);
    EXPECT_TRUE(SamePoint(Projection::LambertCylindricalToEquirectangular(horizon, f),
                          Projection::ArchitecturalToEquirectangular(horizon, f)));
}

// Spherical: a polar picture of the Cylindrical one.

TEST(Projection, CylindricalToSphericalPutsTheAxisOfViewOnACircleOfRadiusHalfPiF) {
    float const f = 400.0f;
    Vector2d const centre = Projection::CylindricalToSpherical(Vector2d(0.0f, 0.0f), f);
    EXPECT_EQ(Trigonometry::HALF_PI * f, centre.x);
    EXPECT_EQ(0.0f, centre.y);
}

TEST(Projection, CylindricalToSphericalTakesUpOutward) {
    float const f = 400.0f;
    float const level = Projection::CylindricalToSpherical(Vector2d(0.0f, 0.0f), f).Length();
    EXPECT_GT(Projection::CylindricalToSpherical(Vector2d(0.0f, 100.0f), f).Length(), level);
    EXPECT_LT(Projection::CylindricalToSpherical(Vector2d(0.0f, -100.0f), f).Length(), level);
}

TEST(Projection, CylindricalToSphericalTurnsTwoRadiansForEachHalfCircleOfLongitude) {
    float const f = 400.0f;
    Vector2d const half_circle =
        Projection::CylindricalToSpherical(Vector2d(Trigonometry::PI * f, 0.0f), f);
    EXPECT_NEAR(-2.0, std::atan2(double(half_circle.y), double(half_circle.x)),
                CLOSED_FORM_TOLERANCE);
}

TEST(Projection, SphericalIsReachedThroughCylindricalFromEverySource) {
    float const f = 400.0f;
    Vector2d const p(0.3f * f, -0.2f * f);
    EXPECT_TRUE(SamePoint(
        Projection::CylindricalToSpherical(Projection::EquirectangularToCylindrical(p, f), f),
        Projection::EquirectangularToSpherical(p, f)));
    EXPECT_TRUE(SamePoint(Projection::SphericalToSpherical(p, f), p));
}

// Links to space: the centre of the picture looks along -z.

TEST(Projection, EquirectangularToVector3dOfTheCentreIsCloseToMinusZ) {
    Vector3d const v = Projection::EquirectangularToVector3d(Vector2d(0.0f, 0.0f), 400.0f);
    EXPECT_NEAR(0.0, double(v.x), NOISE_TOLERANCE);
    EXPECT_NEAR(0.0, double(v.y), NOISE_TOLERANCE);
    EXPECT_NEAR(-1.0, double(v.z), NOISE_TOLERANCE);
}

TEST(Projection, EquirectangularToVector3dMatchesItsClosedForm) {
    float const f = 400.0f;
    for (Pair const& point : Anywhere()) {
        Vector2d const p = AtFocalLength(point, f);
        double const longitude = double(p.x) / double(f);
        double const latitude = double(p.y) / double(f);
        Vector3d const v = Projection::EquirectangularToVector3d(p, f);
        EXPECT_NEAR(std::cos(latitude) * std::sin(longitude), double(v.x), CLOSED_FORM_TOLERANCE);
        EXPECT_NEAR(std::sin(latitude), double(v.y), CLOSED_FORM_TOLERANCE);
        EXPECT_NEAR(-std::cos(latitude) * std::cos(longitude), double(v.z), CLOSED_FORM_TOLERANCE);
    }
}

TEST(Projection, Vector3dToEquirectangularMatchesItsClosedFormWhateverTheLength) {
    float const f = 400.0f;
    for (Vector3d const& v : {Vector3d(0.0f, 0.0f, -1.0f), Vector3d(1.0f, 2.0f, -3.0f),
                              Vector3d(-4.0f, 0.5f, 2.0f), Vector3d(0.2f, -0.1f, 0.05f)}) {
        double const length = std::sqrt(double(v.x) * double(v.x) + double(v.y) * double(v.y) +
                                        double(v.z) * double(v.z));
        Pair const expected{double(f) * std::atan2(double(v.x), -double(v.z)),
                            double(f) * std::asin(double(v.y) / length)};
        EXPECT_TRUE(IsNear(Projection::Vector3dToEquirectangular(v, f), expected, f,
                           CLOSED_FORM_TOLERANCE));
    }
}

TEST(Projection, Vector3dToEquirectangularUndoesEquirectangularToVector3d) {
    float const f = 400.0f;
    for (Pair const& point : InFront()) {
        Vector2d const p = AtFocalLength(point, f);
        Vector2d const back =
            Projection::Vector3dToEquirectangular(Projection::EquirectangularToVector3d(p, f), f);
        EXPECT_TRUE(IsNear(back, Of(p), f, ROUND_TRIP_TOLERANCE)) << Show(p);
    }
}

}  // namespace
}  // namespace quorvel::vexmap
