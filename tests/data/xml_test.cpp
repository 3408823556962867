#include "TestStreams.h"
#include "support/GrammarSupport.h"

#include <plotaid/ChartBase.h>
#include <plotaid/XmlDataHandler.h>

#include <gtest/gtest.h>

#include <chrono>
#include <clocale>

using namespace chartdata_test;
using grammar_test::dataDocument;

namespace {

std::string xmlOf(VarDataProcessor& store, bool compressed = false) {
    Stream s = streamOf(store);
    XmlDataHandler handler(s.bytes.get(), s.length);
    std::string xml;
    EXPECT_TRUE(handler.GetXmlData(xml, compressed));
    return xml;
}

VarDataProcessor storeOf(const std::string& xml) {
    XmlDataHandler handler(xml);
    Stream s;
    s.bytes.reset(handler.GetDataStream(s.length));
    VarDataProcessor store;
    if (s.bytes) {
        EXPECT_TRUE(store.ReadStreamData(s.bytes.get(), s.length));
    }
    return store;
}

std::string source(const std::string& id, const std::string& names, const std::string& rows) {
    return "<embeddedSource id=\"" + id + "\"><names>" + names + "</names><types>string</types>" + rows +
           "</embeddedSource>";
}

} // namespace

// Names survive the round trip; a value keeps all but its semicolons; multibyte characters are not taken
// apart; both validators accept the text.
TEST(XmlDataWriter, DocumentLayoutAndEscapes) {
    VarDataProcessor store;
    store.AddDataSource("ds", 2);
    store.SetVariableValue("ds", "x", 0, 1);
    store.SetVariableValue("ds", "y", 0, 2);
    store.SetVariableValue("ds", "x", 1, 3);
    store.AddDataSource("empty", 0);
    const std::string xml = xmlOf(store);
    EXPECT_EQ(
        xml,
        dataDocument(
            "\t<embeddedSource "
            "id=\"ds\">\n\t\t<names>x;y</names>\n\t\t<types>string;string</types>\n\t\t<row>1;2</"
            "row>\n\t\t<row>3;</row>\n\t</embeddedSource>\n\t<embeddedSource "
            "id=\"empty\">\n\t\t<names></names>\n\t\t<types></types>\n\t\t<row/>\n\t</embeddedSource>\n"));
    EXPECT_EQ(grammar_test::lintFaults("grxml-data-2.1.xsd", xml), "");

    VarDataProcessor odd;
    const std::string variable = "p<q;r\xC3\xB6\xC3\x9F";
    odd.AddVariable("a\"b<c", variable);
    odd.SetStringVariableValue("a\"b<c", variable, 0, "x;y & 'z'>\xE2\x82\xAC");
    const std::string oddXml = xmlOf(odd);
    EXPECT_EQ(storeOf(oddXml).GetValueAsString("a\"b<c", variable, 0), "x,y & 'z'>\xE2\x82\xAC");
    const std::string named =
        grammar_test::replaceOnce(oddXml, "a&quot;b&lt;c", "ab"); // ids are XML names there
    EXPECT_EQ(grammar_test::lintFaults("grxml-data-2.1.xsd", named), "");
}

TEST(XmlDataWriter, ControlCharactersNeverReachTheTextRaw) {
    VarDataProcessor store;
    const std::string name = "a\tb\x01";
    store.AddVariable("s\r", name);
    store.SetStringVariableValue("s\r", name, 0, "x\ny\x1f");
    plotaid::detail::RecordCollector records;
    const std::string xml = xmlOf(store);
    EXPECT_TRUE(ChartBase::ValidXML(xml)) << xml;
    EXPECT_EQ(records.records().size(), 1u) << "what cannot be written is reported once";
    // Tab, line feed and carriage return come back; the others cannot and read as '?'.
    EXPECT_EQ(storeOf(xml).GetValueAsString("s\r", "a\tb?", 0), "x\ny?");
}

TEST(XmlDataWriter, CompressedOutputAndStreamCopies) {
    VarDataProcessor store;
    store.AddVariable("s", "v");
    store.SetVariableValue("s", "v", 0, 0.25);
    const std::string plain = xmlOf(store), packed = xmlOf(store, true);
    std::string unpacked, out;
    ASSERT_TRUE(zpack::decompressString(unpacked, packed));
    EXPECT_EQ(unpacked, plain);
    // From a compressed text, plain is asked for: decompressed; compressed: unchanged.
    XmlDataHandler fromPacked(packed);
    ASSERT_TRUE(fromPacked.GetXmlData(out, false));
    EXPECT_EQ(out, plain);
    ASSERT_TRUE(fromPacked.GetXmlData(out, true));
    EXPECT_EQ(out, packed);
    ASSERT_TRUE(XmlDataHandler(plain).GetXmlData(out, true));
    ASSERT_TRUE(zpack::decompressString(unpacked, out));
    EXPECT_EQ(unpacked, plain);

    // A handler over a stream hands back an exact copy, also through a copy of the handler.
    Stream s = streamOf(store);
    const XmlDataHandler original(s.bytes.get(), s.length);
    XmlDataHandler copy(original);
    Stream again;
    again.bytes.reset(copy.GetDataStream(again.length));
    ASSERT_EQ(again.length, s.length);
    EXPECT_EQ(std::memcmp(again.bytes.get(), s.bytes.get(), s.length), 0);
    ASSERT_TRUE(copy.GetXmlData(out, false));
    EXPECT_EQ(out, plain);
}

TEST(XmlDataWriter, FailuresAreReported) {
    const unsigned char junk[] = {1, 2, 3, 4};
    const std::string none, zip = "x\x9C garbage";
    XmlDataHandler empty(none), bad(junk, sizeof junk), broken(zip);
    std::string out = "kept";
    for (XmlDataHandler* h : {&empty, &bad, &broken}) {
        EXPECT_FALSE(h->GetXmlData(out, false));
        EXPECT_EQ(out, "kept");
    }
    for (XmlDataHandler* h : {&empty, &broken}) {
        unsigned length = 7;
        EXPECT_EQ(h->GetDataStream(length), nullptr);
        EXPECT_EQ(length, 0u);
    }
}

TEST(XmlDataReader, RowsNamesEmptyFieldsAndTexts) {
    VarDataProcessor store = storeOf(dataDocument(
        source("t", "a;b;c;d;e",
               "<row>1;;3;Clerical</row>\n<row>-2.5e3;0x10;;Manager;;99</row><row>;;;Clerical</row>") +
        source("u", "e", "<row>a &amp; b</row>") +
        // Sources are found by their structure, whatever the attribute order, quotes and
        // spacing.
        "<!-- <embeddedSource id=\"comment\"> --><embeddedSource\n kind=\"x\"  id = 'q&amp;1' "
        "><names>v</names><row>4</row></embeddedSource ><gs:embeddedSource id=\"p\"/>"));
    std::vector<std::string> names;
    store.GetSourceNames(names);
    EXPECT_EQ(names, (std::vector<std::string>{"p", "q&1", "t", "u"}));
    EXPECT_EQ(store.GetValueAsString("q&1", "v", 0), "4");
    EXPECT_EQ(store.GetRowCount("t"), 3u);
    const std::pair<const char*, std::vector<double>> columns[] = {
        {"a", {1, -2500, kMissing}}, {"b", {kMissing, 16, kMissing}}, {"c", {3, kMissing, kMissing}}};
    for (const auto& [name, cells] : columns)
        EXPECT_EQ(std::vector<double>(store.GetDataPointer("t", name), store.GetDataPointer("t", name) + 3),
                  cells)
            << name;
    // A column never filled creates no variable; a field beyond the names is ignored.
    EXPECT_EQ(store.GetVariableNames("t", names), 4);
    EXPECT_EQ(store.GetValueAsString("t", "d", 1), "Manager");
    EXPECT_EQ(store.GetDataPointer("t", "d")[0], kMissing);
    EXPECT_EQ(store.GetValueAsString("u", "e", 0), "a & b");
    // Equal texts share one entry of the table.
    const std::string raw = rawOf(streamOf(store));
    EXPECT_EQ(raw.find("Clerical"), raw.rfind("Clerical"));
}

TEST(XmlDataReader, NumbersIgnoreTheProcessLocale) {
    const char* previous = std::setlocale(LC_NUMERIC, nullptr);
    const std::string saved = previous ? previous : "C";
    bool switched = false;
    for (const char* name : {"de_DE.UTF-8", "de_DE.utf8", "fr_FR.UTF-8", "ru_RU.UTF-8"})
        switched = switched || std::setlocale(LC_NUMERIC, name) != nullptr;
    VarDataProcessor store = storeOf(dataDocument(source("n", "v", "<row>1.5</row>")));
    const std::string after = std::setlocale(LC_NUMERIC, nullptr);
    std::setlocale(LC_NUMERIC, saved.c_str());
    EXPECT_EQ(store.GetDataPointer("n", "v")[0], 1.5);
    if (switched) {
        EXPECT_NE(after, "C") << "the reader must not switch the process locale";
    }
}

TEST(XmlDataReader, OldFormWinsAndReadsDataValues) {
    VarDataProcessor store =
        storeOf("<visualization xsi:schemaLocation=\"x grxml-1.4.xsd\">\n<source id=\"old&amp;one\">\n "
                "<row><dataValue name=\"a\">1.5</dataValue><dataValue name=\"b\"/></row>\n <row><dataValue "
                "name=\"b\">2</dataValue><dataValue name=\"c\">word</dataValue></row>\n</source>\n" +
                source("ignored", "z", "<row>1</row>") +
                "<source id=\"second\"><row></row><row><dataValue name=\"q\">7</dataValue></row></source>\n");
    std::vector<std::string> sources;
    store.GetSourceNames(sources);
    EXPECT_EQ(sources, (std::vector<std::string>{"old&one", "second"}));
    const double* a = store.GetDataPointer("old&one", "a");
    const double* b = store.GetDataPointer("old&one", "b");
    EXPECT_EQ(std::vector<double>({a[0], b[0], b[1]}), std::vector<double>({1.5, kMissing, 2}));
    EXPECT_EQ(store.GetValueAsString("old&one", "c", 1), "word");
    EXPECT_EQ(store.GetRowCount("old&one"), 2u);
    EXPECT_EQ(store.GetRowCount("second"), 2u);
    EXPECT_EQ(store.GetDataPointer("second", "q")[1], 7);
}

TEST(XmlDataReader, NoSourceGivesNoStreamSparseRowsClaimNoUnboundedMemory) {
    unsigned length = 5;
    for (const std::string xml : {"<gs:graphSources/>", "grxml-1.4.xsd"}) {
        EXPECT_EQ(std::unique_ptr<unsigned char[]>(XmlDataHandler(xml).GetDataStream(length)), nullptr)
            << xml;
        EXPECT_EQ(length, 0u);
    }
    // An unterminated id may give a stream or none, but the length must say which.
    const std::string cut = "<embeddedSource id=\"unterminated";
    const std::unique_ptr<unsigned char[]> stream(XmlDataHandler(cut).GetDataStream(length));
    EXPECT_EQ(stream == nullptr, length == 0u);

    // Tens of thousands of variables in one row, then a row claimed far down: every array would have to grow
    // to it.
    std::string names, row;
    for (int i = 0; i < 40000; ++i) {
        names += (i ? ";v" : "v") + std::to_string(i);
        row += i ? ";1" : "1";
    }
    std::string body = "<embeddedSource id=\"s\"><names>" + names + "</names><row>" + row + "</row>";
    for (int i = 0; i < 300000; ++i)
        body += "<row>";
    body += "<row>1</row></embeddedSource>";
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(std::unique_ptr<unsigned char[]>(XmlDataHandler(body).GetDataStream(length)), nullptr);
    EXPECT_EQ(length, 0u);
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(20));
}
