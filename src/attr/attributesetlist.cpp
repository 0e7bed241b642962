#include <oecore/attr/attributesetlist.h>

void OmbAttributeSetList::push(const OmbRef<OmbAttributeSet>& set) {
    const OmbRef<OmbAttributeSet> clone(set ? set->clone() : nullptr);
    for (OmbRef<OmbAttributeSet>& slot : inner_) {
        if (!slot) {
            slot = clone;
            return;
        }
    }
    overflow_.push_back(clone);
}

void OmbAttributeSetList::pop() {
    if (!overflow_.empty()) return overflow_.pop_back();
    for (auto slot = inner_.rbegin(); slot != inner_.rend(); ++slot) {
        if (*slot) {
            slot->reset();
            return;
        }
    }
}

void OmbAttributeSetList::pushAll(const OmbAttributeSetList& other) {
    for (const OmbRef<OmbAttributeSet>& set : other.inner_)
        if (set) push(set);
    for (const OmbRef<OmbAttributeSet>& set : other.overflow_) push(set);
}

void OmbAttributeSetList::flatten(OmbAttributeSet& target) const {
    for (const OmbRef<OmbAttributeSet>& set : inner_)
        if (set) target.merge(*set);
    for (const OmbRef<OmbAttributeSet>& set : overflow_)
        if (set) target.merge(*set);
}

const OmbAttributeSet* OmbAttributeSetList::holder(OmbAtom key) const {
    for (auto set = overflow_.rbegin(); set != overflow_.rend(); ++set)
        if (*set && (*set)->containsKey(key)) return set->get();
    for (auto set = inner_.rbegin(); set != inner_.rend(); ++set)
        if (*set && (*set)->containsKey(key)) return set->get();
    return nullptr;
}

const OmbAttributeValue* OmbAttributeSetList::findValue(OmbAtom key) const {
    const OmbAttributeSet* set = holder(key);
    return set ? set->findValue(key) : nullptr;
}
