// Notifier and sharing policies of OmbVec and OmbRefVec.
//
// A notifier tells the owning engine object that the collection changed. A
// sharing policy lets one object own the collection exclusively (OmbVec) or
// own its items through it (OmbRefVec), and makes the collection enforce its
// read-only mark.
#pragma once

#include <oecore/core/ref.h>

#include <atomic>

class OmbEngineObject;

class OmbVecNotifierDummy {
public:
    void owner(OmbEngineObject*) {}
    OmbRef<OmbEngineObject> owner() const { return OmbRef<OmbEngineObject>(); }
    void notify() const {}
};

// Holds the owner weakly, so a collection never keeps its owner alive.
class OmbVecNotifier {
public:
    void owner(OmbEngineObject* owner);
    OmbRef<OmbEngineObject> owner() const;
    // Calls the owner's notifyChanged() if the owner still exists.
    void notify() const;

private:
    OmbWRef<OmbEngineObject> owner_;
};

class OmbRefVecNotifierDummy : public OmbVecNotifierDummy {};
class OmbRefVecNotifier : public OmbVecNotifier {};

// The owned flag shared by the sharing policies; a copy starts unowned.
class OmbOwnedFlag {
public:
    OmbOwnedFlag() = default;
    OmbOwnedFlag(const OmbOwnedFlag&) {}
    OmbOwnedFlag& operator=(const OmbOwnedFlag&) { return *this; }

    // Sets the flag; false if it was set already.
    bool takeFlag() noexcept {
        int expected = 0;
        return owned_.compare_exchange_strong(expected, 1, std::memory_order_acq_rel);
    }
    void clearFlag() noexcept {
        int expected = 1;
        owned_.compare_exchange_strong(expected, 0, std::memory_order_acq_rel);
    }
    bool isOwned() const noexcept { return owned_.load(std::memory_order_acquire) != 0; }

private:
    std::atomic<int> owned_{0};
};

// Item hooks of the policies under which items are not owned.
class OmbItemsNotOwned {
public:
    void argument(int) noexcept {}
    template <class Item>
    bool adoptItem(const Item&) noexcept {
        return true;
    }
    template <class Item>
    void disownItem(const Item&) noexcept {}
};

// No ownership and no read-only enforcement.
class OmbVecSharingDummy : public OmbItemsNotOwned {
public:
    static constexpr bool enforced = false;
    bool takeFlag() noexcept { return true; }
    void clearFlag() noexcept {}
    bool isOwned() const noexcept { return false; }
};

// The collection itself can be owned by one object.
class OmbVecSharing : public OmbOwnedFlag, public OmbItemsNotOwned {
public:
    static constexpr bool enforced = true;
};

template <class T>
class OmbRefVecSharingDummy : public OmbVecSharingDummy {};

// The items are owned through the collection: while it is owned, every item
// in it is owned (T provides takeOwnership(int) and releaseOwnership()).
template <class T>
class OmbRefVecSharing : public OmbOwnedFlag {
public:
    static constexpr bool enforced = true;
    void argument(int argument) noexcept { argument_ = argument; }
    bool adoptItem(const OmbRef<T>& item) { return !item || !isOwned() || item->takeOwnership(argument_); }
    void disownItem(const OmbRef<T>& item) {
        if (item && isOwned()) item->releaseOwnership();
    }

private:
    int argument_ = 0;
};
