#include <oecore/core/exception.h>

#include <gtest/gtest.h>

#include <cerrno>
#include <set>
#include <string>

TEST(Exception, ArgumentsFillTheTemplateInOrder) {
    const OmbXRangeError e(__FILE__, __LINE__, OmbString("12"), OmbString("Zone"), OmbString("1 to 60"));
    EXPECT_EQ(e.id(), OmbString("RangeError"));
    EXPECT_EQ(e.asString(), OmbString("Value \"12\" is out of range in Zone, should be 1 to 60."));
    EXPECT_EQ(e.line(), __LINE__ - 3);
    EXPECT_STREQ(e.file(), __FILE__);
}

TEST(Exception, LaterPassesExpandPlaceholdersInsertedByEarlierOnes) {
    // $2 inside the first argument is filled by the second pass; $1 inside
    // the first argument is not expanded again.
    const OmbXIllegalValue e(__FILE__, __LINE__, OmbString("a$2b$1"), OmbString("X"));
    EXPECT_EQ(e.asString(), OmbString("Value \"aXb$1\" is illegal in X"));
}

TEST(Exception, MissingArgumentsLeaveEmptyText) {
    const OmbXNotSupported e(__FILE__, __LINE__);
    EXPECT_EQ(e.asString(), OmbString(" is not supported."));
    EXPECT_EQ(OmbXAbort(__FILE__, __LINE__).asString(), OmbString("Execution aborted!"));
}

TEST(Exception, WindowFunctionErrorRendersTheErrorCode) {
    const OmbXWindowFunctionError e(__FILE__, __LINE__, OmbString("open"), OmbString("loader"), ENOENT);
    const std::string text = e.asString();
    EXPECT_NE(text.find("Window function open failed in loader."), std::string::npos) << text;
    EXPECT_NE(text.find("No such file or directory"), std::string::npos) << text;
}

TEST(Exception, ThrowMacroRecordsTheThrowSite) {
    try {
        OMB_THROW(SharingViolation, OmbString("item"));
    } catch (const OmbException& e) {
        EXPECT_EQ(e.asString(), OmbString("The item is owned by another object."));
        EXPECT_GT(e.line(), 0);
    }
}

// Every class of the family: its id is its name, ids are unique, and its
// template uses no placeholder beyond $3 and fills completely.
TEST(Exception, EveryClassOfTheFamilyIsWellFormed) {
    std::set<std::string> ids;
    int count = 0;
    auto check = [&](const OmbException& e, const char* name) {
        ++count;
        EXPECT_EQ(e.id(), OmbString(name));
        EXPECT_TRUE(ids.insert(std::string(e.id())).second) << name;
        EXPECT_FALSE(e.defaultMessage().empty()) << name;
        const OmbString text = e.asString();
        EXPECT_FALSE(text.contains(OmbString("$"))) << name << ": " << text;
    };
#define OMB_EXCEPTION(ID, TEMPLATE) check(OmbX##ID(__FILE__, __LINE__, "a", "b", "c"), #ID);
#define OMB_EXCEPTION_WITH_CODE(ID, TEMPLATE) OMB_EXCEPTION(ID, TEMPLATE)
#include <oecore/core/exceptionlist.h>
#undef OMB_EXCEPTION
#undef OMB_EXCEPTION_WITH_CODE
    EXPECT_EQ(count, 202);
}
