#pragma once

namespace quorvel::vexmap {

/// The door to trigonometry for arrays of floats, the map builders' form of `Trigonometry`: each
/// operation works out `count` values at once, as many lanes a step as the processor offers
/// (chosen once, at the first call), with the library's functions of at most one unit in the last
/// place. The results are those of `Trigonometry`'s float forms or one unit off in a few inputs;
/// `hypot` and the guards of `asin` and `acos` are the same bit for bit. An output may be one of
/// the inputs. Pure; any thread.
class BatchTrigonometry {
public:
    BatchTrigonometry();
    BatchTrigonometry(BatchTrigonometry const& other);
    BatchTrigonometry& operator=(BatchTrigonometry const& other);
    virtual ~BatchTrigonometry();

    static void sin(float const* x, float* out, int count);
    static void cos(float const* x, float* out, int count);
    static void tan(float const* x, float* out, int count);
    static void atan(float const* x, float* out, int count);
    /// atan2, the angle of (x, y) from the second argument's axis, as `Trigonometry::atan(y, x)`.
    static void atan(float const* y, float const* x, float* out, int count);
    /// Guarded as `Trigonometry::asin` and `acos`: at or beyond ±1 the end of the range, not NaN.
    static void asin(float const* x, float* out, int count);
    static void acos(float const* x, float* out, int count);
    static void sinh(float const* x, float* out, int count);
    /// The natural logarithm.
    static void log(float const* x, float* out, int count);
    /// `Trigonometry::hypot(float, float)` bit for bit: the root of the sum of squares in double.
    static void hypot(float const* x, float const* y, float* out, int count);

    /// The name of the lanes in use: "avx512", "avx2" or "sse2".
    static char const* GetLanesName();
};

}  // namespace quorvel::vexmap
