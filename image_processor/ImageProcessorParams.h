#pragma once

/// How an `ImageProcessor` is set up: the input picture and its image circle, and the PTZ and
/// panorama outputs. Interpolation 0 is nearest, 1 bilinear; any other value records fractions on
/// a frame that works a map out and blends only when the map is replayed.
struct ImageProcessorParams {
    int InputWidth = 0;
    int InputHeight = 0;
    int InputStride = 0;
    int InputBits = 0;
    int CircleX = 0;  // image circle, in input pixels
    int CircleY = 0;
    int CircleRadius = 0;
    bool OwnInput = false;
    int OutputWidth = 0;
    int OutputHeight = 0;
    int OutputStride = 0;
    bool OwnOutput = false;
    bool CacheOutput = false;
    int OutputInterpolation = 0;
    bool FlipOutput = false;  // mirrors rows and columns
    int PanoramaWidth = 0;
    int PanoramaHeight = 0;
    int PanoramaStride = 0;
    bool OwnPanorama = false;
    bool CachePanorama = false;
    int PanoramaInterpolation = 0;
    bool FlipPanorama = false;
};
