#include <oecore/core/refcnt.h>

#include <mutex>

namespace {

// Orders weak-to-strong promotion against the final release.
std::mutex& weakReferenceMutex() {
    static std::mutex mutex;
    return mutex;
}

}  // namespace

void OmbRefCnt::trydel() const noexcept { delete this; }

void OmbWRefData::unref() noexcept {
    if (count_.fetch_sub(1, std::memory_order_acq_rel) == 1) delete this;
}

OmbRefCnt* OmbWRefData::strong() noexcept {
    if (!object_.load(std::memory_order_acquire)) return nullptr;
    std::lock_guard lock(weakReferenceMutex());
    const OmbRefCnt* object = object_.load(std::memory_order_acquire);
    if (!object) return nullptr;
    // A count of zero means the last strong reference is already gone and
    // its release is on the way to delete the object: promoting it now would
    // let a second release delete it while the first still runs.
    std::int32_t count = object->count_.load(std::memory_order_acquire);
    do {
        if (count <= 0) return nullptr;
    } while (!object->count_.compare_exchange_weak(count, count + 1, std::memory_order_acq_rel));
    return const_cast<OmbRefCnt*>(object);
}

OmbWRefCnt::~OmbWRefCnt() {
    if (OmbWRefData* record = weak_.load(std::memory_order_acquire)) {
        record->object_.store(nullptr, std::memory_order_release);
        record->unref();
    }
}

void OmbWRefCnt::trydel() const noexcept {
    OmbWRefData* record = weak_.load(std::memory_order_acquire);
    if (record) {
        std::lock_guard lock(weakReferenceMutex());
        if (count_.load(std::memory_order_acquire) > 0) return;
        record->object_.store(nullptr, std::memory_order_release);
    }
    delete this;
}

OmbWRefData* OmbWRefCnt::weak() const {
    OmbWRefData* record = weak_.load(std::memory_order_acquire);
    if (!record) {
        auto* fresh = new OmbWRefData(this);
        if (weak_.compare_exchange_strong(record, fresh, std::memory_order_acq_rel))
            record = fresh;
        else
            delete fresh;  // another thread installed its record first
    }
    record->ref();
    return record;
}
