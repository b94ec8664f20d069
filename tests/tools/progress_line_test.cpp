#include "progress_line.h"

#include <cstdio>
#include <memory>
#include <string>

#include <gtest/gtest.h>

namespace vexmap_host {
namespace {

// What was written into a temporary file, from its start.
std::string Contents(FILE* file) {
    fflush(file);
    rewind(file);
    std::string text;
    for (int c = fgetc(file); c != EOF; c = fgetc(file)) {
        text.push_back(char(c));
    }
    return text;
}

class ProgressLineTest : public ::testing::Test {
protected:
    std::unique_ptr<FILE, int (*)(FILE*)> file{tmpfile(), fclose};
};

TEST_F(ProgressLineTest, RewritesTheFrameNumberInPlaceAndEndsTheLine) {
    ASSERT_NE(nullptr, file);
    {
        ProgressLine progress(file.get(), true);
        progress.Show(1);
        progress.Show(2);
        progress.Show(120);
    }
    EXPECT_EQ("\rframe 1\rframe 2\rframe 120\n", Contents(file.get()));
}

TEST_F(ProgressLineTest, EndsTheLineOnceHoweverOftenItIsEnded) {
    ASSERT_NE(nullptr, file);
    {
        ProgressLine progress(file.get(), true);
        progress.Show(7);
        progress.End();
        progress.End();
    }
    EXPECT_EQ("\rframe 7\n", Contents(file.get()));
}

TEST_F(ProgressLineTest, WritesNothingBeforeTheFirstFrame) {
    ASSERT_NE(nullptr, file);
    {
        ProgressLine progress(file.get(), true);
        progress.End();
    }
    EXPECT_EQ("", Contents(file.get()));
}

TEST_F(ProgressLineTest, WritesNothingWhenNotShown) {
    ASSERT_NE(nullptr, file);
    {
        ProgressLine progress(file.get(), false);
        progress.Show(1);
        progress.Show(2);
    }
    EXPECT_EQ("", Contents(file.get()));
}

}  // namespace
}  // namespace vexmap_host
