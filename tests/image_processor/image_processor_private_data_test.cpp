#include <gtest/gtest.h>

#include "ImageProcessorPrivateData.h"

namespace {

ImageProcessorParams Outputs(bool cache_output, bool cache_panorama) {
    ImageProcessorParams params;
    params.OutputWidth = 8;
    params.OutputHeight = 4;
    params.CacheOutput = cache_output;
    params.PanoramaWidth = 6;
    params.PanoramaHeight = 2;
    params.CachePanorama = cache_panorama;
    return params;
}

TEST(ImageProcessorPrivateData, InitDataSizesColumnTermsAndMapsByTheOutputs) {
    ImageProcessorPrivateData data;
    data.InitData(Outputs(true, true));
    EXPECT_EQ(8u, data.ColumnSquares.size());
    EXPECT_EQ(8u, data.ColumnCosines.size());
    EXPECT_EQ(8u, data.ColumnSines.size());
    EXPECT_EQ(32u, data.PtzMap.size());
    EXPECT_EQ(32u, data.PtzFractions.size());
    EXPECT_EQ(12u, data.PanoramaMap.size());
    EXPECT_EQ(12u, data.PanoramaFractions.size());
}

TEST(ImageProcessorPrivateData, InitDataMakesNoMapForAnOutputThatIsNotCached) {
    ImageProcessorPrivateData data;
    data.InitData(Outputs(false, false));
    EXPECT_TRUE(data.PtzMap.empty());
    EXPECT_TRUE(data.PanoramaMap.empty());
}

TEST(ImageProcessorPrivateData, MapEntriesStartAsNoPixel) {
    ImageProcessorPrivateData data;
    data.InitData(Outputs(true, true));
    EXPECT_EQ(ImageProcessorPrivateData::NO_PIXEL, data.PtzMap.front());
    EXPECT_EQ(ImageProcessorPrivateData::NO_PIXEL, data.PanoramaMap.back());
    EXPECT_EQ(0.0f, data.PtzFractions.front().x);
}

TEST(ImageProcessorPrivateData, DeleteDataForgetsTheCachedPositionAndBothMaps) {
    ImageProcessorPrivateData data;
    data.InitData(Outputs(true, true));
    data.CachedPan = 10.0;
    data.CachedTilt = 20.0;
    data.CachedZoom = 2.0;
    data.PtzMapValid = true;
    data.PanoramaMapValid = true;
    data.DeleteData();
    EXPECT_EQ(0.0, data.CachedPan);
    EXPECT_EQ(0.0, data.CachedTilt);
    EXPECT_EQ(0.0, data.CachedZoom);
    EXPECT_FALSE(data.PtzMapValid);
    EXPECT_FALSE(data.PanoramaMapValid);
    EXPECT_TRUE(data.PtzMap.empty());
    EXPECT_TRUE(data.ColumnSquares.empty());
}

TEST(ImageProcessorPrivateData, ReinitDataDropsTheValidFlagsAndSizesAnew) {
    ImageProcessorPrivateData data;
    data.InitData(Outputs(true, true));
    data.PtzMapValid = true;
    ImageProcessorParams larger = Outputs(true, false);
    larger.OutputWidth = 16;
    data.ReinitData(larger);
    EXPECT_FALSE(data.PtzMapValid);
    EXPECT_EQ(64u, data.PtzMap.size());
    EXPECT_TRUE(data.PanoramaMap.empty());
}

}  // namespace
