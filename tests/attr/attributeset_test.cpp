#include <oecore/attr/attributeset.h>
#include <oecore/attr/attributesetlist.h>
#include <oecore/core/exception.h>
#include <oecore/core/runtime.h>

#include <gtest/gtest.h>

#include <cmath>

namespace {

// Constants: the runtime restarts in these tests forget ordinary atoms.
const OmbAtomConstant depth("depth");
const OmbAtomConstant name("name");
const OmbAtomConstant kind("kind");

OmbRef<OmbAttributeSet> newSet() { return OmbRef<OmbAttributeSet>(new OmbAttributeSet); }

}  // namespace

TEST(Atoms, InterningAndNames) {
    const OmbAtom a = OmbAtoms::atom(OmbString("harbour"));
    EXPECT_EQ(OmbAtoms::atom(OmbString("harbour")), a);
    EXPECT_NE(OmbAtoms::atom(OmbString("Harbour")), a);
    EXPECT_EQ(OmbAtoms::name(a), OmbString("harbour"));
    EXPECT_EQ(OmbAtoms::atom(OmbString()), 0u);
    EXPECT_THROW(OmbAtoms::name(0xFFFFFFF0u), OmbXAtomsIllegalAtom);
    EXPECT_TRUE(OmbAtoms::isAtomString(OmbString("#road")));
    EXPECT_FALSE(OmbAtoms::isAtomString(OmbString()));
    EXPECT_FALSE(OmbAtoms::isAtomString(OmbString("road")));
}

TEST(Atoms, ConstantsSurviveARestartOtherAtomsDoNot) {
    static const OmbAtomConstant constant("oecore-test-constant");
    const OmbAtom fixed = constant;
    const OmbAtom passing = OmbAtoms::atom(OmbString("oecore-test-passing"));
    OmbRuntime::init();
    OmbRuntime::shutdown();
    OmbRuntime::init();
    EXPECT_EQ(static_cast<OmbAtom>(constant), fixed);
    EXPECT_EQ(OmbAtoms::atom(OmbString("oecore-test-constant")), fixed);
    EXPECT_EQ(OmbAtoms::name(fixed), OmbString("oecore-test-constant"));
    // The number may name an atom made since (by predefined objects), never
    // the forgotten string.
    bool forgotten = true;
    try {
        forgotten = !(OmbAtoms::name(passing) == OmbString("oecore-test-passing"));
    } catch (const OmbXAtomsIllegalAtom&) {
    }
    EXPECT_TRUE(forgotten);
    OmbRuntime::shutdown();
}

TEST(AttributeValue, EqualityAndOrder) {
    EXPECT_EQ(OmbAttributeValue(), OmbAttributeValue());
    EXPECT_NE(OmbAttributeValue(std::int64_t{1}), OmbAttributeValue(1.0));
    EXPECT_NE(OmbAttributeValue(std::nan("")), OmbAttributeValue(std::nan("")));
    EXPECT_EQ(OmbAttributeValue(OmbString("a")), OmbAttributeValue(OmbString("a")));
    // By tag first, then by payload.
    EXPECT_LT(OmbAttributeValue(std::int64_t{100}), OmbAttributeValue(1UL));
    EXPECT_LT(OmbAttributeValue(-5.0), OmbAttributeValue(OmbString("")));
    EXPECT_LT(OmbAttributeValue::fromBool(false), OmbAttributeValue::fromBool(true));
    EXPECT_FALSE(OmbAttributeValue() < OmbAttributeValue());
    EXPECT_EQ(Omb_attributeValuesCompare(OmbAttributeValue(2.0), OmbAttributeValue(1.0)), 1);
    EXPECT_EQ(Omb_attributeValuesCompare(OmbAttributeValue(1.0), OmbAttributeValue(2.0)), -1);
    OmbAttributeValue s(OmbString("text"));
    OmbAttributeValue copy = s;
    s = OmbAttributeValue(3.5);
    EXPECT_EQ(copy.asString(), OmbString("text"));
    copy.swap(s);
    EXPECT_EQ(copy.asDouble(), 3.5);
    EXPECT_EQ(s.asString(), OmbString("text"));
}

TEST(AttributeSet, TypedReadsAndGrowth) {
    const auto set = newSet();
    set->set(depth, 12.5);
    set->set(name, OmbString("Quay"));
    set->set(kind, 4UL);
    double d = 0;
    std::int64_t i = 99;
    EXPECT_TRUE(set->get(depth, d));
    EXPECT_EQ(d, 12.5);
    EXPECT_FALSE(set->get(depth, i)) << "no conversion between tags";
    EXPECT_EQ(i, 99);
    unsigned long atom = 0;
    EXPECT_TRUE(set->get(kind, atom));
    EXPECT_EQ(atom, 4UL);
    for (int k = 0; k < 6; ++k) set->set(OmbAtoms::atom(OmbString("extra" + std::to_string(k))), std::int64_t{k});
    EXPECT_EQ(set->capacity(), 16u) << "the ninth attribute grows the table by 8";
    EXPECT_EQ(set->size(), 9u);
    const auto keys = set->keys();
    EXPECT_EQ(keys[0], static_cast<OmbAtom>(depth));
    EXPECT_EQ(keys[2], static_cast<OmbAtom>(kind));
}

TEST(AttributeSet, HolesAreReusedAndKeysStayUnique) {
    const auto set = newSet();
    set->set(depth, 1.0);
    set->set(name, OmbString("a"));
    set->set(kind, std::int64_t{3});
    EXPECT_TRUE(set->remove(depth));
    EXPECT_FALSE(set->remove(depth));
    set->set(name, OmbString("b"));  // replaces in place
    EXPECT_EQ(set->size(), 2u);
    set->set(depth, 2.0);  // slot 2 (index count) is taken: the first hole
    EXPECT_EQ(set->keys(), (std::vector<OmbAtom>{depth, name, kind}));
    set->setBool(OmbAtoms::atom(OmbString("lit")), true);
    EXPECT_EQ(set->size(), 4u);
}

TEST(AttributeSet, ClonesAreIsolatedInBothDirections) {
    const auto a = newSet();
    a->set(depth, 1.0);
    const OmbRef<OmbAttributeSet> b(a->clone());
    EXPECT_TRUE(OmbAttributeSet::compare(*a, *b));
    b->set(depth, 2.0);
    a->set(name, OmbString("only a"));
    double d = 0;
    EXPECT_TRUE(a->get(depth, d));
    EXPECT_EQ(d, 1.0);
    EXPECT_FALSE(b->containsKey(name));
    const OmbRef<OmbAttributeSet> c(b->clone());
    c->remove(depth);
    EXPECT_TRUE(b->containsKey(depth));
}

TEST(AttributeSet, AFeatureKeepsItsGeoType) {
    const auto set = newSet();
    const OmbAtom line = OmbAtoms::atom(OmbString("line"));
    ASSERT_TRUE(set->takeOwnership(OmbAttributeSet::FeatureOwner, line));
    EXPECT_FALSE(set->takeOwnership(OmbAttributeSet::LayerInfoOwner));
    set->set(OmbAttributeSet::geoTypeKey, 7UL);
    EXPECT_FALSE(set->remove(OmbAttributeSet::geoTypeKey));
    set->set(depth, 3.0);
    set->clear();
    unsigned long geoType = 0;
    EXPECT_TRUE(set->get(OmbAttributeSet::geoTypeKey, geoType));
    EXPECT_EQ(geoType, line);
    EXPECT_EQ(set->size(), 1u);

    const auto other = newSet();
    other->set(OmbAttributeSet::geoTypeKey, 9UL);
    other->set(depth, 4.0);
    set->assign(*other);
    EXPECT_TRUE(set->get(OmbAttributeSet::geoTypeKey, geoType));
    EXPECT_EQ(geoType, line);
    EXPECT_TRUE(OmbAttributeSet::compare(*set, *other)) << "geoType values are ignored";
    EXPECT_FALSE(OmbAttributeSet::compare(*set, *other, true));
    set->releaseOwnership();
    EXPECT_FALSE(set->isOwned());
}

TEST(AttributeSet, ReadOnlySetsRefuseEveryChange) {
    const auto set = newSet();
    set->set(depth, 1.0);
    set->markReadOnly();
    for (const auto& change : std::vector<std::function<void()>>{
             [&] { set->set(depth, 2.0); }, [&] { set->remove(depth); }, [&] { set->clear(); },
             [&] { set->assign(*newSet()); }, [&] { set->merge(*newSet()); },
             [&] { set->mergeSubset({depth}, *newSet()); }}) {
        try {
            change();
            ADD_FAILURE() << "a read-only set changed";
        } catch (const OmbXReadOnly& e) {
            EXPECT_EQ(e.asString(), OmbString("The AttributeSet is read-only."));
        }
    }
    EXPECT_EQ(set->size(), 1u);
}

TEST(AttributeSet, MergeAndSubsets) {
    const auto a = newSet();
    a->set(depth, 1.0);
    const auto b = newSet();
    b->set(depth, 2.0);
    b->set(name, OmbString("b"));
    b->set(kind, std::int64_t{1});
    a->merge(*b);
    EXPECT_EQ(a->size(), 3u);
    const auto c = newSet();
    EXPECT_TRUE(c->mergeSubset({name, OmbAtoms::atom(OmbString("absent"))}, *b));
    EXPECT_FALSE(c->mergeSubset({OmbAtoms::atom(OmbString("absent"))}, *b));
    EXPECT_EQ(c->keys(), std::vector<OmbAtom>{name});
}

TEST(AttributeSet, SizesAndDump) {
    const auto set = newSet();
    EXPECT_EQ(set->memoryPressure(), 40u + 4u * (8 + 48));
    set->set(name, OmbString("Quay"));
    set->set(depth, 2.5);
    set->setBool(kind, false);
    EXPECT_EQ(set->sizeOf(), 44u + 16 + 4 + 16 + 16);
    const auto lines = set->dumpLines();
    ASSERT_EQ(lines.size(), 8u);
    EXPECT_TRUE(lines[0].startsWith(OmbString("OmbAttributeSet: 0x")));
    EXPECT_FALSE(lines[0].startsWith(OmbString("OmbAttributeSet: 0x0x")));
    EXPECT_EQ(lines[1], OmbString("  size: 3"));
    EXPECT_EQ(lines[2], OmbString("  capacity: 8"));
    EXPECT_EQ(lines[3], OmbString("  values: ["));
    EXPECT_EQ(lines[4], OmbString("    { name, String, \"Quay\" }"));
    EXPECT_EQ(lines[5], OmbString("    { depth, Double, 2.500000 }"));
    EXPECT_EQ(lines[6], OmbString("    { kind, Bool, false }"));
    EXPECT_EQ(lines[7], OmbString("  ]"));
}

TEST(AttributeSetList, TheTopOfTheStackWins) {
    OmbAttributeSetList list;
    std::vector<OmbRef<OmbAttributeSet>> sets;
    for (int level = 0; level < 7; ++level) {
        sets.push_back(newSet());
        sets.back()->set(depth, static_cast<double>(level));
        if (level == 2) sets.back()->set(name, OmbString("level 2"));
        list.push(sets.back());
    }
    double d = -1;
    EXPECT_TRUE(list.get(depth, d));
    EXPECT_EQ(d, 6.0);  // from the overflow vector
    OmbString n;
    EXPECT_TRUE(list.get(name, n));
    list.pop();
    list.pop();
    list.pop();
    EXPECT_TRUE(list.get(depth, d));
    EXPECT_EQ(d, 3.0);
    OmbAttributeSet flat;
    list.flatten(flat);
    double top = 0;
    EXPECT_TRUE(flat.get(depth, top));
    EXPECT_EQ(top, 3.0);
    const OmbReadOnlyAttributes view(list);
    EXPECT_TRUE(view.containsKey(name));
    EXPECT_FALSE(OmbReadOnlyAttributes().containsKey(name));
    EXPECT_TRUE(OmbReadOnlyAttributes(sets[0]).containsKey(depth));
}
