// OmbAttributeUsage: which attributes an object reads, and under which
// condition (null: always).
#pragma once

#include <oecore/attr/condition.h>
#include <oecore/core/engineobject.h>

#include <utility>
#include <vector>

class OmbAttributeUsage : public OmbEngineObject {
    OMB_ENGINE_CLASS_INLINE(OmbEngineObject, "AttributeUsage", 0)

public:
    OmbAttributeUsage* clone() const override { return new OmbAttributeUsage(*this); }

    // Appends, even when the same pair is listed already.
    void addItem(OmbAtom key, const OmbRef<OmbCondition>& condition = OmbRef<OmbCondition>()) {
        items_.emplace_back(key, condition);
    }
    std::size_t count() const noexcept { return items_.size(); }
    void getItem(std::size_t index, OmbAtom& key, OmbRef<OmbCondition>& condition) const {
        key = items_.at(index).first;
        condition = items_.at(index).second;
    }
    // Adds every key in list order.
    void getUsedAttributes(std::vector<OmbAtom>& keys) const {
        for (const auto& [key, condition] : items_) keys.push_back(key);
    }

    // Equal lists: the same keys with the same condition objects, in order.
    friend bool operator==(const OmbAttributeUsage& a, const OmbAttributeUsage& b) { return a.items_ == b.items_; }

private:
    std::vector<std::pair<OmbAtom, OmbRef<OmbCondition>>> items_;
};
