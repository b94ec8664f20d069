#pragma once

#include <cstddef>

/// A picture in memory, either owning its samples or pointing at someone else's. Copies are deep.
class ImageData {
public:
    ImageData();  // empty, no samples
    ImageData(ImageData const& other);
    ImageData& operator=(ImageData const& other);
    virtual ~ImageData();

    /// Allocates `Height * Stride` zeroed bytes and owns them; `Data` must be null.
    void InitData();
    void ReInitData();
    /// Frees the samples if owned, and forgets them either way.
    void DeleteData();
    /// Takes the other's size and samples; keeps the present buffer when the byte counts match.
    void CopyFrom(ImageData const& other);
    std::size_t ByteCount() const;  // Height * Stride, or 0 for a negative size

    int Width;
    int Height;
    int Stride;  // bytes per row
    int BitsPerPixel;
    unsigned char* Data;
    bool OwnsData;
};
