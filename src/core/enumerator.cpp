#include <oecore/core/enumerator.h>

OMB_DEFINE_ENGINE_CLASS(OmbEngineObjectEnumerator, OmbEngineObject, "EngineObjectEnumerator", 0)
OMB_DEFINE_ENGINE_CLASS(OmbChildObjectEnumerator, OmbEngineObjectEnumerator, "ChildObjectEnumerator", 0)

namespace {
const OmbRef<OmbEngineObject> noObject;
}

OmbRef<OmbEngineObjectEnumerator> OmbEngineObjectEnumerator::create(const OmbRef<OmbEngineObjectVec>& items) {
    return OmbRef<OmbEngineObjectEnumerator>(new OmbEngineObjectEnumerator(items));
}

OmbEngineObjectEnumerator* OmbEngineObjectEnumerator::clone() const { return new OmbEngineObjectEnumerator(*this); }

const OmbRef<OmbEngineObject>& OmbEngineObjectEnumerator::current() const {
    if (index_ == 0 || !items_ || index_ > items_->size()) return noObject;
    return items_->get(index_ - 1);
}

bool OmbEngineObjectEnumerator::moveNext() {
    if (!items_ || index_ > items_->size()) return false;
    return ++index_ <= items_->size();
}

void OmbEngineObjectEnumerator::reset() { index_ = 0; }

OmbChildObjectEnumerator::OmbChildObjectEnumerator(const OmbEngineObject& root, bool recursive)
    : root_(&root), recursive_(recursive) {}

OmbChildObjectEnumerator* OmbChildObjectEnumerator::clone() const { return new OmbChildObjectEnumerator(*this); }

const OmbRef<OmbEngineObject>& OmbChildObjectEnumerator::current() const {
    return pending_.empty() ? noObject : pending_.front();
}

bool OmbChildObjectEnumerator::moveNext() {
    if (!started_) {
        started_ = true;
        expand(*root_);
    } else if (!pending_.empty()) {
        const OmbRef<OmbEngineObject> front = pending_.front();
        pending_.pop_front();
        expand(*front);
    }
    return !pending_.empty();
}

void OmbChildObjectEnumerator::reset() {
    started_ = false;
    pending_.clear();
    seen_.clear();
}

void OmbChildObjectEnumerator::expand(const OmbEngineObject& object) {
    if (&object != root_ && !recursive_) return;
    const OmbRef<OmbEngineObjectVec> children = object.getMyChildObjects();
    if (!children) return;
    for (const OmbRef<OmbEngineObject>& child : *children)
        if (child && seen_.insert(child.get()).second) pending_.push_back(child);
}
