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
    // A clock the test moves by hand.
    ProgressLine::Clock Clock() {
        return [this] { return now; };
    }

    std::unique_ptr<FILE, int (*)(FILE*)> file{tmpfile(), fclose};
    double now = 100.0;
};

TEST_F(ProgressLineTest, RewritesTheLineInPlaceAtMostFourTimesASecondAndEndsItWithTheLastState) {
    ASSERT_NE(nullptr, file);
    {
        ProgressLine progress(file.get(), true, Clock());
        now += 0.1;
        progress.Show(1);
        now += 0.1;
        progress.Show(2);  // too soon after the first: not drawn
        now += 0.2;
        progress.Show(3);
        now += 0.1;
        progress.Show(4);
    }
    EXPECT_EQ("\rframe 1, 10.0 fps\rframe 3, 7.5 fps \rframe 4, 8.0 fps\n", Contents(file.get()));
}

TEST_F(ProgressLineTest, KnownLengthAddsTheShareDoneAndTheTimeLeft) {
    EXPECT_EQ("frame 40, 20.0 fps, 40%, 0:03 left", ProgressLine::Text(40, 2.0, 0.4));
    EXPECT_EQ("frame 900, 1.0 fps, 90%, 1:40 left", ProgressLine::Text(900, 900.0, 0.9));
    EXPECT_EQ("frame 1, 0.1 fps, 0%, 2:46:30 left", ProgressLine::Text(1, 10.0, 0.001));
}

TEST_F(ProgressLineTest, ShareBeyondTheWholeShowsAsDone) {
    EXPECT_EQ("frame 11, 11.0 fps, 100%, 0:00 left", ProgressLine::Text(11, 1.0, 1.2));
}

TEST_F(ProgressLineTest, NoTimeYetShowsNoRate) {
    EXPECT_EQ("frame 1", ProgressLine::Text(1, 0.0, -1.0));
    EXPECT_EQ("frame 1, 50%", ProgressLine::Text(1, 0.0, 0.5));
}

TEST_F(ProgressLineTest, BlanksWhatALongerTextLeftOnTheLine) {
    ASSERT_NE(nullptr, file);
    {
        ProgressLine progress(file.get(), true, Clock());
        now += 1.0;
        progress.Show(10, 0.5);
        now += 1.0;
        progress.Show(11, -1.0);
    }
    std::string const first = "frame 10, 10.0 fps, 50%, 0:01 left";
    std::string const second = "frame 11, 5.5 fps";
    EXPECT_EQ("\r" + first + "\r" + second + std::string(first.size() - second.size(), ' ') + "\n",
              Contents(file.get()));
}

TEST_F(ProgressLineTest, EndsTheLineOnceHoweverOftenItIsEnded) {
    ASSERT_NE(nullptr, file);
    {
        ProgressLine progress(file.get(), true, Clock());
        progress.Show(7);
        progress.End();
        progress.End();
    }
    EXPECT_EQ("\rframe 7\n", Contents(file.get()));
}

TEST_F(ProgressLineTest, WritesNothingBeforeTheFirstFrame) {
    ASSERT_NE(nullptr, file);
    {
        ProgressLine progress(file.get(), true, Clock());
        progress.End();
    }
    EXPECT_EQ("", Contents(file.get()));
}

TEST_F(ProgressLineTest, WritesNothingWhenNotShown) {
    ASSERT_NE(nullptr, file);
    {
        ProgressLine progress(file.get(), false, Clock());
        progress.Show(1);
        progress.Show(2);
    }
    EXPECT_EQ("", Contents(file.get()));
}

}  // namespace
}  // namespace vexmap_host
