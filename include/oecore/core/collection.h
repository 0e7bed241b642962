// OmbCollection: the operations OmbVec and OmbRefVec share.
//
// A collection is an engine object holding a sequence of items, with a
// read-only mark, a notifier that reports changes to an owning object and a
// sharing policy. With a sharing policy every change first checks the
// read-only mark; without one the mark is only recorded. get() does not
// check its index (callers keep indices below size()); the operations that
// change the collection do, and throw OmbXRangeError.
#pragma once

#include <oecore/core/collectionpolicies.h>
#include <oecore/core/engineobject.h>
#include <oecore/core/exception.h>

#include <algorithm>
#include <cstddef>
#include <functional>
#include <string>
#include <vector>

template <class Item, class Container, class Notifier, class Sharing>
class OmbCollection : public OmbEngineObject {
public:
    using value_type = Item;
    using const_iterator = typename Container::const_iterator;

    OmbCollection() = default;
    OmbCollection(const OmbCollection& other) : OmbEngineObject(other), items_(other.items_) {}

    std::size_t size() const noexcept { return items_.size(); }
    bool empty() const noexcept { return items_.empty(); }
    std::size_t capacity() const noexcept { return items_.capacity(); }
    const Item& get(std::size_t index) const { return items_[index]; }
    const Item& front() const { return items_.front(); }
    const Item& back() const { return items_.back(); }
    const_iterator begin() const { return items_.begin(); }
    const_iterator end() const { return items_.end(); }
    const Container& items() const noexcept { return items_; }

    bool contains(const Item& item) const { return indexOf(item) >= 0; }
    std::ptrdiff_t indexOf(const Item& item) const {
        const auto it = std::find(items_.begin(), items_.end(), item);
        return it == items_.end() ? -1 : it - items_.begin();
    }
    bool equals(const OmbCollection& other) const { return items_ == other.items_; }

    void set(std::size_t index, const Item& item) {
        checkWritable();
        checkBelow(index, items_.size(), "collection set");
        if (items_[index] == item) return;
        adopt(item);
        Item old = items_[index];
        items_[index] = item;
        sharing_.disownItem(old);
        changed();
    }
    void add(const Item& item) { insert(items_.size(), item); }
    void push_back(const Item& item) { insert(items_.size(), item); }
    void insert(std::size_t index, const Item& item) {
        checkWritable();
        checkBelow(index, items_.size() + 1, "collection insert");
        items_.reserve(items_.size() + 1);
        adopt(item);
        items_.insert(items_.begin() + static_cast<std::ptrdiff_t>(index), item);
        changed();
    }
    void addRange(const OmbCollection& other) { insertRange(items_.size(), other); }
    void insertRange(std::size_t index, const OmbCollection& other) {
        checkWritable();
        checkBelow(index, items_.size() + 1, "collection insertRange");
        const Container added = other.items_;  // other may be this collection
        items_.reserve(items_.size() + added.size());
        adoptAll(added);
        items_.insert(items_.begin() + static_cast<std::ptrdiff_t>(index), added.begin(), added.end());
        changed();
    }
    void assign(const OmbCollection& other) {
        checkWritable();
        if (&other == this) return;
        Container added = other.items_;
        adoptAll(added);
        items_.swap(added);
        disownAll(added);
        changed();
    }

    void clear() {
        checkWritable();
        Container removed;
        removed.swap(items_);
        disownAll(removed);
        changed();
    }
    void erase(std::size_t index, std::size_t count = 1) {
        checkWritable();
        checkBelow(index, items_.size() + 1, "collection erase");
        checkBelow(count, items_.size() - index + 1, "collection erase count");
        const auto first = items_.begin() + static_cast<std::ptrdiff_t>(index);
        const auto last = first + static_cast<std::ptrdiff_t>(count);
        const Container removed(first, last);
        items_.erase(first, last);
        disownAll(removed);
        changed();
    }
    void removeAt(std::size_t index) { erase(index, 1); }
    // Removes the first equal item; false when there is none.
    bool remove(const Item& item) {
        const std::ptrdiff_t index = indexOf(item);
        if (index < 0) return false;
        erase(static_cast<std::size_t>(index));
        return true;
    }
    Item pop() {
        checkBelow(0, items_.size(), "collection pop");
        Item last = items_.back();
        pop_back();
        return last;
    }
    void pop_back() {
        checkBelow(0, items_.size(), "collection pop_back");
        erase(items_.size() - 1);
    }

    void reserve(std::size_t n) { items_.reserve(n); }
    void resize(std::size_t n) {
        if (n < items_.size()) return erase(n, items_.size() - n);
        checkWritable();
        items_.resize(n);
        changed();
    }
    // Adds n default items at the end.
    void grow(std::size_t n) { resize(items_.size() + n); }
    void reverse() {
        checkWritable();
        std::reverse(items_.begin(), items_.end());
        changed();
    }
    template <class Less = std::less<Item>>
    void sort(Less less = Less()) {
        checkWritable();
        std::sort(items_.begin(), items_.end(), less);
        changed();
    }

    void markReadOnly() noexcept { readOnly_ = true; }
    bool isReadOnly() const noexcept { return readOnly_; }

    // Owns the collection (and, with OmbRefVecSharing, its items). If an item
    // refuses, the items taken so far are released in reverse order, the
    // collection is left unowned and false is returned.
    bool takeOwnership() {
        if (!sharing_.takeFlag()) return false;
        for (std::size_t i = 0; i < items_.size(); ++i) {
            if (!sharing_.adoptItem(items_[i])) {
                while (i-- > 0) sharing_.disownItem(items_[i]);
                sharing_.clearFlag();
                return false;
            }
        }
        return true;
    }
    void releaseOwnership() {
        if (!sharing_.isOwned()) return;
        for (const Item& item : items_) sharing_.disownItem(item);
        sharing_.clearFlag();
    }
    bool isOwned() const noexcept { return sharing_.isOwned(); }
    // The argument passed on to items when they are taken.
    void takeOwnershipArgument(int argument) noexcept { sharing_.argument(argument); }

    Notifier& notifier() noexcept { return notifier_; }

    // An estimate of the collection's own size for the caches.
    std::size_t memoryPressure() const noexcept { return items_.capacity() == 0 ? 4000 : 200 * items_.capacity(); }

private:
    void checkWritable() const {
        if constexpr (Sharing::enforced) {
            if (readOnly_) OMB_THROW(ReadOnly, OmbString::literal("Collection"));
        }
    }
    void checkBelow(std::size_t value, std::size_t bound, const char* operation) const {
        if (value < bound) return;
        OMB_THROW(RangeError, OmbString(std::to_string(value)), OmbString(operation),
                  OmbString("below " + std::to_string(bound)));
    }
    void adopt(const Item& item) {
        if (!sharing_.adoptItem(item)) OMB_THROW(SharingViolation, OmbString::literal("item"));
    }
    // Adopts every item or, if one refuses, none.
    void adoptAll(const Container& added) {
        for (std::size_t i = 0; i < added.size(); ++i) {
            if (!sharing_.adoptItem(added[i])) {
                while (i-- > 0) sharing_.disownItem(added[i]);
                OMB_THROW(SharingViolation, OmbString::literal("item"));
            }
        }
    }
    // Items that leave an owned collection are free again.
    void disownAll(const Container& removed) {
        for (const Item& item : removed) sharing_.disownItem(item);
    }
    void changed() const { notifier_.notify(); }

    Container items_;
    bool readOnly_ = false;
    Notifier notifier_;
    Sharing sharing_;
};
