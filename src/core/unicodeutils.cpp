#include <oecore/core/unicodeutils.h>

#include <algorithm>
#include <array>
#include <cstdint>

namespace OmbUnicodeUtils {

namespace {

// How a character joins its neighbours (Unicode ArabicShaping.txt):
// dual-joining letters connect on both sides, right-joining ones only to the
// preceding letter, join-causing ones (tatweel, ZWJ) connect like dual ones
// but have no forms, transparent ones (vowel marks) are skipped over.
enum class Joining : std::uint8_t { None, Right, Dual, Causing, Transparent };

struct Forms {
    char16_t letter;
    Joining joining;
    char16_t isolated;  // the final form is isolated + 1; for dual-joining
                        // letters initial is + 2 and medial + 3
};

// Letters with presentation forms, sorted by code unit.
constexpr std::array<Forms, 43> letters{{
    {0x0622, Joining::Right, 0xFE81}, {0x0623, Joining::Right, 0xFE83}, {0x0624, Joining::Right, 0xFE85},
    {0x0625, Joining::Right, 0xFE87}, {0x0626, Joining::Dual, 0xFE89},  {0x0627, Joining::Right, 0xFE8D},
    {0x0628, Joining::Dual, 0xFE8F},  {0x0629, Joining::Right, 0xFE93}, {0x062A, Joining::Dual, 0xFE95},
    {0x062B, Joining::Dual, 0xFE99},  {0x062C, Joining::Dual, 0xFE9D},  {0x062D, Joining::Dual, 0xFEA1},
    {0x062E, Joining::Dual, 0xFEA5},  {0x062F, Joining::Right, 0xFEA9}, {0x0630, Joining::Right, 0xFEAB},
    {0x0631, Joining::Right, 0xFEAD}, {0x0632, Joining::Right, 0xFEAF}, {0x0633, Joining::Dual, 0xFEB1},
    {0x0634, Joining::Dual, 0xFEB5},  {0x0635, Joining::Dual, 0xFEB9},  {0x0636, Joining::Dual, 0xFEBD},
    {0x0637, Joining::Dual, 0xFEC1},  {0x0638, Joining::Dual, 0xFEC5},  {0x0639, Joining::Dual, 0xFEC9},
    {0x063A, Joining::Dual, 0xFECD},  {0x0641, Joining::Dual, 0xFED1},  {0x0642, Joining::Dual, 0xFED5},
    {0x0643, Joining::Dual, 0xFED9},  {0x0644, Joining::Dual, 0xFEDD},  {0x0645, Joining::Dual, 0xFEE1},
    {0x0646, Joining::Dual, 0xFEE5},  {0x0647, Joining::Dual, 0xFEE9},  {0x0648, Joining::Right, 0xFEED},
    {0x0649, Joining::Right, 0xFEEF}, {0x064A, Joining::Dual, 0xFEF1},  {0x0671, Joining::Right, 0xFB50},
    {0x067E, Joining::Dual, 0xFB56},  {0x0686, Joining::Dual, 0xFB7A},  {0x0698, Joining::Right, 0xFB8A},
    {0x06A4, Joining::Dual, 0xFB6A},  {0x06A9, Joining::Dual, 0xFB8E},  {0x06AF, Joining::Dual, 0xFB92},
    {0x06CC, Joining::Dual, 0xFBFC},
}};

constexpr char16_t lam = 0x0644;

// Lam-alef ligatures (isolated; the final form is + 1) by the alef they absorb.
char16_t lamAlefLigature(char16_t alef) {
    switch (alef) {
        case 0x0622: return 0xFEF5;
        case 0x0623: return 0xFEF7;
        case 0x0625: return 0xFEF9;
        case 0x0627: return 0xFEFB;
        default: return 0;
    }
}

const Forms* formsOf(char16_t c) {
    const auto it =
        std::lower_bound(letters.begin(), letters.end(), c, [](const Forms& f, char16_t v) { return f.letter < v; });
    return it != letters.end() && it->letter == c ? &*it : nullptr;
}

Joining joiningOf(char16_t c) {
    if (const Forms* f = formsOf(c)) return f->joining;
    if (c == 0x0640 || c == 0x200D) return Joining::Causing;
    if ((c >= 0x064B && c <= 0x065F) || c == 0x0670 || (c >= 0x0610 && c <= 0x061A) || (c >= 0x06D6 && c <= 0x06DC) ||
        (c >= 0x06DF && c <= 0x06E4) || c == 0x06E7 || c == 0x06E8 || (c >= 0x06EA && c <= 0x06ED))
        return Joining::Transparent;
    return Joining::None;
}

bool joinsForward(Joining j) { return j == Joining::Dual || j == Joining::Causing; }
bool joinsBackward(Joining j) { return j == Joining::Dual || j == Joining::Right || j == Joining::Causing; }

// Index of the nearest non-transparent character before or after i, or -1.
std::ptrdiff_t neighbour(const std::u16string& line, std::ptrdiff_t i, int step) {
    for (i += step; i >= 0 && i < static_cast<std::ptrdiff_t>(line.size()); i += step)
        if (joiningOf(line[i]) != Joining::Transparent) return i;
    return -1;
}

std::u16string shapeLine(const std::u16string& line) {
    std::u16string out;
    out.reserve(line.size());
    const auto n = static_cast<std::ptrdiff_t>(line.size());
    for (std::ptrdiff_t i = 0; i < n; ++i) {
        const char16_t c = line[i];
        const Forms* forms = formsOf(c);
        if (!forms) {
            out += c;
            continue;
        }
        const std::ptrdiff_t before = neighbour(line, i, -1);
        const bool joinedBefore = before >= 0 && joinsForward(joiningOf(line[before]));
        std::ptrdiff_t after = neighbour(line, i, +1);
        if (c == lam && after >= 0) {
            if (const char16_t ligature = lamAlefLigature(line[after])) {
                out += static_cast<char16_t>(ligature + (joinedBefore ? 1 : 0));
                // Marks between lam and alef follow the ligature.
                out.append(line, static_cast<std::size_t>(i + 1), static_cast<std::size_t>(after - i - 1));
                i = after;
                continue;
            }
        }
        const bool joinedAfter = forms->joining == Joining::Dual && after >= 0 && joinsBackward(joiningOf(line[after]));
        int form = 0;  // isolated
        if (joinedBefore && joinedAfter)
            form = 3;
        else if (joinedAfter)
            form = 2;
        else if (joinedBefore)
            form = 1;
        out += static_cast<char16_t>(forms->isolated + form);
    }
    return out;
}

}  // namespace

void transformArabicTextForPresentation(std::u16string& text) {
    std::u16string result;
    result.reserve(text.size());
    std::size_t start = 0;
    while (start <= text.size()) {
        std::size_t end = text.find(u'\n', start);
        const bool last = end == std::u16string::npos;
        if (last) end = text.size();
        std::u16string line = text.substr(start, end - start);
        std::erase(line, u'\r');
        result += shapeLine(line);
        if (last) break;
        result += u'\n';
        start = end + 1;
    }
    text.swap(result);
}

}  // namespace OmbUnicodeUtils
