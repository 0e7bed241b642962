// OmbExpression: the expression language of conditions and computed styles.
//
// An expression is parsed once into an immutable tree and evaluated per
// feature against its attributes. Values are attribute values; a missing
// attribute, a wrong type or a division by zero gives null, never an error.
//
// Thread safety: an expression may be evaluated on many threads at once.
#pragma once

#include <oecore/attr/attributesetlist.h>
#include <oecore/attr/attributevalue.h>
#include <oecore/core/ref.h>
#include <oecore/core/refcnt.h>

#include <cstdint>
#include <set>
#include <vector>

class OmbExpression : public OmbRefCnt {
public:
    enum ExpressionType {
        Constant = 0,
        Attribute = 1,
        AttributeByName = 2,
        Add = 3,
        Subtract = 4,
        Multiply = 5,
        Divide = 6,
        Remainder = 7,
        Conditional = 8,
        Equal = 9,
        NotEqual = 10,
        Less = 11,
        LessOrEqual = 12,
        Greater = 13,
        GreaterOrEqual = 14,
        And = 15,
        Or = 16,
        Not = 17,
        Sequence = 18,
        Negate = 19,
        Substring = 20,
        Length = 21,
        Like = 22,
        Contains = 23,
        Rand = 24,
        In = 25,
        Keyword = 26,
        BoundingBox = 27,
        ToInt = 28,
        ToDouble = 29,
        ToString = 30,
        ToBool = 31,
        ToAtom = 32,
    };

    // Trees nest at most this deep; deeper text is a parse error.
    static constexpr int maximumDepth = 500;

    // Throws OmbXExpressionParseError with the byte position of the problem.
    static OmbRef<OmbExpression> parse(const OmbString& text);

    explicit OmbExpression(const OmbAttributeValue& constant);
    // A reference to the attribute named by the atom.
    explicit OmbExpression(OmbAtom key);
    OmbExpression(ExpressionType type, OmbRef<OmbExpression> a = OmbRef<OmbExpression>(),
                  OmbRef<OmbExpression> b = OmbRef<OmbExpression>(), OmbRef<OmbExpression> c = OmbRef<OmbExpression>());
    OmbExpression(ExpressionType type, OmbRef<OmbExpression> first, std::vector<OmbRef<OmbExpression>> list);
    OmbExpression(const OmbExpression& other);

    // True when the result is not null. seed, when given, drives rand().
    bool evaluate(const OmbReadOnlyAttributes& attributes, OmbAttributeValue& out, unsigned int* seed = nullptr) const;
    // The result converted as int(), double() or string() would; false for null.
    bool evaluate(const OmbReadOnlyAttributes& attributes, std::int64_t& out, unsigned int* seed = nullptr) const;
    bool evaluate(const OmbReadOnlyAttributes& attributes, double& out, unsigned int* seed = nullptr) const;
    bool evaluate(const OmbReadOnlyAttributes& attributes, OmbString& out, unsigned int* seed = nullptr) const;

    // Whether rand() occurs in the node or its three children.
    bool usesRand() const;
    // Adds the keys of every attribute reference in the tree.
    void dependents(std::set<OmbAtom>& keys) const;

    ExpressionType type() const noexcept { return type_; }
    const OmbAttributeValue& value() const noexcept { return value_; }
    OmbAtom key() const noexcept { return key_; }
    const OmbRef<OmbExpression>& child(int index) const { return children_[index]; }
    const std::vector<OmbRef<OmbExpression>>& list() const noexcept { return list_; }
    // The longest path to a leaf, counting this node.
    int depth() const noexcept { return depth_; }

private:
    void eval(const OmbReadOnlyAttributes& attributes, OmbAttributeValue& out, unsigned int* seed) const;

    ExpressionType type_;
    OmbAttributeValue value_;
    OmbAtom key_ = 0;
    OmbRef<OmbExpression> children_[3];
    std::vector<OmbRef<OmbExpression>> list_;
    int depth_ = 1;
};

// The conversions of int(), double(), string(), bool() and atom(); each
// leaves out null when the value does not convert.
void Omb_toInt(const OmbAttributeValue& in, OmbAttributeValue& out);
void Omb_toDouble(const OmbAttributeValue& in, OmbAttributeValue& out);
void Omb_toString(const OmbAttributeValue& in, OmbAttributeValue& out);
bool Omb_truthiness(const OmbAttributeValue& value);
