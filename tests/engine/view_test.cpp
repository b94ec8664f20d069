#include "vexmap/view.h"

#include <limits>
#include <random>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/error.h"
#include "vexmap/ptz_view_traits.h"
#include "vexmap/single_ptz_view.h"
#include "vexmap/transform_2d_functor.h"
#include "vexmap/trigonometry.h"
#include "view_test_support.h"

namespace quorvel::vexmap {
namespace {

using testing::Entries;
using testing::Entry;
using testing::EntryOf;
using testing::ExpectedWord;
using ::testing::HasSubstr;
using testing::IsUnmapped;
using testing::MakeFisheye;
using testing::RecordingFunctor;
using ::testing::ThrowsMessage;

/// A PTZ view that counts its builds and keeps every point its scale link was given.
class WatchedView : public SinglePtzView {
public:
    using SinglePtzView::SinglePtzView;
    void BuildMap() override {
        ++builds;
        SinglePtzView::BuildMap();
    }
    MapFunctor* GetScaleFunctor(Vector2d const& crop) const override {
        return new RecordingFunctor(SinglePtzView::GetScaleFunctor(crop), inputs);
    }
    int builds = 0;
    boost::shared_ptr<std::vector<Vector2d>> inputs{new std::vector<Vector2d>()};
};

/// An RGB32 frame of its own pixels, each word its index plus one so that no pixel is 0.
struct Rgb32Frame {
    Rgb32Frame(int width, int height, uint32_t fill) : pixels(std::size_t(width * height), fill) {
        image.info.format = DEWARP_IMAGE_FORMAT_RGB32_PACKED;
        image.info.width = std::size_t(width);
        image.info.height = std::size_t(height);
        image.info.stride = std::size_t(width);
        image.data = reinterpret_cast<unsigned char*>(pixels.data());
    }
    std::vector<uint32_t> pixels;
    _DEWARP_IMAGE image{};
};

Rgb32Frame NumberedSource(int size) {
    Rgb32Frame frame(size, size, 0);
    for (std::size_t i = 0; i < frame.pixels.size(); ++i) {
        frame.pixels[i] = uint32_t(i + 1);
    }
    return frame;
}

void Dewarp(View& view, int width, int height, int source_size = 256) {
    Rgb32Frame source = NumberedSource(source_size);
    Rgb32Frame output(width, height, 0xDEADBEEFu);
    view.DewarpImage(source.image, output.image);
}

/// The chain of a view walked plainly: one call every step columns, the points between halved in
/// the order the builder uses, each word rounded by hand. For outputs that the crop fills.
std::vector<Entry> ReferenceMap(View& view, int step) {
    int const width = int(view.GetDewarpedSize().x);
    int const height = int(view.GetDewarpedSize().y);
    Vector2d const crop = view.GetCropSize();
    boost::shared_ptr<MapFunctor> const scale(view.GetScaleFunctor(crop));
    boost::shared_ptr<MapFunctor> const projection(view.GetProjectionFunctor());
    boost::shared_ptr<MapFunctor> const turn(view.GetPtzFunctor());
    auto chain = [&](int x, int y) {
        return turn->Call(projection->Call(scale->Call(Vector2d(float(x), float(y)))));
    };
    float const cx = view.GetCamera().GetResolution().x / 2.0f;
    float const cy = view.GetCamera().GetResolution().y / 2.0f;
    auto entry = [&](Vector2d const& p) {
        return Entry{ExpectedWord(p.x + cx), ExpectedWord(p.y + cy)};
    };
    auto half = [](Vector2d const& a, Vector2d const& b) {
        return Vector2d((a.x + b.x) * 0.5f, (a.y + b.y) * 0.5f);
    };
    std::vector<Entry> map(std::size_t(width * height), Entry{65535, 65535});
    int const left = int(-float(width) / 2.0f);
    int const right = int(float(width) / 2.0f);
    int const bottom = int(-float(height) / 2.0f);
    int const top = int(float(height) / 2.0f);
    for (int y = bottom; y < top; ++y) {
        int const row = int(float(y) + float(height) / 2.0f);
        int column = int(float(left) + float(width) / 2.0f);
        Vector2d p = chain(left, y);
        map[std::size_t(row * width + column++)] = entry(p);
        for (int x = left + step; x < right; x += step) {
            Vector2d const q = chain(x, y);
            std::vector<Vector2d> points;
            if (step == 8) {
                Vector2d const m4 = half(p, q);
                Vector2d const m2 = half(p, m4);
                Vector2d const m6 = half(m4, q);
                points = {half(p, m2), m2, half(m2, m4), m4, half(m4, m6), m6, half(m6, q), q};
            } else if (step == 1) {
                points = {q};
            }
            for (Vector2d const& point : points) {
                map[std::size_t(row * width + column++)] = entry(point);
            }
            p = q;
        }
    }
    return map;
}

class ViewMountTest : public ::testing::TestWithParam<_DEWARP_INTERNAL_CAMERA_MOUNT> {};

TEST_P(ViewMountTest, EighthMapEqualsAPlainWalkOverTheSameChainEntryByEntry) {
    SinglePtzView view(MakeFisheye(GetParam()), DEWARP_PROJECTION_RECTILINEAR,
                       DEWARP_ASPECT_RATIO_FILL);
    PtzPosition turned(EulerAngles(0.3f, -0.4f, 0.0f), 1.5f);
    view.SetPtz(turned);
    Dewarp(view, 70, 44);
    ASSERT_TRUE(view.GetImageMap());
    std::vector<Entry> const expected = ReferenceMap(view, 8);
    EXPECT_EQ(expected, Entries(*view.GetImageMap()));
}

TEST_P(ViewMountTest, WholeMapAgreesWithTheEighthAtEveryEighthColumnAndFillsTheTail) {
    SinglePtzView view(MakeFisheye(GetParam()), DEWARP_PROJECTION_RECTILINEAR);
    Dewarp(view, 64, 40);
    boost::shared_ptr<SimpleImageMap> const eighth = view.GetImageMap();
    view.BuildWholeMap();
    boost::shared_ptr<SimpleImageMap> const whole = view.GetImageMap();
    ASSERT_NE(eighth, whole);
    EXPECT_EQ(ReferenceMap(view, 1), Entries(*whole));
    for (int row = 0; row < 40; ++row) {
        for (int column = 0; column < 64; column += 8) {
            EXPECT_EQ(EntryOf(*eighth, column, row), EntryOf(*whole, column, row))
                << "column " << column << " row " << row;
        }
        for (int column = 57; column < 64; ++column) {
            EXPECT_TRUE(IsUnmapped(EntryOf(*eighth, column, row)));
            EXPECT_FALSE(IsUnmapped(EntryOf(*whole, column, row)));
        }
    }
}

INSTANTIATE_TEST_SUITE_P(EveryMount, ViewMountTest,
                         ::testing::Values(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING,
                                           DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR,
                                           DEWARP_INTERNAL_CAMERA_MOUNT_WALL,
                                           DEWARP_INTERNAL_CAMERA_MOUNT_INVERTED_WALL));

TEST(View, HalfAndQuarterMapsAgreeWithTheEighthWhereTheyComputeTheSamePoints) {
    SinglePtzView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_WALL),
                       DEWARP_PROJECTION_RECTILINEAR);
    Dewarp(view, 48, 16);
    boost::shared_ptr<SimpleImageMap> const eighth = view.GetImageMap();
    view.BuildHalfMap();
    boost::shared_ptr<SimpleImageMap> const half = view.GetImageMap();
    view.BuildQuarterMap();
    boost::shared_ptr<SimpleImageMap> const quarter = view.GetImageMap();
    for (int row = 0; row < 16; ++row) {
        for (int column = 0; column < 41; column += 8) {
            EXPECT_EQ(EntryOf(*eighth, column, row), EntryOf(*half, column, row));
            EXPECT_EQ(EntryOf(*eighth, column, row), EntryOf(*quarter, column, row));
        }
        EXPECT_TRUE(IsUnmapped(EntryOf(*half, 47, row)));
        EXPECT_FALSE(IsUnmapped(EntryOf(*half, 46, row)));
        EXPECT_TRUE(IsUnmapped(EntryOf(*quarter, 45, row)));
        EXPECT_FALSE(IsUnmapped(EntryOf(*quarter, 44, row)));
    }
}

TEST(View, TwoFramesOfOneSizeRunTheChainOnce) {
    WatchedView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                     DEWARP_PROJECTION_RECTILINEAR);
    Dewarp(view, 32, 24);
    std::size_t const calls = view.inputs->size();
    boost::shared_ptr<SimpleImageMap> const first = view.GetImageMap();
    Dewarp(view, 32, 24);
    EXPECT_EQ(1, view.builds);
    EXPECT_EQ(calls, view.inputs->size());
    EXPECT_EQ(first, view.GetImageMap());
}

TEST(View, AFrameOfAnotherSizeRebuildsTheMapAtThatSizeInTheSameCall) {
    WatchedView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                     DEWARP_PROJECTION_RECTILINEAR);
    Dewarp(view, 32, 24);
    Dewarp(view, 40, 20);
    EXPECT_EQ(2, view.builds);
    ASSERT_TRUE(view.GetImageMap());
    EXPECT_EQ(40, view.GetImageMap()->GetMapWidth());
    EXPECT_EQ(20, view.GetImageMap()->GetMapHeight());
}

TEST(View, AtWidth640TheLastSevenColumnsStayUnmappedAndShowBlack) {
    SinglePtzView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                       DEWARP_PROJECTION_RECTILINEAR);
    Rgb32Frame source = NumberedSource(256);
    Rgb32Frame output(640, 12, 0xDEADBEEFu);
    view.DewarpImage(source.image, output.image);
    SimpleImageMap const& map = *view.GetImageMap();
    for (int row = 0; row < 12; ++row) {
        EXPECT_FALSE(IsUnmapped(EntryOf(map, 632, row)));
        for (int column = 633; column < 640; ++column) {
            EXPECT_TRUE(IsUnmapped(EntryOf(map, column, row)));
            EXPECT_EQ(0u, output.pixels[std::size_t(row * 640 + column)]);
        }
    }
}

TEST(View, AnOutputOfEightColumnsOrFewerHasOnlyItsFirstColumnWritten) {
    for (int width : {1, 5, 8}) {
        SinglePtzView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_WALL),
                           DEWARP_PROJECTION_RECTILINEAR);
        Dewarp(view, width, 6);
        SimpleImageMap const& map = *view.GetImageMap();
        for (int row = 0; row < 6; ++row) {
            EXPECT_FALSE(IsUnmapped(EntryOf(map, 0, row))) << width;
            for (int column = 1; column < width; ++column) {
                EXPECT_TRUE(IsUnmapped(EntryOf(map, column, row))) << width;
            }
        }
    }
}

TEST(View, AnOddSizeStartsAtColumnAndRowZeroAndNeverReachesTheLastOnes) {
    WatchedView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_WALL), DEWARP_PROJECTION_RECTILINEAR);
    Dewarp(view, 17, 5);  // from -8.5 to 8.5: L = -8, R = 8; rows from -2 to 1
    SimpleImageMap const& map = *view.GetImageMap();
    EXPECT_FLOAT_EQ(-8.0f, view.inputs->front().x);
    EXPECT_FLOAT_EQ(-2.0f, view.inputs->front().y);
    for (int row = 0; row < 4; ++row) {
        EXPECT_FALSE(IsUnmapped(EntryOf(map, 0, row)));
        EXPECT_FALSE(IsUnmapped(EntryOf(map, 8, row)));
        EXPECT_TRUE(IsUnmapped(EntryOf(map, 9, row)));
        EXPECT_TRUE(IsUnmapped(EntryOf(map, 16, row)));
    }
    for (int column = 0; column < 17; ++column) {
        EXPECT_TRUE(IsUnmapped(EntryOf(map, column, 4)));
    }
}

TEST(View, AChangeOfPanAndOfZoomBeforeTheNextFrameCauseOneBuild) {
    WatchedView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                     DEWARP_PROJECTION_RECTILINEAR);
    Dewarp(view, 32, 24);
    PtzPosition position = view.GetPtz();
    position.orientation.pan = 0.5f;
    view.SetPtz(position);
    EXPECT_FALSE(view.GetImageMap());
    position.zoom = 2.0f;
    view.SetPtz(position);
    Dewarp(view, 32, 24);
    EXPECT_EQ(2, view.builds);
}

TEST(View, APositionThatLimitingLeavesAsItWasKeepsTheMap) {
    WatchedView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                     DEWARP_PROJECTION_RECTILINEAR);
    Dewarp(view, 32, 24);
    boost::shared_ptr<SimpleImageMap> const map = view.GetImageMap();
    view.SetPtz(view.GetPtz());
    EXPECT_EQ(map, view.GetImageMap());
}

TEST(View, EveryChangeOfAspectRatioOrSizeDropsTheMapWithoutBuildingOne) {
    WatchedView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                     DEWARP_PROJECTION_RECTILINEAR);
    Dewarp(view, 32, 24);
    view.SetAspectRatio(DEWARP_ASPECT_RATIO_FIT);
    EXPECT_FALSE(view.GetImageMap());
    Dewarp(view, 32, 24);
    view.SetDewarpedSize(Resolution(16, 16));
    EXPECT_FALSE(view.GetImageMap());
    Dewarp(view, 16, 16);
    view.SetDewarpedSize(Resolution(20, 16), DEWARP_ASPECT_RATIO_FILL);
    EXPECT_FALSE(view.GetImageMap());
    EXPECT_EQ(3, view.builds);
}

TEST(View, FitOnAnOutputWiderThanTheProjectionLeavesBothSidesBlack) {
    SinglePtzView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                       DEWARP_PROJECTION_RECTILINEAR, DEWARP_ASPECT_RATIO_FIT);
    Rgb32Frame source = NumberedSource(256);
    Rgb32Frame output(96, 32, 0xDEADBEEFu);  // the PTZ picture is square
    view.DewarpImage(source.image, output.image);
    SimpleImageMap const& map = *view.GetImageMap();
    for (int row = 0; row < 32; ++row) {
        for (int column : {0, 31, 65, 95}) {
            EXPECT_TRUE(IsUnmapped(EntryOf(map, column, row))) << column;
            EXPECT_EQ(0u, output.pixels[std::size_t(row * 96 + column)]);
        }
        EXPECT_FALSE(IsUnmapped(EntryOf(map, 32, row)));
        EXPECT_FALSE(IsUnmapped(EntryOf(map, 48, row)));
    }
}

// The transform's y step is the inverse of scale_y, and its offset moves the origin.
Vector2d ScaleOf(MapFunctor& functor, Vector2d const& point) {
    return functor.Call(point);
}

TEST(View, OnACeilingScaleYIsTwiceAWallsAndTheOffsetHasTheOppositeSignToTheFloors) {
    SinglePtzView ceiling(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING),
                          DEWARP_PROJECTION_RECTILINEAR);
    SinglePtzView floor(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR),
                        DEWARP_PROJECTION_RECTILINEAR);
    SinglePtzView wall(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_WALL),
                       DEWARP_PROJECTION_RECTILINEAR);
    for (View* view :
         {static_cast<View*>(&ceiling), static_cast<View*>(&floor), static_cast<View*>(&wall)}) {
        view->SetDewarpedSize(Resolution(64, 48));
    }
    Vector2d const crop(64.0f, 48.0f);
    boost::shared_ptr<MapFunctor> const c(ceiling.GetScaleFunctor(crop));
    boost::shared_ptr<MapFunctor> const f(floor.GetScaleFunctor(crop));
    boost::shared_ptr<MapFunctor> const w(wall.GetScaleFunctor(crop));
    float const ceiling_step = ScaleOf(*c, Vector2d(0, 1)).y - ScaleOf(*c, Vector2d(0, 0)).y;
    float const wall_step = ScaleOf(*w, Vector2d(0, 1)).y - ScaleOf(*w, Vector2d(0, 0)).y;
    EXPECT_NEAR(wall_step / 2.0f, ceiling_step, 1e-5f);
    EXPECT_EQ(0.0f, ScaleOf(*w, Vector2d(0, 0)).y);
    float const ceiling_origin = ScaleOf(*c, Vector2d(0, 0)).y;
    float const floor_origin = ScaleOf(*f, Vector2d(0, 0)).y;
    EXPECT_NE(0.0f, ceiling_origin);
    EXPECT_FLOAT_EQ(-floor_origin, ceiling_origin);
}

TEST(View, TheOffsetOfAPtzPictureScalesWithTheZoomSoTheHorizonStaysPut) {
    SinglePtzView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR),
                       DEWARP_PROJECTION_RECTILINEAR);
    view.SetDewarpedSize(Resolution(64, 48));
    boost::shared_ptr<MapFunctor> const one(view.GetScaleFunctor(Vector2d(64, 48)));
    PtzPosition zoomed = view.GetPtz();
    zoomed.zoom = 2.0f;
    view.SetPtz(zoomed);
    ASSERT_EQ(2.0f, view.GetPtz().zoom);
    boost::shared_ptr<MapFunctor> const two(view.GetScaleFunctor(Vector2d(64, 48)));
    // The origin moves by offset / scale: the offset doubles and so does the scale.
    EXPECT_NEAR(one->Call(Vector2d(0, 0)).y, two->Call(Vector2d(0, 0)).y, 1e-4f);
    EXPECT_NE(0.0f, one->Call(Vector2d(0, 0)).y);
}

TEST(View, StoringRoundsAndWrapsAndClamps) {
    EXPECT_EQ(65535, View::MapWord(65535.4f));
    EXPECT_EQ(65535, View::MapWord(70000.0f));
    EXPECT_EQ(65535, View::MapWord(std::numeric_limits<float>::infinity()));
    EXPECT_EQ(65535, View::MapWord(-1.0f));
    EXPECT_EQ(65535, View::MapWord(-0.6f));
    EXPECT_EQ(0, View::MapWord(-0.4f));
    EXPECT_EQ(0, View::MapWord(std::numeric_limits<float>::quiet_NaN()));
    EXPECT_EQ(12, View::MapWord(12.5f));  // half to even
    EXPECT_EQ(14, View::MapWord(13.5f));
    EXPECT_EQ(65534, View::MapWord(-2.0f));
}

TEST(View, ValuesBelowTheIntegerRangeStoreZeroLikeNotANumber) {
    EXPECT_EQ(0, View::MapWord(-3.0e9f));
    EXPECT_EQ(0, View::MapWord(-std::numeric_limits<float>::infinity()));
    EXPECT_EQ(0, View::MapWord(-2147483648.0f));  // the integer minimum itself: low word 0
    EXPECT_EQ(ExpectedWord(-70000.0f), View::MapWord(-70000.0f));
}

TEST(View, WithoutAMapAfterBuildingTheFrameFailsWithInvalidImageMap) {
    class NoMapView : public SinglePtzView {
    public:
        using SinglePtzView::SinglePtzView;
        void BuildMap() override {}
    } view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_WALL), DEWARP_PROJECTION_RECTILINEAR);
    Rgb32Frame source = NumberedSource(256);
    Rgb32Frame output(8, 8, 7u);
    EXPECT_THAT([&] { view.DewarpImage(source.image, output.image); },
                ThrowsMessage<Error>(HasSubstr("Invalid image map")));
    EXPECT_EQ(EINVAL, errno);
    EXPECT_EQ(7u, output.pixels[0]);
}

TEST(View, TheOutputRecordDecidesTheMapSize) {
    SinglePtzView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_WALL),
                       DEWARP_PROJECTION_RECTILINEAR, Resolution(100, 100));
    Dewarp(view, 24, 10);
    EXPECT_EQ(Resolution(24, 10), view.GetDewarpedSize());
    EXPECT_EQ(24, view.GetImageMap()->GetMapWidth());
}

TEST(View, CheckMapSetsTheSizeAndBuildsOnlyWhenThereIsNoMap) {
    WatchedView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_WALL), DEWARP_PROJECTION_RECTILINEAR);
    view.CheckMap(Resolution(16, 8));
    view.CheckMap(Resolution(16, 8));
    EXPECT_EQ(1, view.builds);
    EXPECT_EQ(Resolution(16, 8), view.GetImageMap()->GetMapSize());
    EXPECT_EQ(view.GetCamera().GetResolution(), view.GetImageMap()->image_size);
}

TEST(View, ACopySharesTheMapAndAssignmentToItselfWarnsAndKeepsIt) {
    SinglePtzView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_WALL),
                       DEWARP_PROJECTION_RECTILINEAR);
    Dewarp(view, 16, 8);
    View copy(view);
    EXPECT_EQ(view.GetImageMap(), copy.GetImageMap());
    RecordingLogSink sink(DEWARP_LOG_LEVEL_WARNING);
    View& same = copy;
    copy = same;
    ASSERT_EQ(1u, sink.Count());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of View object\n", sink.Lines()[0].text);
    EXPECT_EQ(view.GetImageMap(), copy.GetImageMap());
}

TEST(View, AFailedBuildLeavesNoMapSoTheNextFrameTriesAgain) {
    class FailingView : public SinglePtzView {
    public:
        using SinglePtzView::SinglePtzView;
        MapFunctor* GetProjectionFunctor() override {
            if (fail) {
                throw Error("no projection");
            }
            return SinglePtzView::GetProjectionFunctor();
        }
        bool fail = true;
    } view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_WALL), DEWARP_PROJECTION_RECTILINEAR);
    EXPECT_THROW(Dewarp(view, 16, 8), Error);
    EXPECT_FALSE(view.GetImageMap());
    view.fail = false;
    Dewarp(view, 16, 8);
    EXPECT_TRUE(view.GetImageMap());
}

TEST(View, AnOutputTooLargeForATableIsRefusedBeforeAnythingIsWritten) {
    SinglePtzView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_WALL),
                       DEWARP_PROJECTION_RECTILINEAR);
    // 65536 x 32769 entries: the 32-bit word count would wrap to a table of 65536 words.
    view.SetDewarpedSize(Resolution(65536, 32769));
    RecordingLogSink sink(DEWARP_LOG_LEVEL_ERROR);
    EXPECT_THAT([&] { view.BuildMap(); },
                ThrowsMessage<Error>(HasSubstr("Invalid image map size")));
    EXPECT_EQ(ENOMEM, errno);
    EXPECT_EQ(1u, sink.Count());
    EXPECT_FALSE(view.GetImageMap());
}

TEST(View, AnOutputWithoutColumnsOrRowsGetsATableWithoutEntries) {
    for (Resolution const& size : {Resolution(0, 6), Resolution(6, 0)}) {
        SinglePtzView view(MakeFisheye(DEWARP_INTERNAL_CAMERA_MOUNT_WALL),
                           DEWARP_PROJECTION_RECTILINEAR, DEWARP_ASPECT_RATIO_STRETCH);
        view.SetDewarpedSize(size);
        view.BuildMap();
        ASSERT_TRUE(view.GetImageMap());
        EXPECT_EQ(size, view.GetImageMap()->GetMapSize());
    }
}

/// The builders' span store, reached from a test.
struct SpanStore : View {
    using View::StoreSpan;
};

// The eight words pairs of a span of 8, halved and rounded plainly.
std::vector<Entry> ExpectedSpan(Vector2d const& p, Vector2d const& q, Vector2d const& centre) {
    auto half = [](Vector2d const& a, Vector2d const& b) {
        return Vector2d((a.x + b.x) * 0.5f, (a.y + b.y) * 0.5f);
    };
    Vector2d const m4 = half(p, q);
    Vector2d const m2 = half(p, m4);
    Vector2d const m6 = half(m4, q);
    std::vector<Entry> entries;
    for (Vector2d const& m :
         {half(p, m2), m2, half(m2, m4), m4, half(m4, m6), m6, half(m6, q), q}) {
        entries.push_back(Entry{ExpectedWord(m.x + centre.x), ExpectedWord(m.y + centre.y)});
    }
    return entries;
}

std::vector<Entry> StoredSpan(Vector2d const& p, Vector2d const& q, Vector2d const& centre) {
    std::vector<unsigned short> words(16, 0xABCD);
    unsigned short* cursor = words.data();
    SpanStore::StoreSpan(cursor, p, q, centre, 8);
    EXPECT_EQ(words.data() + 16, cursor);
    std::vector<Entry> entries;
    for (std::size_t i = 0; i < 16; i += 2) {
        entries.push_back(Entry{words[i], words[i + 1]});
    }
    return entries;
}

TEST(View, ASpanStoresItsHalvedPointsRoundedWrappedAndClampedAsOneWordAtATime) {
    std::mt19937 random(11);
    std::uniform_real_distribution<float> coordinate(-70000.0f, 140000.0f);
    for (int i = 0; i < 20000; ++i) {
        Vector2d const p(coordinate(random), coordinate(random));
        Vector2d const q(coordinate(random), coordinate(random));
        Vector2d const centre(float(i % 3000), 1440.0f);
        ASSERT_EQ(ExpectedSpan(p, q, centre), StoredSpan(p, q, centre)) << i;
    }
}

TEST(View, ASpanWithAFarOrMissingPointStoresEveryWordAsTheStoringRuleSays) {
    float const nan = std::numeric_limits<float>::quiet_NaN();
    Vector2d const centre(1440.0f, 1440.0f);
    for (Vector2d const& q : {Vector2d(nan, 10.0f), Vector2d(10.0f, -5.0e9f),
                              Vector2d(6.0e6f, 20.0f), Vector2d(-4194304.0f, 1.0f)}) {
        EXPECT_EQ(ExpectedSpan(Vector2d(3.0f, 4.0f), q, centre),
                  StoredSpan(Vector2d(3.0f, 4.0f), q, centre));
    }
}

}  // namespace
}  // namespace quorvel::vexmap
