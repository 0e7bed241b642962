#include <oecore/core/exception.h>
#include <oecore/core/readerwriterlock.h>
#include <oecore/core/threadid.h>

#include <tbb/spin_rw_mutex.h>

#include <mutex>
#include <unordered_map>

OMB_DEFINE_ENGINE_CLASS(OmbReaderWriterLock, OmbEngineObject, "ReaderWriterLock", 0)

struct OmbReaderWriterLock::State {
    tbb::spin_rw_mutex lock;
    // Who holds what, guarded by bookkeeping.
    std::mutex bookkeeping;
    std::uint32_t writer = 0;
    int writeRecursion = 0;
    std::unordered_map<std::uint32_t, int> readers;
};

namespace {

[[noreturn]] void alreadyWriter() {
    OMB_THROW(InvalidOperation, OmbString::literal("The current thread already owns the writer lock."));
}
[[noreturn]] void alreadyReader() {
    OMB_THROW(InvalidOperation, OmbString::literal("The current thread already owns a reader lock."));
}

}  // namespace

OmbReaderWriterLock::OmbReaderWriterLock() : state_(std::make_unique<State>()) {}

OmbReaderWriterLock::~OmbReaderWriterLock() = default;

void OmbReaderWriterLock::acquireReaderLock() {
    const std::uint32_t self = Omb_currentThreadId();
    {
        std::lock_guard guard(state_->bookkeeping);
        if (state_->writer == self) alreadyWriter();
        if (state_->readers.count(self)) alreadyReader();
    }
    state_->lock.lock_shared();
    std::lock_guard guard(state_->bookkeeping);
    state_->readers[self] = 1;
}

void OmbReaderWriterLock::acquireRecursiveReaderLock() {
    const std::uint32_t self = Omb_currentThreadId();
    {
        std::lock_guard guard(state_->bookkeeping);
        if (state_->writer == self) alreadyWriter();
        const auto it = state_->readers.find(self);
        if (it != state_->readers.end()) {
            ++it->second;
            return;
        }
    }
    state_->lock.lock_shared();
    std::lock_guard guard(state_->bookkeeping);
    state_->readers[self] = 1;
}

void OmbReaderWriterLock::releaseReaderLock() {
    const std::uint32_t self = Omb_currentThreadId();
    {
        std::lock_guard guard(state_->bookkeeping);
        const auto it = state_->readers.find(self);
        if (it == state_->readers.end())
            OMB_THROW(InvalidOperation, OmbString::literal("The current thread does not own a reader lock."));
        if (--it->second > 0) return;
        state_->readers.erase(it);
    }
    state_->lock.unlock_shared();
}

void OmbReaderWriterLock::acquireWriterLock() {
    const std::uint32_t self = Omb_currentThreadId();
    {
        std::lock_guard guard(state_->bookkeeping);
        if (state_->writer == self) alreadyWriter();
        if (state_->readers.count(self)) alreadyReader();
    }
    state_->lock.lock();
    std::lock_guard guard(state_->bookkeeping);
    state_->writer = self;
    state_->writeRecursion = 1;
}

void OmbReaderWriterLock::acquireRecursiveWriterLock() {
    {
        std::lock_guard guard(state_->bookkeeping);
        if (state_->writer == Omb_currentThreadId()) {
            ++state_->writeRecursion;
            return;
        }
    }
    acquireWriterLock();
}

void OmbReaderWriterLock::releaseWriterLock() {
    {
        std::lock_guard guard(state_->bookkeeping);
        if (state_->writer != Omb_currentThreadId())
            OMB_THROW(InvalidOperation, OmbString::literal("The current thread does not own the writer lock."));
        if (--state_->writeRecursion > 0) return;
        state_->writer = 0;
    }
    state_->lock.unlock();
}

bool OmbReaderWriterLock::hasWriterLock() const {
    std::lock_guard guard(state_->bookkeeping);
    return state_->writer == Omb_currentThreadId();
}

OmbAcquireReaderLock::OmbAcquireReaderLock(OmbRef<OmbReaderWriterLock> lock) : lock_(std::move(lock)) { acquire(); }

OmbAcquireReaderLock::~OmbAcquireReaderLock() { release(); }

void OmbAcquireReaderLock::acquire() {
    if (!lock_ || held_) return;
    lock_->acquireReaderLock();
    held_ = true;
}

void OmbAcquireReaderLock::release() {
    if (!held_) return;
    held_ = false;
    lock_->releaseReaderLock();
}

OmbAcquireWriterLock::OmbAcquireWriterLock(OmbRef<OmbReaderWriterLock> lock) : lock_(std::move(lock)) { acquire(); }

OmbAcquireWriterLock::~OmbAcquireWriterLock() { release(); }

void OmbAcquireWriterLock::acquire() {
    if (!lock_ || held_) return;
    lock_->acquireWriterLock();
    held_ = true;
}

void OmbAcquireWriterLock::release() {
    if (!held_) return;
    held_ = false;
    lock_->releaseWriterLock();
}

OmbReuseWriterOrAcquireRecursiveReaderLock::OmbReuseWriterOrAcquireRecursiveReaderLock(OmbRef<OmbReaderWriterLock> lock)
    : lock_(std::move(lock)) {
    if (!lock_) return;
    writer_ = lock_->hasWriterLock();
    if (writer_)
        lock_->acquireRecursiveWriterLock();
    else
        lock_->acquireRecursiveReaderLock();
}

OmbReuseWriterOrAcquireRecursiveReaderLock::~OmbReuseWriterOrAcquireRecursiveReaderLock() {
    if (!lock_) return;
    if (writer_)
        lock_->releaseWriterLock();
    else
        lock_->releaseReaderLock();
}
