// Parsing, splitting and matching helpers used by the settings reader, the
// configuration reader and the expression language.
#pragma once

#include <oecore/core/string.h>

#include <cstdint>
#include <iosfwd>
#include <string_view>
#include <vector>

namespace OmbStringUtils {

// Pieces between the separators, in order, empty pieces included; the empty
// string gives one empty piece.
void split(const OmbString& s, char separator, std::vector<OmbString>& out);
// The same with any of several separator strings (the longest match wins).
void split(const OmbString& s, const std::vector<OmbString>& separators, std::vector<OmbString>& out);

// Removes runs of ch (or of any listed string) at the chosen ends.
OmbString strip(const OmbString& s, char ch, bool left = true, bool right = true);
OmbString strip(const OmbString& s, const std::vector<OmbString>& list, bool left = true, bool right = true);
// " ", "\t" and "\n".
const std::vector<OmbString>& whiteSpace();

OmbString itoa(int n);
// C rules: leading white space, optional sign, digits; 0 when nothing parses.
std::int64_t atoi64(const OmbString& s);
// "." is the decimal separator whatever the process locale.
double atof(const OmbString& s);

bool isEqualIgnoreCase(const OmbString& a, const OmbString& b);

// Whether the bytes are well-formed UTF-8; if not, badOffset is the byte
// position of the first malformed sequence.
bool isValidUtf8(std::string_view bytes, std::size_t* badOffset = nullptr);

// Byte-wise, case-sensitive; "*" matches any run, "?" exactly one byte.
bool wildcardMatch(const OmbString& pattern, const OmbString& text);

// The variable's value as UTF-8, or the empty string when it is unset.
OmbString getEnvironmentVariable(const OmbString& name);

// Reads one line without its line end ("\n" or "\r\n"); false at end of input.
bool readLine(std::istream& stream, OmbString& out);

}  // namespace OmbStringUtils
