// OmbPointArray: a sequence of points whose storage copies share until one
// of them changes (copy-on-write), so that features, caches and operators
// can pass coordinates around without copying them.
//
// Copies may be used from different threads; one array object is not
// changed from two threads at once.
#pragma once

#include <oecore/linalg/point.h>

#include <initializer_list>
#include <memory>
#include <vector>

class OmbPointArray {
public:
    using value_type = OmbPoint;
    using iterator = OmbPoint*;
    using const_iterator = const OmbPoint*;

    OmbPointArray() = default;
    OmbPointArray(std::initializer_list<OmbPoint> points);
    explicit OmbPointArray(std::size_t size);

    std::size_t size() const noexcept { return storage_ ? storage_->size() : 0; }
    bool empty() const noexcept { return size() == 0; }
    std::size_t capacity() const noexcept { return storage_ ? storage_->capacity() : 0; }

    const OmbPoint& operator[](std::size_t i) const { return (*storage_)[i]; }
    const OmbPoint* data() const noexcept { return storage_ ? storage_->data() : nullptr; }
    const_iterator begin() const noexcept { return data(); }
    const_iterator end() const noexcept { return data() + size(); }
    const OmbPoint& front() const { return (*storage_)[0]; }
    const OmbPoint& back() const { return storage_->back(); }

    // Changing access makes the storage this array's own first.
    OmbPoint& operator[](std::size_t i) { return own()[i]; }
    OmbPoint* data() { return own().data(); }
    iterator begin() { return data(); }
    iterator end() { return data() + size(); }

    void push_back(const OmbPoint& p) { own().push_back(p); }
    void pop_back() { own().pop_back(); }
    void insert(std::size_t at, const OmbPoint& p);
    void erase(std::size_t at);
    void resize(std::size_t size) { own().resize(size); }
    void reserve(std::size_t size) { own().reserve(size); }
    void clear() { storage_.reset(); }

    // Element by element.
    friend bool operator==(const OmbPointArray& a, const OmbPointArray& b);
    // Whether the two still share their storage.
    bool sharesStorageWith(const OmbPointArray& other) const noexcept { return storage_ && storage_ == other.storage_; }

private:
    std::vector<OmbPoint>& own();

    std::shared_ptr<std::vector<OmbPoint>> storage_;
};
