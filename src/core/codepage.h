// Conversions between UTF-8 and the locale's or a numbered code page (iconv).
#pragma once

#include <string>
#include <string_view>

namespace oecore::detail {

// The charset of the process's current LC_CTYPE locale.
std::string activeCodePageName();
// iconv's name for a Windows code page number (65001 is UTF-8, 1252 CP1252).
std::string codePageName(int codePage);

// Converts text between two iconv charsets. Returns false when the input is
// malformed or cannot be represented, unless ignoreErrors is set, in which
// case such characters are dropped.
bool convertCharset(std::string_view text, const std::string& from, const std::string& to, bool ignoreErrors,
                    std::string& out);

}  // namespace oecore::detail
