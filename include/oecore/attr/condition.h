// OmbCondition: a boolean expression that visualizers, queries and
// attribute usages attach; it holds only when its expression gives the bool
// true (an integer 1 or a non-empty text is not enough).
#pragma once

#include <oecore/attr/expression.h>
#include <oecore/config/classdescription.h>
#include <oecore/core/resourceobject.h>

struct OmbConditionParams {
    OmbString expression;
};

class OmbCondition : public OmbResourceObject {
    OMB_DECLARE_ENGINE_CLASS()
    OMB_DESCRIBED_MEMBERS()

public:
    OmbCondition() = default;
    // Both parse at once: a bad text throws OmbXExpressionParseError.
    explicit OmbCondition(const OmbConditionParams& params) { expression(params.expression); }
    explicit OmbCondition(const OmbString& text) { expression(text); }
    OmbCondition* clone() const override { return new OmbCondition(*this); }

    virtual bool eval(const OmbReadOnlyAttributes& attributes) const;
    bool eval(const OmbRef<OmbAttributeSet>& attributes) const {
        return attributes && eval(OmbReadOnlyAttributes::borrow(*attributes));
    }
    void dependents(std::set<OmbAtom>& keys) const;

    const OmbString& expression() const noexcept { return text_; }
    void expression(const OmbString& text);
    const OmbRef<OmbExpression>& parsed() const noexcept { return parsed_; }

    // Conditions that an attribute is (not) present, whatever its name holds.
    static OmbRef<OmbCondition> isNull(OmbAtom key);
    static OmbRef<OmbCondition> isNotNull(OmbAtom key);

private:
    OmbString text_;
    OmbRef<OmbExpression> parsed_;
};
