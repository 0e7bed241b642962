#include <oecore/core/engineobject.h>
#include <oecore/core/enumerator.h>
#include <oecore/core/refvec.h>
#include <oecore/core/runtime.h>

#include <atomic>
#include <mutex>

namespace {

std::mutex classIdMutex_;
int nextClassId_ = 1;

OmbRef<OmbEngineObjectVec> collectChildren(const OmbEngineObject& root, OmbChildObjectMode mode) {
    OmbRef<OmbEngineObjectVec> found(new OmbEngineObjectVec);
    OmbChildObjectEnumerator walk(root, mode == OmbChildObjectMode::AllLevels);
    while (walk.moveNext()) found->add(walk.current());
    return found;
}

}  // namespace

int OmbEngineObject::classId() {
    static int id = 0;
    return initClassId(id);
}

OmbClass* OmbEngineObject::runtimeClass() {
    static OmbClass record(nullptr, 0, "EngineObject");
    return &record;
}

[[maybe_unused]] static const OmbClass* const engineObjectRuntimeClassAtLoad = OmbEngineObject::runtimeClass();

int OmbEngineObject::initClassId(int& id) {
    std::atomic_ref<int> stored(id);
    if (const int known = stored.load(std::memory_order_acquire)) return known;
    std::lock_guard lock(classIdMutex_);
    if (stored.load(std::memory_order_relaxed) == 0) stored.store(nextClassId_++, std::memory_order_release);
    return stored.load(std::memory_order_relaxed);
}

void OmbEngineObject::notifyChanged() {}

OmbRef<OmbEngineObjectVec> OmbEngineObject::getMyChildObjects() const {
    return OmbRef<OmbEngineObjectVec>(new OmbEngineObjectVec);
}

void OmbEngineObject::toXml(OmbXmlSerializer&, TiXmlElement*, TiXmlElement*, const char*, const char*, bool) const {}

bool OmbEngineObject::isLockable() const { return false; }
void OmbEngineObject::lock() {}
void OmbEngineObject::unlock() {}
const char* OmbEngineObject::myRuntimeClassName() const { return ""; }
bool OmbEngineObject::nameEquals(const OmbString&) const { return false; }
OmbString OmbEngineObject::saveComment() const { return OmbString(); }

OmbRef<OmbEngineObject> OmbEngineObject::safeClone() const {
    OmbReuseWriterOrAcquireRecursiveReaderLock scope(OmbRuntime::configurationLock());
    return OmbRef<OmbEngineObject>(clone());
}

OmbRef<OmbEngineObjectVec> OmbEngineObject::getChildObjects(OmbChildObjectMode mode) const {
    OmbReuseWriterOrAcquireRecursiveReaderLock scope(OmbRuntime::configurationLock());
    return collectChildren(*this, mode);
}

OmbRef<OmbEngineObject> OmbEngineObject::findChildObject(const OmbString& name, OmbChildObjectMode mode) const {
    OmbReuseWriterOrAcquireRecursiveReaderLock scope(OmbRuntime::configurationLock());
    const OmbRef<OmbEngineObjectVec> children = collectChildren(*this, mode);
    for (const OmbRef<OmbEngineObject>& child : *children)
        if (child->nameEquals(name)) return child;
    return OmbRef<OmbEngineObject>();
}
