#include <oecore/core/collectionpolicies.h>
#include <oecore/core/engineobject.h>

void OmbVecNotifier::owner(OmbEngineObject* owner) { owner_ = OmbWRef<OmbEngineObject>(owner); }

OmbRef<OmbEngineObject> OmbVecNotifier::owner() const { return owner_.strong(); }

void OmbVecNotifier::notify() const {
    if (const OmbRef<OmbEngineObject> owner = owner_.strong()) owner->notifyChanged();
}
