#include "vexmap/water_mark.h"

#include <gtest/gtest.h>

#include "recording_log_sink.h"

namespace quorvel::vexmap {
namespace {

_DEWARP_IMAGE ImageWithoutPixels() {
    return _DEWARP_IMAGE{{DEWARP_IMAGE_FORMAT_YUV420_PLANAR, 640, 480, 640}, nullptr};
}

TEST(WaterMark, CheckImagePassesAnImageWithoutPixels) {
    WaterMark mark;
    EXPECT_TRUE(mark.CheckImage(ImageWithoutPixels()));
    EXPECT_TRUE(WaterMark(ImageWithoutPixels()).Valid());
}

TEST(WaterMark, IsAlwaysValid) {
    EXPECT_TRUE(WaterMark().Valid());
}

TEST(WaterMark, NamesTheBuiltInCameraModel) {
    _DEWARP_INTERNAL_CAMERA_MODEL const model = WaterMark().GetCameraModel();
    EXPECT_EQ(DEWARP_INTERNAL_CAMERA_TYPE_CIRCULAR_FISHEYE, model.type);
    EXPECT_EQ(183.0f, model.diagonal_fov);
    EXPECT_EQ(183.0f, model.horizontal_fov);
    EXPECT_EQ(183.0f, model.vertical_fov);
    EXPECT_EQ(1936u, model.width);
    EXPECT_EQ(1936u, model.height);
}

TEST(WaterMark, NamesTheDefaultMount) {
    EXPECT_EQ(DEWARP_INTERNAL_CAMERA_MOUNT_WALL, WaterMark().GetCameraMount());
}

TEST(WaterMark, AssignmentToItselfWarns) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    WaterMark mark;
    WaterMark& same = mark;
    mark = same;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of WaterMark object\n", lines[0].text);
}

TEST(WaterMark, AssignmentFromAnotherIsSilent) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    WaterMark const other;
    WaterMark mark(other);
    mark = other;
    EXPECT_EQ(0u, sink.Count());
}

}  // namespace
}  // namespace quorvel::vexmap
