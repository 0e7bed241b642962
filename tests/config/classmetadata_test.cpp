#include <oecore/config/boxedvalue.h>
#include <oecore/config/classmetadata.h>
#include <oecore/config/valueparsers.h>
#include <oecore/config/xmlparser.h>
#include <oecore/core/exception.h>

#include <gtest/gtest.h>
#include <tinyxml.h>

#include <clocale>
#include <string>

namespace {

OmbXmlParserContext& noContext() {
    static OmbXmlParserContext context({}, OmbDataSetInitialization::Delayed, {});
    return context;
}

template <class T>
T valueOf(ClassMetaData& type, const char* text) {
    TiXmlElement element(std::string(type.name()).c_str());
    if (text) element.InsertEndChild(TiXmlText(text));
    OmbRef<OmbRefCnt> boxed = type.createInstance(noContext(), &element);
    auto* value = dynamic_cast<OmbBoxedValue<T>*>(boxed.get());
    if (!value) throw std::logic_error("wrong box type");
    return value->value();
}

}  // namespace

namespace {

template <class Base>
struct Creating : Base {
    using Base::Base;
    OmbRef<OmbRefCnt> createInstance(OmbXmlParserContext&, TiXmlElement*) override { return OmbRef<OmbRefCnt>(); }
};

}  // namespace

TEST(ClassMetaData, FlagsOfEachKind) {
    Creating<ConcreteClassMetaData> concrete(OmbString("View"));
    EXPECT_FALSE(concrete.isAbstract() || concrete.isValueType() || concrete.isCollection());
    EXPECT_EQ(concrete.name(), OmbString("View"));
    EXPECT_TRUE(IntMetaData::instance().isValueType());
    EXPECT_FALSE(IntMetaData::instance().isCollection());

    Creating<CollectionClassMetaData> layers(OmbString("LayerCollection"), OmbString("Layer"));
    EXPECT_TRUE(layers.isCollection());
    EXPECT_TRUE(layers.isValueType());
    EXPECT_EQ(layers.containedType(), OmbString("Layer"));

    AbstractClassMetaData abstract(OmbString("Layer"));
    EXPECT_TRUE(abstract.isAbstract());
    try {
        abstract.createInstance(noContext(), nullptr);
        FAIL() << "an abstract class was instantiated";
    } catch (const OmbXXmlAbstractClass& e) {
        EXPECT_EQ(e.asString(), OmbString("Cannot create instance of abstract class Layer"));
    }
}

TEST(ClassMetaData, BuiltInValuesConvertTheWholeText) {
    EXPECT_EQ(valueOf<long long>(IntMetaData::instance(), " 42"), 42);
    EXPECT_EQ(valueOf<long long>(IntMetaData::instance(), "-9000000000"), -9000000000LL);
    EXPECT_DOUBLE_EQ(valueOf<double>(DoubleMetaData::instance(), "2.5e-1"), 0.25);
    EXPECT_TRUE(valueOf<bool>(BoolMetaData::instance(), "true"));
    EXPECT_FALSE(valueOf<bool>(BoolMetaData::instance(), "false"));
    EXPECT_EQ(valueOf<OmbString>(StringMetaData::instance(), "Harbour \xC3\xA9"), OmbString("Harbour \xC3\xA9"));
    EXPECT_TRUE(valueOf<OmbString>(StringMetaData::instance(), nullptr).empty());
    TiXmlElement comment("Comment");
    EXPECT_FALSE(CommentMetaData::instance().createInstance(noContext(), &comment));
    EXPECT_EQ(&IntMetaData::instance(), &IntMetaData::instance());
}

TEST(ClassMetaData, RejectedTextNamesTheTextAndType) {
    for (const char* bad : {"42 ", "4x", "", "0x10"})
        EXPECT_THROW(valueOf<long long>(IntMetaData::instance(), bad), OmbXXmlParserError) << bad;
    for (const char* bad : {"True", "1", "yes", ""})
        EXPECT_THROW(valueOf<bool>(BoolMetaData::instance(), bad), OmbXXmlParserError) << bad;
    try {
        valueOf<double>(DoubleMetaData::instance(), "1,5");
        FAIL();
    } catch (const OmbXXmlParserError& e) {
        EXPECT_EQ(e.asString(), OmbString("Failed to convert '1,5' to type double."));
    }
}

TEST(ValueParsers, NumbersIgnoreTheProcessLocale) {
    const std::string saved = std::setlocale(LC_NUMERIC, nullptr);
    std::setlocale(LC_NUMERIC, "de_DE.UTF-8");  // when installed, its separator is a comma
    double d = 0;
    EXPECT_TRUE(parseDouble(OmbString("1.5"), d));
    EXPECT_DOUBLE_EQ(d, 1.5);
    EXPECT_FALSE(parseDouble(OmbString("1,5"), d));
    std::setlocale(LC_NUMERIC, saved.c_str());

    float f = 0;
    EXPECT_TRUE(parseFloat(OmbString("+0.5"), f));
    EXPECT_FLOAT_EQ(f, 0.5f);
    long long i = 0;
    EXPECT_FALSE(parseInt(OmbString("99999999999999999999"), i));
    EXPECT_FALSE(parseInt(OmbString("+-1"), i));
}
