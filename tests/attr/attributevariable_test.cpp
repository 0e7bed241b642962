#include <oecore/attr/attributevariable.h>
#include <oecore/attr/featureattribute.h>
#include <oecore/attr/undefinedvalue.h>
#include <oecore/core/exception.h>

#include <gtest/gtest.h>

#include <cmath>
#include <random>

#include "../errortext.h"

namespace {

const OmbAtomConstant value("value");

OmbReadOnlyAttributes attributes(const OmbAttributeValue& v) {
    OmbRef<OmbAttributeSet> set(new OmbAttributeSet);
    if (!v.is_singular()) set->setGeneric(value, v);
    return OmbReadOnlyAttributes(set);
}

template <class T>
std::optional<T> indirect(const OmbAttributeValue& v) {
    const OmbRef<OmbIndirectAttributeVariable<T>> variable(new OmbIndirectAttributeVariable<T>(value));
    T out{};
    return variable->eval(attributes(v), out) ? std::optional<T>(out) : std::nullopt;
}

OmbRef<OmbKeyValueTable<OmbString>> table(std::initializer_list<std::pair<OmbAttributeValue, const char*>> items) {
    OmbRef<OmbKeyValueTable<OmbString>> t(new OmbKeyValueTable<OmbString>);
    for (const auto& [key, text] : items) t->add(key, OmbString(text));
    return t;
}

}  // namespace

TEST(AttributeVariable, IndirectConversions) {
    EXPECT_EQ(indirect<std::int64_t>(OmbAttributeValue(2.9)), 2);
    EXPECT_EQ(indirect<std::int64_t>(OmbAttributeValue(-2.9)), -2);
    EXPECT_EQ(indirect<double>(OmbAttributeValue(std::int64_t{3})), 3.0);
    EXPECT_EQ(indirect<bool>(OmbAttributeValue(std::int64_t{1})), std::nullopt);
    EXPECT_EQ(indirect<OmbString>(OmbAttributeValue(std::int64_t{42})), OmbString("42"));
    EXPECT_EQ(indirect<OmbString>(OmbAttributeValue(0.5)), OmbString("0.5"));
    EXPECT_EQ(indirect<OmbString>(OmbAttributeValue(7UL)), std::nullopt) << "atoms are never converted";
    EXPECT_EQ(indirect<OmbColor>(OmbAttributeValue(OmbString("rgba(255, 0, 0, 0.5)"))), OmbColor(255, 0, 0, 128));
    EXPECT_EQ(indirect<OmbAlignY>(OmbAttributeValue(std::int64_t{0x100000018})), OmbAlignY::Baseline);
    EXPECT_EQ(indirect<double>(OmbAttributeValue()), std::nullopt);

    OmbIndirectAttributeVariable<double> withDefault(value, 1.5);
    double out = 0;
    EXPECT_TRUE(withDefault.eval(attributes(OmbAttributeValue(OmbString("deep"))), out));
    EXPECT_EQ(out, 1.5);
    withDefault.clearDefaultValue();
    EXPECT_EQ(errorOf([&] { withDefault.defaultValue(); }), "Attribute variable has no default value");
}

TEST(AttributeVariable, KeyedLookupsTakeTheNearestKeyBelow) {
    const auto t = table({{OmbAttributeValue(std::int64_t{0}), "zero"},
                          {OmbAttributeValue(std::int64_t{5}), "five"},
                          {OmbAttributeValue(std::int64_t{10}), "ten"}});
    const OmbRef<OmbKeyedAttributeVariable<OmbString>> keyed(
        new OmbKeyedAttributeVariable<OmbString>(value, t, OmbString("default")));
    EXPECT_TRUE(keyed->hasFastTable());
    const auto at = [&](const OmbAttributeValue& v) {
        OmbString out;
        keyed->eval(attributes(v), out);
        return out;
    };
    EXPECT_EQ(at(OmbAttributeValue(std::int64_t{7})), OmbString("five"));
    EXPECT_EQ(at(OmbAttributeValue(std::int64_t{-3})), OmbString("zero"));
    EXPECT_EQ(at(OmbAttributeValue(std::int64_t{12})), OmbString("ten"));
    EXPECT_EQ(at(OmbAttributeValue(std::int64_t{5})), OmbString("five"));
    EXPECT_EQ(at(OmbAttributeValue(7.0)), OmbString("default")) << "no conversion between integer and double keys";
    EXPECT_EQ(keyed->lookup(9), OmbString("five"));
    EXPECT_EQ(keyed->lookup(9.0f), OmbString("default"));

    // The variable follows its table.
    t->add(OmbAttributeValue(std::int64_t{6}), OmbString("six"));
    EXPECT_EQ(at(OmbAttributeValue(std::int64_t{7})), OmbString("six"));
    EXPECT_EQ(errorOf([&] { t->add(OmbAttributeValue(1.0), OmbString("x")); }),
              "All keys in the key/value table for a keyed attribute variable must have the same type");
}

TEST(AttributeVariable, StringKeysMatchExactlyAndDoubleKeysInterpolateDownwards) {
    const auto names = table({{OmbAttributeValue(OmbString("b")), "bee"}, {OmbAttributeValue(OmbString("d")), "dee"}});
    OmbString out;
    EXPECT_FALSE(names->lookup(OmbAttributeValue(OmbString("c")), out));
    EXPECT_TRUE(names->lookup(OmbAttributeValue(OmbString("d")), out));
    const auto depths = table({{OmbAttributeValue(0.0), "shallow"}, {OmbAttributeValue(10.0), "deep"}});
    EXPECT_TRUE(depths->lookup(OmbAttributeValue(9.99), out));
    EXPECT_EQ(out, OmbString("shallow"));
    EXPECT_FALSE(depths->tryGetValue(OmbAttributeValue(9.99), out));
}

TEST(AttributeVariable, TheFastTableAgreesWithTheMap) {
    std::mt19937 random(20261207);
    for (int round = 0; round < 20; ++round) {
        OmbRef<OmbKeyValueTable<std::int64_t>> t(new OmbKeyValueTable<std::int64_t>);
        std::uniform_int_distribution<std::int64_t> keys(-500, 500);
        for (int i = 0; i < 30; ++i) t->add(OmbAttributeValue(keys(random)), keys(random));
        const OmbRef<OmbKeyedAttributeVariable<std::int64_t>> keyed(
            new OmbKeyedAttributeVariable<std::int64_t>(value, t));
        ASSERT_TRUE(keyed->hasFastTable());
        for (std::int64_t k = -700; k <= 700; ++k) {
            std::int64_t fromMap = 0;
            t->lookup(OmbAttributeValue(k), fromMap);
            ASSERT_EQ(keyed->lookup(static_cast<int>(k)), fromMap) << "key " << k;
        }
    }
    // A span of 65,536 or more keys is looked up in the map.
    OmbRef<OmbKeyValueTable<std::int64_t>> wide(new OmbKeyValueTable<std::int64_t>);
    wide->add(OmbAttributeValue(std::int64_t{0}), 1);
    wide->add(OmbAttributeValue(std::int64_t{65535}), 2);
    EXPECT_FALSE(OmbKeyedAttributeVariable<std::int64_t>(value, wide).hasFastTable());
}

TEST(AttributeVariable, IdsAreUniqueAndKeptByCopies) {
    const OmbRef<OmbDirectAttributeVariable<double>> a(new OmbDirectAttributeVariable<double>(1.0));
    const OmbRef<OmbDirectAttributeVariable<double>> b(new OmbDirectAttributeVariable<double>(2.0));
    EXPECT_NE(a->id(), b->id());
    const OmbRef<OmbDirectAttributeVariable<double>> copy(a->clone());
    EXPECT_EQ(copy->id(), a->id());
    EXPECT_STREQ(a->myRuntimeClassName(), "DirectAttributeVariable<double>");
    EXPECT_EQ(a->lookup(3), 1.0);
}

TEST(Color, ParserGrammar) {
    OmbColor c;
    EXPECT_TRUE(OmbColor::fromString(OmbString(" Navy "), c));
    EXPECT_EQ(c, OmbColor(0, 0, 128));
    EXPECT_TRUE(OmbColor::fromString(OmbString("#F80"), c));
    EXPECT_EQ(c, OmbColor(255, 136, 0));
    EXPECT_TRUE(OmbColor::fromString(OmbString("#11223344"), c));
    EXPECT_EQ(c, OmbColor(0x11, 0x22, 0x33, 0x44));
    EXPECT_TRUE(OmbColor::fromString(OmbString("rgb(1, 2, 3)"), c));
    EXPECT_EQ(c, OmbColor(1, 2, 3));
    EXPECT_TRUE(OmbColor::fromString(OmbString("rgba(1,2,3,50%)"), c));
    EXPECT_EQ(c.a, 128);
    EXPECT_EQ(c.toString(), OmbString("#01020380"));
    for (const char* bad : {"", "#12345", "rgb(256,0,0)", "rgba(1,2,3)", "rgba(1,2,3,1.5)", "blurple", "#GG0000"}) {
        OmbColor untouched(9, 9, 9);
        EXPECT_FALSE(OmbColor::fromString(OmbString(bad), untouched)) << bad;
        EXPECT_EQ(untouched, OmbColor(9, 9, 9));
    }
}

TEST(UndefinedValue, IntegersAndFloatsMarkTheirNoDataValue) {
    const OmbUndefinedIntValue minus9999(OmbUndefinedIntValueParams{-9999});
    EXPECT_TRUE(minus9999.isInt());
    EXPECT_TRUE(minus9999.isUndefined(-9999));
    EXPECT_FALSE(minus9999.isUndefined(0));
    EXPECT_FALSE(minus9999.isUndefined(-9999.0f)) << "a float is never an integer's no-data value";
    const OmbUndefinedFloatValue nan(std::nanf(""));
    EXPECT_TRUE(nan.isFloat());
    EXPECT_FALSE(nan.isUndefined(std::nanf(""))) << "a NaN no-data value marks nothing";
    EXPECT_TRUE(OmbUndefinedFloatValue(1.5f).isUndefined(1.5f));
}

TEST(FeatureAttributeSchema, ListsEachKeyAndTypeOnce) {
    OmbRef<OmbFeatureAttributeSchema> schema(new OmbFeatureAttributeSchema);
    schema->add(value, OmbAttributeDouble);
    schema->add(value, OmbAttributeDouble);
    schema->add(value, OmbAttributeString);
    EXPECT_EQ(schema->attributes()->size(), 2u);
    EXPECT_TRUE(schema->contains(value));
    EXPECT_LT(*schema->attributes()->get(0), *schema->attributes()->get(1));
}
