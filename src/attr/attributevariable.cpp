#include <oecore/attr/attributevariable.h>
#include <oecore/config/valueparsers.h>
#include <oecore/config/xmlserializer.h>
#include <oecore/core/exception.h>
#include <oecore/core/stringbuilder.h>

#include <tinyxml.h>

#include <atomic>
#include <cmath>
#include <iterator>

// --- value types ---------------------------------------------------------------

const char* OmbAttributeVariableTraits<std::int64_t>::name() { return "int"; }
bool OmbAttributeVariableTraits<std::int64_t>::fromAttribute(const OmbAttributeValue& value, std::int64_t& out) {
    if (value.type() == OmbAttributeInt64) return out = value.asInt64(), true;
    // Truncated toward zero: 2.9 gives 2, -2.9 gives -2.
    if (value.type() == OmbAttributeDouble && std::isfinite(value.asDouble()) && std::fabs(value.asDouble()) < 9.2e18)
        return out = static_cast<std::int64_t>(std::trunc(value.asDouble())), true;
    return false;
}
OmbString OmbAttributeVariableTraits<std::int64_t>::toText(const std::int64_t& value) {
    return OmbString(std::to_string(value));
}
bool OmbAttributeVariableTraits<std::int64_t>::fromText(const OmbString& text, std::int64_t& out) {
    long long v;
    if (!parseInt(text, v)) return false;
    return out = v, true;
}

const char* OmbAttributeVariableTraits<double>::name() { return "double"; }
bool OmbAttributeVariableTraits<double>::fromAttribute(const OmbAttributeValue& value, double& out) {
    if (value.type() == OmbAttributeDouble) return out = value.asDouble(), true;
    if (value.type() == OmbAttributeInt64) return out = static_cast<double>(value.asInt64()), true;
    return false;
}
OmbString OmbAttributeVariableTraits<double>::toText(const double& value) {
    OmbStringBuilder text;
    text << OmbFormat::real(value);
    return text.str();
}
bool OmbAttributeVariableTraits<double>::fromText(const OmbString& text, double& out) { return parseDouble(text, out); }

const char* OmbAttributeVariableTraits<bool>::name() { return "bool"; }
bool OmbAttributeVariableTraits<bool>::fromAttribute(const OmbAttributeValue& value, bool& out) {
    if (value.type() != OmbAttributeBool) return false;
    return out = value.asBool(), true;
}
OmbString OmbAttributeVariableTraits<bool>::toText(const bool& value) {
    return OmbString::literal(value ? "true" : "false");
}
bool OmbAttributeVariableTraits<bool>::fromText(const OmbString& text, bool& out) { return parseBool(text, out); }

const char* OmbAttributeVariableTraits<OmbString>::name() { return "String"; }
bool OmbAttributeVariableTraits<OmbString>::fromAttribute(const OmbAttributeValue& value, OmbString& out) {
    switch (value.type()) {
        case OmbAttributeString: return out = value.asString(), true;
        case OmbAttributeInt64: return out = OmbString(std::to_string(value.asInt64())), true;
        case OmbAttributeDouble: return out = OmbAttributeVariableTraits<double>::toText(value.asDouble()), true;
        default: return false;
    }
}
OmbString OmbAttributeVariableTraits<OmbString>::toText(const OmbString& value) { return value; }
bool OmbAttributeVariableTraits<OmbString>::fromText(const OmbString& text, OmbString& out) { return out = text, true; }

const char* OmbAttributeVariableTraits<OmbColor>::name() { return "Color"; }
bool OmbAttributeVariableTraits<OmbColor>::fromAttribute(const OmbAttributeValue& value, OmbColor& out) {
    return value.type() == OmbAttributeString && OmbColor::fromString(value.asString(), out);
}
OmbString OmbAttributeVariableTraits<OmbColor>::toText(const OmbColor& value) { return value.toString(); }
bool OmbAttributeVariableTraits<OmbColor>::fromText(const OmbString& text, OmbColor& out) {
    return OmbColor::fromString(text, out);
}

// --- tables --------------------------------------------------------------------

void OmbKeyValueTableNotifier::addListener(OmbEngineObject* listener) {
    std::erase_if(listeners_, [](const OmbWRef<OmbEngineObject>& l) { return l.expired(); });
    listeners_.emplace_back(listener);
}

void OmbKeyValueTableNotifier::removeListener(OmbEngineObject* listener) {
    std::erase_if(listeners_, [listener](const OmbWRef<OmbEngineObject>& l) {
        const OmbRef<OmbEngineObject> alive = l.strong();
        return !alive || alive.get() == listener;
    });
}

void OmbKeyValueTableNotifier::notify() const {
    for (const OmbWRef<OmbEngineObject>& listener : listeners_)
        if (const OmbRef<OmbEngineObject> alive = listener.strong()) alive->notifyChanged();
}

template <class T>
void OmbKeyValueTable<T>::add(const OmbAttributeValue& key, const T& value) {
    if (keyType_ != OmbAttributeEmpty && key.type() != keyType_) OMB_THROW(InconsistentKeyTypes);
    keyType_ = key.type();
    map_[key] = value;
    notifier_.notify();
}

template <class T>
bool OmbKeyValueTable<T>::remove(const OmbAttributeValue& key) {
    if (map_.erase(key) == 0) return false;
    if (map_.empty()) keyType_ = OmbAttributeEmpty;
    notifier_.notify();
    return true;
}

template <class T>
void OmbKeyValueTable<T>::clear() {
    map_.clear();
    keyType_ = OmbAttributeEmpty;
    notifier_.notify();
}

template <class T>
bool OmbKeyValueTable<T>::containsValue(const T& value) const {
    for (const auto& [key, v] : map_)
        if (v == value) return true;
    return false;
}

template <class T>
bool OmbKeyValueTable<T>::tryGetValue(const OmbAttributeValue& key, T& out) const {
    if (key.type() != keyType_) return false;
    const auto it = map_.find(key);
    if (it == map_.end()) return false;
    out = it->second;
    return true;
}

template <class T>
bool OmbKeyValueTable<T>::lookup(const OmbAttributeValue& key, T& out) const {
    if (map_.empty() || key.type() != keyType_) return false;
    if (tryGetValue(key, out)) return true;
    if (keyType_ != OmbAttributeInt64 && keyType_ != OmbAttributeDouble) return false;
    auto above = map_.upper_bound(key);
    out = above == map_.begin() ? above->second : std::prev(above)->second;
    return true;
}

template <class T>
void OmbKeyValueTable<T>::getKeys(std::set<OmbAttributeValue>& keys) const {
    for (const auto& [key, value] : map_) keys.insert(key);
}

template <class T>
void OmbKeyValueTable<T>::getValues(std::vector<T>& values) const {
    for (const auto& [key, value] : map_) values.push_back(value);
}

// --- variables -------------------------------------------------------------------

namespace {

std::atomic<std::uint64_t> nextVariableId{1};

}  // namespace

template <class T>
OmbAttributeVariable<T>::OmbAttributeVariable() : id_(nextVariableId.fetch_add(1)) {}

template <class T>
bool OmbIndirectAttributeVariable<T>::eval(const OmbReadOnlyAttributes& attributes, T& out) const {
    const OmbAttributeValue* value = attributes.findValue(key_);
    if (value && OmbAttributeVariableTraits<T>::fromAttribute(*value, out)) return true;
    if (!default_) return false;
    out = *default_;
    return true;
}

template <class T>
const T& OmbIndirectAttributeVariable<T>::defaultValue() const {
    if (!default_) OMB_THROW(NoDefaultValue);
    return *default_;
}

template <class T>
OmbKeyedAttributeVariable<T>::OmbKeyedAttributeVariable(OmbAtom key, OmbRef<Table> table, std::optional<T> defaultValue)
    : key_(key), default_(std::move(defaultValue)) {
    this->table(table);
}

template <class T>
OmbKeyedAttributeVariable<T>::OmbKeyedAttributeVariable(const OmbKeyedAttributeVariable& other)
    : OmbAttributeVariable<T>(other), key_(other.key_), default_(other.default_) {
    table(other.table_);
}

template <class T>
OmbKeyedAttributeVariable<T>::~OmbKeyedAttributeVariable() {
    if (table_) table_->notifier().removeListener(this);
}

template <class T>
void OmbKeyedAttributeVariable<T>::table(const OmbRef<Table>& table) {
    if (table_) table_->notifier().removeListener(this);
    table_ = table;
    if (table_) table_->notifier().addListener(this);
    buildFastTable();
}

template <class T>
const T& OmbKeyedAttributeVariable<T>::defaultValue() const {
    if (!default_) OMB_THROW(NoDefaultValue);
    return *default_;
}

template <class T>
bool OmbKeyedAttributeVariable<T>::evaluate(const OmbAttributeValue& key, T& out) const {
    if (!table_) return false;
    if (!fast_.empty() && key.type() == OmbAttributeInt64) {
        const std::int64_t k = key.asInt64();
        const std::int64_t last = smallest_ + static_cast<std::int64_t>(fast_.size());
        out = k < smallest_ ? fast_.front() : k >= last ? fast_.back() : fast_[static_cast<std::size_t>(k - smallest_)];
        return true;
    }
    return table_->lookup(key, out);
}

template <class T>
bool OmbKeyedAttributeVariable<T>::eval(const OmbReadOnlyAttributes& attributes, T& out) const {
    const OmbAttributeValue* value = attributes.findValue(key_);
    if (value && evaluate(*value, out)) return true;
    if (!default_) return false;
    out = *default_;
    return true;
}

template <class T>
T OmbKeyedAttributeVariable<T>::lookup(int key) const {
    T out;
    return evaluate(OmbAttributeValue(key), out) ? out : default_.value_or(T());
}

template <class T>
T OmbKeyedAttributeVariable<T>::lookup(float key) const {
    T out;
    return evaluate(OmbAttributeValue(static_cast<double>(key)), out) ? out : default_.value_or(T());
}

template <class T>
void OmbKeyedAttributeVariable<T>::buildFastTable() {
    fast_.clear();
    if (!table_ || table_->size() < 2 || table_->keyType() != OmbAttributeInt64) return;
    const std::int64_t smallest = table_->begin()->first.asInt64();
    const std::int64_t largest = std::prev(table_->end())->first.asInt64();
    if (largest - smallest + 1 >= 65536) return;
    std::vector<T> fast;
    fast.reserve(static_cast<std::size_t>(largest - smallest + 1));
    for (std::int64_t k = smallest; k <= largest; ++k) {
        T value;
        table_->lookup(OmbAttributeValue(k), value);
        fast.push_back(value);
    }
    fast_.swap(fast);
    smallest_ = smallest;
}

// --- configuration text -------------------------------------------------------------

namespace {

// The text of a key in a configuration file: atoms by name.
OmbString keyText(const OmbAttributeValue& key) {
    switch (key.type()) {
        case OmbAttributeInt64: return OmbString(std::to_string(key.asInt64()));
        case OmbAttributeDouble: return OmbAttributeVariableTraits<double>::toText(key.asDouble());
        case OmbAttributeBool: return OmbString::literal(key.asBool() ? "true" : "false");
        case OmbAttributeAtom: return OmbAtoms::name(key.asAtom());
        case OmbAttributeString: return key.asString();
        case OmbAttributeEmpty: break;
    }
    return OmbString();
}

// The element of a variable: named plainly, with its value type, placed in
// the referring element's property element (or at top level).
TiXmlElement* variableElement(const char* kind, const char* valueType, TiXmlElement* topLevel, TiXmlElement* parent,
                              const char* propertyName, bool isPublic) {
    auto* element = new TiXmlElement(kind);
    element->SetAttribute("ValueType", valueType);
    if (isPublic) element->SetAttribute("Public", "true");
    TiXmlElement* container = parent ? parent : topLevel;
    if (parent && propertyName && *propertyName) container = OmbXmlSerializer::propertyElement(parent, propertyName);
    container->LinkEndChild(element);
    return element;
}

}  // namespace

template <class T>
void OmbDirectAttributeVariable<T>::toXml(OmbXmlSerializer&, TiXmlElement* topLevel, TiXmlElement* parent,
                                          const char* propertyName, const char*, bool isPublic) const {
    TiXmlElement* e = variableElement("DirectAttributeVariable", OmbAttributeVariableTraits<T>::name(), topLevel,
                                      parent, propertyName, isPublic);
    e->SetAttribute("Value", OmbAttributeVariableTraits<T>::toText(value_).dataUtf8());
}

template <class T>
void OmbIndirectAttributeVariable<T>::toXml(OmbXmlSerializer&, TiXmlElement* topLevel, TiXmlElement* parent,
                                            const char* propertyName, const char*, bool isPublic) const {
    TiXmlElement* e = variableElement("IndirectAttributeVariable", OmbAttributeVariableTraits<T>::name(), topLevel,
                                      parent, propertyName, isPublic);
    e->SetAttribute("Key", OmbAtoms::name(key_).dataUtf8());
    if (default_) e->SetAttribute("DefaultValue", OmbAttributeVariableTraits<T>::toText(*default_).dataUtf8());
}

template <class T>
void OmbKeyedAttributeVariable<T>::toXml(OmbXmlSerializer&, TiXmlElement* topLevel, TiXmlElement* parent,
                                         const char* propertyName, const char*, bool isPublic) const {
    const OmbAttributeSetType keyType = table_ ? table_->keyType() : OmbAttributeEmpty;
    if (keyType == OmbAttributeEmpty)
        OMB_THROW(SerializationUnknownKeyType, OmbString(std::to_string(static_cast<int>(keyType))));
    TiXmlElement* e = variableElement("KeyedAttributeVariable", OmbAttributeVariableTraits<T>::name(), topLevel, parent,
                                      propertyName, isPublic);
    e->SetAttribute("KeyType", Omb_attributeTypeName(keyType));
    e->SetAttribute("Key", OmbAtoms::name(key_).dataUtf8());
    if (default_) e->SetAttribute("DefaultValue", OmbAttributeVariableTraits<T>::toText(*default_).dataUtf8());
    TiXmlElement* items =
        OmbXmlSerializer::propertyElement(e, "Table")->LinkEndChild(new TiXmlElement("KeyValueTable"))->ToElement();
    for (const auto& [key, value] : *table_) {
        auto* item = items->LinkEndChild(new TiXmlElement("Item"))->ToElement();
        item->SetAttribute("Key", keyText(key).dataUtf8());
        item->SetAttribute("Value", OmbAttributeVariableTraits<T>::toText(value).dataUtf8());
    }
}

#define OMB_INSTANTIATE_ATTRIBUTE_VARIABLE(T)       \
    template class OmbKeyValueTable<T>;             \
    template class OmbAttributeVariable<T>;         \
    template class OmbDirectAttributeVariable<T>;   \
    template class OmbIndirectAttributeVariable<T>; \
    template class OmbKeyedAttributeVariable<T>;
OMB_ATTRIBUTE_VARIABLE_TYPES(OMB_INSTANTIATE_ATTRIBUTE_VARIABLE)
