#include <oecore/core/stringutils.h>

#include <locale.h>
#include <cstdlib>
#include <istream>
#include <string>

#include "utf.h"

namespace OmbStringUtils {

void split(const OmbString& s, char separator, std::vector<OmbString>& out) {
    out.clear();
    const std::string_view text = s.view();
    std::size_t start = 0;
    for (std::size_t pos; (pos = text.find(separator, start)) != std::string_view::npos; start = pos + 1)
        out.emplace_back(text.substr(start, pos - start));
    out.emplace_back(text.substr(start));
}

namespace {

// Length of the longest listed string found at text[pos], or 0.
std::size_t matchAt(std::string_view text, std::size_t pos, const std::vector<OmbString>& list) {
    std::size_t best = 0;
    for (const OmbString& item : list)
        if (item.size() > best && text.substr(pos).starts_with(item.view())) best = item.size();
    return best;
}

std::size_t matchBefore(std::string_view text, std::size_t end, const std::vector<OmbString>& list) {
    std::size_t best = 0;
    for (const OmbString& item : list)
        if (item.size() > best && text.substr(0, end).ends_with(item.view())) best = item.size();
    return best;
}

}  // namespace

void split(const OmbString& s, const std::vector<OmbString>& separators, std::vector<OmbString>& out) {
    out.clear();
    const std::string_view text = s.view();
    std::size_t start = 0;
    for (std::size_t pos = 0; pos < text.size();) {
        const std::size_t length = matchAt(text, pos, separators);
        if (length == 0) {
            ++pos;
            continue;
        }
        out.emplace_back(text.substr(start, pos - start));
        pos += length;
        start = pos;
    }
    out.emplace_back(text.substr(start));
}

OmbString strip(const OmbString& s, char ch, bool left, bool right) {
    const std::string_view text = s.view();
    std::size_t begin = 0;
    std::size_t end = text.size();
    if (left)
        while (begin < end && text[begin] == ch) ++begin;
    if (right)
        while (end > begin && text[end - 1] == ch) --end;
    return begin == 0 && end == text.size() ? s : OmbString(text.substr(begin, end - begin));
}

OmbString strip(const OmbString& s, const std::vector<OmbString>& list, bool left, bool right) {
    const std::string_view text = s.view();
    std::size_t begin = 0;
    std::size_t end = text.size();
    if (left)
        for (std::size_t n; begin < end && (n = matchAt(text.substr(0, end), begin, list)) > 0;) begin += n;
    if (right)
        for (std::size_t n; end > begin && (n = matchBefore(text.substr(begin), end - begin, list)) > 0;) end -= n;
    return begin == 0 && end == text.size() ? s : OmbString(text.substr(begin, end - begin));
}

const std::vector<OmbString>& whiteSpace() {
    static const std::vector<OmbString> list{OmbString::literal(" "), OmbString::literal("\t"),
                                             OmbString::literal("\n")};
    return list;
}

OmbString itoa(int n) { return OmbString(std::to_string(n)); }

std::int64_t atoi64(const OmbString& s) { return std::strtoll(s.dataUtf8(), nullptr, 10); }

double atof(const OmbString& s) {
    // Parsing in the C locale reads "." whatever the application's locale is.
    static const locale_t cLocale = newlocale(LC_NUMERIC_MASK, "C", nullptr);
    return strtod_l(s.dataUtf8(), nullptr, cLocale);
}

bool isEqualIgnoreCase(const OmbString& a, const OmbString& b) {
    return a.size() == b.size() && a.toUpper() == b.toUpper();
}

bool isValidUtf8(std::string_view bytes, std::size_t* badOffset) {
    for (std::size_t pos = 0; pos < bytes.size();) {
        const std::size_t start = pos;
        if (oecore::detail::decodeUtf8(bytes.data(), bytes.size(), pos) < 0) {
            if (badOffset) *badOffset = start;
            return false;
        }
    }
    return true;
}

bool wildcardMatch(const OmbString& pattern, const OmbString& text) {
    const std::string_view p = pattern.view();
    const std::string_view t = text.view();
    std::size_t pi = 0;
    std::size_t ti = 0;
    std::size_t starPattern = std::string_view::npos;
    std::size_t starText = 0;
    while (ti < t.size()) {
        if (pi < p.size() && (p[pi] == '?' || (p[pi] != '*' && p[pi] == t[ti]))) {
            ++pi;
            ++ti;
        } else if (pi < p.size() && p[pi] == '*') {
            starPattern = pi++;
            starText = ti;
        } else if (starPattern != std::string_view::npos) {
            // Back to the most recent star, which now swallows one more byte.
            pi = starPattern + 1;
            ti = ++starText;
        } else {
            return false;
        }
    }
    while (pi < p.size() && p[pi] == '*') ++pi;
    return pi == p.size();
}

OmbString getEnvironmentVariable(const OmbString& name) {
    const char* value = std::getenv(name.dataUtf8());
    return value ? OmbString(value) : OmbString();
}

bool readLine(std::istream& stream, OmbString& out) {
    std::string line;
    if (!std::getline(stream, line)) {
        out.clear();
        return false;
    }
    if (!line.empty() && line.back() == '\r') line.pop_back();
    out = OmbString(std::string_view(line));
    return true;
}

}  // namespace OmbStringUtils
