// Attribute variables: properties computed per feature from its attributes.
//
// A direct variable is a constant; an indirect one reads an attribute and
// converts it; a keyed one reads an attribute and looks it up in a key/value
// table (integer and double keys take the value of the nearest key below).
// They exist for the value types of OmbAttributeVariableTraits.
//
// Thread safety: eval() and lookup() may run on many threads at once; changes
// of a variable or its table are one thread at a time, with no evaluation.
#pragma once

#include <oecore/attr/attributesetlist.h>
#include <oecore/attr/attributevalue.h>
#include <oecore/attr/color.h>
#include <oecore/attr/visenums.h>
#include <oecore/core/engineobject.h>
#include <oecore/core/ref.h>

#include <cstdint>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <type_traits>
#include <vector>

// Per value type: its configuration name, its conversion from an attribute
// value, and its text in configuration files.
template <class T, class = void>
struct OmbAttributeVariableTraits;

#define OMB_ATTRIBUTE_VARIABLE_TRAITS(T)                                   \
    template <>                                                            \
    struct OmbAttributeVariableTraits<T> {                                 \
        static const char* name();                                         \
        static bool fromAttribute(const OmbAttributeValue& value, T& out); \
        static OmbString toText(const T& value);                           \
        static bool fromText(const OmbString& text, T& out);               \
    };
OMB_ATTRIBUTE_VARIABLE_TRAITS(std::int64_t)
OMB_ATTRIBUTE_VARIABLE_TRAITS(double)
OMB_ATTRIBUTE_VARIABLE_TRAITS(bool)
OMB_ATTRIBUTE_VARIABLE_TRAITS(OmbString)
OMB_ATTRIBUTE_VARIABLE_TRAITS(OmbColor)
#undef OMB_ATTRIBUTE_VARIABLE_TRAITS

// Enumerations: an integer attribute's low 32 bits are the value.
template <class E>
struct OmbAttributeVariableTraits<E, std::enable_if_t<std::is_enum_v<E>>> {
    static const char* name() { return OmbEnumNames<E>::description().typeName().dataUtf8(); }
    static bool fromAttribute(const OmbAttributeValue& value, E& out) {
        if (value.type() != OmbAttributeInt64) return false;
        out = static_cast<E>(static_cast<std::int32_t>(value.asInt64() & 0xFFFFFFFF));
        return true;
    }
    static OmbString toText(const E& value) { return OmbEnumNames<E>::description().toName(static_cast<int>(value)); }
    static bool fromText(const OmbString& text, E& out) {
        int value;
        if (!OmbEnumNames<E>::description().fromName(text, value)) return false;
        out = static_cast<E>(value);
        return true;
    }
};

// Tells keyed variables that their table changed.
class OmbKeyValueTableNotifier {
public:
    void addListener(OmbEngineObject* listener);
    void removeListener(OmbEngineObject* listener);
    void notify() const;

private:
    std::vector<OmbWRef<OmbEngineObject>> listeners_;
};

// An ordered map from attribute values to T. All keys have one type.
template <class T>
class OmbKeyValueTable : public OmbEngineObject {
    OMB_ENGINE_CLASS_INLINE(OmbEngineObject,
                            Omb_templateClassName("KeyValueTable", OmbAttributeVariableTraits<T>::name()), 0)

public:
    using Map = std::map<OmbAttributeValue, T>;

    OmbKeyValueTable() = default;
    OmbKeyValueTable(const OmbKeyValueTable& other)
        : OmbEngineObject(other), map_(other.map_), keyType_(other.keyType_) {}

    OmbKeyValueTable* clone() const override { return new OmbKeyValueTable(*this); }

    // Throws OmbXInconsistentKeyTypes for a key of another type.
    void add(const OmbAttributeValue& key, const T& value);
    bool remove(const OmbAttributeValue& key);
    void clear();
    std::size_t size() const noexcept { return map_.size(); }
    bool empty() const noexcept { return map_.empty(); }
    bool containsKey(const OmbAttributeValue& key) const { return map_.count(key) != 0; }
    bool containsValue(const T& value) const;
    // The exact key only; false when its type is not the table's key type.
    bool tryGetValue(const OmbAttributeValue& key, T& out) const;
    // The exact key; for integer and double keys otherwise the nearest key
    // below (the smallest key below them all). False when the type differs.
    bool lookup(const OmbAttributeValue& key, T& out) const;
    void getKeys(std::set<OmbAttributeValue>& keys) const;
    void getValues(std::vector<T>& values) const;
    typename Map::const_iterator begin() const { return map_.begin(); }
    typename Map::const_iterator end() const { return map_.end(); }
    // The type of every key; empty while the table is.
    OmbAttributeSetType keyType() const noexcept { return keyType_; }
    OmbKeyValueTableNotifier& notifier() noexcept { return notifier_; }

private:
    Map map_;
    OmbAttributeSetType keyType_ = OmbAttributeEmpty;
    OmbKeyValueTableNotifier notifier_;
};

template <class T>
class OmbDirectAttributeVariable;
template <class T>
class OmbIndirectAttributeVariable;
template <class T>
class OmbKeyedAttributeVariable;

template <class T>
class OmbAttributeVariable : public OmbEngineObject {
public:
    // A number from one process-wide counter (first 1), kept by copies.
    std::uint64_t id() const noexcept { return id_; }

    // The value for a feature's attributes; false when none results.
    virtual bool eval(const OmbReadOnlyAttributes& attributes, T& out) const = 0;
    // Keyed variables evaluate a bare key (raster colouring); others give a
    // zero value, or their constant.
    virtual T lookup(int /*key*/) const { return T(); }
    virtual OmbDirectAttributeVariable<T>* asDirect() { return nullptr; }
    virtual OmbIndirectAttributeVariable<T>* asIndirect() { return nullptr; }
    virtual OmbKeyedAttributeVariable<T>* asKeyed() { return nullptr; }
    virtual T lookup(float /*key*/) const { return T(); }

protected:
    OmbAttributeVariable();
    OmbAttributeVariable(const OmbAttributeVariable& other) : OmbEngineObject(other), id_(other.id_) {}

private:
    std::uint64_t id_;
};

// The members every attribute variable class template declares.
#define OMB_ATTRIBUTE_VARIABLE_CLASS(KIND) \
    OMB_ENGINE_CLASS_INLINE(OmbEngineObject, Omb_templateClassName(KIND, OmbAttributeVariableTraits<T>::name()), 0)

template <class T>
class OmbDirectAttributeVariable : public OmbAttributeVariable<T> {
    OMB_ATTRIBUTE_VARIABLE_CLASS("DirectAttributeVariable")

public:
    explicit OmbDirectAttributeVariable(const T& value = T()) : value_(value) {}
    OmbDirectAttributeVariable* clone() const override { return new OmbDirectAttributeVariable(*this); }
    void toXml(OmbXmlSerializer& serializer, TiXmlElement* topLevel, TiXmlElement* parent, const char* propertyName,
               const char* elementName, bool isPublic) const override;

    bool eval(const OmbReadOnlyAttributes&, T& out) const override {
        out = value_;
        return true;
    }
    T lookup(int) const override { return value_; }
    T lookup(float) const override { return value_; }
    OmbDirectAttributeVariable* asDirect() override { return this; }

    const T& value() const noexcept { return value_; }
    void value(const T& v) { value_ = v; }

private:
    T value_;
};

template <class T>
class OmbIndirectAttributeVariable : public OmbAttributeVariable<T> {
    OMB_ATTRIBUTE_VARIABLE_CLASS("IndirectAttributeVariable")

public:
    explicit OmbIndirectAttributeVariable(OmbAtom key = 0, std::optional<T> defaultValue = std::nullopt)
        : key_(key), default_(std::move(defaultValue)) {}
    OmbIndirectAttributeVariable* clone() const override { return new OmbIndirectAttributeVariable(*this); }
    void toXml(OmbXmlSerializer& serializer, TiXmlElement* topLevel, TiXmlElement* parent, const char* propertyName,
               const char* elementName, bool isPublic) const override;

    bool eval(const OmbReadOnlyAttributes& attributes, T& out) const override;
    T lookup(int) const override { return default_.value_or(T()); }
    T lookup(float) const override { return default_.value_or(T()); }
    OmbIndirectAttributeVariable* asIndirect() override { return this; }

    OmbAtom key() const noexcept { return key_; }
    void key(OmbAtom key) { key_ = key; }
    // Throws OmbXNoDefaultValue when there is none.
    const T& defaultValue() const;
    void defaultValue(const T& value) { default_ = value; }
    bool hasDefaultValue() const noexcept { return default_.has_value(); }
    void clearDefaultValue() { default_.reset(); }

private:
    OmbAtom key_;
    std::optional<T> default_;
};

template <class T>
class OmbKeyedAttributeVariable : public OmbAttributeVariable<T> {
    OMB_ATTRIBUTE_VARIABLE_CLASS("KeyedAttributeVariable")

public:
    using Table = OmbKeyValueTable<T>;

    explicit OmbKeyedAttributeVariable(OmbAtom key = 0, OmbRef<Table> table = OmbRef<Table>(),
                                       std::optional<T> defaultValue = std::nullopt);
    OmbKeyedAttributeVariable(const OmbKeyedAttributeVariable& other);
    ~OmbKeyedAttributeVariable() override;
    OmbKeyedAttributeVariable* clone() const override { return new OmbKeyedAttributeVariable(*this); }
    void toXml(OmbXmlSerializer& serializer, TiXmlElement* topLevel, TiXmlElement* parent, const char* propertyName,
               const char* elementName, bool isPublic) const override;
    // The table changed: rebuild the fast table.
    void notifyChanged() override { buildFastTable(); }

    bool eval(const OmbReadOnlyAttributes& attributes, T& out) const override;
    T lookup(int key) const override;
    T lookup(float key) const override;
    OmbKeyedAttributeVariable* asKeyed() override { return this; }

    OmbAtom key() const noexcept { return key_; }
    void key(OmbAtom key) { key_ = key; }
    const OmbRef<Table>& table() const noexcept { return table_; }
    void table(const OmbRef<Table>& table);
    const T& defaultValue() const;
    void defaultValue(const T& value) { default_ = value; }
    bool hasDefaultValue() const noexcept { return default_.has_value(); }
    void clearDefaultValue() { default_.reset(); }
    // Whether integer keys are looked up by direct indexing.
    bool hasFastTable() const noexcept { return !fast_.empty(); }

private:
    bool evaluate(const OmbAttributeValue& key, T& out) const;
    void buildFastTable();

    OmbAtom key_;
    OmbRef<Table> table_;
    std::optional<T> default_;
    // Every integer from smallest to smallest + size - 1, with its value.
    std::vector<T> fast_;
    std::int64_t smallest_ = 0;
};

// Every value type has its instances in the library.
// clang-format off
#define OMB_ATTRIBUTE_VARIABLE_TYPES(X) \
    X(std::int64_t) X(double) X(bool) X(OmbString) X(OmbColor) \
    X(OmbAlignX) X(OmbAlignY) X(OmbShape) X(OmbEdgesToSegmentize) X(OmbPickingSupport) X(OmbVisualizerLengthUnit)
// clang-format on

#define OMB_EXTERN_ATTRIBUTE_VARIABLE(T)                   \
    extern template class OmbKeyValueTable<T>;             \
    extern template class OmbAttributeVariable<T>;         \
    extern template class OmbDirectAttributeVariable<T>;   \
    extern template class OmbIndirectAttributeVariable<T>; \
    extern template class OmbKeyedAttributeVariable<T>;
OMB_ATTRIBUTE_VARIABLE_TYPES(OMB_EXTERN_ATTRIBUTE_VARIABLE)
#undef OMB_EXTERN_ATTRIBUTE_VARIABLE
