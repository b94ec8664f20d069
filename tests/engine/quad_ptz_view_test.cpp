#include "vexmap/quad_ptz_view.h"

#include <cstdlib>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/trigonometry.h"
#include "view_test_support.h"

namespace quorvel::vexmap {
namespace {

using testing::Entries;
using testing::Entry;
using testing::EntryOf;
using testing::ExpectedWord;
using testing::IsUnmapped;
using testing::MakeFisheye;

constexpr float DEGREE = Trigonometry::PI / 180.0f;

/// The quad map walked plainly, with the pane that wrote each entry last (0 for none).
struct ReferenceQuad {
    std::vector<Entry> entries;
    std::vector<int> owner;
};

ReferenceQuad WalkQuad(QuadPtzView& view) {
    int const width = int(view.GetDewarpedSize().x);
    int const height = int(view.GetDewarpedSize().y);
    boost::shared_ptr<MapFunctor> const scale(view.GetScaleFunctor(view.GetCropSize()));
    boost::shared_ptr<MapFunctor> const projection(view.GetProjectionFunctor());
    boost::shared_ptr<MapFunctor> const panes[4] = {
        boost::shared_ptr<MapFunctor>(view.GetPtzFunctor()),
        boost::shared_ptr<MapFunctor>(view.GetPtzPane2()),
        boost::shared_ptr<MapFunctor>(view.GetPtzPane3()),
        boost::shared_ptr<MapFunctor>(view.GetPtzPane4())};
    float const cx = view.GetCamera().GetResolution().x / 2.0f;
    float const cy = view.GetCamera().GetResolution().y / 2.0f;
    ReferenceQuad quad{std::vector<Entry>(std::size_t(width * height), Entry{65535, 65535}),
                       std::vector<int>(std::size_t(width * height), 0)};
    auto store = [&](int pane, int column, int row, Vector2d const& p) {
        ASSERT_LT(column, width);
        quad.entries[std::size_t(row * width + column)] =
            Entry{ExpectedWord(p.x + cx), ExpectedWord(p.y + cy)};
        quad.owner[std::size_t(row * width + column)] = pane + 1;
    };
    auto half = [](Vector2d const& a, Vector2d const& b) {
        return Vector2d((a.x + b.x) * 0.5f, (a.y + b.y) * 0.5f);
    };
    int const left = int(-float(width) / 2.0f);
    int const right = int(float(width) / 2.0f);
    int const bottom = int(-float(height) / 2.0f);
    int const top = int(float(height) / 2.0f);
    for (int y = bottom; y < 0; ++y) {
        int x_in = right + 2 * left;
        int const y_in = top + 2 * y;
        int const row = int(float(height) / 2.0f) + y;
        int const columns[4] = {int(float(left) + float(width) / 2.0f), int(float(width) / 2.0f),
                                int(float(left) + float(width) / 2.0f), int(float(width) / 2.0f)};
        int const rows[4] = {row, row, row + top, row + top};
        int next[4];
        Vector2d last[4];
        Vector2d const sample = projection->Call(scale->Call(Vector2d(float(x_in), float(y_in))));
        for (int k = 0; k < 4; ++k) {
            last[k] = panes[k]->Call(sample);
            store(k, columns[k], rows[k], last[k]);
            next[k] = columns[k] + 1;
        }
        auto span = [&](int k, Vector2d const& s) {
            Vector2d const q = panes[k]->Call(s);
            Vector2d const p = last[k];
            Vector2d const m4 = half(p, q);
            Vector2d const m2 = half(p, m4);
            Vector2d const m6 = half(m4, q);
            for (Vector2d const& point :
                 {half(p, m2), m2, half(m2, m4), m4, half(m4, m6), m6, half(m6, q), q}) {
                store(k, next[k]++, rows[k], point);
            }
            last[k] = q;
        };
        for (int x = left + 8; x <= 8; x += 8) {
            x_in += 16;
            Vector2d const s = projection->Call(scale->Call(Vector2d(float(x_in), float(y_in))));
            span(0, s);
            span(2, s);
            if (x < 0) {
                span(1, s);
                span(3, s);
            }
        }
    }
    return quad;
}

void BuildAt(QuadPtzView& view, int width, int height) {
    view.SetDewarpedSize(Resolution(width, height));
    view.BuildMap();
}

PtzPosition Panned(float degrees) {
    return PtzPosition(EulerAngles(degrees * DEGREE, -0.5f, 0.0f), 1.0f);
}

class QuadPtzViewTest : public ::testing::TestWithParam<_DEWARP_INTERNAL_CAMERA_MOUNT> {};

TEST_P(QuadPtzViewTest, MapEqualsAPlainWalkOfItsFourPanes) {
    QuadPtzView view(MakeFisheye(GetParam()), DEWARP_PROJECTION_RECTILINEAR);
    view.SetAspectRatio(DEWARP_ASPECT_RATIO_FILL);
    view.SetPtz(Panned(25.0f));
    for (auto size : {std::pair<int, int>{80, 40}, {64, 48}, {81, 41}}) {
        BuildAt(view, size.first, size.second);
        EXPECT_EQ(WalkQuad(view).entries, Entries(*view.GetImageMap()))
            << size.first << "x" << size.second;
    }
}

INSTANTIATE_TEST_SUITE_P(LookingUpOrDown, QuadPtzViewTest,
                         ::testing::Values(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING,
                                           DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR));

TEST(QuadPtzView, PanesTwoThreeAndFourLookAQuarterHalfAndThreeQuartersOfATurnOn) {
    auto const camera = MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    QuadPtzView quad(camera, DEWARP_PROJECTION_RECTILINEAR);
    quad.SetPtz(Panned(20.0f));
    boost::shared_ptr<MapFunctor> const panes[3] = {
        boost::shared_ptr<MapFunctor>(quad.GetPtzPane2()),
        boost::shared_ptr<MapFunctor>(quad.GetPtzPane3()),
        boost::shared_ptr<MapFunctor>(quad.GetPtzPane4())};
    float const pans[3] = {110.0f, -160.0f, -70.0f};  // 20 + 90, + 180, + 270
    for (int k = 0; k < 3; ++k) {
        QuadPtzView single(camera, DEWARP_PROJECTION_RECTILINEAR);
        single.SetPtz(Panned(pans[k]));
        boost::shared_ptr<MapFunctor> const pane_one(single.GetPtzFunctor());
        for (Vector2d const& point : {Vector2d(10, 20), Vector2d(-40, 5), Vector2d(0, -60)}) {
            Vector2d const expected = pane_one->Call(point);
            Vector2d const actual = panes[k]->Call(point);
            EXPECT_NEAR(expected.x, actual.x, 1e-2f) << "pane " << k + 2;
            EXPECT_NEAR(expected.y, actual.y, 1e-2f) << "pane " << k + 2;
        }
    }
}

TEST(QuadPtzView, PanZeroAndPanNinetyShowTheSameLooksEachMovedOnePaneOn) {
    auto const camera = MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    QuadPtzView zero(camera, DEWARP_PROJECTION_RECTILINEAR);
    QuadPtzView ninety(camera, DEWARP_PROJECTION_RECTILINEAR);
    zero.SetPtz(Panned(0.0f));
    ninety.SetPtz(Panned(90.0f));
    BuildAt(zero, 160, 80);
    BuildAt(ninety, 160, 80);
    // Pane 2 of pan 0 starts at column 80 of the top rows, pane 1 of pan 90 at column 0; both
    // sample the crop at the same points. Compared where pane 2 is not overwritten.
    int mismatches = 0;
    for (int row = 0; row < 40; ++row) {
        for (int offset = 9; offset < 73; ++offset) {
            Entry const a = EntryOf(*zero.GetImageMap(), 80 + offset, row);
            Entry const b = EntryOf(*ninety.GetImageMap(), offset, row);
            mismatches += std::abs(int(a.x) - int(b.x)) > 1 || std::abs(int(a.y) - int(b.y)) > 1;
        }
    }
    EXPECT_EQ(0, mismatches);
}

TEST(QuadPtzView, OnAWallItShowsTheOnePictureOfASinglePtzView) {
    auto const camera = MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_WALL);
    QuadPtzView quad(camera, DEWARP_PROJECTION_RECTILINEAR);
    SinglePtzView single(camera, DEWARP_PROJECTION_RECTILINEAR);
    PtzPosition const position(EulerAngles(0.3f, 0.1f, 0.0f), 1.2f);
    quad.SetPtz(position);
    single.SetPtz(position);
    quad.SetDewarpedSize(Resolution(64, 32));
    single.SetDewarpedSize(Resolution(64, 32));
    quad.BuildMap();
    single.BuildMap();
    EXPECT_EQ(Entries(*single.GetImageMap()), Entries(*quad.GetImageMap()));
    EXPECT_EQ(single.GetPtz(), quad.GetPtz());
}

TEST(QuadPtzView, WithAnEvenSizeThePanesMeetAtTheCentreRow) {
    QuadPtzView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                     DEWARP_PROJECTION_RECTILINEAR);
    view.SetAspectRatio(DEWARP_ASPECT_RATIO_FILL);
    BuildAt(view, 64, 48);
    ReferenceQuad const quad = WalkQuad(view);
    for (int column : {0, 20}) {
        EXPECT_EQ(1, quad.owner[std::size_t(23 * 64 + column)]);
        EXPECT_EQ(3, quad.owner[std::size_t(24 * 64 + column)]);
    }
    for (int column : {44, 50}) {
        EXPECT_EQ(2, quad.owner[std::size_t(0 * 64 + column)]);
        EXPECT_EQ(4, quad.owner[std::size_t(47 * 64 + column)]);
    }
    EXPECT_EQ(quad.entries, Entries(*view.GetImageMap()));
}

TEST(QuadPtzView, AtWidth640Column330BelongsToPaneTwoAndColumn328ToPaneOne) {
    QuadPtzView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                     DEWARP_PROJECTION_RECTILINEAR);
    view.SetAspectRatio(DEWARP_ASPECT_RATIO_FILL);
    view.SetPtz(Panned(10.0f));
    BuildAt(view, 640, 4);
    ReferenceQuad const quad = WalkQuad(view);
    EXPECT_EQ(1, quad.owner[328]);
    EXPECT_EQ(2, quad.owner[329]);
    EXPECT_EQ(2, quad.owner[330]);
    EXPECT_EQ(2, quad.owner[632]);
    EXPECT_EQ(0, quad.owner[633]);
    SimpleImageMap const& map = *view.GetImageMap();
    EXPECT_EQ(quad.entries, Entries(map));
    for (int column = 633; column < 640; ++column) {
        EXPECT_TRUE(IsUnmapped(EntryOf(map, column, 0)));
    }
}

TEST(QuadPtzView, NothingIsWrittenWhenClippingLeavesNoRows) {
    QuadPtzView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                     DEWARP_PROJECTION_RECTILINEAR);
    view.SetAspectRatio(DEWARP_ASPECT_RATIO_FIT);
    BuildAt(view, 1000, 1);  // the square crop is 1 x 1: no row below the centre
    for (Entry const& entry : Entries(*view.GetImageMap())) {
        EXPECT_TRUE(IsUnmapped(entry));
    }
}

TEST(QuadPtzView, NarrowOutputsKeepTheLeftPanesInsideTheirRows) {
    QuadPtzView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                     DEWARP_PROJECTION_RECTILINEAR);
    view.SetAspectRatio(DEWARP_ASPECT_RATIO_FILL);
    for (int width : {1, 2, 8, 9, 16, 17}) {
        BuildAt(view, width, 6);
        ASSERT_TRUE(view.GetImageMap()) << width;
        EXPECT_FALSE(IsUnmapped(EntryOf(*view.GetImageMap(), 0, 0))) << width;
    }
}

TEST(QuadPtzView, ReadingBackThePositionGivesPaneOnesLimitedAsASingleView) {
    auto const camera = MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    QuadPtzView quad(camera, DEWARP_PROJECTION_RECTILINEAR);
    SinglePtzView single(camera, DEWARP_PROJECTION_RECTILINEAR);
    PtzPosition const wanted(EulerAngles(1.0f, 1.5f, 0.0f), 0.1f);
    EXPECT_EQ(single.SetPtz(wanted), quad.SetPtz(wanted));
    EXPECT_NE(wanted, quad.GetPtz());
    EXPECT_FLOAT_EQ(1.0f, quad.GetPtz().orientation.pan);
}

TEST(QuadPtzView, AssignmentToItselfWarnsWithItsOwnName) {
    QuadPtzView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                     DEWARP_PROJECTION_RECTILINEAR);
    RecordingLogSink sink(DEWARP_LOG_LEVEL_WARNING);
    QuadPtzView& same = view;
    view = same;
    ASSERT_EQ(1u, sink.Count());
    EXPECT_THAT(sink.Lines()[0].text, ::testing::HasSubstr("Self assignment of QuadPtzView"));
}

TEST(QuadPtzView, AnOutputWithoutColumnsGetsATableWithoutEntries) {
    QuadPtzView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                     DEWARP_PROJECTION_RECTILINEAR);
    view.SetAspectRatio(DEWARP_ASPECT_RATIO_STRETCH);
    BuildAt(view, 0, 6);
    ASSERT_TRUE(view.GetImageMap());
    EXPECT_EQ(0, view.GetImageMap()->GetMapWidth());
}

}  // namespace
}  // namespace quorvel::vexmap
