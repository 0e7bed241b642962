// ClassMetaData: what the configuration reader knows of one class or value
// type: its element name, whether it is abstract, a value type or a
// collection, and how to create an instance from an element.
#pragma once

#include <oecore/core/ref.h>
#include <oecore/core/refcnt.h>
#include <oecore/core/string.h>

class OmbXmlParserContext;
class TiXmlElement;

class ClassMetaData {
public:
    ClassMetaData(const OmbString& name, bool isAbstract, bool isValueType, bool isCollection)
        : name_(name), isAbstract_(isAbstract), isValueType_(isValueType), isCollection_(isCollection) {}
    ClassMetaData(const ClassMetaData&) = delete;
    ClassMetaData& operator=(const ClassMetaData&) = delete;
    virtual ~ClassMetaData() = default;

    virtual OmbRef<OmbRefCnt> createInstance(OmbXmlParserContext& context, TiXmlElement* element) = 0;

    const OmbString& name() const noexcept { return name_; }
    bool isAbstract() const noexcept { return isAbstract_; }
    bool isValueType() const noexcept { return isValueType_; }
    bool isCollection() const noexcept { return isCollection_; }

private:
    OmbString name_;
    bool isAbstract_;
    bool isValueType_;
    bool isCollection_;
};

class ConcreteClassMetaData : public ClassMetaData {
public:
    explicit ConcreteClassMetaData(const OmbString& name) : ClassMetaData(name, false, false, false) {}
    ConcreteClassMetaData(const OmbString& name, bool isValueType) : ClassMetaData(name, false, isValueType, false) {}
};

// Abstract classes are registered so that references to them resolve, but
// an element naming one cannot be instantiated.
class AbstractClassMetaData : public ClassMetaData {
public:
    explicit AbstractClassMetaData(const OmbString& name) : ClassMetaData(name, true, false, false) {}
    // Throws OmbXXmlAbstractClass.
    OmbRef<OmbRefCnt> createInstance(OmbXmlParserContext& context, TiXmlElement* element) override;
};

// Collections are value types whose items are elements of containedType().
class CollectionClassMetaData : public ClassMetaData {
public:
    CollectionClassMetaData(const OmbString& name, const OmbString& containedType)
        : ClassMetaData(name, false, true, true), containedType_(containedType) {}

    const OmbString& containedType() const noexcept { return containedType_; }

private:
    OmbString containedType_;
};

// The built-in value types. Each converts an element's text to a boxed value
// (OmbBoxedValue<long long>, <double>, <bool> or <OmbString>); a comment
// yields an empty reference. One shared instance each.
class IntMetaData : public ConcreteClassMetaData {
public:
    static IntMetaData& instance();
    OmbRef<OmbRefCnt> createInstance(OmbXmlParserContext& context, TiXmlElement* element) override;

private:
    IntMetaData() : ConcreteClassMetaData(OmbString::literal("int"), true) {}
};

class DoubleMetaData : public ConcreteClassMetaData {
public:
    static DoubleMetaData& instance();
    OmbRef<OmbRefCnt> createInstance(OmbXmlParserContext& context, TiXmlElement* element) override;

private:
    DoubleMetaData() : ConcreteClassMetaData(OmbString::literal("double"), true) {}
};

class BoolMetaData : public ConcreteClassMetaData {
public:
    static BoolMetaData& instance();
    OmbRef<OmbRefCnt> createInstance(OmbXmlParserContext& context, TiXmlElement* element) override;

private:
    BoolMetaData() : ConcreteClassMetaData(OmbString::literal("bool"), true) {}
};

class StringMetaData : public ConcreteClassMetaData {
public:
    static StringMetaData& instance();
    OmbRef<OmbRefCnt> createInstance(OmbXmlParserContext& context, TiXmlElement* element) override;

private:
    StringMetaData() : ConcreteClassMetaData(OmbString::literal("String"), true) {}
};

class CommentMetaData : public ConcreteClassMetaData {
public:
    static CommentMetaData& instance();
    OmbRef<OmbRefCnt> createInstance(OmbXmlParserContext& context, TiXmlElement* element) override;

private:
    CommentMetaData() : ConcreteClassMetaData(OmbString::literal("Comment"), true) {}
};

// Generated-style metadata of the OmbChildObjectMode enumeration: value
// names "TopLevel" and "AllLevels".
class ChildObjectModeMetaData {
public:
    static bool fromString(const OmbString& text, int& value);
    static OmbString toString(int value);
};
