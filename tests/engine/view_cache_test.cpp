#include "vexmap/view_cache.h"

#include <cstddef>
#include <vector>

#include <boost/make_shared.hpp>
#include <boost/shared_ptr.hpp>
#include <boost/weak_ptr.hpp>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/channel.h"
#include "vexmap/ptz_position.h"
#include "vexmap/tarvex_brenvia_418.h"
#include "vexmap/view.h"

namespace quorvel::vexmap {
namespace {

/// A view that only holds state: the cache never looks further.
class StubView : public AbstractView {
public:
    void DewarpImage(_DEWARP_IMAGE const&, _DEWARP_IMAGE&) override {}
};

/// Lets a test see how many views the channel has cached.
class CountingChannel : public Channel {
public:
    CountingChannel(_DEWARP_INTERNAL_CAMERA_MODEL const& model, _DEWARP_INTERNAL_CAMERA_MOUNT mount)
        : Channel(model, mount) {}
    std::size_t CacheSize() const { return m_Cache.Size(); }
};

/// A YUV 4:2:0 frame that owns its pixels, luma and chroma numbered so that every source pixel
/// differs from its neighbours.
class Frame {
public:
    Frame(std::size_t width, std::size_t height) : pixels(width * height * 3 / 2) {
        image.info = {DEWARP_IMAGE_FORMAT_YUV420_PLANAR, width, height, width};
        image.data = pixels.data();
        for (std::size_t index = 0; index < pixels.size(); ++index) {
            pixels[index] = static_cast<unsigned char>(index * 7 + index / width * 13);
        }
    }
    Frame(Frame const&) = delete;
    Frame& operator=(Frame const&) = delete;

    _DEWARP_IMAGE const& Image() const { return image; }
    _DEWARP_IMAGE& Image() { return image; }

private:
    _DEWARP_IMAGE image;
    std::vector<unsigned char> pixels;
};

// The built-in lens on a small sensor keeps map builds short.
_DEWARP_INTERNAL_CAMERA_MODEL SmallCamera() {
    _DEWARP_INTERNAL_CAMERA_MODEL model = TarvexBrenvia418;
    model.width = 640;
    model.height = 640;
    return model;
}

boost::shared_ptr<SimpleImageMap> MapOf(boost::shared_ptr<AbstractView> const& view) {
    return dynamic_cast<View&>(*view).GetImageMap();
}

void ExpectSamePosition(_DEWARP_PTZ_POSITION const& expected, _DEWARP_PTZ_POSITION const& actual) {
    EXPECT_EQ(expected.pan, actual.pan);
    EXPECT_EQ(expected.tilt, actual.tilt);
    EXPECT_EQ(expected.roll, actual.roll);
    EXPECT_EQ(expected.zoom, actual.zoom);
}

ViewCache::Key const CeilingPtz = ViewCache::MakeKey(
    DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, DEWARP_PROJECTION_RECTILINEAR, DEWARP_VIEW_SINGLE_PTZ);

TEST(ViewCache, GetOnAnEmptyCacheReturnsNull) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    ViewCache const cache;
    EXPECT_EQ(nullptr, cache.Get(CeilingPtz));
    EXPECT_EQ(nullptr, cache.Get(DEWARP_INTERNAL_CAMERA_MOUNT_WALL, DEWARP_PROJECTION_CYLINDRICAL,
                                 DEWARP_VIEW_SINGLE_PANORAMIC));
    EXPECT_EQ(0u, sink.Count());
}

TEST(ViewCache, MakeKeyHoldsMountThenProjectionThenView) {
    ViewCache::Key const key = ViewCache::MakeKey(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR,
                                                  DEWARP_PROJECTION_MERCATOR, DEWARP_VIEW_QUAD_PTZ);
    EXPECT_EQ(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR, key.first);
    EXPECT_EQ(DEWARP_PROJECTION_MERCATOR, key.second.first);
    EXPECT_EQ(DEWARP_VIEW_QUAD_PTZ, key.second.second);
}

TEST(ViewCache, KeysSortByMountThenProjectionThenView) {
    using K = ViewCache;
    EXPECT_LT(K::MakeKey(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING,
                         DEWARP_PROJECTION_EQUIRECTANGULAR_PANNINI, DEWARP_VIEW_QUAD_PTZ),
              K::MakeKey(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR, DEWARP_PROJECTION_RECTILINEAR,
                         DEWARP_VIEW_SINGLE_PANORAMIC));
    EXPECT_LT(K::MakeKey(DEWARP_INTERNAL_CAMERA_MOUNT_WALL, DEWARP_PROJECTION_CYLINDRICAL,
                         DEWARP_VIEW_QUAD_PTZ),
              K::MakeKey(DEWARP_INTERNAL_CAMERA_MOUNT_WALL, DEWARP_PROJECTION_EQUIRECTANGULAR,
                         DEWARP_VIEW_SINGLE_PANORAMIC));
    EXPECT_LT(K::MakeKey(DEWARP_INTERNAL_CAMERA_MOUNT_WALL, DEWARP_PROJECTION_CYLINDRICAL,
                         DEWARP_VIEW_DUAL_PANORAMIC),
              K::MakeKey(DEWARP_INTERNAL_CAMERA_MOUNT_WALL, DEWARP_PROJECTION_CYLINDRICAL,
                         DEWARP_VIEW_SINGLE_PTZ));
}

TEST(ViewCache, GetReturnsTheObjectThatSetStored) {
    ViewCache cache;
    boost::shared_ptr<AbstractView> view = boost::make_shared<StubView>();
    cache.Set(CeilingPtz, view);
    EXPECT_EQ(view, cache.Get(CeilingPtz));
    EXPECT_EQ(view, cache.Get(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, DEWARP_PROJECTION_RECTILINEAR,
                              DEWARP_VIEW_SINGLE_PTZ));
    EXPECT_EQ(2, view.use_count());
}

TEST(ViewCache, SetByPartsStoresUnderTheKeyOfThoseParts) {
    ViewCache cache;
    boost::shared_ptr<AbstractView> view = boost::make_shared<StubView>();
    cache.Set(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, DEWARP_PROJECTION_RECTILINEAR,
              DEWARP_VIEW_SINGLE_PTZ, view);
    EXPECT_EQ(view, cache.Get(CeilingPtz));
}

TEST(ViewCache, EachPartOfTheKeyMakesAnotherEntry) {
    ViewCache cache;
    boost::shared_ptr<AbstractView> view = boost::make_shared<StubView>();
    cache.Set(CeilingPtz, view);
    EXPECT_EQ(nullptr, cache.Get(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR, DEWARP_PROJECTION_RECTILINEAR,
                                 DEWARP_VIEW_SINGLE_PTZ));
    EXPECT_EQ(nullptr, cache.Get(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING,
                                 DEWARP_PROJECTION_CYLINDRICAL, DEWARP_VIEW_SINGLE_PTZ));
    EXPECT_EQ(nullptr, cache.Get(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING,
                                 DEWARP_PROJECTION_RECTILINEAR, DEWARP_VIEW_QUAD_PTZ));
    boost::shared_ptr<AbstractView> other = boost::make_shared<StubView>();
    cache.Set(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING, DEWARP_PROJECTION_RECTILINEAR,
              DEWARP_VIEW_QUAD_PTZ, other);
    EXPECT_EQ(2u, cache.Size());
    EXPECT_EQ(view, cache.Get(CeilingPtz));
}

TEST(ViewCache, SetTwiceUnderOneKeyLogsOnceAndKeepsTheSecond) {
    ViewCache cache;
    boost::shared_ptr<AbstractView> first = boost::make_shared<StubView>();
    boost::shared_ptr<AbstractView> second = boost::make_shared<StubView>();
    boost::weak_ptr<AbstractView> const first_seen = first;
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    cache.Set(CeilingPtz, first);
    EXPECT_EQ(0u, sink.Count());
    first.reset();
    cache.Set(CeilingPtz, second);
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: INFO - Projection map cache item was overwritten\n", lines[0].text);
    EXPECT_EQ(second, cache.Get(CeilingPtz));
    EXPECT_EQ(1u, cache.Size());
    EXPECT_TRUE(first_seen.expired());  // the cache was its last holder
}

TEST(ViewCache, ClearRemovesEveryEntryAndReleasesTheViews) {
    ViewCache cache;
    boost::shared_ptr<AbstractView> view = boost::make_shared<StubView>();
    boost::weak_ptr<AbstractView> const seen = view;
    cache.Set(CeilingPtz, view);
    cache.Set(DEWARP_INTERNAL_CAMERA_MOUNT_WALL, DEWARP_PROJECTION_CYLINDRICAL,
              DEWARP_VIEW_SINGLE_PANORAMIC, view);
    view.reset();
    cache.Clear();
    EXPECT_EQ(0u, cache.Size());
    EXPECT_EQ(nullptr, cache.Get(CeilingPtz));
    EXPECT_TRUE(seen.expired());
}

TEST(ViewCache, ACopySharesTheViewsButNotLaterEntries) {
    ViewCache original;
    boost::shared_ptr<AbstractView> view = boost::make_shared<StubView>();
    original.Set(CeilingPtz, view);
    ViewCache copy(original);
    EXPECT_EQ(view, copy.Get(CeilingPtz));
    boost::shared_ptr<AbstractView> later = boost::make_shared<StubView>();
    copy.Set(DEWARP_INTERNAL_CAMERA_MOUNT_WALL, DEWARP_PROJECTION_CYLINDRICAL,
             DEWARP_VIEW_SINGLE_PANORAMIC, later);
    EXPECT_EQ(1u, original.Size());
    EXPECT_EQ(2u, copy.Size());
}

TEST(ViewCache, AssignmentReplacesTheEntriesAndSharesTheViews) {
    ViewCache source;
    ViewCache target;
    boost::shared_ptr<AbstractView> view = boost::make_shared<StubView>();
    boost::shared_ptr<AbstractView> replaced = boost::make_shared<StubView>();
    source.Set(CeilingPtz, view);
    target.Set(DEWARP_INTERNAL_CAMERA_MOUNT_WALL, DEWARP_PROJECTION_CYLINDRICAL,
               DEWARP_VIEW_SINGLE_PANORAMIC, replaced);
    target = source;
    EXPECT_EQ(1u, target.Size());
    EXPECT_EQ(view, target.Get(CeilingPtz));
    EXPECT_EQ(1, replaced.use_count());
}

TEST(ViewCache, AssignmentToItselfWarnsAndKeepsTheEntries) {
    ViewCache cache;
    boost::shared_ptr<AbstractView> view = boost::make_shared<StubView>();
    cache.Set(CeilingPtz, view);
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    ViewCache& same = cache;
    cache = same;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of ViewCache object\n", lines[0].text);
    EXPECT_EQ(view, cache.Get(CeilingPtz));
}

TEST(ViewCache, KeepsPtzPositionAndMapWhenViewIsRevisited) {
    CountingChannel channel(SmallCamera(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    Frame const source(640, 640);
    Frame output(160, 120);
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    _DEWARP_PTZ_POSITION moved{30.0f, -60.0f, 0.0f, 2.0f};
    channel.SetPtz(moved);
    ASSERT_TRUE(channel.DewarpImage(source.Image(), output.Image()));
    boost::shared_ptr<AbstractView> const ptz_view = channel.GetViewObject();
    boost::shared_ptr<SimpleImageMap> const ptz_map = MapOf(ptz_view);
    ASSERT_NE(nullptr, ptz_map);

    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PANORAMIC));
    ASSERT_TRUE(channel.DewarpImage(source.Image(), output.Image()));
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));

    EXPECT_EQ(ptz_view, channel.GetViewObject());
    _DEWARP_PTZ_POSITION found{};
    channel.GetPtz(found);
    ExpectSamePosition(moved, found);
    EXPECT_EQ(ptz_map, MapOf(ptz_view));
    ASSERT_TRUE(channel.DewarpImage(source.Image(), output.Image()));
    EXPECT_EQ(ptz_map, MapOf(ptz_view));  // the frame found the map and built none
    EXPECT_EQ(2u, channel.CacheSize());
}

TEST(ViewCache, TwoProjectionsOfOneViewKindAreTwoEntriesWithTheirOwnPositions) {
    CountingChannel channel(SmallCamera(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel.SetProjection(DEWARP_VIEW_SINGLE_PTZ, DEWARP_PROJECTION_RECTILINEAR));
    boost::shared_ptr<AbstractView> const rectilinear = channel.GetViewObject();
    _DEWARP_PTZ_POSITION first{40.0f, -70.0f, 0.0f, 1.5f};
    channel.SetPtz(first);

    ASSERT_TRUE(channel.SetProjection(DEWARP_VIEW_SINGLE_PTZ, DEWARP_PROJECTION_CYLINDRICAL));
    boost::shared_ptr<AbstractView> const cylindrical = channel.GetViewObject();
    EXPECT_NE(rectilinear, cylindrical);
    EXPECT_EQ(PtzPosition::Identity, cylindrical->GetPtz());
    _DEWARP_PTZ_POSITION second{-100.0f, -30.0f, 0.0f, 3.0f};
    channel.SetPtz(second);

    ASSERT_TRUE(channel.SetProjection(DEWARP_VIEW_SINGLE_PTZ, DEWARP_PROJECTION_RECTILINEAR));
    _DEWARP_PTZ_POSITION found{};
    channel.GetPtz(found);
    ExpectSamePosition(first, found);
    ASSERT_TRUE(channel.SetProjection(DEWARP_VIEW_SINGLE_PTZ, DEWARP_PROJECTION_CYLINDRICAL));
    channel.GetPtz(found);
    ExpectSamePosition(second, found);
    EXPECT_EQ(2u, channel.CacheSize());
}

TEST(ViewCache, FindsTheFirstViewAgainAfterAMountChangeAndBack) {
    CountingChannel channel(SmallCamera(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    boost::shared_ptr<AbstractView> const ceiling_view = channel.GetViewObject();
    ASSERT_TRUE(channel.SetMount(DEWARP_INTERNAL_CAMERA_MOUNT_FLOOR));
    boost::shared_ptr<AbstractView> const floor_view = channel.GetViewObject();
    EXPECT_NE(ceiling_view, floor_view);
    ASSERT_TRUE(channel.SetMount(DEWARP_INTERNAL_CAMERA_MOUNT_CEILING));
    EXPECT_EQ(ceiling_view, channel.GetViewObject());
    EXPECT_EQ(2u, channel.CacheSize());
}

TEST(ViewCache, AfterAModelChangeEveryViewIsBuiltAfreshAtIdentity) {
    CountingChannel channel(SmallCamera(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    _DEWARP_PTZ_POSITION moved{30.0f, -60.0f, 0.0f, 2.0f};
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    channel.SetPtz(moved);
    boost::weak_ptr<AbstractView> const old_single = channel.GetViewObject();
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_QUAD_PTZ));
    channel.SetPtz(moved);
    boost::weak_ptr<AbstractView> const old_quad = channel.GetViewObject();

    ASSERT_TRUE(channel.SetModel(SmallCamera(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING));
    EXPECT_TRUE(old_single.expired());
    EXPECT_TRUE(old_quad.expired());
    EXPECT_EQ(1u, channel.CacheSize());  // the current view, built before SetModel returned
    EXPECT_EQ(PtzPosition::Identity, channel.GetViewObject()->GetPtz());
    ASSERT_TRUE(channel.SetView(DEWARP_VIEW_SINGLE_PTZ));
    EXPECT_EQ(PtzPosition::Identity, channel.GetViewObject()->GetPtz());
    EXPECT_EQ(2u, channel.CacheSize());
}

TEST(ViewCache, TwoChannelsThatOpenTheSameCameraHaveNoViewInCommon) {
    Channel first(SmallCamera(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    Channel second(SmallCamera(), DEWARP_INTERNAL_CAMERA_MOUNT_CEILING);
    Frame const source(640, 640);
    Frame output(160, 120);
    for (Channel* channel : {&first, &second}) {
        ASSERT_TRUE(channel->SetView(DEWARP_VIEW_SINGLE_PTZ));
        ASSERT_TRUE(channel->DewarpImage(source.Image(), output.Image()));
    }
    EXPECT_NE(first.GetViewObject(), second.GetViewObject());
    EXPECT_NE(&first.GetViewObject()->GetCamera(), &second.GetViewObject()->GetCamera());
    EXPECT_NE(MapOf(first.GetViewObject()), MapOf(second.GetViewObject()));
}

}  // namespace
}  // namespace quorvel::vexmap
