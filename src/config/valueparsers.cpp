#include <oecore/config/valueparsers.h>

#include <cctype>
#include <charconv>

namespace {

// The text after leading white space; from_chars itself rejects it.
std::string_view skipSpace(const OmbString& text) {
    std::string_view s = text.view();
    while (!s.empty() && std::isspace(static_cast<unsigned char>(s.front()))) s.remove_prefix(1);
    return s;
}

template <class T>
bool parseWhole(const OmbString& text, T& out) {
    std::string_view s = skipSpace(text);
    // from_chars takes no leading "+", which the C library's readers accept.
    if (s.size() > 1 && s.front() == '+' && s[1] != '-' && s[1] != '+') s.remove_prefix(1);
    T value{};
    const auto [end, error] = std::from_chars(s.data(), s.data() + s.size(), value);
    if (error != std::errc() || end != s.data() + s.size() || s.empty()) return false;
    out = value;
    return true;
}

}  // namespace

bool parseInt(const OmbString& text, long long& out) { return parseWhole(text, out); }

bool parseFloat(const OmbString& text, float& out) { return parseWhole(text, out); }

bool parseDouble(const OmbString& text, double& out) { return parseWhole(text, out); }

bool parseBool(const OmbString& text, bool& out) {
    if (text == OmbString::literal("true")) {
        out = true;
        return true;
    }
    if (text == OmbString::literal("false")) {
        out = false;
        return true;
    }
    return false;
}
