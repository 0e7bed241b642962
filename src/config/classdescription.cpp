#include <oecore/config/classdescription.h>
#include <oecore/core/exception.h>
#include <oecore/core/stringbuilder.h>

#include <map>
#include <mutex>

namespace {

struct DescriptionRegistry {
    std::mutex mutex;
    std::vector<std::unique_ptr<OmbClassDescription>> descriptions;
    std::map<const OmbClass*, const OmbClassDescription*> byClass;
    std::vector<OmbClassDescription::CollectionType> collectionTypes;
    std::vector<const OmbEnumDescription*> enums;
};

DescriptionRegistry& registry() {
    static DescriptionRegistry r;
    return r;
}

}  // namespace

OmbEnumDescription::OmbEnumDescription(const char* typeName, std::vector<Value> values)
    : typeName_(OmbString::literal(typeName)), values_(std::move(values)) {
    DescriptionRegistry& r = registry();
    std::lock_guard lock(r.mutex);
    r.enums.push_back(this);
}

bool OmbEnumDescription::fromName(const OmbString& name, int& value) const {
    for (const Value& v : values_) {
        if (name == OmbString::literal(v.name)) {
            value = v.value;
            return true;
        }
    }
    return false;
}

OmbString OmbEnumDescription::toName(int value) const {
    for (const Value& v : values_)
        if (v.value == value) return OmbString::literal(v.name);
    OMB_THROW(IllegalValue, OmbString(std::to_string(value)), typeName_);
}

const std::vector<const OmbEnumDescription*>& OmbEnumDescription::all() { return registry().enums; }

OmbClassDescription::OmbClassDescription(OmbClass* runtimeClass, Factory factory)
    : runtimeClass_(runtimeClass), factory_(factory) {}

const std::vector<const OmbPropertyDescription*>& OmbClassDescription::properties() const {
    // Resolved on first use, when every class of the library is described.
    std::lock_guard lock(registry().mutex);
    if (!resolved_) {
        for (const OmbClass* base = runtimeClass_->baseClass(); base; base = base->baseClass()) {
            const auto it = registry().byClass.find(base);
            if (it == registry().byClass.end()) continue;
            std::vector<const OmbPropertyDescription*> inherited;
            for (const auto& p : it->second->own_) inherited.push_back(p.get());
            all_.insert(all_.begin(), inherited.begin(), inherited.end());
        }
        for (const auto& p : own_) all_.push_back(p.get());
        resolved_ = true;
    }
    return all_;
}

const OmbPropertyDescription* OmbClassDescription::property(const OmbString& name) const {
    for (const OmbPropertyDescription* p : properties())
        if (name == OmbString::literal(p->name())) return p;
    return nullptr;
}

const OmbClassDescription* OmbClassDescription::of(const OmbClass* cls) {
    DescriptionRegistry& r = registry();
    std::lock_guard lock(r.mutex);
    for (; cls; cls = cls->baseClass()) {
        const auto it = r.byClass.find(cls);
        if (it != r.byClass.end()) return it->second;
    }
    return nullptr;
}

std::vector<const OmbClassDescription*> OmbClassDescription::all() {
    DescriptionRegistry& r = registry();
    std::lock_guard lock(r.mutex);
    std::vector<const OmbClassDescription*> out;
    for (const auto& d : r.descriptions) out.push_back(d.get());
    return out;
}

bool OmbClassDescription::add(std::unique_ptr<OmbClassDescription> description) {
    DescriptionRegistry& r = registry();
    std::lock_guard lock(r.mutex);
    r.byClass[description->runtimeClass()] = description.get();
    r.descriptions.push_back(std::move(description));
    return true;
}

void OmbClassDescription::addCollectionType(const CollectionType& type) {
    DescriptionRegistry& r = registry();
    std::lock_guard lock(r.mutex);
    for (const CollectionType& known : r.collectionTypes)
        if (known.typeName == type.typeName) return;
    r.collectionTypes.push_back(type);
}

const std::vector<OmbClassDescription::CollectionType>& OmbClassDescription::collectionTypes() {
    return registry().collectionTypes;
}

OmbRef<OmbEngineObjectVec> Omb_describedChildObjects(const OmbEngineObject& object) {
    OmbRef<OmbEngineObjectVec> children(new OmbEngineObjectVec);
    const OmbClassDescription* description = OmbClassDescription::of(object.myRuntimeClass());
    if (!description) return children;
    for (const OmbPropertyDescription* p : description->properties()) {
        if (p->kind() == OmbPropertyDescription::Kind::Simple) continue;
        const OmbRef<OmbEngineObject> held = p->object(object);
        if (!held) continue;
        if (p->kind() == OmbPropertyDescription::Kind::Object) {
            children->add(held);
        } else {
            // A collection's items are the children, not the collection.
            const OmbRef<OmbEngineObjectVec> items = held->getMyChildObjects();
            for (const OmbRef<OmbEngineObject>& item : *items) children->add(item);
        }
    }
    return children;
}

bool OmbXmlValueTraits<OmbString>::fromBox(const OmbRefCnt& box, OmbString& out) {
    const auto* v = dynamic_cast<const OmbBoxedValue<OmbString>*>(&box);
    if (!v) return false;
    out = v->value();
    return true;
}

bool OmbXmlValueTraits<bool>::fromBox(const OmbRefCnt& box, bool& out) {
    const auto* v = dynamic_cast<const OmbBoxedValue<bool>*>(&box);
    if (!v) return false;
    out = v->value();
    return true;
}

bool Omb_integerFromBox(const OmbRefCnt& box, long long& out) {
    const auto* v = dynamic_cast<const OmbBoxedValue<long long>*>(&box);
    if (!v) return false;
    out = v->value();
    return true;
}

bool OmbXmlValueTraits<double>::fromBox(const OmbRefCnt& box, double& out) {
    if (const auto* d = dynamic_cast<const OmbBoxedValue<double>*>(&box)) {
        out = d->value();
        return true;
    }
    if (const auto* f = dynamic_cast<const OmbBoxedValue<float>*>(&box)) {
        out = f->value();
        return true;
    }
    return false;
}

bool OmbXmlValueTraits<float>::fromBox(const OmbRefCnt& box, float& out) {
    if (const auto* f = dynamic_cast<const OmbBoxedValue<float>*>(&box)) {
        out = f->value();
        return true;
    }
    return false;
}

OmbString OmbXmlValueTraits<double>::text(double value) {
    OmbStringBuilder out;
    out << OmbFormat::real(value);
    return out.str();
}
