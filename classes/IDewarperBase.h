#pragma once

#include "DewarpWrapper.h"

/// What every dewarper shares: the two frame buffers and their reallocation rule, the step
/// arithmetic of pan, tilt and zoom, and the limiting of a position to the backend's ranges.
/// Positions are held in the backend's own units. Owns both buffers and the copy of the
/// parameters. Not locked: one thread at a time.
class IDewarperBase : public IDewarper {
public:
    /// One axis of the backend's position: its limits, the span that makes one step a fifth of
    /// the span's share (`step`), and whether the axis turns round.
    struct AxisRange {
        float min;
        float max;
        float step;
        bool wrap;
    };

    explicit IDewarperBase(DewarpParams_t const& creationParams);
    IDewarperBase(IDewarperBase const&) = delete;  // owns its buffers
    IDewarperBase& operator=(IDewarperBase const&) = delete;
    ~IDewarperBase() override;

    int Mode() override = 0;
    bool Check() override = 0;
    int SubMode() override;
    void SetSubMode(int newSubMode) override;
    bool IsSubModeSupported(int candidate) override;
    bool IsNormalPTZSupported(int candidate) override;
    bool CanPan(int candidate) override;
    bool CanTilt(int candidate) override;
    bool CanZoom(int candidate) override;
    void Pan(int direction, int speed) override;
    void Tilt(int direction, int speed) override;
    void Zoom(int direction, int speed) override;
    /// All three exactly zero is the command to go home.
    void SetPosition(float newPan, float newTilt, float newZoom) override;
    void GetPosition(float& currentPan, float& currentTilt, float& currentZoom) override;
    bool GetImageInputBuffer(int width, int height, unsigned char** buffer, unsigned int* size,
                             int* format) override;
    /// The base step of a frame: rounds the size up (width to a multiple of 8, height to even),
    /// keeps or replaces the buffer and sets the backend up when the options are dirty.
    bool GetImageOutputBuffer(int* width, int* height, unsigned char** buffer, unsigned int* size,
                              int* format) override;
    bool GetNeedsRotation() override;
    bool GetFlipVertical() override;
    bool GetFlipHorizontal() override;
    float AdjustAspectRatio(float width, float height) override;
    void Clear() override = 0;
    DewarpParams_t* Parameters() override;
    int GetLens(int lens, char* buffer, unsigned long size) override;
    void SetDewarperType(DewarperType::DewarperTypes newType) override;

protected:
    static void Report(AxisRange const& range, float& min, float& max, float& step, bool& wrap);

    virtual bool InitOptions();
    virtual void UpdatePosition() = 0;
    virtual float GetZoomScaleModifier();
    virtual float LimitZoomRange(float value);
    virtual bool InvertPan();
    virtual bool InvertTilt();
    virtual void GetPanRange(float& min, float& max, float& step, bool& wrap);
    virtual void GetTiltRange(float& min, float& max, float& step, bool& wrap);
    virtual float LimitPanRange(float value);
    virtual float LimitTiltRange(float value);
    virtual void GetFormatAndSize(int width, int height, unsigned int* size, int* format);
    virtual void GetInputFormatAndSize(int width, int height, unsigned int* size, int* format);
    virtual void GetOutputFormatAndSize(int width, int height, unsigned int* size, int* format);

    /// Back to the kind's defaults in sub-mode 1, through `SetPosition` unless the defaults are
    /// all zero (which would recurse).
    void ResetPosition();

    DewarpParams_t params;
    DewarperType::DewarperTypes type;
    int inputWidth;
    int inputHeight;
    int outputWidth;
    int outputHeight;
    int subMode;
    bool optionsDirty;
    float pan;
    float tilt;
    float zoom;
    unsigned char* inputBuffer;
    unsigned char* outputBuffer;

private:
    AxisRange PanRange();
    AxisRange TiltRange();
    void LimitAndUpdatePosition();
};

/// Fixes the mode number of a concrete class, whatever type `SetDewarperType` is told later.
template <DewarperType::DewarperTypes N>
class IDewarperBaseT : public IDewarperBase {
public:
    explicit IDewarperBaseT(DewarpParams_t const& creationParams) : IDewarperBase(creationParams) {}
    IDewarperBaseT(IDewarperBaseT const&) = delete;
    IDewarperBaseT& operator=(IDewarperBaseT const&) = delete;
    ~IDewarperBaseT() override = default;

    int Mode() override { return N; }
};
