// What attributes features may carry: one attribute's key and type, and the
// schema that data sets, operators and layers fill to describe their output.
#pragma once

#include <oecore/attr/attributevalue.h>
#include <oecore/core/engineobject.h>
#include <oecore/core/refvec.h>

class OmbFeatureAttribute : public OmbEngineObject {
    OMB_ENGINE_CLASS_INLINE(OmbEngineObject, "FeatureAttribute", 0)

public:
    OmbFeatureAttribute(OmbAtom key = 0, OmbAttributeSetType type = OmbAttributeEmpty) : key_(key), type_(type) {}
    OmbFeatureAttribute* clone() const override { return new OmbFeatureAttribute(*this); }

    OmbAtom key() const noexcept { return key_; }
    OmbAttributeSetType type() const noexcept { return type_; }

    friend bool operator==(const OmbFeatureAttribute& a, const OmbFeatureAttribute& b) {
        return a.key_ == b.key_ && a.type_ == b.type_;
    }
    // By key, then by type.
    friend bool operator<(const OmbFeatureAttribute& a, const OmbFeatureAttribute& b) {
        return a.key_ != b.key_ ? a.key_ < b.key_ : a.type_ < b.type_;
    }

private:
    OmbAtom key_;
    OmbAttributeSetType type_;
};

class OmbFeatureAttributeSchema : public OmbEngineObject {
    OMB_ENGINE_CLASS_INLINE(OmbEngineObject, "FeatureAttributeSchema", 0)

public:
    using Attributes = OmbRefVec<OmbFeatureAttribute>;

    OmbFeatureAttributeSchema() : attributes_(new Attributes) {}
    OmbFeatureAttributeSchema(const OmbFeatureAttributeSchema& other)
        : OmbEngineObject(other), attributes_(other.attributes_->shallowCopy()) {}
    OmbFeatureAttributeSchema* clone() const override { return new OmbFeatureAttributeSchema(*this); }

    const OmbRef<Attributes>& attributes() const noexcept { return attributes_; }
    // Adds the attribute unless an equal one is listed.
    void add(OmbAtom key, OmbAttributeSetType type);
    bool contains(OmbAtom key) const;

private:
    OmbRef<Attributes> attributes_;
};
