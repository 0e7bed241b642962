#include "utf.h"

namespace oecore::detail {

namespace {

bool isContinuation(unsigned char c) { return (c & 0xC0) == 0x80; }
bool isSurrogate(char32_t p) { return p >= 0xD800 && p <= 0xDFFF; }

}  // namespace

long decodeUtf8(const char* bytes, std::size_t length, std::size_t& pos) {
    const auto lead = static_cast<unsigned char>(bytes[pos]);
    std::size_t extra;
    char32_t point;
    char32_t minimum;
    if (lead < 0x80) {
        ++pos;
        return lead;
    } else if ((lead & 0xE0) == 0xC0) {
        extra = 1, point = lead & 0x1F, minimum = 0x80;
    } else if ((lead & 0xF0) == 0xE0) {
        extra = 2, point = lead & 0x0F, minimum = 0x800;
    } else if ((lead & 0xF8) == 0xF0) {
        extra = 3, point = lead & 0x07, minimum = 0x10000;
    } else {
        ++pos;
        return -1;
    }
    if (length - pos <= extra) {
        ++pos;
        return -1;
    }
    for (std::size_t i = 1; i <= extra; ++i) {
        const auto c = static_cast<unsigned char>(bytes[pos + i]);
        if (!isContinuation(c)) {
            ++pos;
            return -1;
        }
        point = (point << 6) | (c & 0x3F);
    }
    if (point < minimum || point > 0x10FFFF || isSurrogate(point)) {
        ++pos;
        return -1;
    }
    pos += extra + 1;
    return static_cast<long>(point);
}

void appendUtf8(char32_t p, std::string& out) {
    if (p < 0x80) {
        out += static_cast<char>(p);
    } else if (p < 0x800) {
        out += static_cast<char>(0xC0 | (p >> 6));
        out += static_cast<char>(0x80 | (p & 0x3F));
    } else if (p < 0x10000) {
        out += static_cast<char>(0xE0 | (p >> 12));
        out += static_cast<char>(0x80 | ((p >> 6) & 0x3F));
        out += static_cast<char>(0x80 | (p & 0x3F));
    } else {
        out += static_cast<char>(0xF0 | (p >> 18));
        out += static_cast<char>(0x80 | ((p >> 12) & 0x3F));
        out += static_cast<char>(0x80 | ((p >> 6) & 0x3F));
        out += static_cast<char>(0x80 | (p & 0x3F));
    }
}

bool utf8ToUtf16(const char* bytes, std::size_t length, std::u16string& out) {
    out.clear();
    out.reserve(length);
    for (std::size_t pos = 0; pos < length;) {
        const long point = decodeUtf8(bytes, length, pos);
        if (point < 0) return false;
        if (point < 0x10000) {
            out += static_cast<char16_t>(point);
        } else {
            const long v = point - 0x10000;
            out += static_cast<char16_t>(0xD800 | (v >> 10));
            out += static_cast<char16_t>(0xDC00 | (v & 0x3FF));
        }
    }
    return true;
}

bool utf16ToUtf8(const char16_t* units, std::size_t length, std::string& out) {
    out.clear();
    out.reserve(length);
    for (std::size_t i = 0; i < length; ++i) {
        char32_t p = units[i];
        if (p >= 0xD800 && p <= 0xDBFF) {
            if (i + 1 >= length || units[i + 1] < 0xDC00 || units[i + 1] > 0xDFFF) return false;
            p = 0x10000 + ((p - 0xD800) << 10) + (units[++i] - 0xDC00);
        } else if (p >= 0xDC00 && p <= 0xDFFF) {
            return false;
        }
        appendUtf8(p, out);
    }
    return true;
}

bool utf32ToUtf8(const char32_t* points, std::size_t length, std::string& out) {
    out.clear();
    out.reserve(length);
    for (std::size_t i = 0; i < length; ++i) {
        if (points[i] > 0x10FFFF || isSurrogate(points[i])) return false;
        appendUtf8(points[i], out);
    }
    return true;
}

}  // namespace oecore::detail
