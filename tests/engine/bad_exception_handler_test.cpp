#include "vexmap/bad_exception_handler.h"

#include <atomic>
#include <functional>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/error.h"

namespace quorvel::vexmap {
namespace {

using ::testing::HasSubstr;
using ::testing::StartsWith;
using ::testing::Throws;
using ::testing::ThrowsMessage;

struct ForeignException {
    char const* name;
    std::function<void()> thrower;
    char const* format;  // without the log's prefix
    char const* text;    // the expanded line without its prefix; null where it holds an address
};

char const CHARACTER = 'q';
short const SHORT = -3;
long double const LONG_DOUBLE = 1.5L;

// One row for each arm of the handler, in its order.
std::vector<ForeignException> const FOREIGN_EXCEPTIONS = {
    {"Char", [] { throw 'q'; }, "Caught unexpected char exception - %c\n",
     "Caught unexpected char exception - q\n"},
    {"UnsignedChar", [] { throw static_cast<unsigned char>(0xAB); },
     "Caught unexpected char exception - 0x%02X\n", "Caught unexpected char exception - 0xAB\n"},
    {"Short", [] { throw static_cast<short>(-12); },
     "Caught unexpected short integer exception - %d\n",
     "Caught unexpected short integer exception - -12\n"},
    {"UnsignedShort", [] { throw static_cast<unsigned short>(65535); },
     "Caught unexpected unsigned short integer exception - %u\n",
     "Caught unexpected unsigned short integer exception - 65535\n"},
    {"Int", [] { throw 42; }, "Caught unexpected integer exception - %d\n",
     "Caught unexpected integer exception - 42\n"},
    {"UnsignedInt", [] { throw 4000000000u; },
     "Caught unexpected unsigned integer exception - %u\n",
     "Caught unexpected unsigned integer exception - 4000000000\n"},
    {"Long", [] { throw -5000000000L; }, "Caught unexpected long integer exception - %ld\n",
     "Caught unexpected long integer exception - -5000000000\n"},
    {"UnsignedLong", [] { throw 7UL; }, "Caught unexpected unsigned long integer exception - %lu\n",
     "Caught unexpected unsigned long integer exception - 7\n"},
    {"LongLong", [] { throw -8LL; }, "Caught unexpected long-long integer exception - %lld\n",
     "Caught unexpected long-long integer exception - -8\n"},
    {"UnsignedLongLong", [] { throw 9ULL; },
     "Caught unexpected unsigned long-long integer exception - %llu\n",
     "Caught unexpected unsigned long-long integer exception - 9\n"},
    {"CharPointer", [] { throw "text"; }, "Caught unexpected char pointer exception - %p\n",
     nullptr},
    {"UnsignedCharPointer", [] { throw reinterpret_cast<unsigned char const*>(&CHARACTER); },
     "Caught unexpected unsigned char pointer exception - %p\n", nullptr},
    {"ShortPointer", [] { throw &SHORT; },
     "Caught unexpected short integer pointer exception - %p\n", nullptr},
    {"UnsignedShortPointer", [] { throw static_cast<unsigned short const*>(nullptr); },
     "Caught unexpected unsigned short integer exception - %p\n", nullptr},
    {"IntPointer", [] { throw static_cast<int*>(nullptr); },
     "Caught unexpected integer pointer exception - %p\n", nullptr},
    {"UnsignedIntPointer", [] { throw static_cast<unsigned int const*>(nullptr); },
     "Caught unexpected unsigned integer pointer exception - %p\n", nullptr},
    {"LongPointer", [] { throw static_cast<long const*>(nullptr); },
     "Caught unexpected long integer pointer exception - %p\n", nullptr},
    {"UnsignedLongPointer", [] { throw static_cast<unsigned long const*>(nullptr); },
     "Caught unexpected unsigned long integer pointer exception - %p\n", nullptr},
    {"LongLongPointer", [] { throw static_cast<long long const*>(nullptr); },
     "Caught unexpected long-long integer pointer exception - %p\n", nullptr},
    {"UnsignedLongLongPointer", [] { throw static_cast<unsigned long long const*>(nullptr); },
     "Caught unexpected unsigned long-long integer pointer exception - %p\n", nullptr},
    {"Float", [] { throw 2.5f; }, "Caught unexpected float exception - %f\n",
     "Caught unexpected float exception - 2.500000\n"},
    {"Double", [] { throw 0.25; }, "Caught unexpected double exception - %f\n",
     "Caught unexpected double exception - 0.250000\n"},
    {"LongDouble", [] { throw LONG_DOUBLE; }, "Caught unexpected long-double exception - %Lf\n",
     "Caught unexpected long-double exception - 1.500000\n"},
    {"FloatPointer", [] { throw static_cast<float const*>(nullptr); },
     "Caught unexpected float pointer exception - %p\n", nullptr},
    {"DoublePointer", [] { throw static_cast<double const*>(nullptr); },
     "Caught unexpected double pointer exception - %p\n", nullptr},
    {"LongDoublePointer", [] { throw &LONG_DOUBLE; },
     "Caught unexpected long-double pointer exception - %p\n", nullptr},
    {"VoidPointer", [] { throw static_cast<void*>(nullptr); },
     "Caught unexpected void pointer exception - %p\n", nullptr},
    {"ObjectPointerAsVoidPointer", [] { throw static_cast<ForeignException const*>(nullptr); },
     "Caught unexpected void pointer exception - %p\n", nullptr},
    {"String", [] { throw std::string("words"); }, "Caught unexpected string exception - %s\n",
     "Caught unexpected string exception - words\n"},
    {"Anything", [] { throw ForeignException{}; }, "Caught unexpected exception\n",
     "Caught unexpected exception\n"},
};

class BadExceptionHandlerTest : public ::testing::TestWithParam<ForeignException> {};

TEST_P(BadExceptionHandlerTest, DescribesAForeignExceptionAndLetsABadExceptionOut) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    EXPECT_THAT([] { BadExceptionHandler::Run(GetParam().thrower); }, Throws<std::bad_exception>());
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ(std::string("VEXMAP: ERROR - ") + GetParam().format, lines[0].format);
    if (GetParam().text != nullptr) {
        EXPECT_EQ(std::string("VEXMAP: ERROR - ") + GetParam().text, lines[0].text);
    }
}

INSTANTIATE_TEST_SUITE_P(EveryArm, BadExceptionHandlerTest, ::testing::ValuesIn(FOREIGN_EXCEPTIONS),
                         [](auto const& row) { return std::string(row.param.name); });

TEST(BadExceptionHandler, AnIntegerIsLoggedWithItsValue) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    try {
        BadExceptionHandler::Run([]() -> int { throw 42; });
        FAIL() << "nothing was thrown";
    } catch (std::bad_exception const& error) {
        EXPECT_STRNE("", error.what());
    }
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: ERROR - Caught unexpected integer exception - 42\n", lines[0].text);
}

TEST(BadExceptionHandler, ThePointerLineNamesTheAddress) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    static int const value = 1;
    EXPECT_THROW(BadExceptionHandler::Run([] { throw &value; }), std::bad_exception);
    char expected[128];
    snprintf(expected, sizeof expected,
             "VEXMAP: ERROR - Caught unexpected integer pointer exception - %p\n",
             static_cast<void const*>(&value));
    EXPECT_EQ(expected, sink.Lines().at(0).text);
}

TEST(BadExceptionHandler, ErrorsPassUnloggedAndUnchanged) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    EXPECT_THAT([] { BadExceptionHandler::Run([] { throw Error(EINVAL, "Invalid view"); }); },
                ThrowsMessage<Error>(HasSubstr("Invalid view")));
    EXPECT_EQ(0u, sink.Count());
}

TEST(BadExceptionHandler, StandardExceptionsPassUnlogged) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    EXPECT_THAT([] { BadExceptionHandler::Run([] { throw std::runtime_error("out"); }); },
                ThrowsMessage<std::runtime_error>("out"));
    EXPECT_THAT([] { BadExceptionHandler::Run([] { throw std::bad_alloc(); }); },
                Throws<std::bad_alloc>());
    EXPECT_EQ(0u, sink.Count());
}

TEST(BadExceptionHandler, RunGivesTheInnerFunctionsResult) {
    EXPECT_EQ(7, BadExceptionHandler::Run([] { return 7; }));
}

TEST(BadExceptionHandler, AStandardExceptionThatReachesTheHandlerTakesItsOwnLine) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    try {
        throw std::logic_error("broken");
    } catch (...) {
        EXPECT_THROW(BadExceptionHandler::UnexpectedHandler(), std::bad_exception);
    }
    EXPECT_EQ("VEXMAP: ERROR - Caught unexpected standard exception - broken\n",
              sink.Lines().at(0).text);
}

TEST(BadExceptionHandler, LeavesTheTerminateHandlerAsItFoundIt) {
    std::terminate_handler const before = std::get_terminate();
    EXPECT_THROW(BadExceptionHandler::Run([] { throw 1; }), std::bad_exception);
    EXPECT_EQ(before, std::get_terminate());
}

TEST(BadExceptionHandler, GuardsCallsOnSeveralThreadsAtOnce) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_ERROR);
    std::atomic<int> bad_exceptions{0};
    std::vector<std::thread> threads;
    for (int thread = 0; thread < 4; ++thread) {
        threads.emplace_back([&bad_exceptions, thread] {
            for (int call = 0; call < 100; ++call) {
                try {
                    BadExceptionHandler::Run([thread] { throw thread; });
                } catch (std::bad_exception const&) {
                    ++bad_exceptions;
                }
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(400, bad_exceptions.load());
    EXPECT_EQ(400u, sink.Count());
}

}  // namespace
}  // namespace quorvel::vexmap
