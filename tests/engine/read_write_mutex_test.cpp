#include "vexmap/read_write_mutex.h"

#include <atomic>
#include <cerrno>
#include <chrono>
#include <future>
#include <memory>
#include <thread>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "recording_log_sink.h"
#include "vexmap/error.h"

namespace quorvel::vexmap {
namespace {

using ::testing::HasSubstr;
using ::testing::ThrowsMessage;

/// A writer on a thread of its own, which reports whether it has got the lock yet. Only a writer
/// on another thread can probe a read hold: one on the holding thread would wait for itself.
class WaitingWriter {
public:
    explicit WaitingWriter(ReadWriteMutex& mutex)
        : got(false), thread([this, &mutex]() {
              WriteLock const lock(mutex);
              got = true;
          }) {}
    WaitingWriter(WaitingWriter const&) = delete;
    WaitingWriter& operator=(WaitingWriter const&) = delete;
    virtual ~WaitingWriter() {
        if (thread.joinable()) {
            thread.join();
        }
    }

    // While the lock is held elsewhere the writer cannot get in, however long it is given; the
    // pause only gives it the chance to try.
    bool GotInWhileHeld() {
        std::this_thread::sleep_for(std::chrono::milliseconds(20));
        return got.load();
    }
    bool GotInAtLast() {
        thread.join();
        return got.load();
    }

private:
    std::atomic<bool> got;
    std::thread thread;
};

TEST(ReadWriteMutex, InitAndFiniReturnThePthreadResults) {
    ReadWriteMutex mutex;
    EXPECT_EQ(0, mutex.Fini());
    EXPECT_EQ(0, mutex.Init());
    EXPECT_TRUE(mutex.LockWrite());
    mutex.Unlock();
}

TEST(ReadWriteMutex, ManyReadersHoldTheLockAtOnce) {
    ReadWriteMutex mutex;
    ASSERT_TRUE(mutex.LockRead());
    bool const second = std::async(std::launch::async, [&mutex]() {
                            bool const locked = mutex.LockRead();
                            if (locked) {
                                mutex.Unlock();
                            }
                            return locked;
                        }).get();
    EXPECT_TRUE(second);
    mutex.Unlock();
}

TEST(ReadWriteMutex, LockReadFailsWhileThisThreadHoldsTheWriteLock) {
    ReadWriteMutex mutex;
    ASSERT_TRUE(mutex.LockWrite());
    EXPECT_FALSE(mutex.LockRead());
    EXPECT_FALSE(mutex.LockWrite());
    mutex.Unlock();
    EXPECT_TRUE(mutex.LockRead());
    mutex.Unlock();
}

TEST(ReadWriteMutex, WriterWaitsUntilTheReaderUnlocks) {
    ReadWriteMutex mutex;
    ASSERT_TRUE(mutex.LockRead());
    WaitingWriter writer(mutex);
    EXPECT_FALSE(writer.GotInWhileHeld());
    mutex.Unlock();
    EXPECT_TRUE(writer.GotInAtLast());
}

TEST(ReadWriteMutex, ACopyDoesNotTakeOverTheOriginalsLockState) {
    ReadWriteMutex original;
    ASSERT_TRUE(original.LockWrite());
    ReadWriteMutex copy(original);
    EXPECT_EQ(0, copy.Init());
    EXPECT_TRUE(copy.LockWrite());
    copy.Unlock();
    original.Unlock();
}

TEST(ReadWriteMutex, AssignmentLeavesTheLockAsItWas) {
    ReadWriteMutex target;
    ReadWriteMutex const source;
    ASSERT_TRUE(target.LockWrite());
    target = source;
    EXPECT_FALSE(target.LockRead());  // still held for writing by this thread
    target.Unlock();
    EXPECT_TRUE(target.LockRead());
    target.Unlock();
}

TEST(ReadWriteMutex, AssignmentToItselfLogsNothing) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_INFO);
    ReadWriteMutex mutex;
    ReadWriteMutex& same = mutex;
    mutex = same;
    EXPECT_EQ(0u, sink.Count());
}

TEST(ReadLock, KeepsAWriterOnAnotherThreadWaiting) {
    ReadWriteMutex mutex;
    std::unique_ptr<WaitingWriter> writer;
    {
        ReadLock const lock(mutex);
        writer = std::make_unique<WaitingWriter>(mutex);
        EXPECT_FALSE(writer->GotInWhileHeld());
    }
    EXPECT_TRUE(writer->GotInAtLast());
}

TEST(ReadLock, FailureThrowsLockFailureWithEdeadlk) {
    ReadWriteMutex mutex;
    WriteLock const held(mutex);
    errno = 0;
    EXPECT_THAT([&mutex]() { ReadLock const lock(mutex); },
                ThrowsMessage<Error>(HasSubstr("(ReadLock::ReadLock@")));
    EXPECT_THAT([&mutex]() { ReadLock const lock(mutex); },
                ThrowsMessage<Error>(HasSubstr("[Error EDEADLK (35)] - Lock failure")));
    EXPECT_EQ(EDEADLK, errno);
}

TEST(ReadLock, AFailedLockReleasesNothing) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    ReadWriteMutex mutex;
    ASSERT_TRUE(mutex.LockWrite());
    EXPECT_THROW(ReadLock const lock(mutex), Error);
    EXPECT_FALSE(mutex.LockRead());  // the write hold is still there
    mutex.Unlock();
    EXPECT_EQ(0u, sink.Count());
}

TEST(ReadLock, WithoutAMutexWarnsInvalidMutexWhenDestroyed) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    { ReadLock const lock; }
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Invalid mutex\n", lines[0].text);
}

TEST(ReadLock, ACopyHoldsNothingAndTheLockIsReleasedOnce) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    ReadWriteMutex mutex;
    std::unique_ptr<WaitingWriter> writer;
    {
        ReadLock const lock(mutex);
        {
            // NOLINTNEXTLINE(performance-unnecessary-copy-initialization): the copy is the subject
            ReadLock const copy(lock);
        }
        EXPECT_EQ(1u, sink.Count());  // the copy had nothing to release
        writer = std::make_unique<WaitingWriter>(mutex);
        EXPECT_FALSE(writer->GotInWhileHeld());  // the original still holds
    }
    EXPECT_TRUE(writer->GotInAtLast());
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Invalid mutex\n", lines[0].text);
}

TEST(ReadLock, AssignmentKeepsWhatEachSideHolds) {
    ReadWriteMutex mutex;
    std::unique_ptr<WaitingWriter> writer;
    {
        ReadLock holding(mutex);
        {
            ReadLock empty;
            empty = holding;  // takes over nothing, so it releases nothing either
            holding = empty;  // and this one keeps its hold
        }
        writer = std::make_unique<WaitingWriter>(mutex);
        EXPECT_FALSE(writer->GotInWhileHeld());
    }
    EXPECT_TRUE(writer->GotInAtLast());
}

TEST(ReadLock, AssignmentToItselfWarns) {
    ReadWriteMutex mutex;
    ReadLock lock(mutex);
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    ReadLock& same = lock;
    lock = same;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of ReadLock object\n", lines[0].text);
}

TEST(WriteLock, HoldsTheWriteLockForItsLifetime) {
    ReadWriteMutex mutex;
    {
        WriteLock const lock(mutex);
        EXPECT_FALSE(mutex.LockRead());
    }
    EXPECT_TRUE(mutex.LockRead());
    mutex.Unlock();
}

TEST(WriteLock, KeepsAReaderOnAnotherThreadWaiting) {
    ReadWriteMutex mutex;
    std::atomic<bool> read(false);
    std::thread reader;
    {
        WriteLock const lock(mutex);
        reader = std::thread([&mutex, &read]() {
            ReadLock const inner(mutex);
            read = true;
        });
        std::this_thread::sleep_for(std::chrono::milliseconds(20));
        EXPECT_FALSE(read.load());
    }
    reader.join();
    EXPECT_TRUE(read.load());
}

TEST(WriteLock, FailureThrowsLockFailureWithEdeadlk) {
    ReadWriteMutex mutex;
    WriteLock const held(mutex);
    errno = 0;
    EXPECT_THAT([&mutex]() { WriteLock const lock(mutex); },
                ThrowsMessage<Error>(HasSubstr("(WriteLock::WriteLock@")));
    EXPECT_THAT([&mutex]() { WriteLock const lock(mutex); },
                ThrowsMessage<Error>(HasSubstr("[Error EDEADLK (35)] - Lock failure")));
    EXPECT_EQ(EDEADLK, errno);
}

TEST(WriteLock, WithoutAMutexWarnsInvalidMutexWhenDestroyed) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    { WriteLock const lock; }
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Invalid mutex\n", lines[0].text);
}

TEST(WriteLock, ACopyHoldsNothingAndTheLockIsReleasedOnce) {
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    ReadWriteMutex mutex;
    {
        WriteLock const lock(mutex);
        {
            // NOLINTNEXTLINE(performance-unnecessary-copy-initialization): the copy is the subject
            WriteLock const copy(lock);
        }
        ASSERT_EQ(1u, sink.Count());
        EXPECT_FALSE(mutex.LockRead());  // the original still holds
    }
    EXPECT_TRUE(mutex.LockWrite());
    mutex.Unlock();
}

TEST(WriteLock, AssignmentToItselfWarns) {
    ReadWriteMutex mutex;
    WriteLock lock(mutex);
    RecordingLogSink const sink(DEWARP_LOG_LEVEL_WARNING);
    WriteLock& same = lock;
    lock = same;
    auto const lines = sink.Lines();
    ASSERT_EQ(1u, lines.size());
    EXPECT_EQ("VEXMAP: WARNING - Self assignment of WriteLock object\n", lines[0].text);
}

}  // namespace
}  // namespace quorvel::vexmap
