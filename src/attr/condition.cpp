#include <oecore/attr/condition.h>
#include <oecore/config/classdescription.h>
#include <oecore/core/stringbuilder.h>

OMB_DEFINE_ENGINE_CLASS(OmbCondition, OmbResourceObject, "Condition", 0)
OMB_DEFINE_DESCRIBED_MEMBERS(OmbCondition)

OMB_DESCRIBE_CLASS(OmbCondition) {
    d.property<OmbString>(
         "Expression", [](const OmbCondition& c) { return c.expression(); },
         [](OmbCondition& c, const OmbString& text) { c.expression(text); })
        .required();
}

void OmbCondition::expression(const OmbString& text) {
    OmbRef<OmbExpression> parsed = OmbExpression::parse(text);
    text_ = text;
    parsed_ = std::move(parsed);
}

bool OmbCondition::eval(const OmbReadOnlyAttributes& attributes) const {
    OmbAttributeValue result;
    if (!parsed_ || !parsed_->evaluate(attributes, result)) return false;
    return result.type() == OmbAttributeBool && result.asBool();
}

void OmbCondition::dependents(std::set<OmbAtom>& keys) const {
    if (parsed_) parsed_->dependents(keys);
}

namespace {

// attribute("NAME") with the name's quotes and backslashes escaped, so
// that any name parses.
OmbString attributeTest(OmbAtom key, const char* comparison) {
    OmbStringBuilder text;
    text << "attribute(\"";
    for (const char c : OmbAtoms::name(key).view()) {
        if (c == '"' || c == '\\') text << '\\';
        text << c;
    }
    text << "\") " << comparison << " null";
    return text.str();
}

}  // namespace

OmbRef<OmbCondition> OmbCondition::isNull(OmbAtom key) {
    return OmbRef<OmbCondition>(new OmbCondition(attributeTest(key, "=")));
}

OmbRef<OmbCondition> OmbCondition::isNotNull(OmbAtom key) {
    return OmbRef<OmbCondition>(new OmbCondition(attributeTest(key, "!=")));
}
