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

// Holds the read side for its lifetime (a null lock is not locked).
class OmbAcquireReaderLock {
public:
    explicit OmbAcquireReaderLock(OmbRef<OmbReaderWriterLock> lock);
    ~OmbAcquireReaderLock();
    OmbAcquireReaderLock(const OmbAcquireReaderLock&) = delete;
    OmbAcquireReaderLock& operator=(const OmbAcquireReaderLock&) = delete;

    void acquire();
    void release();

private:
    OmbRef<OmbReaderWriterLock> lock_;
    bool held_ = false;
};

// Holds the write side for its lifetime (a null lock is not locked).
class OmbAcquireWriterLock {
public:
    explicit OmbAcquireWriterLock(OmbRef<OmbReaderWriterLock> lock);
    ~OmbAcquireWriterLock();
    OmbAcquireWriterLock(const OmbAcquireWriterLock&) = delete;
    OmbAcquireWriterLock& operator=(const OmbAcquireWriterLock&) = delete;

    void acquire();
    void release();

private:
    OmbRef<OmbReaderWriterLock> lock_;
    bool held_ = false;
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
