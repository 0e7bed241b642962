#include <oecore/core/stringbuilder.h>

#include <gtest/gtest.h>

#include <clocale>
#include <string>

TEST(StringBuilder, GrowsByHalfAndKeepsOneByteForTheZero) {
    OmbStringBuilder b;
    b << 'x';
    EXPECT_EQ(b.capacity(), 200u);
    for (int i = 1; i < 199; ++i) b << 'x';
    EXPECT_EQ(b.size(), 199u);
    EXPECT_EQ(b.capacity(), 200u);
    b << 'x';  // the 200th byte would leave no room for the zero
    EXPECT_EQ(b.capacity(), 300u);
    // A large append skips straight to what it needs plus 100.
    const std::string big(1000, 'y');
    b << big.c_str();
    EXPECT_EQ(b.capacity(), 200u + 1000u + 100u);
    const OmbString s = b.str();
    EXPECT_EQ(s.size(), 1200u);
    EXPECT_EQ(s.dataUtf8()[1200], '\0');
    EXPECT_EQ(b.size(), 0u);
    EXPECT_EQ(b.capacity(), 0u);
    EXPECT_TRUE(b.str().empty());
}

TEST(StringBuilder, AppendsTextOfEveryKind) {
    OmbStringBuilder b;
    b << "n=" << 42 << ' ' << -7L << ' ' << 3000000000u << ' ' << static_cast<long long>(-9000000000LL) << ' '
      << OmbString::literal("lit") << ' ' << L"\u00e9" << L'\u20ac';
    EXPECT_EQ(b.str(), OmbString("n=42 -7 3000000000 -9000000000 lit \xC3\xA9\xE2\x82\xAC"));
}

TEST(StringBuilder, Manipulators) {
    OmbStringBuilder b;
    b << OmbFormat::dec(42, 5) << '|' << OmbFormat::dec(42, 5, true) << '|' << OmbFormat::dec(-3) << '|';
    b << OmbFormat::hex(255) << '|' << OmbFormat::hex(255, 4, true) << '|' << OmbFormat::hex(10, 3) << '|';
    b << OmbFormat::fixed(3.14159, 2) << '|' << OmbFormat::fixed(2.5, 1, 6, true) << '|';
    b << OmbFormat::scientific(1234.5, 2);
    EXPECT_EQ(b.str(), OmbString("   42|00042|-3|ff|00ff|  a|3.14|0002.5|1.23e+03"));
}

TEST(StringBuilder, RealWritesRoundTripDigitsWithAShortExponent) {
    OmbStringBuilder b;
    b << OmbFormat::real(0.5) << ' ' << OmbFormat::real(1e-5) << ' ' << OmbFormat::real(1e300) << ' '
      << OmbFormat::real(1e100) << ' ' << 2.0;
    EXPECT_EQ(b.str(), OmbString("0.5 1.0000000000000001e-5 1.0000000000000001e+300 1e+100 2"));
}

TEST(StringBuilder, DecimalCommaLocalesStillWriteAPoint) {
    const std::string saved = std::setlocale(LC_NUMERIC, nullptr);
    const char* comma[] = {"de_DE.UTF-8", "de_DE.utf8", "fr_FR.UTF-8", "nb_NO.UTF-8"};
    bool found = false;
    for (const char* name : comma) found = found || std::setlocale(LC_NUMERIC, name) != nullptr;
    if (!found) GTEST_SKIP() << "no locale with a decimal comma is installed";
    OmbStringBuilder b;
    b << OmbFormat::real(1.25) << ' ' << OmbFormat::fixed(0.5, 2);
    std::setlocale(LC_NUMERIC, saved.c_str());
    EXPECT_EQ(b.str(), OmbString("1.25 0.50"));
}
