// OmbRef<T> and OmbWRef<T>: the strong and weak smart pointers of the
// library.
//
// OmbRef keeps the OmbRefCnt base beside the typed pointer, so copying needs
// neither a cast nor a virtual call, and a class whose counting base is not
// its first base (an object that is also a cache interface) still counts
// right.
#pragma once

#include <oecore/core/refcnt.h>

#include <cstddef>
#include <functional>
#include <type_traits>
#include <utility>

template <class T>
class OmbRef {
public:
    using element_type = T;

    OmbRef() noexcept = default;
    OmbRef(std::nullptr_t) noexcept {}
    // Takes a reference on the object.
    OmbRef(T* object) noexcept : count_(object), object_(object) { retain(); }
    // For interfaces that do not derive from OmbRefCnt: counting goes through
    // the given base, access through the interface pointer.
    OmbRef(const OmbRefCnt* count, T* object) noexcept : count_(object ? count : nullptr), object_(object) { retain(); }
    OmbRef(const OmbRef& other) noexcept : count_(other.count_), object_(other.object_) { retain(); }
    OmbRef(OmbRef&& other) noexcept : count_(other.count_), object_(other.object_) {
        other.count_ = nullptr;
        other.object_ = nullptr;
    }
    template <class U, class = std::enable_if_t<std::is_convertible_v<U*, T*>>>
    OmbRef(const OmbRef<U>& other) noexcept : count_(other.countPointer()), object_(other.get()) {
        retain();
    }
    ~OmbRef() {
        if (count_) count_->unref();
    }

    // Raises the new count before dropping the old one: self-assignment is safe.
    OmbRef& operator=(const OmbRef& other) noexcept {
        OmbRef(other).swap(*this);
        return *this;
    }
    OmbRef& operator=(OmbRef&& other) noexcept {
        OmbRef(std::move(other)).swap(*this);
        return *this;
    }
    OmbRef& operator=(T* object) noexcept {
        OmbRef(object).swap(*this);
        return *this;
    }

    // Wraps an object whose count already includes this reference.
    static OmbRef adopt(const OmbRefCnt* count, T* object) noexcept {
        OmbRef r;
        r.count_ = object ? count : nullptr;
        r.object_ = object;
        return r;
    }

    void reset() noexcept { OmbRef().swap(*this); }
    void swap(OmbRef& other) noexcept {
        std::swap(count_, other.count_);
        std::swap(object_, other.object_);
    }

    T* get() const noexcept { return object_; }
    T* operator->() const noexcept { return object_; }
    T& operator*() const noexcept { return *object_; }
    explicit operator bool() const noexcept { return object_ != nullptr; }
    const OmbRefCnt* countPointer() const noexcept { return count_; }

    friend bool operator==(const OmbRef& a, const OmbRef& b) noexcept { return a.object_ == b.object_; }
    friend bool operator==(const OmbRef& a, std::nullptr_t) noexcept { return a.object_ == nullptr; }
    friend bool operator<(const OmbRef& a, const OmbRef& b) noexcept { return std::less<T*>()(a.object_, b.object_); }

private:
    void retain() const noexcept {
        if (count_) count_->ref();
    }

    const OmbRefCnt* count_ = nullptr;
    T* object_ = nullptr;
};

// A reference of another type to the same object: empty when the object is
// not a U.
template <class U, class T>
OmbRef<U> omb_dynamic_cast(const OmbRef<T>& r) {
    U* u = dynamic_cast<U*>(r.get());
    return u ? OmbRef<U>(r.countPointer(), u) : OmbRef<U>();
}

template <class U, class T>
OmbRef<U> omb_static_cast(const OmbRef<T>& r) {
    return OmbRef<U>(r.countPointer(), static_cast<U*>(r.get()));
}

template <class T>
class OmbWRef {
public:
    OmbWRef() noexcept = default;
    OmbWRef(std::nullptr_t) noexcept {}
    OmbWRef(T* object) : object_(object), data_(object ? object->weak() : nullptr) {}
    OmbWRef(const OmbRef<T>& strong) : OmbWRef(strong.get()) {}
    OmbWRef(const OmbWRef& other) noexcept : object_(other.object_), data_(other.data_) {
        if (data_) data_->ref();
    }
    OmbWRef(OmbWRef&& other) noexcept : object_(other.object_), data_(other.data_) {
        other.object_ = nullptr;
        other.data_ = nullptr;
    }
    ~OmbWRef() {
        if (data_) data_->unref();
    }

    OmbWRef& operator=(const OmbWRef& other) noexcept {
        OmbWRef(other).swap(*this);
        return *this;
    }
    OmbWRef& operator=(OmbWRef&& other) noexcept {
        OmbWRef(std::move(other)).swap(*this);
        return *this;
    }

    void reset() noexcept { OmbWRef().swap(*this); }
    void swap(OmbWRef& other) noexcept {
        std::swap(object_, other.object_);
        std::swap(data_, other.data_);
    }

    // A strong reference, or an empty one once the object is gone.
    OmbRef<T> strong() const noexcept {
        if (!data_) return OmbRef<T>();
        const OmbRefCnt* count = data_->strong();
        return count ? OmbRef<T>::adopt(count, object_) : OmbRef<T>();
    }

    bool empty() const noexcept { return data_ == nullptr; }
    bool expired() const noexcept { return !data_ || !strong(); }
    OmbWRefData* data() const noexcept { return data_; }

    friend bool operator==(const OmbWRef& a, const OmbWRef& b) noexcept { return a.data_ == b.data_; }

private:
    T* object_ = nullptr;
    OmbWRefData* data_ = nullptr;
};
