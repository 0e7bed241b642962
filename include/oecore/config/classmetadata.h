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
template <class Self>
class OmbBuiltInValueMetaData : public ConcreteClassMetaData {
public:
    static Self& instance() {
        static Self metaData;
        return metaData;
    }

protected:
    explicit OmbBuiltInValueMetaData(const char* name) : ConcreteClassMetaData(OmbString::literal(name), true) {}
};

#define OMB_BUILT_IN_VALUE_METADATA(CLASS, NAME)                                                        \
    class CLASS : public OmbBuiltInValueMetaData<CLASS> {                                               \
    public:                                                                                             \
        OmbRef<OmbRefCnt> createInstance(OmbXmlParserContext& context, TiXmlElement* element) override; \
                                                                                                        \
    private:                                                                                            \
        friend class OmbBuiltInValueMetaData<CLASS>;                                                    \
        CLASS() : OmbBuiltInValueMetaData(NAME) {}                                                      \
    };

OMB_BUILT_IN_VALUE_METADATA(IntMetaData, "int")
OMB_BUILT_IN_VALUE_METADATA(DoubleMetaData, "double")
OMB_BUILT_IN_VALUE_METADATA(BoolMetaData, "bool")
OMB_BUILT_IN_VALUE_METADATA(StringMetaData, "String")
OMB_BUILT_IN_VALUE_METADATA(CommentMetaData, "Comment")
#undef OMB_BUILT_IN_VALUE_METADATA
