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

TEST(OsportConverter, RoundTripsUtf8AndCodePage1252) {
    Converter utf8 = converter("UTF-8");
    ASSERT_NE(utf8, nullptr);
    const std::pair<std::string, std::u16string> cases[] = {
        {"", u""},
        {std::string("a\0<chart/>", 10), std::u16string(u"a\0<chart/>", 10)}, // NULs are kept
        {"Caf\xC3\xA9 \xC3\xBC\xC3\x9F \xE2\x82\xAC", u"Caf\u00E9 \u00FC\u00DF \u20AC"},
        {"\xF0\x9F\x93\x88", u"\U0001F4C8"}, // outside the BMP: a surrogate pair
    };
    for (const auto& [host, u16] : cases) {
        std::u16string wide;
        ASSERT_TRUE(KovarMBGenericToU16(utf8.get(), host, wide)) << host;
        EXPECT_EQ(wide, u16) << host;
        std::string back;
        ASSERT_TRUE(KovarMBU16ToGeneric(utf8.get(), wide.c_str(), back));
        EXPECT_EQ(back, host.substr(0, host.find('\0')));
    }

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

TEST(OsportConverter, RejectsInvalidInputAndUnknownCodePages) {
    Converter utf8 = converter("UTF-8");
    ASSERT_NE(utf8, nullptr);
    // truncated, stray continuation byte, overlong '/', encoded surrogate, beyond U+10FFFF
    for (const std::string text :
         {"\xC3", "a\x80z", "\xC0\xAF", "\xED\xA0\x80", "\xF4\x90\x80\x80", "\xFF"}) {
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

    for (const char* name : {"NO-SUCH-CODEPAGE-42", "", static_cast<const char*>(nullptr)})
        EXPECT_EQ(KovarMBConverterNew_A(0, name), nullptr);
    KovarMBConverterDelete_A(nullptr);
}

TEST_F(HostEncoding, FreeFunctionsFollowTheHostCodePage) {
    EXPECT_EQ(hostEncoding(), "UTF-8");
    EXPECT_EQ(toU16("Gr\xC3\xBC\xC3\x9F"), u"Gr\u00FC\u00DF");
    EXPECT_EQ(toHost(u"\u00C5 \U0001F600"), "\xC3\x85 \xF0\x9F\x98\x80");
    EXPECT_EQ(toU16("bad \xE2\x82"), u"<null>");
    const char16_t lone[] = {0xDC00, 0};
    EXPECT_EQ(toHost(lone), "<null>");
    EXPECT_EQ(KovarMBTranscodeGeneric(static_cast<const char*>(nullptr)), nullptr);
    EXPECT_EQ(KovarMBTranscodeGeneric(static_cast<const char16_t*>(nullptr)), nullptr);
    KovarMBRelease(static_cast<char*>(nullptr));
    KovarMBRelease(static_cast<char16_t*>(nullptr));

    ASSERT_TRUE(setHostEncoding("CP1252"));
    EXPECT_EQ(hostEncoding(), "CP1252");
    EXPECT_EQ(toU16("\x80"), u"\u20AC");
    EXPECT_EQ(toHost(u"\u20AC\u00E9"), "\x80\xE9");
    EXPECT_EQ(toHost(u"\u4E2D"), "<null>");

    // An unknown name leaves the encoding as it was.
    ASSERT_TRUE(setHostEncoding("ISO-8859-1"));
    EXPECT_FALSE(setHostEncoding("NO-SUCH-CODEPAGE-42"));
    EXPECT_FALSE(setHostEncoding(""));
    EXPECT_EQ(hostEncoding(), "ISO-8859-1");
    EXPECT_EQ(toU16("\xE9"), u"\u00E9");
}

TEST_F(HostEncoding, StrincStepsOverWholeCharactersAndNeverPastTheNul) {
    const char* text = "a\xC3\xA9\xE2\x82\xAC\xF0\x9F\x93\x88z";
    const char* p = text;
    for (int expected : {1, 3, 6, 10, 11, 11}) { // the last step stays at the NUL
        p = KovarMBstrinc_A(p);
        EXPECT_EQ(p - text, expected);
    }
    EXPECT_EQ(KovarMBstrinc_A(nullptr), nullptr);
    // A lead byte promising more than the text holds, and stray bytes.
    const char truncated[] = {'\xF0', '\x9F', '\0', 'x', '\0'};
    EXPECT_EQ(KovarMBstrinc_A(truncated), truncated + 1);
    EXPECT_EQ(KovarMBstrinc_A(truncated + 1), truncated + 2);
    EXPECT_EQ(KovarMBstrinc_A(truncated + 2), truncated + 2);
    const char stray[] = "\x80\xFF";
    EXPECT_EQ(KovarMBstrinc_A(stray), stray + 1);
    EXPECT_EQ(KovarMBstrinc_A(stray + 1), stray + 2);

    ASSERT_TRUE(setHostEncoding("CP1252"));
    const char* single = "\xC3\xA9\x80";
    EXPECT_EQ(KovarMBstrinc_A(single), single + 1);
    EXPECT_EQ(KovarMBstrinc_A(single + 2), single + 3);

    ASSERT_TRUE(setHostEncoding("CP932"));
    const char* sjis = "\x93\xFA"
                       "a\x82";
    EXPECT_EQ(KovarMBstrinc_A(sjis), sjis + 2); // one two-byte character
    EXPECT_EQ(KovarMBstrinc_A(sjis + 2), sjis + 3);
    EXPECT_EQ(KovarMBstrinc_A(sjis + 3), sjis + 4); // a lead byte cut off by the NUL
    EXPECT_EQ(toU16("\x93\xFA"), u"\u65E5");
}

} // namespace
