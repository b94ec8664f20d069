#include <gtest/gtest.h>

#include "SharedLibrary.h"

namespace {

// The C library's maths part is on every Linux system, under this name.
constexpr char const* PRESENT_LIBRARY = "libm.so.6";
constexpr char const* ABSENT_LIBRARY = "libvexmap_absent_vendor.so.9";

TEST(SharedLibrary, StartsClosedAndFindsNothing) {
    SharedLibrary library;
    EXPECT_FALSE(library.IsOpen());
    EXPECT_EQ(nullptr, library.Find("cos"));
}

TEST(SharedLibrary, OpensALibraryByItsNameAndFindsItsFunctions) {
    SharedLibrary library;
    ASSERT_TRUE(library.Open(PRESENT_LIBRARY));
    EXPECT_TRUE(library.IsOpen());
    double (*cosine)(double) = nullptr;
    ASSERT_TRUE(library.Bind("cos", cosine));
    EXPECT_DOUBLE_EQ(1.0, cosine(0.0));
}

TEST(SharedLibrary, AMissingSymbolBindsToNull) {
    SharedLibrary library;
    ASSERT_TRUE(library.Open(PRESENT_LIBRARY));
    void (*missing)() = reinterpret_cast<void (*)()>(&library);
    EXPECT_FALSE(library.Bind("vexmap_no_such_function", missing));
    EXPECT_EQ(nullptr, missing);
    EXPECT_EQ(nullptr, library.Find(nullptr));
}

TEST(SharedLibrary, AMissingLibraryLeavesItClosed) {
    SharedLibrary library;
    EXPECT_FALSE(library.Open(ABSENT_LIBRARY));
    EXPECT_FALSE(library.IsOpen());
    EXPECT_FALSE(library.Open(nullptr));
}

TEST(SharedLibrary, OpeningAnotherClosesTheFirst) {
    SharedLibrary library;
    ASSERT_TRUE(library.Open(PRESENT_LIBRARY));
    EXPECT_FALSE(library.Open(ABSENT_LIBRARY));
    EXPECT_FALSE(library.IsOpen());
    EXPECT_EQ(nullptr, library.Find("cos"));
}

TEST(SharedLibrary, CloseTwiceIsHarmless) {
    SharedLibrary library;
    ASSERT_TRUE(library.Open(PRESENT_LIBRARY));
    library.Close();
    library.Close();
    EXPECT_FALSE(library.IsOpen());
}

}  // namespace
