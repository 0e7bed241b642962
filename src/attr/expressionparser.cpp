// The scanner and the recursive-descent parser of the expression language.
#include <oecore/attr/expression.h>
#include <oecore/core/exception.h>

#include <cctype>
#include <clocale>
#include <cstdlib>
#include <string>
#include <string_view>

namespace {

enum class Token {
    End,
    LeftParen,
    RightParen,
    Comma,
    Plus,
    Minus,
    Star,
    Slash,
    Percent,
    Equal,
    Less,
    LessEqual,
    Greater,
    GreaterEqual,
    NotEqual,
    Integer,
    Double,
    String,
    Atom,
    Word,
    Null,
    True,
    False,
    If,
    Then,
    Else,
    Not,
    And,
    Or,
    Function,
    Invalid
};

struct FunctionName {
    const char* name;
    OmbExpression::ExpressionType type;
};

constexpr FunctionName functions[] = {
    {"double", OmbExpression::ToDouble}, {"int", OmbExpression::ToInt},
    {"length", OmbExpression::Length},   {"substr", OmbExpression::Substring},
    {"like", OmbExpression::Like},       {"contains", OmbExpression::Contains},
    {"string", OmbExpression::ToString}, {"bool", OmbExpression::ToBool},
    {"atom", OmbExpression::ToAtom},     {"attribute", OmbExpression::AttributeByName},
    {"rand", OmbExpression::Rand},       {"in", OmbExpression::In},
    {"keyword", OmbExpression::Keyword}, {"boundingbox", OmbExpression::BoundingBox},
};

struct Keyword {
    const char* word;
    Token token;
};

constexpr Keyword keywords[] = {
    {"null", Token::Null}, {"true", Token::True}, {"false", Token::False}, {"if", Token::If}, {"then", Token::Then},
    {"else", Token::Else}, {"not", Token::Not},   {"and", Token::And},     {"or", Token::Or},
};

class Parser {
public:
    explicit Parser(const OmbString& text) : source_(text), text_(text.view()) { next(); }

    OmbRef<OmbExpression> parseAll() {
        if (token_ == Token::End) fail(0, "Empty expression");
        OmbRef<OmbExpression> e = sequence();
        if (token_ != Token::End) fail("Expected end of string");
        return e;
    }

private:
    using Ref = OmbRef<OmbExpression>;

    [[noreturn]] void fail(std::size_t position, const char* message) {
        OMB_THROW(ExpressionParseError, source_, OmbString(std::to_string(position)), OmbString(message));
    }
    [[noreturn]] void fail(const char* message) { fail(tokenStart_, message); }
    [[noreturn]] void fail(const std::string& message) {
        OMB_THROW(ExpressionParseError, source_, OmbString(std::to_string(tokenStart_)), OmbString(message));
    }

    // --- scanner ---

    void skipSpace() {
        while (pos_ < text_.size() && std::isspace(static_cast<unsigned char>(text_[pos_]))) ++pos_;
    }

    static bool isWordStart(char c) { return std::isalpha(static_cast<unsigned char>(c)) || c == '_'; }
    static bool isWordChar(char c) { return std::isalnum(static_cast<unsigned char>(c)) || c == '_'; }

    void next() {
        skipSpace();
        tokenStart_ = pos_;
        if (pos_ >= text_.size()) return setToken(Token::End);
        const char c = text_[pos_];
        const char after = pos_ + 1 < text_.size() ? text_[pos_ + 1] : '\0';
        switch (c) {
            case '(': ++pos_; return setToken(Token::LeftParen);
            case ')': ++pos_; return setToken(Token::RightParen);
            case ',': ++pos_; return setToken(Token::Comma);
            case '+': ++pos_; return setToken(Token::Plus);
            case '-': ++pos_; return setToken(Token::Minus);
            case '*': ++pos_; return setToken(Token::Star);
            case '/': ++pos_; return setToken(Token::Slash);
            case '%': ++pos_; return setToken(Token::Percent);
            case '=': ++pos_; return setToken(Token::Equal);
            case '<': pos_ += after == '=' ? 2 : 1; return setToken(after == '=' ? Token::LessEqual : Token::Less);
            case '>':
                pos_ += after == '=' ? 2 : 1;
                return setToken(after == '=' ? Token::GreaterEqual : Token::Greater);
            case '!':
                if (after != '=') return setToken(Token::Invalid);
                pos_ += 2;
                return setToken(Token::NotEqual);
            case '"': return scanString();
            default: break;
        }
        if (std::isdigit(static_cast<unsigned char>(c))) return scanNumber();
        if (c == '#' && isWordStart(after)) {
            const std::size_t start = ++pos_;
            while (pos_ < text_.size() && isWordChar(text_[pos_])) ++pos_;
            word_ = text_.substr(start, pos_ - start);
            return setToken(Token::Atom);
        }
        if (isWordStart(c)) return scanWord();
        setToken(Token::Invalid);
    }

    void setToken(Token token) { token_ = token; }

    void scanNumber() {
        const std::size_t start = pos_;
        bool isDouble = false;
        while (pos_ < text_.size() && std::isdigit(static_cast<unsigned char>(text_[pos_]))) ++pos_;
        if (pos_ + 1 < text_.size() && text_[pos_] == '.' &&
            std::isdigit(static_cast<unsigned char>(text_[pos_ + 1]))) {
            isDouble = true;
            ++pos_;
            while (pos_ < text_.size() && std::isdigit(static_cast<unsigned char>(text_[pos_]))) ++pos_;
        }
        if (pos_ + 1 < text_.size() && (text_[pos_] == 'e' || text_[pos_] == 'E') &&
            (text_[pos_ + 1] == '+' || text_[pos_ + 1] == '-' ||
             std::isdigit(static_cast<unsigned char>(text_[pos_ + 1])))) {
            isDouble = true;
            pos_ += 2;
            while (pos_ < text_.size() && std::isdigit(static_cast<unsigned char>(text_[pos_]))) ++pos_;
        }
        const std::string number(text_.substr(start, pos_ - start));
        if (isDouble) {
            static const locale_t c = newlocale(LC_NUMERIC_MASK, "C", nullptr);
            number_ = OmbAttributeValue(strtod_l(number.c_str(), nullptr, c));
            return setToken(Token::Double);
        }
        // Literals beyond 64 bits wrap rather than fail.
        number_ = OmbAttributeValue(static_cast<std::int64_t>(std::strtoull(number.c_str(), nullptr, 10)));
        setToken(Token::Integer);
    }

    void scanString() {
        std::string value;
        for (++pos_; pos_ < text_.size(); ++pos_) {
            const char c = text_[pos_];
            if (c == '"') {
                ++pos_;
                number_ = OmbAttributeValue(OmbString(value));
                return setToken(Token::String);
            }
            if (c == '\\') {
                if (pos_ + 1 >= text_.size() || (text_[pos_ + 1] != '"' && text_[pos_ + 1] != '\\'))
                    return setToken(Token::Invalid);
                value += text_[++pos_];
                continue;
            }
            value += c;
        }
        setToken(Token::Invalid);  // no closing quote
    }

    void scanWord() {
        const std::size_t start = pos_;
        while (pos_ < text_.size() && isWordChar(text_[pos_])) ++pos_;
        word_ = text_.substr(start, pos_ - start);
        std::size_t look = pos_;
        while (look < text_.size() && std::isspace(static_cast<unsigned char>(text_[look]))) ++look;
        for (const Keyword& k : keywords)
            if (word_ == k.word) return setToken(k.token);
        if (look < text_.size() && text_[look] == '(') {
            for (const FunctionName& f : functions) {
                if (word_ == f.name) {
                    function_ = f.type;
                    return setToken(Token::Function);
                }
            }
            fail("Unknown keyword '" + std::string(word_) + "'.");
        }
        setToken(Token::Word);
    }

    void expect(Token token, const char* message) {
        if (token_ != token) fail(message);
        next();
    }

    // --- nodes ---

    // Every node is checked for depth as it is made, so neither parsing nor
    // evaluating nor freeing a tree can recurse without bound.
    Ref node(Ref e) {
        if (e->depth() > OmbExpression::maximumDepth) fail("Expression nested too deeply");
        return e;
    }
    Ref make(OmbExpression::ExpressionType type, Ref a = Ref(), Ref b = Ref(), Ref c = Ref()) {
        return node(Ref(new OmbExpression(type, std::move(a), std::move(b), std::move(c))));
    }

    // Guards the recursion of the grammar itself (parentheses, prefixes).
    struct Nesting {
        Parser& parser;
        explicit Nesting(Parser& p) : parser(p) {
            if (++parser.nesting_ > OmbExpression::maximumDepth) parser.fail("Expression nested too deeply");
        }
        ~Nesting() { --parser.nesting_; }
    };

    // --- grammar ---

    Ref sequence() {
        Ref e = conditional();
        while (token_ == Token::Comma) {
            next();
            e = make(OmbExpression::Sequence, e, conditional());
        }
        return e;
    }

    Ref conditional() {
        Nesting nesting(*this);
        if (token_ != Token::If) return orLevel();
        next();
        Ref c = conditional();
        expect(Token::Then, "Expected 'then'");
        Ref a = conditional();
        expect(Token::Else, "Expected 'else'");
        return make(OmbExpression::Conditional, c, a, conditional());
    }

    Ref orLevel() {
        Ref e = andLevel();
        while (token_ == Token::Or) {
            next();
            e = make(OmbExpression::Or, e, andLevel());
        }
        return e;
    }

    Ref andLevel() {
        Ref e = notLevel();
        while (token_ == Token::And) {
            next();
            e = make(OmbExpression::And, e, notLevel());
        }
        return e;
    }

    Ref notLevel() {
        if (token_ != Token::Not) return inLevel();
        next();
        return make(OmbExpression::Not, inLevel());
    }

    Ref inLevel() {
        Ref e = comparison();
        if (!(token_ == Token::Function && function_ == OmbExpression::In)) return e;
        next();
        expect(Token::LeftParen, "Expected '('");
        std::vector<Ref> items;
        if (token_ != Token::RightParen) {
            for (;;) {
                items.push_back(conditional());
                if (token_ == Token::RightParen) break;
                if (token_ != Token::Comma) fail("Expected ',' or ')'");
                next();
            }
        }
        next();
        return node(Ref(new OmbExpression(OmbExpression::In, e, std::move(items))));
    }

    Ref comparison() {
        Ref e = sum();
        OmbExpression::ExpressionType type;
        switch (token_) {
            case Token::Equal: type = OmbExpression::Equal; break;
            case Token::NotEqual: type = OmbExpression::NotEqual; break;
            case Token::Less: type = OmbExpression::Less; break;
            case Token::LessEqual: type = OmbExpression::LessOrEqual; break;
            case Token::Greater: type = OmbExpression::Greater; break;
            case Token::GreaterEqual: type = OmbExpression::GreaterOrEqual; break;
            default: return e;
        }
        next();
        return make(type, e, sum());
    }

    Ref sum() {
        Ref e = product();
        while (token_ == Token::Plus || token_ == Token::Minus) {
            const auto type = token_ == Token::Plus ? OmbExpression::Add : OmbExpression::Subtract;
            next();
            e = make(type, e, product());
        }
        return e;
    }

    Ref product() {
        Ref e = unary();
        while (token_ == Token::Star || token_ == Token::Slash || token_ == Token::Percent) {
            const auto type = token_ == Token::Star    ? OmbExpression::Multiply
                              : token_ == Token::Slash ? OmbExpression::Divide
                                                       : OmbExpression::Remainder;
            next();
            e = make(type, e, unary());
        }
        return e;
    }

    Ref unary() {
        if (token_ != Token::Minus) return primary();
        next();
        return make(OmbExpression::Negate, primary());
    }

    Ref primary() {
        Nesting nesting(*this);
        switch (token_) {
            case Token::LeftParen: {
                next();
                Ref e = sequence();
                expect(Token::RightParen, "Expected ')'");
                return e;
            }
            case Token::Integer:
            case Token::Double:
            case Token::String: return constant(number_);
            case Token::Atom:
                return constant(OmbAttributeValue(static_cast<unsigned long>(OmbAtoms::atom(OmbString(word_)))));
            case Token::True: return constant(OmbAttributeValue::fromBool(true));
            case Token::False: return constant(OmbAttributeValue::fromBool(false));
            case Token::Null: return constant(OmbAttributeValue());
            case Token::Word: {
                const OmbAtom key = OmbAtoms::atom(OmbString(word_));
                next();
                return node(Ref(new OmbExpression(key)));
            }
            case Token::Function: return function();
            default: fail("Unexpected token");
        }
    }

    Ref constant(const OmbAttributeValue& value) {
        next();
        return node(Ref(new OmbExpression(value)));
    }

    // name(arg, arg, ...): the kinds table gives how many arguments each takes.
    Ref function() {
        const OmbExpression::ExpressionType type = function_;
        next();
        expect(Token::LeftParen, "Expected '('");
        int least = 1;
        int most = 1;
        switch (type) {
            case OmbExpression::Rand: least = most = 0; break;
            case OmbExpression::Substring:
            case OmbExpression::Like:
            case OmbExpression::Contains: least = 2, most = 3; break;
            case OmbExpression::Keyword: least = 1, most = 3; break;
            case OmbExpression::BoundingBox: least = most = 4; break;
            case OmbExpression::In: fail("Unexpected token");
            default: break;
        }
        std::vector<Ref> args;
        for (int i = 0; i < most; ++i) {
            if (i >= least && token_ == Token::RightParen) break;
            if (i > 0) expect(Token::Comma, "Expected ','");
            args.push_back(conditional());
        }
        expect(Token::RightParen, "Expected ')'");
        if (type == OmbExpression::BoundingBox) return node(Ref(new OmbExpression(type, Ref(), std::move(args))));
        args.resize(3);
        return make(type, args[0], args[1], args[2]);
    }

    OmbString source_;
    std::string_view text_;
    std::size_t pos_ = 0;
    std::size_t tokenStart_ = 0;
    Token token_ = Token::End;
    std::string_view word_;
    OmbAttributeValue number_;
    OmbExpression::ExpressionType function_ = OmbExpression::Constant;
    int nesting_ = 0;
};

}  // namespace

OmbRef<OmbExpression> OmbExpression::parse(const OmbString& text) { return Parser(text).parseAll(); }
