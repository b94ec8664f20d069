#include "vexmap/read_write_mutex.h"

namespace quorvel::vexmap {

// The result is not looked at: with default attributes the initialisation cannot fail here.
ReadWriteMutex::ReadWriteMutex() : m_Lock() {
    pthread_rwlock_init(&m_Lock, nullptr);
}

// No pthread_rwlock_init: a copy is not meant to be locked until Init. The bytes are zeroed only
// so that its destructor reads nothing indeterminate.
ReadWriteMutex::ReadWriteMutex(ReadWriteMutex const&) : m_Lock() {}

// The lock is the object's identity and state, neither of which assignment can take over.
ReadWriteMutex& ReadWriteMutex::operator=(ReadWriteMutex const&) {
    return *this;
}

ReadWriteMutex::~ReadWriteMutex() {
    pthread_rwlock_destroy(&m_Lock);
}

int ReadWriteMutex::Init() {
    return pthread_rwlock_init(&m_Lock, nullptr);
}

int ReadWriteMutex::Fini() {
    return pthread_rwlock_destroy(&m_Lock);
}

bool ReadWriteMutex::LockRead() {
    return pthread_rwlock_rdlock(&m_Lock) == 0;
}

bool ReadWriteMutex::LockWrite() {
    return pthread_rwlock_wrlock(&m_Lock) == 0;
}

void ReadWriteMutex::Unlock() {
    pthread_rwlock_unlock(&m_Lock);
}

}  // namespace quorvel::vexmap
