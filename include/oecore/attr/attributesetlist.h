// OmbAttributeSetList: a stack of attribute sets searched from the top, and
// OmbReadOnlyAttributes: a read-only view over one set or one list.
#pragma once

#include <oecore/attr/attributeset.h>

#include <array>
#include <vector>

class OmbAttributeSetList {
public:
    OmbAttributeSetList() = default;
    // A list holding a clone of the set (sharing its storage).
    explicit OmbAttributeSetList(const OmbRef<OmbAttributeSet>& set) { push(set); }

    // Stores a clone of the set: five inline slots, then the overflow vector.
    void push(const OmbRef<OmbAttributeSet>& set);
    void pop();
    void pushAll(const OmbAttributeSetList& other);
    // Merges the sets bottom to top into target, so higher sets win.
    void flatten(OmbAttributeSet& target) const;

    bool containsKey(OmbAtom key) const { return findValue(key) != nullptr; }
    const OmbAttributeValue* findValue(OmbAtom key) const;
    template <class T>
    bool get(OmbAtom key, T& out) const {
        const OmbAttributeSet* set = holder(key);
        return set && set->get(key, out);
    }

private:
    // The highest set that has the key, or null.
    const OmbAttributeSet* holder(OmbAtom key) const;

    std::array<OmbRef<OmbAttributeSet>, 5> inner_;
    std::vector<OmbRef<OmbAttributeSet>> overflow_;
};

class OmbReadOnlyAttributes {
public:
    OmbReadOnlyAttributes() = default;
    OmbReadOnlyAttributes(const OmbRef<OmbAttributeSet>& set) : set_(set), borrowed_(set.get()) {}
    // Borrows the set without counting a reference; the set must outlive the
    // view. For loops that evaluate many features.
    static OmbReadOnlyAttributes borrow(const OmbAttributeSet& set) {
        OmbReadOnlyAttributes view;
        view.borrowed_ = &set;
        return view;
    }
    // The list must outlive the view.
    OmbReadOnlyAttributes(const OmbAttributeSetList& list) : list_(&list) {}

    bool containsKey(OmbAtom key) const { return findValue(key) != nullptr; }
    const OmbAttributeValue* findValue(OmbAtom key) const {
        if (list_) return list_->findValue(key);
        return borrowed_ ? borrowed_->findValue(key) : nullptr;
    }
    template <class T>
    bool get(OmbAtom key, T& out) const {
        if (list_) return list_->get(key, out);
        return borrowed_ && borrowed_->get(key, out);
    }

private:
    OmbRef<OmbAttributeSet> set_;  // keeps a counted set alive
    const OmbAttributeSet* borrowed_ = nullptr;
    const OmbAttributeSetList* list_ = nullptr;
};
