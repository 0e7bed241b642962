#include <oecore/core/class.h>
#include <oecore/core/enumerator.h>

#include <gtest/gtest.h>

#include "testobjects.h"

namespace {

std::vector<OmbString> names(const OmbRef<OmbEngineObjectVec>& objects) {
    std::vector<OmbString> out;
    for (const OmbRef<OmbEngineObject>& o : *objects) out.push_back(omb_dynamic_cast<TestNode>(o)->name());
    return out;
}

OmbRef<TestNode> node(const char* name, std::vector<OmbRef<TestNode>> children = {}) {
    OmbRef<TestNode> n(new TestNode(name));
    n->children = std::move(children);
    return n;
}

template <int>
struct Fresh : OmbEngineObject {
    OMB_ENGINE_CLASS_INLINE(OmbEngineObject, "Fresh", 0)

public:
    Fresh* clone() const override { return new Fresh; }
};

}  // namespace

TEST(ClassId, AssignedOnceInAskingOrderFromOneCounter) {
    const int first = Fresh<1>::classId();
    const int second = Fresh<2>::classId();
    EXPECT_GE(first, 1);
    EXPECT_EQ(second, first + 1);
    EXPECT_EQ(Fresh<1>::classId(), first);
    OmbRef<OmbEngineObject> object(new Fresh<2>);
    EXPECT_EQ(object->myClassId(), second);
}

TEST(RuntimeClass, RecordsChainUpToTheEngineObject) {
    OmbRef<OmbEngineObject> n(node("n"));
    const OmbClass* record = n->myRuntimeClass();
    EXPECT_EQ(record, TestNode::runtimeClass());
    EXPECT_EQ(record->plugin(), 9);
    EXPECT_EQ(record->baseClass(), OmbResourceObject::runtimeClass());
    EXPECT_EQ(record->baseClass()->baseClass(), OmbEngineObject::runtimeClass());
    EXPECT_EQ(OmbEngineObject::runtimeClass()->baseClass(), nullptr);
    EXPECT_TRUE(n->isA(OmbResourceObject::runtimeClass()));
    EXPECT_FALSE(n->isA(OmbEngineObjectEnumerator::runtimeClass()));
    EXPECT_STREQ(n->myRuntimeClassName(), "TestNode");

    const std::vector<OmbClass*> all = OmbClass::all();
    EXPECT_NE(std::find(all.begin(), all.end(), OmbChildObjectEnumerator::runtimeClass()), all.end());
}

TEST(Plugins, NamesAndModulesComeFromTheTable) {
    EXPECT_EQ(pluginName(1), OmbString("DataSets"));
    EXPECT_EQ(pluginName(13), OmbString("Catalog"));
    EXPECT_EQ(pluginName(10), OmbString("Unknown plugin"));
    EXPECT_EQ(pluginName(0), OmbString("Unknown plugin"));
    EXPECT_EQ(pluginName(99), OmbString("Unknown plugin"));
    EXPECT_EQ(pluginLibName(OmbString("Ogc")), OmbString("OEOgc"));
    EXPECT_TRUE(pluginLibName(OmbString("Nope")).empty());
}

TEST(ChildObjects, TopLevelReportsASharedChildOnce) {
    OmbRef<TestNode> shared = node("shared", {node("grandchild")});
    OmbRef<TestNode> root = node("root", {shared, shared, node("other")});
    EXPECT_EQ(names(root->getChildObjects(OmbChildObjectMode::TopLevel)), (std::vector<OmbString>{"shared", "other"}));
}

TEST(ChildObjects, AllLevelsIsBreadthFirstAndSurvivesCycles) {
    OmbRef<TestNode> a = node("a", {node("a1"), node("a2")});
    OmbRef<TestNode> b = node("b", {node("b1", {node("b11")})});
    OmbRef<TestNode> root = node("root", {a, b});
    EXPECT_EQ(names(root->getChildObjects(OmbChildObjectMode::AllLevels)),
              (std::vector<OmbString>{"a", "b", "a1", "a2", "b1", "b11"}));

    // A child referring back to its parent ends the walk, each object once.
    a->children.push_back(root);
    const auto found = names(root->getChildObjects(OmbChildObjectMode::AllLevels));
    EXPECT_EQ(std::count(found.begin(), found.end(), OmbString("root")), 1);
    EXPECT_EQ(found.size(), 7u);
    a->children.pop_back();  // break the cycle so the nodes can go
}

TEST(ChildObjects, FindChildObjectLooksAsDeepAsAsked) {
    OmbRef<TestNode> root = node("root", {node("a", {node("deep")})});
    EXPECT_FALSE(root->findChildObject(OmbString("deep"), OmbChildObjectMode::TopLevel));
    OmbRef<OmbEngineObject> deep = root->findChildObject(OmbString("deep"), OmbChildObjectMode::AllLevels);
    ASSERT_TRUE(deep);
    EXPECT_EQ(omb_dynamic_cast<TestNode>(deep)->name(), OmbString("deep"));
    EXPECT_FALSE(root->findChildObject(OmbString("root"), OmbChildObjectMode::AllLevels));
    EXPECT_FALSE(root->findChildObject(OmbString(), OmbChildObjectMode::AllLevels));
}

TEST(Clone, SafeCloneCopiesAndUnclonableClassesSaySo) {
    OmbRef<TestNode> original = node("n", {node("c")});
    OmbRef<OmbEngineObject> copy = original->safeClone();
    ASSERT_TRUE(copy);
    EXPECT_NE(copy.get(), original.get());
    EXPECT_EQ(copy->refCount(), 1);
    EXPECT_EQ(omb_dynamic_cast<TestNode>(copy)->children.size(), 1u);

    OmbRef<Unclonable> fixed(new Unclonable);
    try {
        fixed->safeClone();
        FAIL() << "clone of an unclonable class succeeded";
    } catch (const OmbXObjectNotClonable& e) {
        EXPECT_EQ(e.asString(), OmbString("Objects of type Unclonable can not be cloned."));
    }
}

TEST(Enumerator, WalksACollectionFromBeforeTheFirstItem) {
    OmbRef<OmbEngineObjectVec> items(new OmbEngineObjectVec);
    items->add(node("x"));
    items->add(node("y"));
    OmbRef<OmbEngineObjectEnumerator> e = OmbEngineObjectEnumerator::create(items);
    EXPECT_FALSE(e->current());
    ASSERT_TRUE(e->moveNext());
    EXPECT_EQ(e->current().get(), items->get(0).get());
    ASSERT_TRUE(e->moveNext());
    EXPECT_EQ(e->current().get(), items->get(1).get());
    EXPECT_FALSE(e->moveNext());
    EXPECT_FALSE(e->moveNext());
    EXPECT_FALSE(e->current());
    e->reset();
    ASSERT_TRUE(e->moveNext());
    EXPECT_EQ(e->current().get(), items->get(0).get());
}
