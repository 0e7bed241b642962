// Strict UTF-8 / UTF-16 / UTF-32 transcoding used by OmbString.
#pragma once

#include <cstddef>
#include <string>

namespace oecore::detail {

// Each returns false on malformed input (overlong forms, surrogates encoded
// in UTF-8, lone surrogates in UTF-16, code points past U+10FFFF) and never
// reads past the given length.
bool utf8ToUtf16(const char* bytes, std::size_t length, std::u16string& out);
bool utf16ToUtf8(const char16_t* units, std::size_t length, std::string& out);
bool utf32ToUtf8(const char32_t* points, std::size_t length, std::string& out);

// Decodes one code point at bytes[pos]; advances pos. Returns -1 when the
// sequence there is malformed (pos then moves past one byte).
long decodeUtf8(const char* bytes, std::size_t length, std::size_t& pos);
void appendUtf8(char32_t point, std::string& out);

}  // namespace oecore::detail
