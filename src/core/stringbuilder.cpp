#include <oecore/core/exception.h>
#include <oecore/core/stringblock.h>
#include <oecore/core/stringbuilder.h>

#include <clocale>
#include <cstdio>
#include <cstdlib>
#include <cstring>

#include "utf.h"

using oecore::detail::StringBlock;

OmbStringBuilder::~OmbStringBuilder() { std::free(buffer_); }

void OmbStringBuilder::makeRoom(std::size_t n) {
    if (used_ + n < capacity_) return;
    std::size_t capacity = capacity_ ? capacity_ + capacity_ / 2 : 200;
    if (capacity <= used_ + n) capacity = used_ + n + 100;
    if (capacity > StringBlock::maxLength) OMB_THROW(StringTooLong);
    char* buffer = static_cast<char*>(std::malloc(StringBlock::headerSize + capacity));
    if (!buffer) throw std::bad_alloc();
    if (used_) std::memcpy(buffer + StringBlock::headerSize, buffer_ + StringBlock::headerSize, used_);
    std::free(buffer_);
    buffer_ = buffer;
    capacity_ = capacity;
}

OmbStringBuilder& OmbStringBuilder::append(const char* bytes, std::size_t count) {
    if (count == 0) return *this;
    makeRoom(count);
    std::memcpy(buffer_ + StringBlock::headerSize + used_, bytes, count);
    used_ += count;
    return *this;
}

OmbString OmbStringBuilder::str() {
    if (used_ == 0) return OmbString();
    buffer_[StringBlock::headerSize + used_] = '\0';
    StringBlock* block = StringBlock::adopt(buffer_, used_);
    buffer_ = nullptr;
    used_ = capacity_ = 0;
    return OmbString(block);
}

OmbStringBuilder& OmbStringBuilder::operator<<(wchar_t c) {
    std::string utf8;
    oecore::detail::appendUtf8(static_cast<char32_t>(c), utf8);
    return *this << std::string_view(utf8);
}

OmbStringBuilder& OmbStringBuilder::operator<<(const char* utf8) {
    if (utf8) append(utf8, std::strlen(utf8));
    return *this;
}

OmbStringBuilder& OmbStringBuilder::operator<<(const wchar_t* text) {
    if (text) *this << OmbString::fromWide(text);
    return *this;
}

OmbStringBuilder& OmbStringBuilder::operator<<(int value) { return *this << OmbFormat::dec(value); }
OmbStringBuilder& OmbStringBuilder::operator<<(unsigned int value) {
    return *this << static_cast<unsigned long long>(value);
}
OmbStringBuilder& OmbStringBuilder::operator<<(long value) { return *this << OmbFormat::dec(value); }
OmbStringBuilder& OmbStringBuilder::operator<<(unsigned long value) {
    return *this << static_cast<unsigned long long>(value);
}
OmbStringBuilder& OmbStringBuilder::operator<<(long long value) { return *this << OmbFormat::dec(value); }

OmbStringBuilder& OmbStringBuilder::operator<<(unsigned long long value) {
    char text[24];
    const int n = std::snprintf(text, sizeof text, "%llu", value);
    return append(text, static_cast<std::size_t>(n));
}

OmbStringBuilder& OmbStringBuilder::operator<<(float value) { return *this << static_cast<double>(value); }

OmbStringBuilder& OmbStringBuilder::operator<<(double value) { return *this << OmbFormat::real(value); }

OmbStringBuilder& OmbStringBuilder::operator<<(const OmbStringManipulator& m) {
    m.appendTo(*this);
    return *this;
}

namespace OmbFormat {

namespace {

// printf with the process locale's decimal separator turned back into ".".
template <class... Args>
void appendFormatted(OmbStringBuilder& builder, const char* format, Args... args) {
    char text[512];
    int n = std::snprintf(text, sizeof text, format, args...);
    if (n < 0) return;
    if (static_cast<std::size_t>(n) >= sizeof text) n = sizeof text - 1;
    const char* point = std::localeconv()->decimal_point;
    if (point && point[0] && point[0] != '.' && !point[1]) {
        for (int i = 0; i < n; ++i)
            if (text[i] == point[0]) text[i] = '.';
    }
    builder.append(text, static_cast<std::size_t>(n));
}

// Shortens an exponent such as e+005 to e+5, keeping at least one digit.
std::size_t trimExponent(char* text, std::size_t n) {
    char* e = static_cast<char*>(std::memchr(text, 'e', n));
    if (!e || e + 2 >= text + n) return n;
    char* digits = e + 2;
    char* first = digits;
    while (first + 1 < text + n && *first == '0') ++first;
    const std::size_t tail = static_cast<std::size_t>(text + n - first);
    std::memmove(digits, first, tail);
    return static_cast<std::size_t>(digits - text) + tail;
}

}  // namespace

void dec::appendTo(OmbStringBuilder& builder) const {
    if (width_ <= 0) return appendFormatted(builder, "%lld", value_);
    appendFormatted(builder, zeroPad_ ? "%0*lld" : "%*lld", width_, value_);
}

void hex::appendTo(OmbStringBuilder& builder) const {
    if (width_ <= 0) return appendFormatted(builder, "%llx", value_);
    appendFormatted(builder, zeroPad_ ? "%0*llx" : "%*llx", width_, value_);
}

void fixed::appendTo(OmbStringBuilder& builder) const {
    appendFormatted(builder, zeroPad_ ? "%0*.*f" : "%*.*f", width_, decimals_, value_);
}

void scientific::appendTo(OmbStringBuilder& builder) const { appendFormatted(builder, "%.*e", decimals_, value_); }

void real::appendTo(OmbStringBuilder& builder) const {
    OmbStringBuilder digits;
    appendFormatted(digits, "%.17g", value_);
    std::string text(digits.str().view());
    text.resize(trimExponent(text.data(), text.size()));
    builder << std::string_view(text);
}

}  // namespace OmbFormat
