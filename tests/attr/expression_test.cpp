#include <oecore/attr/attributeusage.h>
#include <oecore/attr/condition.h>
#include <oecore/attr/expression.h>
#include <oecore/config/configuration.h>
#include <oecore/core/exception.h>

#include <gtest/gtest.h>

#include <array>
#include <string>
#include <utility>

#include "../errortext.h"

namespace {

OmbRef<OmbAttributeSet> feature() {
    OmbRef<OmbAttributeSet> set(new OmbAttributeSet);
    set->set(OmbAtoms::atom(OmbString("class")), std::int64_t{2});
    set->setBool(OmbAtoms::atom(OmbString("bridge")), false);
    set->set(OmbAtoms::atom(OmbString("name")), OmbString("Main Road"));
    set->set(OmbAtoms::atom(OmbString("x")), 0.0);
    set->set(OmbAtoms::atom(OmbString("keywords")), OmbString("Road.Main, harbour ,\tQuay"));
    set->set(OmbAtoms::atom(OmbString("extentWest")), 10.0);
    set->set(OmbAtoms::atom(OmbString("extentSouth")), 50.0);
    set->set(OmbAtoms::atom(OmbString("extentEast")), 11.0);
    set->set(OmbAtoms::atom(OmbString("extentNorth")), 51.0);
    return set;
}

OmbAttributeValue eval(const std::string& text) {
    OmbAttributeValue out;
    OmbExpression::parse(OmbString(text))->evaluate(OmbReadOnlyAttributes(feature()), out);
    return out;
}

// The value and its type, as "type:value".
std::string show(const OmbAttributeValue& v) {
    if (v.is_singular()) return "null";
    OmbAttributeValue text;
    Omb_toString(v, text);
    return std::string(Omb_attributeTypeName(v.type())) + ":" +
           (text.is_singular() ? "" : std::string(text.asString().view()));
}

std::string result(const std::string& text) { return show(eval(text)); }

std::string parseError(const std::string& text) {
    return errorOf([&] { OmbExpression::parse(OmbString(text)); });
}

// One operand of each value type: null, integer, double, string, bool, atom.
const std::array<const char*, 6> operands = {"null", "7", "2.5", "\"ab\"", "true", "#a"};
// Which of them count as true for "and", "or" and ",".
const std::array<bool, 6> truthy = {false, true, true, true, true, false};

std::string apply(std::size_t left, const char* op, std::size_t right) {
    return result(std::string("(") + operands[left] + ") " + op + " (" + operands[right] + ")");
}

std::string boolean(bool b) { return b ? "bool:true" : "bool:false"; }

}  // namespace

TEST(Expression, ArithmeticTakesTwoNumbersOrTwoStringsToJoin) {
    // The results for 7 and 7, 7 and 2.5, 2.5 and 7, 2.5 and 2.5.
    const std::pair<const char*, std::array<const char*, 4>> numeric[] = {
        {"+", {"14", "9.5", "9.5", "5.0"}},
        {"-", {"0", "4.5", "-4.5", "0.0"}},
        {"*", {"49", "17.5", "17.5", "6.25"}},
        {"/", {"1", "2.8", "0.35714285714285715", "1.0"}},
        {"%", {"0", "2.0", "2.5", "0.0"}}};
    for (const auto& [op, results] : numeric)
        for (std::size_t i = 0; i < operands.size(); ++i)
            for (std::size_t j = 0; j < operands.size(); ++j) {
                const bool numbers = (i == 1 || i == 2) && (j == 1 || j == 2);
                const bool strings = std::string(op) == "+" && i == 3 && j == 3;
                const std::string expected = numbers   ? result(results[2 * (i - 1) + (j - 1)])
                                             : strings ? "String:abab"
                                                       : "null";
                EXPECT_EQ(apply(i, op, j), expected) << operands[i] << " " << op << " " << operands[j];
            }
}

TEST(Expression, ComparisonsAndLogicOfEveryPairOfTypes) {
    // Null sorts first; only numbers order across types; atoms are unordered.
    const char* less[] = {"011111", "000000", "010000", "000000", "000000", "000000"};
    const char* lessOrEqual[] = {"111111", "010000", "011000", "000100", "000010", "000000"};
    for (std::size_t i = 0; i < operands.size(); ++i)
        for (std::size_t j = 0; j < operands.size(); ++j) {
            SCOPED_TRACE(std::string(operands[i]) + " and " + operands[j]);
            EXPECT_EQ(apply(i, "=", j), boolean(i == j));
            EXPECT_EQ(apply(i, "!=", j), boolean(i != j));
            EXPECT_EQ(apply(i, "<", j), boolean(less[i][j] == '1'));
            EXPECT_EQ(apply(i, ">", j), boolean(less[j][i] == '1'));
            EXPECT_EQ(apply(i, "<=", j), boolean(lessOrEqual[i][j] == '1'));
            EXPECT_EQ(apply(i, ">=", j), boolean(lessOrEqual[j][i] == '1'));
            EXPECT_EQ(apply(i, "and", j), boolean(truthy[i] && truthy[j]));
            EXPECT_EQ(apply(i, "or", j), boolean(truthy[i] || truthy[j]));
            EXPECT_EQ(apply(i, ",", j), result(truthy[i] ? operands[i] : operands[j]));
        }
}

TEST(Expression, ArithmeticEdges) {
    EXPECT_EQ(result("1 + 2"), "int:3");
    EXPECT_EQ(result("\"a\" + 1"), "null");
    EXPECT_EQ(result("7 / 2"), "int:3");
    EXPECT_EQ(result("-7 / 2"), "int:-3");
    EXPECT_EQ(result("7 % -2"), "int:1");
    EXPECT_EQ(result("7 / 0"), "null");
    EXPECT_EQ(result("7.0 / 0"), "null");
    EXPECT_EQ(result("9223372036854775807 + 1"), "int:-9223372036854775808");
    EXPECT_EQ(result("(0 - 9223372036854775807 - 1) / -1"), "int:-9223372036854775808");
    // Integers beyond 2^53 compare exactly with each other.
    EXPECT_EQ(result("9007199254740993 = 9007199254740992"), "bool:false");
    EXPECT_EQ(result("9007199254740993 = 9007199254740992.0"), "bool:true");
}

TEST(Expression, NullsAtomsAndLogic) {
    EXPECT_EQ(result("null < 1"), "bool:true");
    EXPECT_EQ(result("1 < null"), "bool:false");
    EXPECT_EQ(result("null <= null"), "bool:true");
    EXPECT_EQ(result("null = null"), "bool:true");
    EXPECT_EQ(result("#a < #b"), "bool:false");
    EXPECT_EQ(result("#a = #a"), "bool:true");
    EXPECT_EQ(result("missing, \"none\""), "String:none");
    EXPECT_EQ(result("name, \"none\""), "String:Main Road");
    EXPECT_EQ(result("0, 5"), "int:5");
    EXPECT_EQ(result("class = 2 and not bridge"), "bool:true");
    EXPECT_EQ(result("if x then 1 else 2, 3"), "int:2");
    EXPECT_EQ(result("3 in (1, 2, 3)"), "bool:true");
    EXPECT_EQ(result("3 in (3.0)"), "bool:false");
    EXPECT_EQ(result("3 in ()"), "bool:false");
    EXPECT_EQ(result("attribute(\"class\") + attribute(#class)"), "int:4");
    EXPECT_EQ(result("length"), "null");
}

TEST(Expression, Functions) {
    EXPECT_EQ(result("substr(\"abcdef\", 2)"), "String:cdef");
    EXPECT_EQ(result("substr(\"abcdef\", 2, 2)"), "String:cd");
    EXPECT_EQ(result("substr(\"abc\", 5, 1)"), "String:");
    EXPECT_EQ(result("substr(\"abc\", 1.0)"), "null");
    EXPECT_EQ(result("substr(\"abc\", 1, -5)"), "String:");
    EXPECT_EQ(result("length(\"K\xC3\xB8"
                     "benhavn \xF0\x9F\x97\xBA\")"),
              "int:12");
    EXPECT_EQ(result("substr(\"\xC3\xB8"
                     "a\", 1)"),
              "String:a");
    EXPECT_EQ(result("like(name, \"*road\")"), "bool:false");
    EXPECT_EQ(result("like(name, \"*road\", false)"), "bool:true");
    EXPECT_EQ(result("like(name, \"M?in*\")"), "bool:true");
    EXPECT_EQ(result("contains(\"a, b ,c\", \"b\")"), "bool:true");
    EXPECT_EQ(result("contains(\"a, b ,c\", \"d\")"), "bool:false");
    EXPECT_EQ(result("keyword(\"main\", \"road\")"), "bool:true");
    EXPECT_EQ(result("keyword(\"quay\")"), "bool:true");
    EXPECT_EQ(result("keyword(\"quay\", null, true)"), "bool:false");
    EXPECT_EQ(result("boundingbox(11, 51, 12, 52)"), "bool:true");
    EXPECT_EQ(result("boundingbox(11.5, 51, 12, 52)"), "bool:false");
    EXPECT_EQ(result("int(2.5)"), "int:2");
    EXPECT_EQ(result("int(3.5)"), "int:4");
    EXPECT_EQ(result("int(-2.5)"), "int:-2");
    EXPECT_EQ(result("int(\"42abc\")"), "int:42");
    EXPECT_EQ(result("double(\"x\")"), "double:0");
    EXPECT_EQ(result("string(true)"), "String:true");
    EXPECT_EQ(result("string(#quay)"), "String:quay");
    EXPECT_EQ(result("bool(#x)"), "bool:false");
    EXPECT_EQ(result("atom(\"quay\") = #quay"), "bool:true");
    const OmbRef<OmbExpression> random = OmbExpression::parse(OmbString("rand() + 0"));
    EXPECT_TRUE(random->usesRand());
    unsigned int seed = 1;
    OmbAttributeValue first;
    random->evaluate(OmbReadOnlyAttributes(), first, &seed);
    EXPECT_DOUBLE_EQ(first.asDouble(), 41 / 32767.0);  // the first number of the congruence from state 1
    std::set<OmbAtom> keys;
    OmbExpression::parse(OmbString("a + b in (c, attribute(\"d\"))"))->dependents(keys);
    EXPECT_EQ(keys.size(), 3u);
}

TEST(Expression, ParseErrorsCarryTheirPosition) {
    EXPECT_EQ(parseError(""), "Error parsing expression '', position 0: Empty expression");
    EXPECT_EQ(parseError("   "), "Error parsing expression '   ', position 0: Empty expression");
    EXPECT_EQ(parseError("a b"), "Error parsing expression 'a b', position 2: Expected end of string");
    EXPECT_EQ(parseError("f(1)"), "Error parsing expression 'f(1)', position 0: Unknown keyword 'f'.");
    EXPECT_EQ(parseError("if a 1"), "Error parsing expression 'if a 1', position 5: Expected 'then'");
    EXPECT_EQ(parseError("if a then 1"), "Error parsing expression 'if a then 1', position 11: Expected 'else'");
    EXPECT_EQ(parseError("(1"), "Error parsing expression '(1', position 2: Expected ')'");
    EXPECT_EQ(parseError("substr(\"a\" 1)"), "Error parsing expression 'substr(\"a\" 1)', position 11: Expected ','");
    EXPECT_EQ(parseError("1 in (2 3)"), "Error parsing expression '1 in (2 3)', position 8: Expected ',' or ')'");
    EXPECT_EQ(parseError("not not a"), "Error parsing expression 'not not a', position 4: Unexpected token");
    EXPECT_EQ(parseError("--1"), "Error parsing expression '--1', position 1: Unexpected token");
    EXPECT_EQ(parseError("1 < 2 < 3"), "Error parsing expression '1 < 2 < 3', position 6: Expected end of string");
    EXPECT_EQ(parseError("a ! b"), "Error parsing expression 'a ! b', position 2: Expected end of string");
    EXPECT_EQ(parseError("\"open"), "Error parsing expression '\"open', position 0: Unexpected token");
    EXPECT_NE(
        parseError(std::string(100000, '(') + "1" + std::string(100000, ')')).find("Expression nested too deeply"),
        std::string::npos);
    std::string chain = "1";
    for (int i = 0; i < 1000; ++i) chain += " + 1";
    EXPECT_NE(parseError(chain).find("Expression nested too deeply"), std::string::npos);
    EXPECT_EQ(result("AND"), "null") << "keywords are case-sensitive: AND is an attribute";
}

TEST(Condition, OnlyTheBoolTrueHolds) {
    const OmbRef<OmbAttributeSet> f = feature();
    EXPECT_TRUE(OmbCondition(OmbString("class = 2")).eval(f));
    EXPECT_FALSE(OmbCondition(OmbString("class")).eval(f));
    EXPECT_FALSE(OmbCondition(OmbString("name")).eval(f));
    EXPECT_THROW(OmbCondition(OmbString("class =")), OmbXExpressionParseError);
    const OmbAtom odd = OmbAtoms::atom(OmbString("say \"hi\" \\ there"));
    f->set(odd, std::int64_t{1});
    EXPECT_TRUE(OmbCondition::isNotNull(odd)->eval(f));
    EXPECT_FALSE(OmbCondition::isNull(odd)->eval(f));
    EXPECT_TRUE(OmbCondition::isNull(OmbAtoms::atom(OmbString("absent")))->eval(f));
}

TEST(Condition, ReadsFromConfigurationsAndFailsTheLoadWhenBad) {
    const auto c = OmbXmlParser::loadString(OmbString("<Configuration Namespace='D'><Condition Name='C' Public='true' "
                                                      "Expression='class &lt; 3'/></Configuration>"),
                                            {}, OmbDataSetInitialization::Delayed, {});
    const auto condition = omb_dynamic_cast<OmbCondition>(c->getPublicObject(OmbString("C")));
    ASSERT_TRUE(condition);
    EXPECT_TRUE(condition->eval(feature()));
    EXPECT_NE(condition->save().find(OmbString("Expression=\"class &lt; 3\"")), -1);
    EXPECT_EQ(errorOf([] {
                  OmbXmlParser::loadString(
                      OmbString("<Configuration Namespace='D'><Condition Expression='1 +'/></Configuration>"), {},
                      OmbDataSetInitialization::Delayed, {});
              }),
              "Error parsing expression '1 +', position 3: Unexpected token Row 1, Column 30.");
}

TEST(AttributeUsage, ListsPairsInOrderWithoutMerging) {
    OmbRef<OmbCondition> deep(new OmbCondition(OmbString("depth > 10")));
    OmbAttributeUsage usage;
    const OmbAtom depth = OmbAtoms::atom(OmbString("depth"));
    usage.addItem(depth, deep);
    usage.addItem(depth, deep);
    usage.addItem(OmbAtoms::atom(OmbString("name")));
    EXPECT_EQ(usage.count(), 3u);
    OmbAtom key = 0;
    OmbRef<OmbCondition> condition;
    usage.getItem(2, key, condition);
    EXPECT_FALSE(condition);
    std::vector<OmbAtom> keys;
    usage.getUsedAttributes(keys);
    EXPECT_EQ(keys.size(), 3u);
    OmbAttributeUsage same;
    same.addItem(depth, deep);
    EXPECT_FALSE(same == usage);
    same.addItem(depth, deep);
    same.addItem(OmbAtoms::atom(OmbString("name")));
    EXPECT_TRUE(same == usage);
}
