// OmbClassDescription: what a configuration file can say about an engine
// class, declared once per class.
//
// A description lists the class's configuration properties in order: name,
// type name, default, whether it is required or the element's content, and
// how to read and set it. The reader creates objects from it, the writer
// saves them with it and child enumeration walks it, so reading and saving
// cannot drift apart. A class describes itself in its source file:
//
//   OMB_DESCRIBE_CLASS(OmbLengthUnit) {
//       d.property("InMeters", &OmbLengthUnit::inMeters, &OmbLengthUnit::inMeters, 1.0);
//   }
//
// and gets its toXml and getMyChildObjects from OMB_DESCRIBED_MEMBERS() in
// its class body and OMB_DEFINE_DESCRIBED_MEMBERS(Class) in its source file.
// Properties of base classes come first, so "Name" leads for every resource
// object.
#pragma once

#include <oecore/config/boxedvalue.h>
#include <oecore/config/classmetadata.h>
#include <oecore/core/engineobject.h>
#include <oecore/core/refvec.h>
#include <oecore/core/string.h>

#include <cstdint>
#include <functional>
#include <memory>
#include <type_traits>
#include <utility>
#include <vector>

class OmbXmlSerializer;
class TiXmlElement;

// The names of an enumeration's values, as configuration files write them.
class OmbEnumDescription {
public:
    struct Value {
        const char* name;
        int value;
    };
    OmbEnumDescription(const char* typeName, std::vector<Value> values);

    const OmbString& typeName() const noexcept { return typeName_; }
    bool fromName(const OmbString& name, int& value) const;
    // Throws OmbXIllegalValue for a value without a name.
    OmbString toName(int value) const;

    // Every enumeration described so far.
    static const std::vector<const OmbEnumDescription*>& all();

private:
    OmbString typeName_;
    std::vector<Value> values_;
};

// Declares an enumeration's value names: OMB_DESCRIBE_ENUM(OmbChildObjectMode,
// "ChildObjectMode", {{"TopLevel", 0}, {"AllLevels", 1}}).
template <class E>
struct OmbEnumNames;
#define OMB_DESCRIBE_ENUM(ENUM, TYPENAME, ...)                        \
    template <>                                                       \
    struct OmbEnumNames<ENUM> {                                       \
        static const OmbEnumDescription& description() {              \
            static const OmbEnumDescription d(TYPENAME, __VA_ARGS__); \
            return d;                                                 \
        }                                                             \
    };

// How a property's C++ value type meets configuration text and boxed values.
template <class V, class = void>
struct OmbXmlValueTraits;

// One configuration property of a class.
class OmbPropertyDescription {
public:
    enum class Kind { Simple, Object, Collection };

    OmbPropertyDescription(const char* name, OmbString typeName, Kind kind)
        : name_(name), typeName_(std::move(typeName)), kind_(kind) {}
    virtual ~OmbPropertyDescription() = default;

    const char* name() const noexcept { return name_; }
    const OmbString& typeName() const noexcept { return typeName_; }
    Kind kind() const noexcept { return kind_; }
    bool required() const noexcept { return required_; }
    bool content() const noexcept { return content_; }
    void required(bool value) noexcept { required_ = value; }
    void content(bool value) noexcept { content_ = value; }

    // Whether a value read for the property has the right type.
    virtual bool accepts(const OmbRefCnt& value) const = 0;
    virtual void set(OmbEngineObject& object, const OmbRefCnt& value) const = 0;
    virtual bool isDefault(const OmbEngineObject& object) const = 0;
    // Simple values: the text of the attribute the writer sets.
    virtual OmbString text(const OmbEngineObject& object) const = 0;
    // Objects and collections: the engine object held, or null.
    virtual OmbRef<OmbEngineObject> object(const OmbEngineObject& object) const = 0;

private:
    const char* name_;
    OmbString typeName_;
    Kind kind_;
    bool required_ = false;
    bool content_ = false;
};

class OmbClassDescription {
public:
    using Factory = OmbEngineObject* (*)();

    OmbClassDescription(OmbClass* runtimeClass, Factory factory);
    OmbClassDescription(const OmbClassDescription&) = delete;
    OmbClassDescription& operator=(const OmbClassDescription&) = delete;

    OmbClass* runtimeClass() const noexcept { return runtimeClass_; }
    // The configuration element name of the class.
    OmbString elementName() const { return OmbString::literal(runtimeClass_->name()); }
    // Null for abstract classes.
    Factory factory() const noexcept { return factory_; }
    // The base classes' properties, then the class's own, in order.
    const std::vector<const OmbPropertyDescription*>& properties() const;
    const OmbPropertyDescription* property(const OmbString& name) const;

    // Reader metadata that creates the class from its elements; extension
    // modules register it with a context for their classes.
    std::unique_ptr<ClassMetaData> metaData() const;

    void add(std::unique_ptr<OmbPropertyDescription> property) { own_.push_back(std::move(property)); }
    OmbPropertyDescription& last() { return *own_.back(); }

    // Run by the reader once it has set the properties of an object of
    // exactly this class, for checks and set-up that need them all.
    using AfterRead = std::function<void(OmbEngineObject&)>;
    void afterRead(AfterRead hook) { afterRead_ = std::move(hook); }
    const AfterRead& afterRead() const noexcept { return afterRead_; }

    // The description of cls, or of its nearest described base; null if none.
    static const OmbClassDescription* of(const OmbClass* cls);
    // Every described class, in registration order.
    static std::vector<const OmbClassDescription*> all();
    static bool add(std::unique_ptr<OmbClassDescription> description);

    // Collection type names with their item class, from collection properties.
    struct CollectionType {
        OmbString typeName;
        OmbString itemTypeName;
        OmbEngineObject* (*create)();
        bool (*accepts)(const OmbRefCnt& item);
        void (*add)(OmbEngineObject& collection, const OmbRefCnt& item);
    };
    static void addCollectionType(const CollectionType& type);
    static const std::vector<CollectionType>& collectionTypes();

private:
    OmbClass* runtimeClass_;
    Factory factory_;
    std::vector<std::unique_ptr<OmbPropertyDescription>> own_;
    mutable std::vector<const OmbPropertyDescription*> all_;
    mutable bool resolved_ = false;
    AfterRead afterRead_;
};

// Walks the description: the engine objects held by object and collection
// properties (for getMyChildObjects), and the toXml contract.
OmbRef<OmbEngineObjectVec> Omb_describedChildObjects(const OmbEngineObject& object);
void Omb_describedToXml(const OmbEngineObject& object, OmbXmlSerializer& serializer, TiXmlElement* topLevel,
                        TiXmlElement* parent, const char* propertyName, const char* elementName, bool isPublic);

#define OMB_DESCRIBED_MEMBERS()                                                                                      \
public:                                                                                                              \
    OmbRef<OmbEngineObjectVec> getMyChildObjects() const override;                                                   \
    void toXml(OmbXmlSerializer& serializer, TiXmlElement* topLevel, TiXmlElement* parent, const char* propertyName, \
               const char* elementName, bool isPublic) const override;

#define OMB_DEFINE_DESCRIBED_MEMBERS(CLASS)                                                                  \
    OmbRef<OmbEngineObjectVec> CLASS::getMyChildObjects() const { return Omb_describedChildObjects(*this); } \
    void CLASS::toXml(OmbXmlSerializer& serializer, TiXmlElement* topLevel, TiXmlElement* parent,            \
                      const char* propertyName, const char* elementName, bool isPublic) const {              \
        Omb_describedToXml(*this, serializer, topLevel, parent, propertyName, elementName, isPublic);        \
    }

// --- value traits -----------------------------------------------------------

template <>
struct OmbXmlValueTraits<OmbString> {
    static constexpr auto kind = OmbPropertyDescription::Kind::Simple;
    static OmbString typeName() { return OmbString::literal("String"); }
    static bool fromBox(const OmbRefCnt& box, OmbString& out);
    static OmbString text(const OmbString& value) { return value; }
};

template <>
struct OmbXmlValueTraits<bool> {
    static constexpr auto kind = OmbPropertyDescription::Kind::Simple;
    static OmbString typeName() { return OmbString::literal("bool"); }
    static bool fromBox(const OmbRefCnt& box, bool& out);
    static OmbString text(bool value) { return OmbString::literal(value ? "true" : "false"); }
};

template <>
struct OmbXmlValueTraits<double> {
    static constexpr auto kind = OmbPropertyDescription::Kind::Simple;
    static OmbString typeName() { return OmbString::literal("double"); }
    static bool fromBox(const OmbRefCnt& box, double& out);
    static OmbString text(double value);
};

template <>
struct OmbXmlValueTraits<float> {
    static constexpr auto kind = OmbPropertyDescription::Kind::Simple;
    static OmbString typeName() { return OmbString::literal("float"); }
    static bool fromBox(const OmbRefCnt& box, float& out);
    static OmbString text(float value) { return OmbXmlValueTraits<double>::text(value); }
};

// Every integer type reads as "int" (a 64-bit integer) and must fit.
bool Omb_integerFromBox(const OmbRefCnt& box, long long& out);
template <class I>
struct OmbXmlValueTraits<I, std::enable_if_t<std::is_integral_v<I> && !std::is_same_v<I, bool>>> {
    static constexpr auto kind = OmbPropertyDescription::Kind::Simple;
    static OmbString typeName() { return OmbString::literal("int"); }
    static bool fromBox(const OmbRefCnt& box, I& out) {
        long long v;
        if (!Omb_integerFromBox(box, v) || !std::in_range<I>(v)) return false;
        out = static_cast<I>(v);
        return true;
    }
    static OmbString text(I value) { return OmbString(std::to_string(value)); }
};

template <class E>
struct OmbXmlValueTraits<E, std::enable_if_t<std::is_enum_v<E>>> {
    static constexpr auto kind = OmbPropertyDescription::Kind::Simple;
    static OmbString typeName() { return OmbEnumNames<E>::description().typeName(); }
    static bool fromBox(const OmbRefCnt& box, E& out) {
        const auto* v = dynamic_cast<const OmbBoxedValue<int>*>(&box);
        if (!v) return false;
        out = static_cast<E>(v->value());
        return true;
    }
    static OmbString text(E value) { return OmbEnumNames<E>::description().toName(static_cast<int>(value)); }
};

template <class T>
struct OmbXmlValueTraits<OmbRef<T>, std::enable_if_t<std::is_base_of_v<OmbEngineObject, T>>> {
    static constexpr auto kind = OmbPropertyDescription::Kind::Object;
    static OmbString typeName() { return OmbString::literal(T::runtimeClass()->name()); }
    static bool fromBox(const OmbRefCnt& box, OmbRef<T>& out) {
        T* object = dynamic_cast<T*>(const_cast<OmbRefCnt*>(&box));
        if (!object) return false;
        out = OmbRef<T>(object);
        return true;
    }
    static OmbString text(const OmbRef<T>&) { return OmbString(); }
};

// --- typed properties ---------------------------------------------------------

template <class T, class V>
class OmbTypedProperty : public OmbPropertyDescription {
public:
    using Traits = OmbXmlValueTraits<V>;
    using Getter = std::function<V(const T&)>;
    using Setter = std::function<void(T&, const V&)>;

    OmbTypedProperty(const char* name, OmbString typeName, Getter get, Setter set, V defaultValue)
        : OmbPropertyDescription(name, std::move(typeName), Traits::kind),
          get_(std::move(get)),
          set_(std::move(set)),
          default_(std::move(defaultValue)) {}

    bool accepts(const OmbRefCnt& value) const override {
        V v;
        return Traits::fromBox(value, v);
    }
    void set(OmbEngineObject& object, const OmbRefCnt& value) const override {
        V v;
        if (Traits::fromBox(value, v)) set_(static_cast<T&>(object), v);
    }
    bool isDefault(const OmbEngineObject& object) const override {
        return get_(static_cast<const T&>(object)) == default_;
    }
    OmbString text(const OmbEngineObject& object) const override {
        return Traits::text(get_(static_cast<const T&>(object)));
    }
    OmbRef<OmbEngineObject> object(const OmbEngineObject& object) const override {
        if constexpr (Traits::kind == Kind::Simple)
            return OmbRef<OmbEngineObject>();
        else
            return OmbRef<OmbEngineObject>(get_(static_cast<const T&>(object)));
    }

private:
    Getter get_;
    Setter set_;
    V default_;
};

// Collection properties hold an OmbRefVec of engine objects, written inline
// as an element named after the collection type.
template <class T, class C>
class OmbCollectionProperty : public OmbPropertyDescription {
public:
    using Item = typename C::value_type::element_type;
    using Getter = std::function<OmbRef<C>(const T&)>;
    using Setter = std::function<void(T&, const OmbRef<C>&)>;

    OmbCollectionProperty(const char* name, const char* typeName, Getter get, Setter set)
        : OmbPropertyDescription(name, OmbString::literal(typeName), Kind::Collection),
          get_(std::move(get)),
          set_(std::move(set)) {
        OmbClassDescription::addCollectionType(
            {OmbString::literal(typeName), OmbString::literal(Item::runtimeClass()->name()),
             [] { return static_cast<OmbEngineObject*>(new C); },
             [](const OmbRefCnt& item) { return dynamic_cast<const Item*>(&item) != nullptr; },
             [](OmbEngineObject& collection, const OmbRefCnt& item) {
                 static_cast<C&>(collection).add(OmbRef<Item>(dynamic_cast<Item*>(const_cast<OmbRefCnt*>(&item))));
             }});
    }

    bool accepts(const OmbRefCnt& value) const override { return dynamic_cast<const C*>(&value) != nullptr; }
    void set(OmbEngineObject& object, const OmbRefCnt& value) const override {
        if (auto* c = dynamic_cast<C*>(const_cast<OmbRefCnt*>(&value))) set_(static_cast<T&>(object), OmbRef<C>(c));
    }
    bool isDefault(const OmbEngineObject& object) const override {
        const OmbRef<C> c = get_(static_cast<const T&>(object));
        return !c || c->empty();
    }
    OmbString text(const OmbEngineObject&) const override { return OmbString(); }
    OmbRef<OmbEngineObject> object(const OmbEngineObject& object) const override {
        return OmbRef<OmbEngineObject>(get_(static_cast<const T&>(object)));
    }

private:
    Getter get_;
    Setter set_;
};

// Adds the properties of class T to its description, in order.
template <class T>
class OmbDescriptionBuilder {
public:
    explicit OmbDescriptionBuilder(OmbClassDescription& description) : description_(description) {}

    // A property read and written through a getter and a setter member.
    template <class V, class G, class S>
    OmbDescriptionBuilder& property(const char* name, G getter, S setter, V defaultValue = V()) {
        using Traits = OmbXmlValueTraits<V>;
        description_.add(std::make_unique<OmbTypedProperty<T, V>>(
            name, Traits::typeName(), [getter](const T& o) -> V { return std::invoke(getter, o); },
            [setter](T& o, const V& v) { std::invoke(setter, o, v); }, std::move(defaultValue)));
        return *this;
    }
    // A property of an engine-object type.
    template <class U, class G, class S>
    OmbDescriptionBuilder& object(const char* name, G getter, S setter) {
        return property<OmbRef<U>>(name, getter, setter, OmbRef<U>());
    }
    template <class C, class G, class S>
    OmbDescriptionBuilder& collection(const char* name, const char* typeName, G getter, S setter) {
        description_.add(std::make_unique<OmbCollectionProperty<T, C>>(
            name, typeName, [getter](const T& o) -> OmbRef<C> { return std::invoke(getter, o); },
            [setter](T& o, const OmbRef<C>& v) { std::invoke(setter, o, v); }));
        return *this;
    }
    // Completes an object once all its properties are read.
    template <class F>
    OmbDescriptionBuilder& afterRead(F hook) {
        description_.afterRead([hook](OmbEngineObject& o) { hook(static_cast<T&>(o)); });
        return *this;
    }
    // Marks the last property as required, or as the element's content.
    OmbDescriptionBuilder& required() {
        description_.last().required(true);
        return *this;
    }
    OmbDescriptionBuilder& content() {
        description_.last().content(true);
        return *this;
    }

private:
    OmbClassDescription& description_;
};

// The "Authority" and "AuthorityCode" properties of a class with
// authority()/authorityCode() accessors.
template <class T>
void Omb_describeAuthority(OmbDescriptionBuilder<T>& d) {
    d.template property<OmbString>(
        "Authority", [](const T& o) { return o.authority(); }, [](T& o, const OmbString& v) { o.authority(v); });
    d.template property<OmbString>(
        "AuthorityCode", [](const T& o) { return o.authorityCode(); },
        [](T& o, const OmbString& v) { o.authorityCode(v); });
}

template <class T>
bool Omb_describeClass(void (*describe)(OmbDescriptionBuilder<T>&)) {
    OmbClassDescription::Factory factory = nullptr;
    if constexpr (!std::is_abstract_v<T> && std::is_default_constructible_v<T>)
        factory = [] { return static_cast<OmbEngineObject*>(new T); };
    auto description = std::make_unique<OmbClassDescription>(T::runtimeClass(), factory);
    OmbDescriptionBuilder<T> builder(*description);
    describe(builder);
    return OmbClassDescription::add(std::move(description));
}

// Describes CLASS when the library (or module) loads; the body that follows
// adds the properties through the builder d.
#define OMB_DESCRIBE_CLASS(CLASS)                                                                      \
    static void CLASS##_describe(OmbDescriptionBuilder<CLASS>& d);                                     \
    [[maybe_unused]] static const bool CLASS##_described = Omb_describeClass<CLASS>(CLASS##_describe); \
    static void CLASS##_describe([[maybe_unused]] OmbDescriptionBuilder<CLASS>& d)

OMB_DESCRIBE_ENUM(OmbChildObjectMode, "ChildObjectMode", {{"TopLevel", 0}, {"AllLevels", 1}})
