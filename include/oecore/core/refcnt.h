// Intrusive reference counting and weak references.
//
// OmbRefCnt is the root of everything shared; OmbWRefCnt adds a weak record
// that outlives the object while weak references remain. Counts change with
// atomic operations only, so references may be copied and released on any
// thread without locks; one process-wide mutex orders a weak promotion
// against the final release.
#pragma once

#include <atomic>
#include <cstdint>

class OmbRefCnt {
public:
    OmbRefCnt() noexcept = default;
    // A copy is a new object: it starts unreferenced.
    OmbRefCnt(const OmbRefCnt&) noexcept {}
    OmbRefCnt& operator=(const OmbRefCnt&) noexcept { return *this; }
    virtual ~OmbRefCnt() = default;

    void ref() const noexcept { count_.fetch_add(1, std::memory_order_relaxed); }
    void unref() const noexcept {
        if (count_.fetch_sub(1, std::memory_order_acq_rel) == 1) trydel();
    }
    bool hasOnlyOneReferee() const noexcept { return count_.load(std::memory_order_acquire) == 1; }
    std::int32_t refCount() const noexcept { return count_.load(std::memory_order_acquire); }

private:
    friend class OmbWRefData;
    friend class OmbWRefCnt;

    // Called when the count reaches zero; the base deletes the object.
    virtual void trydel() const noexcept;

    mutable std::atomic<std::int32_t> count_{0};
};

// The weak-reference record of one object.
class OmbWRefData {
public:
    explicit OmbWRefData(const OmbRefCnt* object) noexcept : object_(object) {}
    OmbWRefData(const OmbWRefData&) = delete;
    OmbWRefData& operator=(const OmbWRefData&) = delete;

    void ref() noexcept { count_.fetch_add(1, std::memory_order_relaxed); }
    // Frees the record when the last holder lets go.
    void unref() noexcept;
    // The object with its strong count raised for the caller, or null once
    // the object has been condemned.
    OmbRefCnt* strong() noexcept;
    std::int32_t refCount() const noexcept { return count_.load(std::memory_order_acquire); }

private:
    friend class OmbWRefCnt;

    std::atomic<std::int32_t> count_{1};  // the object's own hold
    std::atomic<const OmbRefCnt*> object_;
};

class OmbWRefCnt : public OmbRefCnt {
public:
    OmbWRefCnt() noexcept = default;
    // A copy has no weak record of its own.
    OmbWRefCnt(const OmbWRefCnt& other) noexcept : OmbRefCnt(other) {}
    OmbWRefCnt& operator=(const OmbWRefCnt&) noexcept { return *this; }
    ~OmbWRefCnt() override;

    bool hasWeakRecord() const noexcept { return weak_.load(std::memory_order_acquire) != nullptr; }

private:
    template <class T>
    friend class OmbWRef;
    friend class OmbCacheRef;

    void trydel() const noexcept override;
    // The record, created on first use, with its count raised for the caller.
    OmbWRefData* weak() const;

    mutable std::atomic<OmbWRefData*> weak_{nullptr};
};
