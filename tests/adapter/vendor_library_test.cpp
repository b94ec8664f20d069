#include <gtest/gtest.h>

#include "VendorLibrary.h"

namespace {

// A vendor table over the C library's maths part, which every Linux system has.
struct MathsFunctions {
    static constexpr char const* FILE_NAME = "libm.so.6";
    double (*cos)(double);
    double (*sin)(double);

    bool Bind(SharedLibrary const& library) {
        return library.Bind("cos", cos) && library.Bind("sin", sin);
    }
};

// The same library, asked for one function it does not have.
struct IncompleteFunctions {
    static constexpr char const* FILE_NAME = "libm.so.6";
    double (*cos)(double);
    void (*missing)();

    bool Bind(SharedLibrary const& library) {
        return library.Bind("cos", cos) && library.Bind("vexmap_no_such_function", missing);
    }
};

TEST(VendorLibrary, StartsClosedWithEveryFunctionNull) {
    VendorLibrary<MathsFunctions> library;
    EXPECT_FALSE(library.IsOpen());
    EXPECT_EQ(nullptr, library.Api().cos);
    EXPECT_EQ(nullptr, library.Api().sin);
}

TEST(VendorLibrary, AcquireOpensTheLibraryByItsOwnNameAndBindsEveryFunction) {
    VendorLibrary<MathsFunctions> library;
    ASSERT_TRUE(library.Acquire());
    EXPECT_TRUE(library.IsOpen());
    EXPECT_DOUBLE_EQ(1.0, library.Api().cos(0.0));
    EXPECT_DOUBLE_EQ(0.0, library.Api().sin(0.0));
    library.Release();
}

TEST(VendorLibrary, TheLastReleaseClosesItAndNullsTheFunctions) {
    VendorLibrary<MathsFunctions> library;
    ASSERT_TRUE(library.Acquire());
    ASSERT_TRUE(library.Acquire());
    library.Release();
    EXPECT_TRUE(library.IsOpen());
    EXPECT_NE(nullptr, library.Api().cos);
    library.Release();
    EXPECT_FALSE(library.IsOpen());
    EXPECT_EQ(nullptr, library.Api().cos);
}

TEST(VendorLibrary, ReleaseWithoutAReferenceDoesNothing) {
    VendorLibrary<MathsFunctions> library;
    library.Release();
    EXPECT_FALSE(library.IsOpen());
    ASSERT_TRUE(library.Acquire());
    library.Release();
    library.Release();
    EXPECT_FALSE(library.IsOpen());
    ASSERT_TRUE(library.Acquire());
    EXPECT_TRUE(library.IsOpen());
    library.Release();
}

TEST(VendorLibrary, AMissingLibraryTakesNoReference) {
    VendorLibrary<MathsFunctions> library;
    EXPECT_FALSE(library.Acquire("libvexmap_absent_vendor.so.9"));
    EXPECT_FALSE(library.IsOpen());
    EXPECT_EQ(nullptr, library.Api().cos);
}

TEST(VendorLibrary, ALibraryLackingOneFunctionIsNotLoadedAtAll) {
    VendorLibrary<IncompleteFunctions> library;
    EXPECT_FALSE(library.Acquire());
    EXPECT_FALSE(library.IsOpen());
    EXPECT_EQ(nullptr, library.Api().cos);
    EXPECT_EQ(nullptr, library.Api().missing);
}

TEST(VendorLibrary, AFailedAcquireCanBeTriedAgain) {
    VendorLibrary<MathsFunctions> library;
    EXPECT_FALSE(library.Acquire("libvexmap_absent_vendor.so.9"));
    EXPECT_TRUE(library.Acquire());
    library.Release();
}

}  // namespace
