#include "ImageData.h"

#include <cstring>

#include "ProcessorAssert.h"

ImageData::ImageData()
    : Width(0), Height(0), Stride(0), BitsPerPixel(0), Data(nullptr), OwnsData(false) {}

ImageData::ImageData(ImageData const& other) : ImageData() {
    CopyFrom(other);
}

ImageData& ImageData::operator=(ImageData const& other) {
    CopyFrom(other);
    return *this;
}

ImageData::~ImageData() {
    DeleteData();
}

void ImageData::InitData() {
    ProcessorAssert(Data == nullptr, "Data == __null", "ImageData", __LINE__, __PRETTY_FUNCTION__);
    Data = new unsigned char[ByteCount()]();
    OwnsData = true;
}

void ImageData::ReInitData() {
    DeleteData();
    InitData();
}

void ImageData::DeleteData() {
    if (OwnsData) {
        delete[] Data;
    }
    Data = nullptr;
    OwnsData = false;
}

void ImageData::CopyFrom(ImageData const& other) {
    if (this == &other) {
        return;
    }
    if (ByteCount() != other.ByteCount()) {
        DeleteData();
    }
    Width = other.Width;
    Height = other.Height;
    Stride = other.Stride;
    BitsPerPixel = other.BitsPerPixel;
    if (Data == nullptr) {
        InitData();
    }
    if (other.Data != nullptr) {
        memcpy(Data, other.Data, ByteCount());
    }
}

std::size_t ImageData::ByteCount() const {
    return Height > 0 && Stride > 0 ? std::size_t(Height) * std::size_t(Stride) : 0;
}
