#include <oecore/attr/featureattribute.h>

void OmbFeatureAttributeSchema::add(OmbAtom key, OmbAttributeSetType type) {
    for (const OmbRef<OmbFeatureAttribute>& a : *attributes_)
        if (a->key() == key && a->type() == type) return;
    attributes_->add(OmbRef<OmbFeatureAttribute>(new OmbFeatureAttribute(key, type)));
}

bool OmbFeatureAttributeSchema::contains(OmbAtom key) const {
    for (const OmbRef<OmbFeatureAttribute>& a : *attributes_)
        if (a->key() == key) return true;
    return false;
}
