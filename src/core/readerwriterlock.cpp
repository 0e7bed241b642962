#include <oecore/core/exception.h>
#include <oecore/core/readerwriterlock.h>
#include <oecore/core/threadid.h>

#include <tbb/spin_rw_mutex.h>

#include <atomic>
#include <vector>

OMB_DEFINE_ENGINE_CLASS(OmbReaderWriterLock, OmbEngineObject, "ReaderWriterLock", 0)

struct OmbReaderWriterLock::State {
    tbb::spin_rw_mutex lock;
    // Written only by the thread that holds the write lock; others only
    // compare it with their own id.
    std::atomic<std::uint32_t> writer{0};
    int writeRecursion = 0;
};

namespace {

// Each thread keeps its own read counts, so taking a read lock touches no
// memory shared with other readers besides the spin lock itself.
struct ReadCount {
    const void* lock;
    int count;
};
thread_local std::vector<ReadCount> readCounts;

ReadCount* readCountOf(const void* lock) {
    for (ReadCount& entry : readCounts)
        if (entry.lock == lock) return &entry;
    return nullptr;
}

void forgetReadCount(const void* lock) {
    std::erase_if(readCounts, [lock](const ReadCount& entry) { return entry.lock == lock; });
}

[[noreturn]] void alreadyWriter() {
    OMB_THROW(InvalidOperation, OmbString::literal("The current thread already owns the writer lock."));
}
[[noreturn]] void alreadyReader() {
    OMB_THROW(InvalidOperation, OmbString::literal("The current thread already owns a reader lock."));
}

}  // namespace

OmbReaderWriterLock::OmbReaderWriterLock() : state_(std::make_unique<State>()) {}

OmbReaderWriterLock::~OmbReaderWriterLock() = default;

bool OmbReaderWriterLock::hasWriterLock() const {
    return state_->writer.load(std::memory_order_relaxed) == Omb_currentThreadId();
}

void OmbReaderWriterLock::acquireReaderLock() {
    if (hasWriterLock()) alreadyWriter();
    if (readCountOf(this)) alreadyReader();
    state_->lock.lock_shared();
    readCounts.push_back({this, 1});
}

void OmbReaderWriterLock::acquireRecursiveReaderLock() {
    if (hasWriterLock()) alreadyWriter();
    if (ReadCount* own = readCountOf(this)) {
        ++own->count;
        return;
    }
    state_->lock.lock_shared();
    readCounts.push_back({this, 1});
}

void OmbReaderWriterLock::releaseReaderLock() {
    ReadCount* own = readCountOf(this);
    if (!own) OMB_THROW(InvalidOperation, OmbString::literal("The current thread does not own a reader lock."));
    if (--own->count > 0) return;
    forgetReadCount(this);
    state_->lock.unlock_shared();
}

void OmbReaderWriterLock::acquireWriterLock() {
    if (hasWriterLock()) alreadyWriter();
    if (readCountOf(this)) alreadyReader();
    state_->lock.lock();
    state_->writer.store(Omb_currentThreadId(), std::memory_order_relaxed);
    state_->writeRecursion = 1;
}

void OmbReaderWriterLock::acquireRecursiveWriterLock() {
    if (hasWriterLock())
        ++state_->writeRecursion;
    else
        acquireWriterLock();
}

void OmbReaderWriterLock::releaseWriterLock() {
    if (!hasWriterLock())
        OMB_THROW(InvalidOperation, OmbString::literal("The current thread does not own the writer lock."));
    if (--state_->writeRecursion > 0) return;
    state_->writer.store(0, std::memory_order_relaxed);
    state_->lock.unlock();
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
