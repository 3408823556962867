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

// Restores the host encoding that a test changes.
class HostEncoding : public ::testing::Test {
protected:
    void TearDown() override { ASSERT_TRUE(setHostEncoding("UTF-8")); }
};

// The free functions in the host encoding; "?" for a failure.
template <typename To, typename From> std::basic_string<To> host(const From* text) {
    To* buffer = KovarMBTranscodeGeneric(text);
    if (buffer == nullptr)
        return std::basic_string<To>(1, To('?'));
    std::basic_string<To> result(buffer);
    KovarMBRelease(buffer);
    return result;
}
std::u16string toU16(const char* text) {
    return host<char16_t>(text);
}
std::string toHost(const char16_t* text) {
    return host<char>(text);
}

TEST(OsportConverter, RoundTripsOrFailsWithEmptyOutput) {
    Converter utf8(KovarMBConverterNew_A(0, "UTF-8")), cp(KovarMBConverterNew_A(0, "CP1252"));
    ASSERT_TRUE(utf8 && cp);
    const struct {
        KovarMBConverter* converter;
        std::string host;
        std::u16string u16; // empty with a non-empty host text: the host text is refused
    } toWide[] = {
        {utf8.get(), "", u""},
        {utf8.get(), std::string("a\0<chart/>", 10), std::u16string(u"a\0<chart/>", 10)}, // NULs are kept
        {utf8.get(), "Caf\xC3\xA9 \xC3\xBC\xC3\x9F \xE2\x82\xAC", u"Caf\u00E9 \u00FC\u00DF \u20AC"},
        {utf8.get(), "\xF0\x9F\x93\x88", u"\U0001F4C8"}, // outside the BMP: a surrogate pair
        {cp.get(), "\x80 \xE9\x9F", u"\u20AC \u00E9\u0178"},
        // truncated, stray continuation byte
        {utf8.get(), "\xC3", u""},
        {utf8.get(), "a\x80z", u""},
        {nullptr, "x", u""},
    };
    for (const auto& c : toWide) {
        SCOPED_TRACE(testing::PrintToString(c.host));
        std::u16string wide = u"stale";
        EXPECT_EQ(KovarMBGenericToU16(c.converter, c.host, wide), c.host.empty() || !c.u16.empty());
        EXPECT_EQ(wide, c.u16);
        std::string back = "stale";
        if (!c.u16.empty()) {
            EXPECT_TRUE(KovarMBU16ToGeneric(c.converter, wide.c_str(), back));
            EXPECT_EQ(back, c.host.substr(0, c.host.find('\0')));
        }
    }
    const char16_t lone[] = {u'a', 0xD800, u'b', 0};
    const struct {
        KovarMBConverter* converter;
        const char16_t* u16;
        const char* host; // null: refused, as a character the code page lacks is
    } toHostCases[] = {{cp.get(), u"\u20AC\u00FC", "\x80\xFC"},
                       {cp.get(), u"\u4E2D", nullptr},
                       {utf8.get(), lone, nullptr},
                       {utf8.get(), nullptr, nullptr},
                       {nullptr, u"x", nullptr}};
    for (const auto& c : toHostCases) {
        std::string out = "stale";
        EXPECT_EQ(KovarMBU16ToGeneric(c.converter, c.u16, out), c.host != nullptr);
        EXPECT_EQ(out, c.host ? c.host : "");
    }
    for (const char* name : {"NO-SUCH-CODEPAGE-42", "", static_cast<const char*>(nullptr)})
        EXPECT_EQ(KovarMBConverterNew_A(0, name), nullptr);
    KovarMBConverterDelete_A(nullptr);
}

TEST_F(HostEncoding, FreeFunctionsFollowTheHostCodePage) {
    EXPECT_EQ(hostEncoding(), "UTF-8");
    EXPECT_EQ(toU16("Gr\xC3\xBC\xC3\x9F"), u"Gr\u00FC\u00DF");
    EXPECT_EQ(toHost(u"\u00C5 \U0001F600"), "\xC3\x85 \xF0\x9F\x98\x80");
    const char16_t lone[] = {0xDC00, 0};
    EXPECT_EQ(toU16("bad \xE2\x82") + u"|" + toU16(nullptr), u"?|?");
    EXPECT_EQ(toHost(lone) + "|" + toHost(nullptr), "?|?");
    KovarMBRelease(static_cast<char*>(nullptr));
    KovarMBRelease(static_cast<char16_t*>(nullptr));

    ASSERT_TRUE(setHostEncoding("CP1252"));
    EXPECT_EQ(hostEncoding(), "CP1252");
    EXPECT_EQ(toU16("\x80"), u"\u20AC");
    EXPECT_EQ(toHost(u"\u20AC\u00E9") + "|" + toHost(u"\u4E2D"), "\x80\xE9|?");
    // An unknown name leaves the encoding as it was.
    ASSERT_TRUE(setHostEncoding("ISO-8859-1"));
    EXPECT_FALSE(setHostEncoding("NO-SUCH-CODEPAGE-42") || setHostEncoding(""));
    EXPECT_EQ(hostEncoding(), "ISO-8859-1");
    EXPECT_EQ(toU16("\xE9"), u"\u00E9");
    ASSERT_TRUE(setHostEncoding("CP932"));
    EXPECT_EQ(toU16("\x93\xFA"), u"\u65E5");
}

TEST_F(HostEncoding, StrincStepsOverWholeCharactersAndNeverPastTheNul) {
    EXPECT_EQ(KovarMBstrinc_A(nullptr), nullptr);
    const char truncated[] = {'\xF0', '\x9F', '\0', 'x', '\0'}; // a lead byte promising too much
    const struct {
        const char* encoding;
        const char* text;
        std::vector<int> steps; // offsets after each step; a step at the NUL stays there
    } cases[] = {
        {"UTF-8", "a\xC3\xA9\xE2\x82\xAC\xF0\x9F\x93\x88z", {1, 3, 6, 10, 11, 11}},
        {"UTF-8", truncated, {1, 2, 2}},
        {"UTF-8", "\x80\xFF", {1, 2}},
        {"CP1252", "\xC3\xA9\x80", {1, 2, 3}},
        {"CP932",
         "\x93\xFA"
         "a\x82",
         {2, 3, 4, 4}}, // one two-byte character; a lead byte cut off by the NUL
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.encoding);
        ASSERT_TRUE(setHostEncoding(c.encoding));
        const char* p = c.text;
        for (int expected : c.steps)
            EXPECT_EQ((p = KovarMBstrinc_A(p)) - c.text, expected);
    }
}

} // namespace
