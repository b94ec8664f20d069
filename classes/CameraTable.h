#pragma once

/// Which dewarper kind suits a camera, from the make and model it reports and, for a plain stream,
/// the path of its URL. Fixed code: an ordered chain of tests on the make, where the first make
/// that passes alone decides. Every test is case-sensitive and trims nothing. Any thread.
class CameraTable {
public:
    CameraTable();
    CameraTable(CameraTable const& other);
    CameraTable& operator=(CameraTable const& other);
    virtual ~CameraTable();

    /// The mode of the kind, which need not be registered, or 0 for none; 0 for a null string too.
    static int ModeOf(char const* make, char const* model, char const* url);
};
