#include <oecore/core/stringutils.h>

#include <gtest/gtest.h>

#include <sstream>

using namespace OmbStringUtils;

namespace {

std::vector<OmbString> pieces(std::initializer_list<const char*> texts) {
    std::vector<OmbString> out;
    for (const char* t : texts) out.emplace_back(t);
    return out;
}

}  // namespace

TEST(StringUtils, SplitKeepsEmptyPieces) {
    std::vector<OmbString> out{OmbString("stale")};
    split(OmbString("a,,b"), ',', out);
    EXPECT_EQ(out, pieces({"a", "", "b"}));
    split(OmbString("A="), '=', out);
    EXPECT_EQ(out, pieces({"A", ""}));
    split(OmbString(), ',', out);
    EXPECT_EQ(out, pieces({""}));
    split(OmbString("k := v ; w"), pieces({":=", ";"}), out);
    EXPECT_EQ(out, pieces({"k ", " v ", " w"}));
}

TEST(StringUtils, StripRemovesRunsAtTheChosenEnds) {
    EXPECT_EQ(strip(OmbString("--a-b--"), '-'), OmbString("a-b"));
    EXPECT_EQ(strip(OmbString("--a--"), '-', true, false), OmbString("a--"));
    EXPECT_EQ(strip(OmbString("--a--"), '-', false, true), OmbString("--a"));
    EXPECT_EQ(strip(OmbString("----"), '-'), OmbString());
    EXPECT_EQ(strip(OmbString(" \t value \n "), whiteSpace()), OmbString("value"));
    EXPECT_EQ(strip(OmbString("<!--x-->"), pieces({"<!--", "-->"})), OmbString("x"));
}

TEST(StringUtils, NumbersFollowTheCRulesWithAPoint) {
    EXPECT_EQ(atoi64(OmbString("  -42abc")), -42);
    EXPECT_EQ(atoi64(OmbString("9223372036854775807")), 9223372036854775807LL);
    EXPECT_EQ(atoi64(OmbString("x1")), 0);
    EXPECT_EQ(atoi64(OmbString()), 0);
    EXPECT_DOUBLE_EQ(atof(OmbString("3.5e2 m")), 350.0);
    EXPECT_DOUBLE_EQ(atof(OmbString("-0.25")), -0.25);
    EXPECT_EQ(itoa(-17), OmbString("-17"));
}

TEST(StringUtils, EqualIgnoringCase) {
    EXPECT_TRUE(isEqualIgnoreCase(OmbString("Meter"), OmbString("METER")));
    EXPECT_TRUE(isEqualIgnoreCase(OmbString("\xC3\xA9t\xC3\xA9"), OmbString("\xC3\x89T\xC3\x89")));
    EXPECT_FALSE(isEqualIgnoreCase(OmbString("Meter"), OmbString("Metre")));
    EXPECT_FALSE(isEqualIgnoreCase(OmbString("a"), OmbString("aa")));
}

TEST(StringUtils, WildcardMatchesTheWholeText) {
    EXPECT_TRUE(wildcardMatch(OmbString("*.px"), OmbString("harbour.px")));
    EXPECT_FALSE(wildcardMatch(OmbString("?.px"), OmbString("ab.px")));
    EXPECT_TRUE(wildcardMatch(OmbString("?.px"), OmbString("a.px")));
    EXPECT_FALSE(wildcardMatch(OmbString("*.px"), OmbString("harbour.pxz")));
    EXPECT_TRUE(wildcardMatch(OmbString("a*b*c"), OmbString("aXbYbZc")));
    EXPECT_FALSE(wildcardMatch(OmbString("a*b*c"), OmbString("aXbYbZ")));
    EXPECT_TRUE(wildcardMatch(OmbString("*"), OmbString()));
    EXPECT_TRUE(wildcardMatch(OmbString(), OmbString()));
    EXPECT_FALSE(wildcardMatch(OmbString(), OmbString("x")));
    EXPECT_FALSE(wildcardMatch(OmbString("*.PX"), OmbString("a.px")));
    EXPECT_TRUE(wildcardMatch(OmbString("**a"), OmbString("bba")));
}

TEST(StringUtils, ReadLineDropsLineEnds) {
    std::istringstream in("first\r\nsecond\n\nlast");
    OmbString line;
    std::vector<OmbString> lines;
    while (readLine(in, line)) lines.push_back(line);
    EXPECT_EQ(lines, pieces({"first", "second", "", "last"}));
}
