#include <oecore/attr/attributevalue.h>

#include <cstring>

namespace {

constexpr const char* typeNames[] = {"", "int", "Atom", "double", "String", "bool"};

}  // namespace

const char* Omb_attributeTypeName(OmbAttributeSetType type) {
    return type >= OmbAttributeEmpty && type <= OmbAttributeBool ? typeNames[type] : "";
}

bool Omb_attributeTypeFromName(const OmbString& name, OmbAttributeSetType& type) {
    for (int t = OmbAttributeInt64; t <= OmbAttributeBool; ++t) {
        if (name == OmbString::literal(typeNames[t])) {
            type = static_cast<OmbAttributeSetType>(t);
            return true;
        }
    }
    return false;
}

OmbAttributeValue& OmbAttributeValue::operator=(const OmbAttributeValue& other) {
    if (this == &other) return *this;
    if (other.type_ == OmbAttributeString && type_ == OmbAttributeString) {
        payload_.s = other.payload_.s;
        return *this;
    }
    clear();
    if (other.type_ == OmbAttributeString)
        new (&payload_.s) OmbString(other.payload_.s);
    else
        std::memcpy(static_cast<void*>(&payload_), &other.payload_, sizeof(std::int64_t));  // plain bytes
    type_ = other.type_;
    return *this;
}

void OmbAttributeValue::take(OmbAttributeValue& other) noexcept {
    if (other.type_ == OmbAttributeString)
        new (&payload_.s) OmbString(std::move(other.payload_.s));
    else
        std::memcpy(static_cast<void*>(&payload_), &other.payload_, sizeof(std::int64_t));
    type_ = other.type_;
    other.clear();
}

void OmbAttributeValue::clear() noexcept {
    if (type_ == OmbAttributeString) payload_.s.~OmbString();
    type_ = OmbAttributeEmpty;
    payload_.i = 0;
}

bool operator==(const OmbAttributeValue& a, const OmbAttributeValue& b) {
    if (a.type_ != b.type_) return false;
    switch (a.type_) {
        case OmbAttributeEmpty: return true;
        case OmbAttributeInt64: return a.payload_.i == b.payload_.i;
        case OmbAttributeAtom: return a.payload_.atom == b.payload_.atom;
        case OmbAttributeDouble: return a.payload_.d == b.payload_.d;
        case OmbAttributeString: return a.payload_.s == b.payload_.s;
        case OmbAttributeBool: return a.payload_.b == b.payload_.b;
    }
    return false;
}

bool operator<(const OmbAttributeValue& a, const OmbAttributeValue& b) {
    if (a.type_ != b.type_) return a.type_ < b.type_;
    switch (a.type_) {
        case OmbAttributeEmpty: return false;
        case OmbAttributeInt64: return a.payload_.i < b.payload_.i;
        case OmbAttributeAtom: return a.payload_.atom < b.payload_.atom;
        case OmbAttributeDouble: return a.payload_.d < b.payload_.d;
        case OmbAttributeString: return a.payload_.s < b.payload_.s;
        case OmbAttributeBool: return !a.payload_.b && b.payload_.b;
    }
    return false;
}

int Omb_attributeValuesCompare(const OmbAttributeValue& a, const OmbAttributeValue& b) {
    if (a == b) return 0;
    return a < b ? -1 : 1;
}
