#include <oecore/core/unicodeutils.h>

#include <gtest/gtest.h>

using OmbUnicodeUtils::transformArabicTextForPresentation;

namespace {

std::u16string shaped(std::u16string text) {
    transformArabicTextForPresentation(text);
    return text;
}

}  // namespace

TEST(ArabicShaping, LettersTakeTheirPositionalForms) {
    // beh seen meem: initial, medial, final.
    EXPECT_EQ(shaped(u"\u0628\u0633\u0645"), (std::u16string{0xFE91, 0xFEB4, 0xFEE2}));
    // A lone letter is isolated.
    EXPECT_EQ(shaped(u"\u0628"), (std::u16string{0xFE8F}));
    // Dal joins only to the letter before it, so the beh after it starts anew.
    EXPECT_EQ(shaped(u"\u0628\u062F\u0628"), (std::u16string{0xFE91, 0xFEAA, 0xFE8F}));
    // Persian peh and farsi yeh use the extended forms.
    EXPECT_EQ(shaped(u"\u067E\u06CC"), (std::u16string{0xFB58, 0xFBFD}));
}

TEST(ArabicShaping, LamAlefBecomesALigature) {
    EXPECT_EQ(shaped(u"\u0644\u0627"), (std::u16string{0xFEFB}));
    // salam: seen initial, lam-alef final, meem isolated (alef does not join on).
    EXPECT_EQ(shaped(u"\u0633\u0644\u0627\u0645"), (std::u16string{0xFEB3, 0xFEFC, 0xFEE1}));
    EXPECT_EQ(shaped(u"\u0644\u0623"), (std::u16string{0xFEF7}));
    EXPECT_EQ(shaped(u"\u0644\u0625"), (std::u16string{0xFEF9}));
    EXPECT_EQ(shaped(u"\u0644\u0622"), (std::u16string{0xFEF5}));
}

TEST(ArabicShaping, MarksAreSkippedWhenJoining) {
    // beh fatha beh: the mark stays and does not break the join.
    EXPECT_EQ(shaped(u"\u0628\u064E\u0628"), (std::u16string{0xFE91, 0x064E, 0xFE90}));
    // Tatweel joins on both sides.
    EXPECT_EQ(shaped(u"\u0628\u0640\u0628"), (std::u16string{0xFE91, 0x0640, 0xFE90}));
}

TEST(ArabicShaping, LinesAreShapedSeparatelyAndOtherTextIsKept) {
    EXPECT_EQ(shaped(u"\u0628\r\n\u0628 A1"), (std::u16string{0xFE8F, u'\n', 0xFE8F, u' ', u'A', u'1'}));
    EXPECT_EQ(shaped(u"Harbour\n"), u"Harbour\n");
    EXPECT_EQ(shaped(u""), u"");
    // A space ends a word: both behs are isolated.
    EXPECT_EQ(shaped(u"\u0628 \u0628"), (std::u16string{0xFE8F, u' ', 0xFE8F}));
}
