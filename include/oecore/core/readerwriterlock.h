// OmbReaderWriterLock: a spin reader/writer lock that knows which threads
// hold it, so that misuse (taking it twice, upgrading a read lock) throws
// OmbXInvalidOperation instead of deadlocking, and recursive forms can be
// offered on top.
//
// Thread safety: all operations may be called from any thread. Which threads
// hold read locks is kept per thread, so readers share nothing but the spin
// lock; a lock must not be destroyed while a thread still holds it.
#pragma once

#include <oecore/core/engineobject.h>

#include <memory>
#include <utility>

class OmbReaderWriterLock : public OmbEngineObject {
    OMB_DECLARE_ENGINE_CLASS()

public:
    OmbReaderWriterLock();
    ~OmbReaderWriterLock() override;

    // A lock is a place, not a value: a clone is a new, free lock.
    OmbReaderWriterLock* clone() const override { return new OmbReaderWriterLock; }

    void acquireReaderLock();
    void acquireRecursiveReaderLock();
    void releaseReaderLock();
    void acquireWriterLock();
    void acquireRecursiveWriterLock();
    void releaseWriterLock();
    // Whether the calling thread holds the write lock.
    bool hasWriterLock() const;

private:
    struct State;
    std::unique_ptr<State> state_;
};

// Holds one side of a lock from construction to destruction, with
// acquire() and release() in between (a null lock is never taken).
template <void (OmbReaderWriterLock::*Acquire)(), void (OmbReaderWriterLock::*Release)()>
class OmbLockGuard {
public:
    explicit OmbLockGuard(OmbRef<OmbReaderWriterLock> lock) : lock_(std::move(lock)) { acquire(); }
    ~OmbLockGuard() { release(); }
    OmbLockGuard(const OmbLockGuard&) = delete;
    OmbLockGuard& operator=(const OmbLockGuard&) = delete;

    void acquire() {
        if (!lock_ || held_) return;
        ((*lock_).*Acquire)();
        held_ = true;
    }
    void release() {
        if (!held_) return;
        held_ = false;
        ((*lock_).*Release)();
    }

private:
    OmbRef<OmbReaderWriterLock> lock_;
    bool held_ = false;
};

class OmbAcquireReaderLock
    : public OmbLockGuard<&OmbReaderWriterLock::acquireReaderLock, &OmbReaderWriterLock::releaseReaderLock> {
    using OmbLockGuard::OmbLockGuard;
};

class OmbAcquireWriterLock
    : public OmbLockGuard<&OmbReaderWriterLock::acquireWriterLock, &OmbReaderWriterLock::releaseWriterLock> {
    using OmbLockGuard::OmbLockGuard;
};

// For code that only reads: inside a writer's critical region it re-enters
// the write lock, elsewhere it takes a recursive read lock.
class OmbReuseWriterOrAcquireRecursiveReaderLock {
public:
    explicit OmbReuseWriterOrAcquireRecursiveReaderLock(OmbRef<OmbReaderWriterLock> lock);
    ~OmbReuseWriterOrAcquireRecursiveReaderLock();
    OmbReuseWriterOrAcquireRecursiveReaderLock(const OmbReuseWriterOrAcquireRecursiveReaderLock&) = delete;
    OmbReuseWriterOrAcquireRecursiveReaderLock& operator=(const OmbReuseWriterOrAcquireRecursiveReaderLock&) = delete;

private:
    OmbRef<OmbReaderWriterLock> lock_;
    bool writer_ = false;
};
