#include <cstdint>
#include <vector>

#include <gtest/gtest.h>

#include "ImageData.h"

namespace {

ImageData Sized(int width, int height, int stride) {
    ImageData image;
    image.Width = width;
    image.Height = height;
    image.Stride = stride;
    image.BitsPerPixel = 24;
    return image;
}

TEST(ImageData, StartsEmpty) {
    ImageData const image;
    EXPECT_EQ(nullptr, image.Data);
    EXPECT_FALSE(image.OwnsData);
    EXPECT_EQ(0u, image.ByteCount());
}

TEST(ImageData, InitDataAllocatesHeightTimesStrideZeroedBytesAndOwnsThem) {
    ImageData image = Sized(3, 4, 12);
    image.InitData();
    ASSERT_NE(nullptr, image.Data);
    EXPECT_TRUE(image.OwnsData);
    EXPECT_EQ(48u, image.ByteCount());
    EXPECT_EQ(std::vector<uint8_t>(48, 0), std::vector<uint8_t>(image.Data, image.Data + 48));
}

TEST(ImageDataDeathTest, InitDataOverExistingSamplesFailsItsAssertion) {
    ImageData image = Sized(2, 2, 6);
    image.InitData();
    EXPECT_DEATH(image.InitData(), "Assertion `Data == __null' failed");
}

TEST(ImageData, DeleteDataForgetsSamplesItDoesNotOwnWithoutFreeingThem) {
    std::vector<unsigned char> buffer(12, 7);
    ImageData image = Sized(2, 2, 6);
    image.Data = buffer.data();
    image.DeleteData();
    EXPECT_EQ(nullptr, image.Data);
    EXPECT_FALSE(image.OwnsData);
    EXPECT_EQ(7, buffer[0]);
}

TEST(ImageData, ReInitDataReplacesTheSamplesWithFreshZeroes) {
    ImageData image = Sized(2, 2, 6);
    image.InitData();
    image.Data[0] = 9;
    image.ReInitData();
    EXPECT_TRUE(image.OwnsData);
    EXPECT_EQ(0, image.Data[0]);
}

TEST(ImageData, CopyFromWritesIntoAPointedAtBufferOfTheSameByteCount) {
    std::vector<unsigned char> target(12, 0);
    ImageData destination = Sized(2, 2, 6);
    destination.Data = target.data();
    ImageData source = Sized(4, 1, 12);
    source.InitData();
    for (int i = 0; i < 12; ++i) {
        source.Data[i] = static_cast<unsigned char>(i + 1);
    }
    destination.CopyFrom(source);
    EXPECT_EQ(target.data(), destination.Data);
    EXPECT_FALSE(destination.OwnsData);
    EXPECT_EQ(4, destination.Width);
    EXPECT_EQ(1, destination.Height);
    EXPECT_EQ(12, target[11]);
}

TEST(ImageData, CopyFromAllocatesItsOwnBufferWhenTheByteCountsDiffer) {
    std::vector<unsigned char> target(12, 0);
    ImageData destination = Sized(2, 2, 6);
    destination.Data = target.data();
    ImageData source = Sized(2, 3, 6);
    source.InitData();
    source.Data[17] = 5;
    destination.CopyFrom(source);
    EXPECT_NE(target.data(), destination.Data);
    EXPECT_TRUE(destination.OwnsData);
    EXPECT_EQ(5, destination.Data[17]);
}

TEST(ImageData, CopiesAreDeep) {
    ImageData original = Sized(1, 1, 3);
    original.InitData();
    original.Data[0] = 200;
    ImageData const copy(original);
    original.Data[0] = 1;
    EXPECT_NE(original.Data, copy.Data);
    EXPECT_EQ(200, copy.Data[0]);
}

}  // namespace
