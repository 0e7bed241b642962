// OmbString: the library's shared, immutable UTF-8 string.
//
// Two words: a pointer to a shared heap block (or null) and a pointer to the
// text. Copies share the block through an atomic count; a string made with
// OmbString::literal() points at the literal and never allocates. Sizes and
// positions are in bytes.
//
// Thread safety: copies of one string may be made and destroyed on any
// thread at once; a single OmbString value must not be assigned from two
// threads at the same time.
#pragma once

#include <oecore/core/stringblock.h>

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <iosfwd>
#include <string>
#include <string_view>

class OmbStringBuilder;

class OmbString {
public:
    OmbString() noexcept = default;
    OmbString(const OmbString& other) noexcept : block_(other.block_), text_(other.text_) {
        if (block_) block_->ref();
    }
    OmbString(OmbString&& other) noexcept : block_(other.block_), text_(other.text_) {
        other.block_ = nullptr;
        other.text_ = nullptr;
    }
    // Copies the bytes (taken as UTF-8); null gives the empty string.
    OmbString(const char* utf8);
    OmbString(const char* begin, const char* end);
    OmbString(std::string_view utf8);
    ~OmbString() { release(); }

    OmbString& operator=(const OmbString& other) noexcept;
    OmbString& operator=(OmbString&& other) noexcept;

    // A string that refers to a literal with static lifetime without copying.
    static OmbString literal(const char* text) noexcept;

    // A length of -1 means the input is zero-terminated.
    static OmbString fromUtf8(const char* bytes, std::ptrdiff_t length = -1);
    static OmbString fromLatin1(const char* bytes, std::ptrdiff_t length = -1);
    static OmbString fromWide(const char16_t* utf16, std::ptrdiff_t length = -1);
    static OmbString fromWide(const wchar_t* chars, std::ptrdiff_t length = -1);
    static OmbString fromActiveCP(const char* bytes, std::ptrdiff_t length = -1);
    static OmbString fromSpecificCP(int codePage, const char* bytes, std::ptrdiff_t length = -1);

    void assignFromUtf8(const char* bytes, std::ptrdiff_t length = -1);
    void assignFromLatin1(const char* bytes, std::ptrdiff_t length = -1);
    void assignFromWide(const char16_t* utf16, std::ptrdiff_t length = -1);
    void assignFromActiveCP(const char* bytes, std::ptrdiff_t length = -1);
    void assignFromSpecificCP(int codePage, const char* bytes, std::ptrdiff_t length = -1);

    // Never null; the empty string gives "".
    const char* dataUtf8() const noexcept { return text_ ? text_ : ""; }
    std::u16string toWide() const;
    std::string toLatin1() const;
    std::string toActiveCP() const;
    std::string toActiveCPIgnoreErrors() const;
    std::string toSpecificCP(int codePage) const;
    operator std::string() const { return std::string(dataUtf8(), size()); }
    std::string_view view() const noexcept { return {dataUtf8(), size()}; }

    std::size_t size() const noexcept {
        if (block_) return block_->length;
        return text_ ? std::strlen(text_) : 0;
    }
    bool empty() const noexcept { return size() == 0; }

    // Byte positions; -1 when not found.
    std::ptrdiff_t find(const OmbString& s, std::ptrdiff_t from = 0) const noexcept;
    std::ptrdiff_t findLast(const OmbString& s, std::ptrdiff_t from = -1) const noexcept;
    std::ptrdiff_t findFirstOf(const OmbString& list, std::ptrdiff_t from = 0) const noexcept;
    std::ptrdiff_t findLastOf(const OmbString& list, std::ptrdiff_t from = -1) const noexcept;
    bool startsWith(const OmbString& s) const noexcept;
    bool endsWith(const OmbString& s) const noexcept;
    bool contains(const OmbString& s) const noexcept { return find(s) >= 0; }

    OmbString substr(std::size_t pos) const;
    OmbString substr(std::size_t pos, std::size_t count) const;
    OmbString replace(const OmbString& what, const OmbString& with, bool all = true) const;
    OmbString toUpper() const;
    OmbString toLower() const;

    OmbString& operator+=(const OmbString& other);
    void clear() noexcept;
    void swap(OmbString& other) noexcept;

    friend OmbString operator+(const OmbString& a, const OmbString& b);
    friend bool operator==(const OmbString& a, const OmbString& b) noexcept { return a.compare(b) == 0; }
    friend bool operator!=(const OmbString& a, const OmbString& b) noexcept { return a.compare(b) != 0; }
    friend bool operator<(const OmbString& a, const OmbString& b) noexcept { return a.compare(b) < 0; }
    friend bool operator<=(const OmbString& a, const OmbString& b) noexcept { return a.compare(b) <= 0; }
    friend bool operator>(const OmbString& a, const OmbString& b) noexcept { return a.compare(b) > 0; }
    friend bool operator>=(const OmbString& a, const OmbString& b) noexcept { return a.compare(b) >= 0; }

    // True when the string shares heap storage (false for literals and "").
    bool isAllocated() const noexcept { return block_ != nullptr; }

private:
    friend class OmbStringBuilder;
    using Block = oecore::detail::StringBlock;

    explicit OmbString(Block* block) noexcept;
    int compare(const OmbString& other) const noexcept {
        if (text_ == other.text_) return 0;
        const std::size_t a = size();
        const std::size_t b = other.size();
        const int c = std::memcmp(dataUtf8(), other.dataUtf8(), a < b ? a : b);
        if (c != 0) return c < 0 ? -1 : 1;
        return a == b ? 0 : (a < b ? -1 : 1);
    }
    void release() noexcept {
        if (block_) block_->unref();
        block_ = nullptr;
        text_ = nullptr;
    }

    Block* block_ = nullptr;
    const char* text_ = nullptr;
};

std::ostream& operator<<(std::ostream& out, const OmbString& s);

template <>
struct std::hash<OmbString> {
    std::size_t operator()(const OmbString& s) const noexcept { return std::hash<std::string_view>()(s.view()); }
};
