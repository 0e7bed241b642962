// OmbColor: an 8-bit RGBA colour, and the colour text of map styles.
//
// Grammar of fromString (white space around the text is ignored, names and
// hex digits in any case):
//   colour  := name | "#" hex3 | "#" hex6 | "#" hex8
//            | "rgb(" int "," int "," int ")" | "rgba(" int "," int "," int "," alpha ")"
//   name    := a CSS colour keyword (black, white, red, green, blue, yellow,
//              cyan/aqua, magenta/fuchsia, gray/grey, silver, maroon, olive,
//              lime, navy, purple, teal, orange, brown, pink) or "transparent"
//   hex3    := R G B, each digit doubled (#f80 is #ff8800)
//   hex6    := RR GG BB, opaque;  hex8 := RR GG BB AA
//   int     := 0..255;  alpha := a number from 0 to 1, or a percentage
// toString writes "#RRGGBBAA", which fromString reads back exactly.
#pragma once

#include <oecore/core/string.h>

#include <cstdint>

struct OmbColor {
    std::uint8_t r = 0;
    std::uint8_t g = 0;
    std::uint8_t b = 0;
    std::uint8_t a = 255;

    constexpr OmbColor() = default;
    constexpr OmbColor(std::uint8_t red, std::uint8_t green, std::uint8_t blue, std::uint8_t alpha = 255)
        : r(red), g(green), b(blue), a(alpha) {}

    // False, leaving out untouched, when the text is not a colour.
    static bool fromString(const OmbString& text, OmbColor& out);
    OmbString toString() const;

    friend bool operator==(const OmbColor&, const OmbColor&) = default;
};
