#include <osport/osport.h>

#include <gtest/gtest.h>

#include <memory>
#include <string>

using namespace osport;

namespace {

struct ConverterDeleter {
    void operator()(KovarMBConverter* c) const { KovarMBConverterDelete_A(c); }
};
using Converter = std::unique_ptr<KovarMBConverter, ConverterDeleter>;

Converter converter(const char* encoding) {
    return Converter(KovarMBConverterNew_A(0, encoding));
}

// Restores the host encoding that a test changes.
class HostEncoding : public ::testing::Test {
protected:
    void TearDown() override { ASSERT_TRUE(setHostEncoding("UTF-8")); }
};

std::u16string toU16(const char* host) {
    char16_t* buffer = KovarMBTranscodeGeneric(host);
    if (buffer == nullptr)
        return u"<null>";
    std::u16string result(buffer);
    KovarMBRelease(buffer);
    return result;
}

std::string toHost(const char16_t* text) {
    char* buffer = KovarMBTranscodeGeneric(text);
    if (buffer == nullptr)
        return "<null>";
    std::string result(buffer);
    KovarMBRelease(buffer);
    return result;
}

} // namespace

TEST(OsportConverter, RoundTripsUtf8ThroughUtf16) {
    Converter utf8 = converter("UTF-8");
    ASSERT_NE(utf8, nullptr);
    struct Case {
        std::string host;
        std::u16string u16;
    };
    const Case cases[] = {
        {"", u""},
        {"plain ASCII <chart/>", u"plain ASCII <chart/>"},
        {"Caf\xC3\xA9 \xC3\xBC\xC3\x9F", u"Caf\u00E9 \u00FC\u00DF"},
        {"\xE2\x82\xAC 5", u"\u20AC 5"},
        {"\xF0\x9F\x93\x88", u"\U0001F4C8"}, // outside the BMP: a surrogate pair
    };
    for (const Case& c : cases) {
        std::u16string u16;
        ASSERT_TRUE(KovarMBGenericToU16(utf8.get(), c.host, u16)) << c.host;
        EXPECT_EQ(u16, c.u16) << c.host;
        std::string back;
        ASSERT_TRUE(KovarMBU16ToGeneric(utf8.get(), u16.c_str(), back));
        EXPECT_EQ(back, c.host);
    }
    std::u16string pair;
    ASSERT_TRUE(KovarMBGenericToU16(utf8.get(), "\xF0\x9F\x93\x88", pair));
    ASSERT_EQ(pair.size(), 2u);
    EXPECT_EQ(pair[0], 0xD83D);
    EXPECT_EQ(pair[1], 0xDCC8);
}

TEST(OsportConverter, CodePage1252) {
    Converter cp = converter("CP1252");
    ASSERT_NE(cp, nullptr);
    std::u16string u16;
    ASSERT_TRUE(KovarMBGenericToU16(cp.get(), "\x80 \xE9\x9F", u16));
    EXPECT_EQ(u16, u"\u20AC \u00E9\u0178");
    std::string host;
    ASSERT_TRUE(KovarMBU16ToGeneric(cp.get(), u"\u20AC\u00FC", host));
    EXPECT_EQ(host, "\x80\xFC");
    // Characters the code page lacks are a failure, not a silent substitute.
    EXPECT_FALSE(KovarMBU16ToGeneric(cp.get(), u"\u4E2D", host));
    EXPECT_TRUE(host.empty());
}

TEST(OsportConverter, RejectsInvalidInput) {
    Converter utf8 = converter("UTF-8");
    ASSERT_NE(utf8, nullptr);
    const std::string invalid[] = {
        "\xC3",             // truncated
        "a\x80z",           // stray continuation byte
        "\xC0\xAF",         // overlong '/'
        "\xED\xA0\x80",     // an encoded surrogate
        "\xF4\x90\x80\x80", // beyond U+10FFFF
        "\xFF",
    };
    for (const std::string& text : invalid) {
        std::u16string out = u"stale";
        EXPECT_FALSE(KovarMBGenericToU16(utf8.get(), text, out)) << testing::PrintToString(text);
        EXPECT_TRUE(out.empty());
    }
    std::string out = "stale";
    const char16_t lone[] = {u'a', 0xD800, u'b', 0};
    EXPECT_FALSE(KovarMBU16ToGeneric(utf8.get(), lone, out));
    EXPECT_TRUE(out.empty());
    EXPECT_FALSE(KovarMBU16ToGeneric(utf8.get(), nullptr, out));
    EXPECT_FALSE(KovarMBU16ToGeneric(nullptr, u"x", out));
    std::u16string u16;
    EXPECT_FALSE(KovarMBGenericToU16(nullptr, "x", u16));
}

TEST(OsportConverter, KeepsEmbeddedNulsOfHostText) {
    Converter utf8 = converter("UTF-8");
    std::u16string u16;
    ASSERT_TRUE(KovarMBGenericToU16(utf8.get(), std::string("a\0b", 3), u16));
    EXPECT_EQ(u16, std::u16string(u"a\0b", 3));
}

TEST(OsportConverter, UnknownCodePageGivesNoConverter) {
    EXPECT_EQ(KovarMBConverterNew_A(0, "NO-SUCH-CODEPAGE-42"), nullptr);
    EXPECT_EQ(KovarMBConverterNew_A(0, ""), nullptr);
    EXPECT_EQ(KovarMBConverterNew_A(0, nullptr), nullptr);
    KovarMBConverterDelete_A(nullptr);
}

TEST_F(HostEncoding, DefaultsToUtf8) {
    EXPECT_EQ(hostEncoding(), "UTF-8");
    EXPECT_EQ(toU16("Gr\xC3\xBC\xC3\x9F"
                    "e"),
              u"Gr\u00FC\u00DFe");
    EXPECT_EQ(toHost(u"\u00C5ngstr\u00F6m \U0001F600"), "\xC3\x85ngstr\xC3\xB6m \xF0\x9F\x98\x80");
    EXPECT_EQ(toU16(""), u"");
}

TEST_F(HostEncoding, FreeFunctionsFollowTheHostCodePage) {
    ASSERT_TRUE(setHostEncoding("CP1252"));
    EXPECT_EQ(hostEncoding(), "CP1252");
    EXPECT_EQ(toU16("\x80"), u"\u20AC");
    EXPECT_EQ(toHost(u"\u20AC\u00E9"), "\x80\xE9");
    EXPECT_EQ(toHost(u"\u4E2D"), "<null>");
}

TEST_F(HostEncoding, InvalidInputGivesNull) {
    EXPECT_EQ(KovarMBTranscodeGeneric(static_cast<const char*>(nullptr)), nullptr);
    EXPECT_EQ(KovarMBTranscodeGeneric(static_cast<const char16_t*>(nullptr)), nullptr);
    EXPECT_EQ(toU16("bad \xE2\x82"), u"<null>");
    const char16_t lone[] = {0xDC00, 0};
    EXPECT_EQ(toHost(lone), "<null>");
    KovarMBRelease(static_cast<char*>(nullptr));
    KovarMBRelease(static_cast<char16_t*>(nullptr));
}

TEST_F(HostEncoding, UnknownNameLeavesEncodingUnchanged) {
    ASSERT_TRUE(setHostEncoding("ISO-8859-1"));
    EXPECT_FALSE(setHostEncoding("NO-SUCH-CODEPAGE-42"));
    EXPECT_FALSE(setHostEncoding(""));
    EXPECT_EQ(hostEncoding(), "ISO-8859-1");
    EXPECT_EQ(toU16("\xE9"), u"\u00E9");
}

TEST_F(HostEncoding, StrincStepsOverUtf8Characters) {
    const char* text = "a\xC3\xA9\xE2\x82\xAC\xF0\x9F\x93\x88z";
    const char* p = text;
    p = KovarMBstrinc_A(p);
    EXPECT_EQ(p - text, 1);
    p = KovarMBstrinc_A(p);
    EXPECT_EQ(p - text, 3);
    p = KovarMBstrinc_A(p);
    EXPECT_EQ(p - text, 6);
    p = KovarMBstrinc_A(p);
    EXPECT_EQ(p - text, 10);
    p = KovarMBstrinc_A(p);
    EXPECT_EQ(p - text, 11);
    EXPECT_EQ(KovarMBstrinc_A(p), p); // at the NUL
    EXPECT_EQ(KovarMBstrinc_A(nullptr), nullptr);
}

TEST_F(HostEncoding, StrincNeverStepsPastTheNul) {
    // A lead byte promising more than the text holds.
    const char truncated[] = {'\xF0', '\x9F', '\0', 'x', '\0'};
    EXPECT_EQ(KovarMBstrinc_A(truncated), truncated + 1);
    EXPECT_EQ(KovarMBstrinc_A(truncated + 1), truncated + 2);
    EXPECT_EQ(KovarMBstrinc_A(truncated + 2), truncated + 2);
    const char stray[] = "\x80\xFF";
    EXPECT_EQ(KovarMBstrinc_A(stray), stray + 1);
    EXPECT_EQ(KovarMBstrinc_A(stray + 1), stray + 2);
}

TEST_F(HostEncoding, StrincInSingleAndDoubleByteCodePages) {
    ASSERT_TRUE(setHostEncoding("CP1252"));
    const char* text = "\xC3\xA9\x80";
    EXPECT_EQ(KovarMBstrinc_A(text), text + 1);
    EXPECT_EQ(KovarMBstrinc_A(text + 2), text + 3);

    ASSERT_TRUE(setHostEncoding("CP932"));
    const char* sjis = "\x93\xFA"
                       "a\x82";
    EXPECT_EQ(KovarMBstrinc_A(sjis), sjis + 2); // one two-byte character
    EXPECT_EQ(KovarMBstrinc_A(sjis + 2), sjis + 3);
    EXPECT_EQ(KovarMBstrinc_A(sjis + 3), sjis + 4); // a lead byte cut off by the NUL
    EXPECT_EQ(toU16("\x93\xFA"), u"\u65E5");
}
