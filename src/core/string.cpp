#include <oecore/core/exception.h>
#include <oecore/core/string.h>
#include <oecore/core/stringblock.h>

#include <locale.h>
#include <atomic>
#include <cstdlib>
#include <cstring>
#include <cwctype>
#include <new>
#include <ostream>

#include "codepage.h"
#include "utf.h"

using oecore::detail::StringBlock;

namespace {

StringBlock* newBlock(const char* bytes, std::size_t length) {
    if (length > StringBlock::maxLength) OMB_THROW(StringTooLong);
    auto* block = StringBlock::allocate(length);
    std::memcpy(block->bytes(), bytes, length);
    block->bytes()[length] = '\0';
    return block;
}

std::size_t lengthOf(const char* bytes, std::ptrdiff_t length) {
    if (!bytes) return 0;
    return length < 0 ? std::strlen(bytes) : static_cast<std::size_t>(length);
}

template <class Char>
std::size_t lengthOf(const Char* chars, std::ptrdiff_t length) {
    if (!chars) return 0;
    if (length >= 0) return static_cast<std::size_t>(length);
    std::size_t n = 0;
    while (chars[n]) ++n;
    return n;
}

[[noreturn]] void conversionFailed(const char* from, const char* to) {
    OMB_THROW(StringConversionFailed, OmbString::literal(from), OmbString::literal(to));
}

OmbString fromCharset(const char* bytes, std::ptrdiff_t length, const std::string& charset, const char* name) {
    std::string utf8;
    if (!oecore::detail::convertCharset({bytes, lengthOf(bytes, length)}, charset, "UTF-8", false, utf8))
        conversionFailed(name, "UTF-8");
    return OmbString(std::string_view(utf8));
}

std::string toCharset(const OmbString& s, const std::string& charset, const char* name, bool ignoreErrors) {
    std::string out;
    if (!oecore::detail::convertCharset(s.view(), "UTF-8", charset, ignoreErrors, out)) conversionFailed("UTF-8", name);
    return out;
}

// Case mapping uses the C.UTF-8 locale when it exists, so that it covers all
// of Unicode whatever locale the application has set.
locale_t unicodeLocale() {
    static const locale_t locale = newlocale(LC_CTYPE_MASK, "C.UTF-8", nullptr);
    return locale;
}

template <class Map, class MapL>
OmbString mapCase(const OmbString& s, Map map, MapL mapL) {
    std::u16string wide = s.toWide();
    const locale_t locale = unicodeLocale();
    for (char16_t& unit : wide) {
        if (unit >= 0xD800 && unit <= 0xDFFF) continue;
        const wint_t mapped = locale ? mapL(unit, locale) : map(unit);
        if (mapped <= 0xFFFF) unit = static_cast<char16_t>(mapped);
    }
    return OmbString::fromWide(wide.data(), static_cast<std::ptrdiff_t>(wide.size()));
}

}  // namespace

OmbString::OmbString(StringBlock* block) noexcept : block_(block), text_(block ? block->bytes() : nullptr) {}

OmbString::OmbString(const char* utf8) { assignFromUtf8(utf8, -1); }

OmbString::OmbString(const char* begin, const char* end) { assignFromUtf8(begin, end - begin); }

OmbString::OmbString(std::string_view utf8) { assignFromUtf8(utf8.data(), static_cast<std::ptrdiff_t>(utf8.size())); }

OmbString& OmbString::operator=(const OmbString& other) noexcept {
    if (block_ == other.block_) {
        text_ = other.text_;
        return *this;
    }
    if (other.block_) other.block_->ref();
    release();
    block_ = other.block_;
    text_ = other.text_;
    return *this;
}

OmbString& OmbString::operator=(OmbString&& other) noexcept {
    if (this != &other) {
        release();
        std::swap(block_, other.block_);
        std::swap(text_, other.text_);
    }
    return *this;
}

OmbString OmbString::literal(const char* text) noexcept {
    OmbString s;
    if (text && *text) s.text_ = text;
    return s;
}

OmbString OmbString::fromUtf8(const char* bytes, std::ptrdiff_t length) {
    OmbString s;
    s.assignFromUtf8(bytes, length);
    return s;
}

OmbString OmbString::fromLatin1(const char* bytes, std::ptrdiff_t length) {
    OmbString s;
    s.assignFromLatin1(bytes, length);
    return s;
}

OmbString OmbString::fromWide(const char16_t* utf16, std::ptrdiff_t length) {
    OmbString s;
    s.assignFromWide(utf16, length);
    return s;
}

OmbString OmbString::fromWide(const wchar_t* chars, std::ptrdiff_t length) {
    static_assert(sizeof(wchar_t) == sizeof(char32_t), "wchar_t holds UTF-32 on Linux");
    std::string utf8;
    if (!oecore::detail::utf32ToUtf8(reinterpret_cast<const char32_t*>(chars), lengthOf(chars, length), utf8))
        conversionFailed("UTF-32", "UTF-8");
    return OmbString(std::string_view(utf8));
}

OmbString OmbString::fromActiveCP(const char* bytes, std::ptrdiff_t length) {
    OmbString s;
    s.assignFromActiveCP(bytes, length);
    return s;
}

OmbString OmbString::fromSpecificCP(int codePage, const char* bytes, std::ptrdiff_t length) {
    OmbString s;
    s.assignFromSpecificCP(codePage, bytes, length);
    return s;
}

void OmbString::assignFromUtf8(const char* bytes, std::ptrdiff_t length) {
    const std::size_t n = lengthOf(bytes, length);
    StringBlock* block = n ? newBlock(bytes, n) : nullptr;
    release();
    block_ = block;
    text_ = block ? block->bytes() : nullptr;
}

void OmbString::assignFromLatin1(const char* bytes, std::ptrdiff_t length) {
    const std::size_t n = lengthOf(bytes, length);
    std::string utf8;
    utf8.reserve(n);
    for (std::size_t i = 0; i < n; ++i) oecore::detail::appendUtf8(static_cast<unsigned char>(bytes[i]), utf8);
    assignFromUtf8(utf8.data(), static_cast<std::ptrdiff_t>(utf8.size()));
}

void OmbString::assignFromWide(const char16_t* utf16, std::ptrdiff_t length) {
    std::string utf8;
    if (!oecore::detail::utf16ToUtf8(utf16, lengthOf(utf16, length), utf8)) conversionFailed("UTF-16", "UTF-8");
    assignFromUtf8(utf8.data(), static_cast<std::ptrdiff_t>(utf8.size()));
}

void OmbString::assignFromActiveCP(const char* bytes, std::ptrdiff_t length) {
    *this = fromCharset(bytes, length, oecore::detail::activeCodePageName(), "ActiveCP");
}

void OmbString::assignFromSpecificCP(int codePage, const char* bytes, std::ptrdiff_t length) {
    const std::string name = oecore::detail::codePageName(codePage);
    *this = fromCharset(bytes, length, name, name.c_str());
}

std::u16string OmbString::toWide() const {
    std::u16string wide;
    if (!oecore::detail::utf8ToUtf16(dataUtf8(), size(), wide)) conversionFailed("UTF-8", "UTF-16");
    return wide;
}

std::string OmbString::toLatin1() const { return toCharset(*this, "ISO-8859-1", "Latin1", false); }

std::string OmbString::toActiveCP() const {
    return toCharset(*this, oecore::detail::activeCodePageName(), "ActiveCP", false);
}

std::string OmbString::toActiveCPIgnoreErrors() const {
    return toCharset(*this, oecore::detail::activeCodePageName(), "ActiveCP", true);
}

std::string OmbString::toSpecificCP(int codePage) const {
    const std::string name = oecore::detail::codePageName(codePage);
    return toCharset(*this, name, name.c_str(), false);
}

namespace {

// Between string_view's unsigned positions and ours, where -1 is "none" (or,
// as a start, "from the end").
std::ptrdiff_t position(std::size_t pos) {
    return pos == std::string_view::npos ? -1 : static_cast<std::ptrdiff_t>(pos);
}
std::size_t startFromEnd(std::ptrdiff_t from) {
    return from < 0 ? std::string_view::npos : static_cast<std::size_t>(from);
}

}  // namespace

std::ptrdiff_t OmbString::find(const OmbString& s, std::ptrdiff_t from) const noexcept {
    if (empty() || s.empty() || from < 0) return -1;
    return position(view().find(s.view(), static_cast<std::size_t>(from)));
}

std::ptrdiff_t OmbString::findLast(const OmbString& s, std::ptrdiff_t from) const noexcept {
    if (empty() || s.empty()) return -1;
    return position(view().rfind(s.view(), startFromEnd(from)));
}

std::ptrdiff_t OmbString::findFirstOf(const OmbString& list, std::ptrdiff_t from) const noexcept {
    if (empty() || list.empty() || from < 0) return -1;
    return position(view().find_first_of(list.view(), static_cast<std::size_t>(from)));
}

std::ptrdiff_t OmbString::findLastOf(const OmbString& list, std::ptrdiff_t from) const noexcept {
    if (empty() || list.empty()) return -1;
    return position(view().find_last_of(list.view(), startFromEnd(from)));
}

bool OmbString::startsWith(const OmbString& s) const noexcept { return view().starts_with(s.view()); }

bool OmbString::endsWith(const OmbString& s) const noexcept { return view().ends_with(s.view()); }

OmbString OmbString::substr(std::size_t pos) const {
    if (pos > size()) OMB_THROW(StringIndexOutOfRange);
    if (pos == 0) return *this;
    // The tail of a literal is itself a literal.
    if (!block_) return literal(text_ + pos);
    return OmbString(view().substr(pos));
}

OmbString OmbString::substr(std::size_t pos, std::size_t count) const {
    if (pos > size() || count > size() - pos) OMB_THROW(StringIndexOutOfRange);
    if (pos == 0 && count == size()) return *this;
    return OmbString(view().substr(pos, count));
}

OmbString OmbString::replace(const OmbString& what, const OmbString& with, bool all) const {
    if (what.empty() || empty()) return *this;
    std::ptrdiff_t pos = find(what);
    if (pos < 0) return *this;
    std::string out;
    std::size_t copied = 0;
    const std::string_view text = view();
    while (pos >= 0) {
        out.append(text.substr(copied, static_cast<std::size_t>(pos) - copied));
        out.append(with.view());
        copied = static_cast<std::size_t>(pos) + what.size();
        pos = all ? find(what, static_cast<std::ptrdiff_t>(copied)) : -1;
    }
    out.append(text.substr(copied));
    return OmbString(std::string_view(out));
}

OmbString OmbString::toUpper() const { return mapCase(*this, ::towupper, ::towupper_l); }

OmbString OmbString::toLower() const { return mapCase(*this, ::towlower, ::towlower_l); }

OmbString& OmbString::operator+=(const OmbString& other) { return *this = *this + other; }

OmbString operator+(const OmbString& a, const OmbString& b) {
    if (b.empty()) return a;
    if (a.empty()) return b;
    const std::size_t n = a.size() + b.size();
    if (n > StringBlock::maxLength) OMB_THROW(StringTooLong);
    auto* block = StringBlock::allocate(n);
    std::memcpy(block->bytes(), a.dataUtf8(), a.size());
    std::memcpy(block->bytes() + a.size(), b.dataUtf8(), b.size());
    block->bytes()[n] = '\0';
    return OmbString(block);
}

void OmbString::clear() noexcept { release(); }

void OmbString::swap(OmbString& other) noexcept {
    std::swap(block_, other.block_);
    std::swap(text_, other.text_);
}

std::ostream& operator<<(std::ostream& out, const OmbString& s) { return out << s.view(); }
