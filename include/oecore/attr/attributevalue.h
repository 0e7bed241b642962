// OmbAttributeValue: one tagged attribute value (empty, 64-bit integer,
// atom, double, string or bool).
#pragma once

#include <oecore/attr/atoms.h>
#include <oecore/core/string.h>

#include <cstdint>
#include <new>
#include <utility>

// The tags, in their order; configuration names "int", "Atom", "double",
// "String", "bool".
enum OmbAttributeSetType : int {
    OmbAttributeEmpty = 0,
    OmbAttributeInt64 = 1,
    OmbAttributeAtom = 2,
    OmbAttributeDouble = 3,
    OmbAttributeString = 4,
    OmbAttributeBool = 5,
};

// "int", "Atom", "double", "String", "bool"; "" for the empty tag.
const char* Omb_attributeTypeName(OmbAttributeSetType type);
bool Omb_attributeTypeFromName(const OmbString& name, OmbAttributeSetType& type);

class OmbAttributeValue {
public:
    OmbAttributeValue() noexcept {}
    OmbAttributeValue(std::int64_t value) noexcept : type_(OmbAttributeInt64) { payload_.i = value; }
    OmbAttributeValue(int value) noexcept : OmbAttributeValue(static_cast<std::int64_t>(value)) {}
    // An atom value.
    OmbAttributeValue(unsigned long atom) noexcept : type_(OmbAttributeAtom) {
        payload_.atom = static_cast<OmbAtom>(atom);
    }
    OmbAttributeValue(double value) noexcept : type_(OmbAttributeDouble) { payload_.d = value; }
    OmbAttributeValue(const OmbString& value) : type_(OmbAttributeString) { new (&payload_.s) OmbString(value); }
    static OmbAttributeValue fromBool(bool value) noexcept {
        OmbAttributeValue v;
        v.type_ = OmbAttributeBool;
        v.payload_.b = value;
        return v;
    }
    OmbAttributeValue(const OmbAttributeValue& other) { *this = other; }
    OmbAttributeValue(OmbAttributeValue&& other) noexcept { take(other); }
    ~OmbAttributeValue() { clear(); }

    OmbAttributeValue& operator=(const OmbAttributeValue& other);
    OmbAttributeValue& operator=(OmbAttributeValue&& other) noexcept {
        if (this != &other) {
            clear();
            take(other);
        }
        return *this;
    }
    void swap(OmbAttributeValue& other) noexcept {
        OmbAttributeValue moved(std::move(other));
        other = std::move(*this);
        *this = std::move(moved);
    }

    OmbAttributeSetType type() const noexcept { return type_; }
    OmbAttributeSetType which() const noexcept { return type_; }
    bool is_singular() const noexcept { return type_ == OmbAttributeEmpty; }
    void clear() noexcept;

    // The payload; only meaningful for the matching tag.
    std::int64_t asInt64() const noexcept { return payload_.i; }
    OmbAtom asAtom() const noexcept { return payload_.atom; }
    double asDouble() const noexcept { return payload_.d; }
    const OmbString& asString() const noexcept { return payload_.s; }
    bool asBool() const noexcept { return payload_.b; }

    // Equal tags and equal payloads (a NaN equals nothing).
    friend bool operator==(const OmbAttributeValue& a, const OmbAttributeValue& b);
    friend bool operator!=(const OmbAttributeValue& a, const OmbAttributeValue& b) { return !(a == b); }
    // By tag, then by payload (atoms by number, false before true).
    friend bool operator<(const OmbAttributeValue& a, const OmbAttributeValue& b);

private:
    // Moves other's value into this empty value and leaves other empty.
    void take(OmbAttributeValue& other) noexcept;

    union Payload {
        Payload() : i(0) {}
        ~Payload() {}
        std::int64_t i;
        OmbAtom atom;
        double d;
        OmbString s;
        bool b;
    };

    OmbAttributeSetType type_ = OmbAttributeEmpty;
    Payload payload_;
};

// 0 when equal, -1 when a is less, otherwise 1.
int Omb_attributeValuesCompare(const OmbAttributeValue& a, const OmbAttributeValue& b);
