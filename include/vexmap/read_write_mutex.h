#pragma once

#include <cerrno>
#include <pthread.h>

#include "vexmap/code_location.h"
#include "vexmap/error.h"
#include "vexmap/log.h"

namespace quorvel::vexmap {

/// One POSIX read-write lock with default attributes. Not recursive. Copies are not meant to be
/// used: it is the owner's shared pointer that is copied, so a copy leaves its lock
/// uninitialised and assignment does nothing. Any thread may lock and unlock.
class ReadWriteMutex {
public:
    ReadWriteMutex();
    ReadWriteMutex(ReadWriteMutex const& other);
    ReadWriteMutex& operator=(ReadWriteMutex const& other);
    virtual ~ReadWriteMutex();

    /// The bare pthread calls, for a lock that was left uninitialised or finished early.
    int Init();
    int Fini();
    bool LockRead();
    bool LockWrite();
    void Unlock();

private:
    pthread_rwlock_t m_Lock;
};

/// Holds the read lock of a mutex for its own lifetime; throws EDEADLK if it cannot be taken.
/// A copy holds nothing, so no lock is ever released twice. One thread: the one that locked.
class ReadLock {
public:
    ReadLock();
    ReadLock(ReadLock const& other);
    explicit ReadLock(ReadWriteMutex& mutex);
    ReadLock& operator=(ReadLock const& other);  // each side keeps what it holds
    virtual ~ReadLock();

private:
    ReadWriteMutex* m_pMutex;  // null until the lock succeeded
};

/// Holds the write lock of a mutex for its own lifetime; throws EDEADLK if it cannot be taken.
/// A copy holds nothing, so no lock is ever released twice. One thread: the one that locked.
class WriteLock {
public:
    WriteLock();
    WriteLock(WriteLock const& other);
    explicit WriteLock(ReadWriteMutex& mutex);
    WriteLock& operator=(WriteLock const& other);  // each side keeps what it holds
    virtual ~WriteLock();

private:
    ReadWriteMutex* m_pMutex;  // null until the lock succeeded
};

inline ReadLock::ReadLock() : m_pMutex(nullptr) {}

// A copy holds nothing: sharing the original's hold would unlock twice, and taking a second hold
// would fail on a lock that this thread already holds for writing.
inline ReadLock::ReadLock(ReadLock const&) : m_pMutex(nullptr) {}

inline ReadLock::ReadLock(ReadWriteMutex& mutex) : m_pMutex(nullptr) {
    if (!mutex.LockRead()) {
        Error::SetLastError(EDEADLK);
        throw Error(
            CodeLocation("include/vexmap/read_write_mutex", "ReadLock", "ReadLock", __LINE__),
            EDEADLK, "%s", "Lock failure");
    }
    m_pMutex = &mutex;
}

inline ReadLock& ReadLock::operator=(ReadLock const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n", "ReadLock");
    }
    return *this;
}

inline ReadLock::~ReadLock() {
    if (m_pMutex != nullptr) {
        m_pMutex->Unlock();
    } else {
        Log::warn(__LINE__, __FILE__, "~ReadLock", "Invalid mutex\n");
    }
}

inline WriteLock::WriteLock() : m_pMutex(nullptr) {}

// A copy holds nothing: sharing the original's hold would unlock twice, and a second write hold
// cannot be had at all.
inline WriteLock::WriteLock(WriteLock const&) : m_pMutex(nullptr) {}

inline WriteLock::WriteLock(ReadWriteMutex& mutex) : m_pMutex(nullptr) {
    if (!mutex.LockWrite()) {
        Error::SetLastError(EDEADLK);
        throw Error(
            CodeLocation("include/vexmap/read_write_mutex", "WriteLock", "WriteLock", __LINE__),
            EDEADLK, "%s", "Lock failure");
    }
    m_pMutex = &mutex;
}

inline WriteLock& WriteLock::operator=(WriteLock const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "operator=", "Self assignment of %s object\n", "WriteLock");
    }
    return *this;
}

inline WriteLock::~WriteLock() {
    if (m_pMutex != nullptr) {
        m_pMutex->Unlock();
    } else {
        Log::warn(__LINE__, __FILE__, "~WriteLock", "Invalid mutex\n");
    }
}

}  // namespace quorvel::vexmap
