#include <oecore/attr/color.h>
#include <oecore/core/stringbuilder.h>

#include <cctype>
#include <charconv>
#include <cmath>
#include <string>
#include <string_view>
#include <vector>

namespace {

struct NamedColor {
    const char* name;
    OmbColor color;
};

constexpr NamedColor namedColors[] = {
    {"black", {0, 0, 0}},        {"white", {255, 255, 255}}, {"red", {255, 0, 0}},          {"green", {0, 128, 0}},
    {"blue", {0, 0, 255}},       {"yellow", {255, 255, 0}},  {"cyan", {0, 255, 255}},       {"aqua", {0, 255, 255}},
    {"magenta", {255, 0, 255}},  {"fuchsia", {255, 0, 255}}, {"gray", {128, 128, 128}},     {"grey", {128, 128, 128}},
    {"silver", {192, 192, 192}}, {"maroon", {128, 0, 0}},    {"olive", {128, 128, 0}},      {"lime", {0, 255, 0}},
    {"navy", {0, 0, 128}},       {"purple", {128, 0, 128}},  {"teal", {0, 128, 128}},       {"orange", {255, 165, 0}},
    {"brown", {165, 42, 42}},    {"pink", {255, 192, 203}},  {"transparent", {0, 0, 0, 0}},
};

std::string lower(std::string_view text) {
    std::string out(text);
    for (char& c : out) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    return out;
}

std::string_view trim(std::string_view s) {
    while (!s.empty() && std::isspace(static_cast<unsigned char>(s.front()))) s.remove_prefix(1);
    while (!s.empty() && std::isspace(static_cast<unsigned char>(s.back()))) s.remove_suffix(1);
    return s;
}

bool hexByte(std::string_view digits, std::uint8_t& out) {
    unsigned value = 0;
    const auto [end, error] = std::from_chars(digits.data(), digits.data() + digits.size(), value, 16);
    if (error != std::errc() || end != digits.data() + digits.size()) return false;
    out = static_cast<std::uint8_t>(value);
    return true;
}

bool fromHex(std::string_view hex, OmbColor& out) {
    OmbColor c;
    if (hex.size() == 3) {
        const std::string doubled{hex[0], hex[0], hex[1], hex[1], hex[2], hex[2]};
        return fromHex(doubled, out);
    }
    if (hex.size() != 6 && hex.size() != 8) return false;
    if (!hexByte(hex.substr(0, 2), c.r) || !hexByte(hex.substr(2, 2), c.g) || !hexByte(hex.substr(4, 2), c.b))
        return false;
    if (hex.size() == 8 && !hexByte(hex.substr(6, 2), c.a)) return false;
    out = c;
    return true;
}

bool channel(std::string_view text, std::uint8_t& out) {
    text = trim(text);
    int value = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
    if (error != std::errc() || end != text.data() + text.size() || value < 0 || value > 255) return false;
    out = static_cast<std::uint8_t>(value);
    return true;
}

bool alpha(std::string_view text, std::uint8_t& out) {
    text = trim(text);
    const bool percent = !text.empty() && text.back() == '%';
    if (percent) text.remove_suffix(1);
    double value = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
    if (error != std::errc() || end != text.data() + text.size()) return false;
    if (percent) value /= 100;
    if (!(value >= 0 && value <= 1)) return false;
    out = static_cast<std::uint8_t>(std::lround(value * 255));
    return true;
}

// rgb(...) or rgba(...): the arguments between the parentheses.
bool fromFunction(std::string_view text, OmbColor& out) {
    const bool withAlpha = text.starts_with("rgba(");
    if (!withAlpha && !text.starts_with("rgb(")) return false;
    if (text.back() != ')') return false;
    text = text.substr(withAlpha ? 5 : 4);
    text.remove_suffix(1);
    std::vector<std::string_view> parts;
    for (std::size_t comma; (comma = text.find(',')) != std::string_view::npos; text.remove_prefix(comma + 1))
        parts.push_back(text.substr(0, comma));
    parts.push_back(text);
    if (parts.size() != (withAlpha ? 4u : 3u)) return false;
    OmbColor c;
    if (!channel(parts[0], c.r) || !channel(parts[1], c.g) || !channel(parts[2], c.b)) return false;
    if (withAlpha && !alpha(parts[3], c.a)) return false;
    out = c;
    return true;
}

}  // namespace

bool OmbColor::fromString(const OmbString& text, OmbColor& out) {
    const std::string s = lower(trim(text.view()));
    if (s.empty()) return false;
    if (s[0] == '#') return fromHex(std::string_view(s).substr(1), out);
    for (const NamedColor& named : namedColors) {
        if (s == named.name) {
            out = named.color;
            return true;
        }
    }
    return fromFunction(s, out);
}

OmbString OmbColor::toString() const {
    OmbStringBuilder text;
    text << '#' << OmbFormat::hex(r, 2, true) << OmbFormat::hex(g, 2, true) << OmbFormat::hex(b, 2, true)
         << OmbFormat::hex(a, 2, true);
    return text.str();
}
