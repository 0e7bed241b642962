// Preparing text for display by renderers that draw one glyph per code unit.
#pragma once

#include <string>

namespace OmbUnicodeUtils {

// Rewrites Arabic letters in place into their contextual presentation forms
// (isolated, initial, medial, final) and joins lam + alef into ligatures.
// Lines (ending at line feeds) are shaped separately; carriage returns are
// removed. Text in other scripts is left as it is.
void transformArabicTextForPresentation(std::u16string& text);

}  // namespace OmbUnicodeUtils
