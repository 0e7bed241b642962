#include <oecore/core/exception.h>
#include <oecore/core/string.h>

#include <gtest/gtest.h>

#include <clocale>
#include <string>

TEST(String, LiteralsAndTheirCopiesNeverAllocate) {
    const OmbString lit = OmbString::literal("harbour");
    const OmbString copy = lit;
    EXPECT_FALSE(lit.isAllocated());
    EXPECT_FALSE(copy.isAllocated());
    EXPECT_EQ(lit.size(), 7u);
    EXPECT_EQ(copy.size(), 7u);
    EXPECT_EQ(copy.dataUtf8(), lit.dataUtf8());
    EXPECT_FALSE(lit.substr(3).isAllocated());
}

TEST(String, CopiesShareOneBlock) {
    const OmbString a("quay");
    OmbString b = a;
    EXPECT_TRUE(a.isAllocated());
    EXPECT_EQ(a.dataUtf8(), b.dataUtf8());
    b += OmbString("side");
    EXPECT_EQ(a, OmbString("quay"));
    EXPECT_EQ(b, OmbString("quayside"));
    b = b;
    EXPECT_EQ(b, OmbString("quayside"));
}

TEST(String, EmptyFormsAreEqualAndLessThanAnyText) {
    const OmbString null;
    const OmbString fromLiteral = OmbString::literal("");
    const OmbString fromBytes("");
    EXPECT_EQ(null, fromLiteral);
    EXPECT_EQ(null, fromBytes);
    EXPECT_STREQ(null.dataUtf8(), "");
    EXPECT_TRUE(null.empty());
    EXPECT_LT(null, OmbString("a"));
    EXPECT_LT(OmbString("ab"), OmbString("b"));
    EXPECT_LT(OmbString("a"), OmbString("ab"));
    // Byte order is code-point order: U+00E9 sorts after "z".
    EXPECT_GT(OmbString("\xC3\xA9"), OmbString("z"));
}

TEST(String, SubstrPositionsAreCheckedInBytes) {
    const OmbString s(
        "K\xC3\xB8"
        "benhavn");  // 10 bytes
    EXPECT_EQ(s.size(), 10u);
    EXPECT_TRUE(s.substr(s.size()).empty());
    EXPECT_THROW(s.substr(s.size() + 1), OmbXStringIndexOutOfRange);
    EXPECT_EQ(s.substr(3, 4), OmbString("benh"));
    EXPECT_EQ(s.substr(6, 4), OmbString("havn"));
    EXPECT_THROW(s.substr(6, 5), OmbXStringIndexOutOfRange);
    EXPECT_THROW(s.substr(1, static_cast<std::size_t>(-1)), OmbXStringIndexOutOfRange);
    try {
        s.substr(11);
    } catch (const OmbException& e) {
        EXPECT_EQ(e.asString(), OmbString("String index was out of range."));
    }
}

TEST(String, SearchFunctions) {
    const OmbString s("a.b.c");
    EXPECT_EQ(s.find(OmbString("")), -1);
    EXPECT_EQ(OmbString().find(OmbString("a")), -1);
    EXPECT_EQ(s.find(OmbString(".")), 1);
    EXPECT_EQ(s.find(OmbString("."), 2), 3);
    EXPECT_EQ(s.find(OmbString("x")), -1);
    EXPECT_EQ(s.findLast(OmbString(".")), 3);
    EXPECT_EQ(s.findLast(OmbString("."), 2), 1);
    EXPECT_EQ(s.findFirstOf(OmbString("cb")), 2);
    EXPECT_EQ(s.findLastOf(OmbString("ab")), 2);
    EXPECT_TRUE(s.startsWith(OmbString("a.")));
    EXPECT_TRUE(s.endsWith(OmbString(".c")));
    EXPECT_TRUE(s.contains(OmbString("b.c")));
    EXPECT_FALSE(s.contains(OmbString()));
}

TEST(String, ReplaceResumesAfterInsertedText) {
    EXPECT_EQ(OmbString("aaa").replace(OmbString("a"), OmbString("aa")), OmbString("aaaaaa"));
    EXPECT_EQ(OmbString("a-b-c").replace(OmbString("-"), OmbString("+"), false), OmbString("a+b-c"));
    EXPECT_EQ(OmbString("abc").replace(OmbString(""), OmbString("x")), OmbString("abc"));
}

TEST(String, CaseMappingCoversNonAsciiLetters) {
    EXPECT_EQ(OmbString("Stra\xC3\x9F"
                        "e \xC3\xA9t\xC3\xA9")
                  .toUpper(),
              OmbString("STRA\xC3\x9F"
                        "E \xC3\x89T\xC3\x89"));
    EXPECT_EQ(OmbString("\xD0\x9C\xD0\x9E\xD0\xA1\xD0\x9A\xD0\x92\xD0\x90").toLower(),
              OmbString("\xD0\xBC\xD0\xBE\xD1\x81\xD0\xBA\xD0\xB2\xD0\xB0"));
    // Characters outside the basic plane pass through unchanged.
    EXPECT_EQ(OmbString("x\xF0\x9F\x97\xBA").toUpper(), OmbString("X\xF0\x9F\x97\xBA"));
}

TEST(String, Utf16RoundTripIncludesSurrogatePairs) {
    const OmbString s("A\xC3\xA9\xE2\x82\xAC\xF0\x9F\x97\xBA");  // A é € 🗺
    const std::u16string wide = s.toWide();
    EXPECT_EQ(wide, (std::u16string{u'A', 0x00E9, 0x20AC, 0xD83D, 0xDDFA}));
    EXPECT_EQ(OmbString::fromWide(wide.data(), static_cast<std::ptrdiff_t>(wide.size())), s);
    EXPECT_EQ(OmbString::fromWide(L"\u00e9t\u00e9"), OmbString("\xC3\xA9t\xC3\xA9"));
}

TEST(String, MalformedInputThrowsAndNeverReadsPastTheEnd) {
    const char* malformed[] = {
        "\xC3",              // truncated two-byte sequence
        "ab\xE2\x82",        // truncated three-byte sequence at the end
        "\xC0\xAF",          // overlong "/"
        "\xED\xA0\x80",      // an encoded surrogate
        "\xF4\x90\x80\x80",  // past U+10FFFF
        "\x80",              // a lone continuation byte
    };
    for (const char* bytes : malformed) {
        // Copy into an exactly sized buffer so ASan sees any read past the end.
        const std::string exact(bytes);
        auto* buffer = new char[exact.size()];
        exact.copy(buffer, exact.size());
        const OmbString s = OmbString::fromUtf8(buffer, static_cast<std::ptrdiff_t>(exact.size()));
        delete[] buffer;
        EXPECT_THROW(s.toWide(), OmbXStringConversionFailed) << exact;
        EXPECT_THROW(s.toLatin1(), OmbXStringConversionFailed) << exact;
    }
    const char16_t loneHigh[] = {u'a', 0xD800};
    EXPECT_THROW(OmbString::fromWide(loneHigh, 2), OmbXStringConversionFailed);
    const char16_t loneLow[] = {0xDC00, u'a', 0};
    try {
        OmbString::fromWide(loneLow);
        FAIL();
    } catch (const OmbXStringConversionFailed& e) {
        EXPECT_EQ(e.asString(), OmbString("Failed to convert string from UTF-16 to UTF-8."));
    }
}

TEST(String, CodePages) {
    EXPECT_EQ(OmbString::fromLatin1("caf\xE9"), OmbString("caf\xC3\xA9"));
    EXPECT_EQ(OmbString("caf\xC3\xA9").toLatin1(), std::string("caf\xE9"));
    EXPECT_THROW(OmbString("\xE2\x82\xAC").toLatin1(), OmbXStringConversionFailed);
    EXPECT_EQ(OmbString::fromSpecificCP(1252, "\x80 5"), OmbString("\xE2\x82\xAC 5"));
    EXPECT_EQ(OmbString("\xE2\x82\xAC").toSpecificCP(1252), std::string("\x80"));
    EXPECT_EQ(OmbString("x").toSpecificCP(65001), std::string("x"));
}

TEST(String, ActiveCodePageFollowsTheLocale) {
    const std::string saved = std::setlocale(LC_CTYPE, nullptr);
    // The C locale's code page is ASCII: it cannot represent "é".
    std::setlocale(LC_CTYPE, "C");
    const OmbString text("caf\xC3\xA9");
    try {
        text.toActiveCP();
        ADD_FAILURE() << "no exception";
    } catch (const OmbXStringConversionFailed& e) {
        EXPECT_EQ(e.asString(), OmbString("Failed to convert string from UTF-8 to ActiveCP."));
    }
    EXPECT_EQ(text.toActiveCPIgnoreErrors(), std::string("caf"));
    EXPECT_EQ(OmbString::fromActiveCP("plain"), OmbString("plain"));
    if (std::setlocale(LC_CTYPE, "C.UTF-8")) {
        EXPECT_EQ(text.toActiveCP(), std::string(text));
        EXPECT_EQ(OmbString::fromActiveCP("caf\xC3\xA9"), text);
    }
    std::setlocale(LC_CTYPE, saved.c_str());
}

TEST(String, LongTextsConvertBeyondTheStackBuffer) {
    std::string big;
    for (int i = 0; i < 6000; ++i) big += "\xC3\xA9";  // 12,000 bytes
    const OmbString s(big);
    const std::string latin1 = s.toLatin1();
    EXPECT_EQ(latin1.size(), 6000u);
    EXPECT_EQ(OmbString::fromLatin1(latin1.data(), static_cast<std::ptrdiff_t>(latin1.size())), s);
}
