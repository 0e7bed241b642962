#include <oecore/attr/expression.h>
#include <oecore/core/exception.h>

#include <cstddef>
#include <cstdint>

// Whatever the text, parsing either gives a tree that evaluates without
// error against a feature, or throws the parse error.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static const OmbRef<OmbAttributeSet> feature = [] {
        OmbRef<OmbAttributeSet> set(new OmbAttributeSet);
        set->set(OmbAtoms::atom(OmbString("class")), std::int64_t{2});
        set->set(OmbAtoms::atom(OmbString("name")), OmbString("Main Road"));
        set->set(OmbAtoms::atom(OmbString("depth")), 12.5);
        set->set(OmbAtoms::atom(OmbString("keywords")), OmbString("road.main, quay"));
        return set;
    }();
    const OmbString text(reinterpret_cast<const char*>(data), reinterpret_cast<const char*>(data) + size);
    try {
        const OmbRef<OmbExpression> e = OmbExpression::parse(text);
        OmbAttributeValue out;
        unsigned int seed = 1;
        e->evaluate(OmbReadOnlyAttributes(feature), out, &seed);
    } catch (const OmbXExpressionParseError&) {
    }
    return 0;
}
