#include <oecore/attr/expression.h>
#include <oecore/core/exception.h>
#include <oecore/core/stringbuilder.h>
#include <oecore/core/stringutils.h>

#include <algorithm>
#include <atomic>
#include <cmath>
#include <limits>
#include <string>
#include <vector>

namespace {

using Value = OmbAttributeValue;

const OmbAtomConstant keywordsKey("keywords");
const OmbAtomConstant extentWest("extentWest");
const OmbAtomConstant extentSouth("extentSouth");
const OmbAtomConstant extentEast("extentEast");
const OmbAtomConstant extentNorth("extentNorth");

// The process-wide state of rand() when no seed is given.
std::atomic<unsigned int> randomState{1};

bool isNumeric(const Value& v) { return v.type() == OmbAttributeInt64 || v.type() == OmbAttributeDouble; }
double asDouble(const Value& v) {
    return v.type() == OmbAttributeInt64 ? static_cast<double>(v.asInt64()) : v.asDouble();
}
bool bothInt(const Value& a, const Value& b) { return a.type() == OmbAttributeInt64 && b.type() == OmbAttributeInt64; }

// Integer arithmetic wraps on overflow instead of being undefined.
std::int64_t wrap(std::uint64_t v) { return static_cast<std::int64_t>(v); }

void arithmetic(OmbExpression::ExpressionType type, const Value& a, const Value& b, Value& out) {
    if (type == OmbExpression::Add && a.type() == OmbAttributeString && b.type() == OmbAttributeString) {
        out = Value(a.asString() + b.asString());
        return;
    }
    if (!isNumeric(a) || !isNumeric(b)) return;
    if (bothInt(a, b)) {
        const auto x = static_cast<std::uint64_t>(a.asInt64());
        const auto y = static_cast<std::uint64_t>(b.asInt64());
        const std::int64_t i = a.asInt64();
        const std::int64_t j = b.asInt64();
        switch (type) {
            case OmbExpression::Add: out = Value(wrap(x + y)); return;
            case OmbExpression::Subtract: out = Value(wrap(x - y)); return;
            case OmbExpression::Multiply: out = Value(wrap(x * y)); return;
            case OmbExpression::Divide:
                if (j == 0) return;
                out = Value(j == -1 ? wrap(0 - x) : i / j);  // the minimum integer divided by -1 wraps
                return;
            case OmbExpression::Remainder:
                if (j == 0) return;
                out = Value(j == -1 ? std::int64_t{0} : i % j);
                return;
            default: return;
        }
    }
    const double x = asDouble(a);
    const double y = asDouble(b);
    switch (type) {
        case OmbExpression::Add: out = Value(x + y); return;
        case OmbExpression::Subtract: out = Value(x - y); return;
        case OmbExpression::Multiply: out = Value(x * y); return;
        case OmbExpression::Divide:
            if (y != 0) out = Value(x / y);
            return;
        case OmbExpression::Remainder:
            if (y != 0) out = Value(std::fmod(x, y));
            return;
        default: return;
    }
}

// Two integers compare exactly; an integer and a double as doubles.
bool equal(const Value& a, const Value& b) {
    if (bothInt(a, b)) return a.asInt64() == b.asInt64();
    if (isNumeric(a) && isNumeric(b)) return asDouble(a) == asDouble(b);
    return a == b;
}

bool ordered(OmbExpression::ExpressionType type, const Value& a, const Value& b) {
    const bool leftNull = a.is_singular();
    const bool rightNull = b.is_singular();
    if (leftNull || rightNull) {
        switch (type) {
            case OmbExpression::Less: return leftNull && !rightNull;
            case OmbExpression::LessOrEqual: return leftNull;
            case OmbExpression::Greater: return rightNull && !leftNull;
            default: return rightNull;
        }
    }
    int order;
    if (a.type() == b.type() && a.type() != OmbAttributeAtom) {
        order = a < b ? -1 : (b < a ? 1 : 0);
        if (a.type() == OmbAttributeDouble && order == 0 && !(a.asDouble() == b.asDouble())) return false;  // NaN
    } else if (isNumeric(a) && isNumeric(b)) {
        const double x = asDouble(a);
        const double y = asDouble(b);
        if (!(x < y) && !(x > y) && !(x == y)) return false;  // NaN
        order = x < y ? -1 : (x > y ? 1 : 0);
    } else {
        return false;
    }
    switch (type) {
        case OmbExpression::Less: return order < 0;
        case OmbExpression::LessOrEqual: return order <= 0;
        case OmbExpression::Greater: return order > 0;
        default: return order >= 0;
    }
}

// UTF-16 code units of text; false for text that is not well-formed.
bool utf16(const OmbString& text, std::u16string& out) {
    if (!OmbStringUtils::isValidUtf8(text.view())) return false;
    out = text.toWide();
    return true;
}

// "*" any run, "?" one character; UTF-16 code units compared.
bool wildcard(std::u16string_view p, std::u16string_view t) {
    std::size_t pi = 0, ti = 0, star = std::u16string_view::npos, mark = 0;
    while (ti < t.size()) {
        if (pi < p.size() && (p[pi] == u'?' || (p[pi] != u'*' && p[pi] == t[ti]))) {
            ++pi, ++ti;
        } else if (pi < p.size() && p[pi] == u'*') {
            star = pi++, mark = ti;
        } else if (star != std::u16string_view::npos) {
            pi = star + 1, ti = ++mark;
        } else {
            return false;
        }
    }
    while (pi < p.size() && p[pi] == u'*') ++pi;
    return pi == p.size();
}

bool matches(const OmbString& text, const OmbString& pattern, bool caseSensitive) {
    std::u16string t;
    std::u16string p;
    if (!utf16(caseSensitive ? text : text.toLower(), t) || !utf16(caseSensitive ? pattern : pattern.toLower(), p))
        return false;
    return wildcard(p, t);
}

// The items of a comma list, trimmed of spaces and then of tabs.
std::vector<OmbString> listItems(const OmbString& list) {
    std::vector<OmbString> items;
    OmbStringUtils::split(list, ',', items);
    for (OmbString& item : items) item = OmbStringUtils::strip(OmbStringUtils::strip(item, ' '), '\t');
    return items;
}

bool anyItemMatches(const OmbString& list, const OmbString& pattern, bool caseSensitive) {
    for (const OmbString& item : listItems(list))
        if (matches(item, pattern, caseSensitive)) return true;
    return false;
}

bool validString(const OmbString& s) { return OmbStringUtils::isValidUtf8(s.view()); }

unsigned int advance(unsigned int state) { return state * 214013u + 2531011u; }

double randomNumber(unsigned int* seed) {
    unsigned int state;
    if (seed) {
        state = *seed = advance(*seed);
    } else {
        unsigned int old = randomState.load(std::memory_order_relaxed);
        while (!randomState.compare_exchange_weak(old, advance(old), std::memory_order_relaxed)) {
        }
        state = advance(old);
    }
    return ((state >> 16) & 0x7FFF) / 32767.0;
}

}  // namespace

bool Omb_truthiness(const OmbAttributeValue& v) {
    switch (v.type()) {
        case OmbAttributeInt64: return v.asInt64() != 0;
        case OmbAttributeDouble: return !(v.asDouble() == 0);
        case OmbAttributeString: return !v.asString().empty();
        case OmbAttributeBool: return v.asBool();
        default: return false;
    }
}

void Omb_toInt(const OmbAttributeValue& in, OmbAttributeValue& out) {
    out.clear();
    switch (in.type()) {
        case OmbAttributeInt64: out = in; break;
        case OmbAttributeDouble: {
            // Halves to even; values outside the 32-bit range give null.
            const double r = std::nearbyint(in.asDouble());
            if (r >= std::numeric_limits<std::int32_t>::min() && r <= std::numeric_limits<std::int32_t>::max())
                out = OmbAttributeValue(static_cast<std::int64_t>(r));
            break;
        }
        case OmbAttributeString: out = OmbAttributeValue(OmbStringUtils::atoi64(in.asString())); break;
        case OmbAttributeBool: out = OmbAttributeValue(std::int64_t{in.asBool() ? 1 : 0}); break;
        default: break;
    }
}

void Omb_toDouble(const OmbAttributeValue& in, OmbAttributeValue& out) {
    out.clear();
    switch (in.type()) {
        case OmbAttributeInt64: out = OmbAttributeValue(static_cast<double>(in.asInt64())); break;
        case OmbAttributeDouble: out = in; break;
        case OmbAttributeString: out = OmbAttributeValue(OmbStringUtils::atof(in.asString())); break;
        case OmbAttributeBool: out = OmbAttributeValue(in.asBool() ? 1.0 : 0.0); break;
        default: break;
    }
}

void Omb_toString(const OmbAttributeValue& in, OmbAttributeValue& out) {
    OmbStringBuilder text;
    switch (in.type()) {
        case OmbAttributeInt64: text << static_cast<long long>(in.asInt64()); break;
        case OmbAttributeDouble: text << OmbFormat::real(in.asDouble()); break;
        case OmbAttributeString: out = in; return;
        case OmbAttributeBool: text << (in.asBool() ? "true" : "false"); break;
        case OmbAttributeAtom:
            // An atom forgotten by a restart of the runtime has no name.
            try {
                text << OmbAtoms::name(in.asAtom());
            } catch (const OmbXAtomsIllegalAtom&) {
                out.clear();
                return;
            }
            break;
        case OmbAttributeEmpty: out.clear(); return;
    }
    out = OmbAttributeValue(text.str());
}

OmbExpression::OmbExpression(const OmbAttributeValue& constant) : type_(Constant), value_(constant) {}

OmbExpression::OmbExpression(OmbAtom key) : type_(Attribute), key_(key) {}

OmbExpression::OmbExpression(ExpressionType type, OmbRef<OmbExpression> a, OmbRef<OmbExpression> b,
                             OmbRef<OmbExpression> c)
    : type_(type), children_{std::move(a), std::move(b), std::move(c)} {
    for (const auto& child : children_)
        if (child) depth_ = std::max(depth_, child->depth_ + 1);
}

OmbExpression::OmbExpression(ExpressionType type, OmbRef<OmbExpression> first, std::vector<OmbRef<OmbExpression>> list)
    : OmbExpression(type, std::move(first)) {
    list_ = std::move(list);
    for (const auto& item : list_)
        if (item) depth_ = std::max(depth_, item->depth_ + 1);
}

OmbExpression::OmbExpression(const OmbExpression& other)
    : OmbRefCnt(),
      type_(other.type_),
      value_(other.value_),
      key_(other.key_),
      children_{other.children_[0], other.children_[1], other.children_[2]},
      list_(other.list_),
      depth_(other.depth_) {}

bool OmbExpression::evaluate(const OmbReadOnlyAttributes& attributes, OmbAttributeValue& out,
                             unsigned int* seed) const {
    eval(attributes, out, seed);
    return !out.is_singular();
}

namespace {

// Evaluates, converts the result as int(), double() or string() would and
// reads it out; false for null.
template <class T, class Convert, class Read>
bool evaluateAs(const OmbExpression& e, const OmbReadOnlyAttributes& attributes, T& out, unsigned int* seed,
                Convert convert, Read read) {
    OmbAttributeValue v;
    OmbAttributeValue converted;
    e.evaluate(attributes, v, seed);
    convert(v, converted);
    if (converted.is_singular()) return false;
    out = read(converted);
    return true;
}

}  // namespace

bool OmbExpression::evaluate(const OmbReadOnlyAttributes& attributes, std::int64_t& out, unsigned int* seed) const {
    return evaluateAs(*this, attributes, out, seed, Omb_toInt, [](const Value& v) { return v.asInt64(); });
}

bool OmbExpression::evaluate(const OmbReadOnlyAttributes& attributes, double& out, unsigned int* seed) const {
    return evaluateAs(*this, attributes, out, seed, Omb_toDouble, [](const Value& v) { return v.asDouble(); });
}

bool OmbExpression::evaluate(const OmbReadOnlyAttributes& attributes, OmbString& out, unsigned int* seed) const {
    return evaluateAs(*this, attributes, out, seed, Omb_toString, [](const Value& v) { return v.asString(); });
}

void OmbExpression::eval(const OmbReadOnlyAttributes& attributes, OmbAttributeValue& out, unsigned int* seed) const {
    out.clear();
    Value a;
    Value b;
    Value c;
    const auto arg = [&](int i, Value& v) {
        if (children_[i]) children_[i]->eval(attributes, v, seed);
    };
    switch (type_) {
        case Constant: out = value_; return;
        case Attribute:
            if (const Value* v = attributes.findValue(key_)) out = *v;
            return;
        case AttributeByName: {
            arg(0, a);
            OmbAtom key;
            if (a.type() == OmbAttributeString)
                key = OmbAtoms::atom(a.asString());
            else if (a.type() == OmbAttributeAtom)
                key = a.asAtom();
            else
                return;
            if (const Value* v = attributes.findValue(key)) out = *v;
            return;
        }
        case Add:
        case Subtract:
        case Multiply:
        case Divide:
        case Remainder:
            arg(0, a);
            arg(1, b);
            arithmetic(type_, a, b, out);
            return;
        case Conditional:
            arg(0, a);
            arg(Omb_truthiness(a) ? 1 : 2, out);
            return;
        case Equal:
        case NotEqual:
            arg(0, a);
            arg(1, b);
            out = Value::fromBool(equal(a, b) == (type_ == Equal));
            return;
        case Less:
        case LessOrEqual:
        case Greater:
        case GreaterOrEqual:
            arg(0, a);
            arg(1, b);
            out = Value::fromBool(ordered(type_, a, b));
            return;
        case And:
            arg(0, a);
            if (Omb_truthiness(a)) arg(1, b);
            out = Value::fromBool(Omb_truthiness(a) && Omb_truthiness(b));
            return;
        case Or:
            arg(0, a);
            if (!Omb_truthiness(a)) arg(1, b);
            out = Value::fromBool(Omb_truthiness(a) || Omb_truthiness(b));
            return;
        case Not:
            arg(0, a);
            out = Value::fromBool(!Omb_truthiness(a));
            return;
        case Sequence:
            arg(0, out);
            if (!Omb_truthiness(out)) arg(1, out);
            return;
        case Negate:
            arg(0, a);
            if (a.type() == OmbAttributeInt64) out = Value(wrap(0 - static_cast<std::uint64_t>(a.asInt64())));
            if (a.type() == OmbAttributeDouble) out = Value(-a.asDouble());
            return;
        case Substring: {
            arg(0, a);
            arg(1, b);
            std::u16string s;
            if (a.type() != OmbAttributeString || b.type() != OmbAttributeInt64 || !utf16(a.asString(), s)) return;
            const auto length = static_cast<std::int64_t>(s.size());
            const std::int64_t start = std::clamp<std::int64_t>(b.asInt64(), 0, length);
            std::int64_t end = length;
            if (children_[2]) {
                arg(2, c);
                if (c.type() != OmbAttributeInt64) return;
                const std::int64_t count = c.asInt64();
                end = count > length ? length : std::clamp<std::int64_t>(start + count, start, length);
            }
            out = Value(OmbString::fromWide(s.data() + start, end - start));
            return;
        }
        case Length: {
            arg(0, a);
            std::u16string s;
            if (a.type() == OmbAttributeString && utf16(a.asString(), s))
                out = Value(static_cast<std::int64_t>(s.size()));
            return;
        }
        case Like:
        case Contains: {
            arg(0, a);
            arg(1, b);
            bool caseSensitive = true;
            if (children_[2]) {
                arg(2, c);
                caseSensitive = Omb_truthiness(c);
            }
            bool result = false;
            if (a.type() == OmbAttributeString && b.type() == OmbAttributeString && validString(a.asString()) &&
                validString(b.asString()))
                result = type_ == Like ? matches(a.asString(), b.asString(), caseSensitive)
                                       : anyItemMatches(a.asString(), b.asString(), caseSensitive);
            out = Value::fromBool(result);
            return;
        }
        case Keyword: {
            arg(0, a);
            OmbString keywords;
            bool result = false;
            if (a.type() == OmbAttributeString && attributes.get(keywordsKey, keywords) && validString(keywords) &&
                validString(a.asString())) {
                OmbString pattern = a.asString();
                arg(1, b);
                if (b.type() == OmbAttributeString && validString(b.asString()))
                    pattern = b.asString().toLower() + OmbString::literal(".") + pattern;
                bool caseSensitive = false;
                if (children_[2]) {
                    arg(2, c);
                    caseSensitive = Omb_truthiness(c);
                }
                result = anyItemMatches(keywords, pattern, caseSensitive);
            }
            out = Value::fromBool(result);
            return;
        }
        case BoundingBox: {
            double box[4];
            for (int i = 0; i < 4; ++i) {
                Value v;
                if (list_.size() > static_cast<std::size_t>(i) && list_[i]) list_[i]->eval(attributes, v, seed);
                if (!isNumeric(v)) return out = Value::fromBool(false), void();
                box[i] = asDouble(v);
            }
            double west, south, east, north;
            const bool known = attributes.get(extentWest, west) && attributes.get(extentSouth, south) &&
                               attributes.get(extentEast, east) && attributes.get(extentNorth, north);
            out = Value::fromBool(known && box[0] <= east && box[1] <= north && west <= box[2] && south <= box[3]);
            return;
        }
        case Rand: out = Value(randomNumber(seed)); return;
        case In: {
            arg(0, a);
            bool found = false;
            for (const auto& item : list_) {
                Value v;
                if (item) item->eval(attributes, v, seed);
                if (v == a) {
                    found = true;
                    break;
                }
            }
            out = Value::fromBool(found);
            return;
        }
        case ToInt:
            arg(0, a);
            Omb_toInt(a, out);
            return;
        case ToDouble:
            arg(0, a);
            Omb_toDouble(a, out);
            return;
        case ToString:
            arg(0, a);
            Omb_toString(a, out);
            return;
        case ToBool:
            arg(0, a);
            out = Value::fromBool(Omb_truthiness(a));
            return;
        case ToAtom:
            arg(0, a);
            if (a.type() == OmbAttributeAtom) out = a;
            if (a.type() == OmbAttributeString) out = Value(static_cast<unsigned long>(OmbAtoms::atom(a.asString())));
            return;
    }
}

bool OmbExpression::usesRand() const {
    if (type_ == Rand) return true;
    for (const auto& child : children_)
        if (child && child->usesRand()) return true;
    return false;
}

void OmbExpression::dependents(std::set<OmbAtom>& keys) const {
    if (type_ == Attribute) keys.insert(key_);
    for (const auto& child : children_)
        if (child) child->dependents(keys);
    for (const auto& item : list_)
        if (item) item->dependents(keys);
}
