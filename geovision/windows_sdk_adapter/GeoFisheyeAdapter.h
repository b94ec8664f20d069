#pragma once

#include <map>

#include "IFishEye.h"
#include "geo_fisheye.h"

/// The library's context, shared by every adapter of the process and unlocked: the first adapter
/// makes it while it is null, and destroying any adapter shuts it down for all.
extern geo_fisheye_context* gFisheyeContext;

/// The SDK's fisheye interface on top of libgeofisheye: a channel is one library object, and the
/// SDK's tenths of a degree become the library's float degrees and fields of view. Owns the
/// objects of its channels. The library is reached only through `GeoFisheyeLibraryInstance`, and
/// not at all while it is closed. Not locked; since the context is shared, the host serialises
/// every adapter of the process.
class GeoFisheyeAdapter : public IFishEye {
public:
    /// The view mode of the SDK (1, 2, 4, 8) and the internal view (0, 1, 2, 3); -1 for a value
    /// with no counterpart, in both directions.
    static int convertViewModeToInternal(int viewMode);
    static int convertViewModeFromInternal(int internalView);
    /// Both sides number the mounts alike (0 ceiling, 1 wall, 2 floor); -1 for anything else.
    static int convertMountTypeToInternal(int mountType);
    static int convertMountTypeFromInternal(int mount);
    /// 1 on both sides; -1 for anything else.
    static int convertFormatToInternal(int format);
    static int convertFormatFromInternal(int format);
    /// The layout that the SDK's frame (counted from 1) of an internal view moves, and back; -1
    /// for a pair with no counterpart.
    static int convertInternalLayoutIdFromSetFrame(int internalView, int frame);
    static int convertInternalLayoutIdToSetFrame(int internalView, int layout);

    /// SDK tenths of a degree and zoom steps (0 to 800) to the library's degrees and field of view
    /// (100 to 20 degrees), by internal mount; a mount beyond 2 passes the value through.
    static float calculatePanToInternal(short pan, int mount);
    static float calculateTiltToInternal(short tilt, int mount);
    static float calculateZoomToInternal(short zoom, int mount);
    /// The reverse, truncated towards zero into 16 bits.
    static short calculatePanFromInternal(float value, int mount);
    static short calculateTiltFromInternal(float value, int mount);
    static short calculateZoomFromInternal(float value, int mount);
    /// The same conversions, for the absolute moves.
    static float calculatePanToInternalAbsolutePtz(short pan, int mount);
    static float calculateTiltToInternalAbsolutePtz(short tilt, int mount);
    static float calculateZoomToInternalAbsolutePtz(short zoom, int mount);
    static short calculatePanFromInternalAbsolutePtz(float value, int mount);
    static short calculateTiltFromInternalAbsolutePtz(float value, int mount);
    static short calculateZoomFromInternalAbsolutePtz(float value, int mount);

    /// The library's position of one layout of the object's present view, read from its
    /// controller record; false for a layout that the view does not have, or no object.
    static bool getPtzValue(int layout, geo_fisheye const* object, float& pan, float& tilt,
                            float& zoom);

    /// Makes the context unless another adapter made it already.
    GeoFisheyeAdapter();
    GeoFisheyeAdapter(GeoFisheyeAdapter const&) = delete;  // owns its objects
    GeoFisheyeAdapter& operator=(GeoFisheyeAdapter const&) = delete;
    /// Releases every object and shuts the shared context down, whoever else still uses it.
    ~GeoFisheyeAdapter() override;

    int RegCallback(CFishEyeCallBack* callback) override;
    int GvFE_Initialize(int channel, int inputWidth, int inputHeight, int outputWidth,
                        int outputHeight, FORMAT format) override;
    int GvFE_ParamsUpdated(int channel, FE_EventParams* event, FE_ViewParams* view) override;
    /// Feeds one picture; with an output, renders the object's size into it, 4 bytes a pixel.
    int GvFE_VideoInput(int channel, unsigned char* input, unsigned char* output, int width,
                        int height, FORMAT format, bool flag) override;
    int GvFE_Close(int channel) override;
    int GvFEalignmentTool(int channel, unsigned char* input, int width, int height, FORMAT format,
                          FE_ViewParams* view) override;
    int GvFESetPosition(int channel, FE_CurPosParams* params) override;
    int GvFEGetPosition(int channel, FE_CurPosParams* params) override;
    int SetInfo(int channel, int kind, int value, void* data) override;
    bool GvFEGPUCreate(int channel, void* device) override;
    int GvFEGPUDeviceReset(int channel) override;
    /// 1 with a picture, 0 for a snapshot without a buffer, -1 on failure.
    int GvFEGPUSnapShotRawData(int channel, Fisheye_SnapShot& snapshot) override;
    int GetAbsolutePositionFromInputVideoPoint(int channel, int x, int y, short& pan,
                                               short& tilt) override;
    int SetAbsolutePTZ(int channel, short pan, short tilt, short zoom,
                       unsigned short frame) override;

    /// The object of a channel, or null; null too while the library is closed.
    geo_fisheye* find_fisheye_object(int channel) const;
    /// The object of a channel, made and kept if there is none; null when that fails.
    geo_fisheye* prepare_fisheye_object(int channel);
    /// Releases every object and forgets every channel; the context stays.
    void release();

private:
    std::map<int, geo_fisheye*> fisheyeObjects;
};
