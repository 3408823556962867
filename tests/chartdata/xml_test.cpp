#include "TestStreams.h"

#include <plotaid/XmlDataHandler.h>

#include <gtest/gtest.h>

#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <clocale>
#include <cstdio>
#include <fstream>

using namespace chartdata_test;

namespace {

const std::string kHead = "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"no\"?> \n"
                          "<gs:graphSources xmlns=\"http://plotaid.org/grxml\" "
                          "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\"\n"
                          "xmlns:gs=\"http://plotaid.org/grxml/data\" "
                          "xsi:schemaLocation=\"http://plotaid.org/grxml/data "
                          "http://plotaid.org/grxml/data/grxml-data-2.1.xsd\">\n";

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

std::string embedded(const std::string& body) {
    return kHead + body + "</gs:graphSources>\n";
}

} // namespace

TEST(XmlDataWriter, DocumentLayout) {
    VarDataProcessor store;
    store.AddDataSource("ds", 2);
    store.SetVariableValue("ds", "x", 0, 1);
    store.SetVariableValue("ds", "y", 0, 2);
    store.SetVariableValue("ds", "x", 1, 3);
    store.AddDataSource("empty", 0);
    EXPECT_EQ(xmlOf(store), kHead + "\t<embeddedSource id=\"ds\">\n"
                                    "\t\t<names>x;y</names>\n"
                                    "\t\t<types>string;string</types>\n"
                                    "\t\t<row>1;2</row>\n"
                                    "\t\t<row>3;</row>\n"
                                    "\t</embeddedSource>\n"
                                    "\t<embeddedSource id=\"empty\">\n"
                                    "\t\t<names></names>\n"
                                    "\t\t<types></types>\n"
                                    "\t\t<row/>\n"
                                    "\t</embeddedSource>\n"
                                    "</gs:graphSources>\n");
}

TEST(XmlDataWriter, EscapesNamesAndValues) {
    VarDataProcessor store;
    store.AddVariable("a\"b<c", "p<q;r");
    store.SetStringVariableValue("a\"b<c", "p<q;r", 0, "x;y & 'z'>");
    const std::string xml = xmlOf(store);
    EXPECT_NE(xml.find("<embeddedSource id=\"a&quot;b&lt;c\">"), std::string::npos) << xml;
    EXPECT_NE(xml.find("<names>p&lt;q&#59;r</names>"), std::string::npos) << xml;
    EXPECT_NE(xml.find("<row>x,y &amp; &apos;z&apos;&gt;</row>"), std::string::npos) << xml;
    // Every name survives the round trip; the value keeps all but its semicolon.
    VarDataProcessor back = storeOf(xml);
    EXPECT_EQ(back.GetValueAsString("a\"b<c", "p<q;r", 0), "x,y & 'z'>");
}

TEST(XmlDataWriter, MultibyteCharactersAreNotTakenApart) {
    VarDataProcessor store;
    store.AddVariable("s", "gr\xC3\xB6\xC3\x9F"
                           "e");
    store.SetStringVariableValue("s",
                                 "gr\xC3\xB6\xC3\x9F"
                                 "e",
                                 0, "\xE2\x82\xAC<5");
    const std::string xml = xmlOf(store);
    EXPECT_NE(xml.find("<names>gr\xC3\xB6\xC3\x9F"
                       "e</names>"),
              std::string::npos);
    EXPECT_NE(xml.find("<row>\xE2\x82\xAC&lt;5</row>"), std::string::npos);
}

TEST(XmlDataWriter, CompressedOutputAndStreamCopies) {
    VarDataProcessor store;
    store.AddVariable("s", "v");
    store.SetVariableValue("s", "v", 0, 0.25);
    const std::string plain = xmlOf(store);
    const std::string packed = xmlOf(store, true);
    ASSERT_FALSE(packed.empty());
    EXPECT_EQ(static_cast<unsigned char>(packed[0]), 0x78);
    std::string unpacked;
    ASSERT_TRUE(zpack::decompressString(unpacked, packed));
    EXPECT_EQ(unpacked, plain);

    // From a compressed text, plain is asked for: decompressed; compressed: unchanged.
    XmlDataHandler fromPacked(packed);
    std::string out;
    ASSERT_TRUE(fromPacked.GetXmlData(out, false));
    EXPECT_EQ(out, plain);
    ASSERT_TRUE(fromPacked.GetXmlData(out, true));
    EXPECT_EQ(out, packed);
    XmlDataHandler fromPlain(plain);
    ASSERT_TRUE(fromPlain.GetXmlData(out, true));
    ASSERT_TRUE(zpack::decompressString(unpacked, out));
    EXPECT_EQ(unpacked, plain);

    // A handler over a stream hands back an exact copy, also through a copy of the handler.
    Stream s = streamOf(store);
    auto copyOf = [&] {
        XmlDataHandler original(s.bytes.get(), s.length);
        return XmlDataHandler(original);
    };
    XmlDataHandler copy = copyOf();
    unsigned length = 0;
    std::unique_ptr<unsigned char[]> again(copy.GetDataStream(length));
    ASSERT_EQ(length, s.length);
    EXPECT_EQ(std::string(reinterpret_cast<char*>(again.get()), length),
              std::string(reinterpret_cast<char*>(s.bytes.get()), s.length));
    ASSERT_TRUE(copy.GetXmlData(out, false));
    EXPECT_EQ(out, plain);
}

TEST(XmlDataWriter, FailuresAreReported) {
    const std::string empty;
    XmlDataHandler nothing(empty);
    std::string out = "kept";
    EXPECT_FALSE(nothing.GetXmlData(out, false));
    unsigned length = 7;
    EXPECT_EQ(nothing.GetDataStream(length), nullptr);
    EXPECT_EQ(length, 0u);

    const unsigned char junk[] = {1, 2, 3, 4};
    XmlDataHandler bad(junk, sizeof junk);
    EXPECT_FALSE(bad.GetXmlData(out, false));
    EXPECT_EQ(out, "kept");

    const std::string brokenZip = "x\x9C garbage";
    XmlDataHandler broken(brokenZip);
    EXPECT_FALSE(broken.GetXmlData(out, false));
    EXPECT_EQ(broken.GetDataStream(length), nullptr);
}

TEST(XmlDataReader, RowsNamesAndEmptyFields) {
    VarDataProcessor store = storeOf(embedded("\t<embeddedSource id=\"t\">\n"
                                              "\t\t<names>a;b;c</names>\n"
                                              "\t\t<types>string;string;string</types>\n"
                                              "\t\t<row>1;;3</row>\n"
                                              "\t\t<row>-2.5e3;0x10;;99</row>\n"
                                              "\t</embeddedSource>\n"));
    EXPECT_EQ(store.GetRowCount("t"), 2u);
    EXPECT_EQ(store.GetDataPointer("t", "a")[0], 1);
    EXPECT_EQ(store.GetDataPointer("t", "b")[0], kMissing);
    EXPECT_EQ(store.GetDataPointer("t", "c")[0], 3);
    EXPECT_EQ(store.GetDataPointer("t", "a")[1], -2500);
    EXPECT_EQ(store.GetDataPointer("t", "b")[1], 16);
    EXPECT_EQ(store.GetDataPointer("t", "c")[1], kMissing);
    std::vector<std::string> names;
    EXPECT_EQ(store.GetVariableNames("t", names), 3) << "the field beyond the names is ignored";
}

TEST(XmlDataReader, TextFieldsBecomeStringValues) {
    VarDataProcessor store = storeOf(embedded("<embeddedSource id=\"graphdataset\">"
                                              "<names>id;jobcat</names><types>string;string</types>"
                                              "<row>1;Clerical</row><row>2;Manager</row><row>3;Clerical</row>"
                                              "<row>4;a &amp; b</row></embeddedSource>"));
    EXPECT_EQ(store.GetValueAsString("graphdataset", "jobcat", 0), "Clerical");
    EXPECT_EQ(store.GetValueAsString("graphdataset", "jobcat", 1), "Manager");
    EXPECT_EQ(store.GetValueAsString("graphdataset", "jobcat", 3), "a & b");
    EXPECT_EQ(store.GetDataPointer("graphdataset", "jobcat")[0], kMissing);
    EXPECT_EQ(store.GetValueAsString("graphdataset", "id", 2), "3");
    // Equal texts share one entry of the table.
    Stream s = streamOf(store);
    const std::string raw = rawOf(s);
    EXPECT_EQ(raw.find("Clerical"), raw.rfind("Clerical"));
}

TEST(XmlDataReader, NumbersIgnoreTheProcessLocale) {
    const char* previous = std::setlocale(LC_NUMERIC, nullptr);
    const std::string saved = previous ? previous : "C";
    bool switched = false;
    for (const char* name : {"de_DE.UTF-8", "de_DE.utf8", "fr_FR.UTF-8", "ru_RU.UTF-8"})
        if (std::setlocale(LC_NUMERIC, name)) {
            switched = true;
            break;
        }
    VarDataProcessor store = storeOf(embedded(
        "<embeddedSource id=\"n\"><names>v</names><types>string</types><row>1.5</row></embeddedSource>"));
    VarDataProcessor written;
    written.AddVariable("n", "v");
    written.SetVariableValue("n", "v", 0, 0.125);
    const std::string xml = xmlOf(written);
    const std::string after = std::setlocale(LC_NUMERIC, nullptr);
    std::setlocale(LC_NUMERIC, saved.c_str());
    EXPECT_EQ(store.GetDataPointer("n", "v")[0], 1.5);
    EXPECT_NE(xml.find("<row>0.125</row>"), std::string::npos);
    if (switched)
        EXPECT_NE(after, "C") << "the reader must not switch the process locale";
    else
        GTEST_LOG_(INFO) << "no comma locale installed; checked in the C locale only";
}

TEST(XmlDataReader, OldFormWinsAndReadsDataValues) {
    const std::string xml =
        "<visualization xsi:schemaLocation=\"x grxml-1.4.xsd\">\n"
        "<source id=\"old&amp;one\">\n"
        " <row><dataValue name=\"a\">1.5</dataValue><dataValue name=\"b\"/></row>\n"
        " <row><dataValue name=\"b\">2</dataValue><dataValue name=\"c\">word</dataValue></row>\n"
        "</source>\n"
        "<embeddedSource id=\"ignored\"><names>z</names><row>1</row></embeddedSource>\n"
        "<source id=\"second\"><row></row><row><dataValue name=\"q\">7</dataValue></row></source>\n";
    VarDataProcessor store = storeOf(xml);
    std::vector<std::string> sources;
    store.GetSourceNames(sources);
    EXPECT_EQ(sources, (std::vector<std::string>{"old&one", "second"}));
    EXPECT_EQ(store.GetDataPointer("old&one", "a")[0], 1.5);
    EXPECT_EQ(store.GetDataPointer("old&one", "b")[0], kMissing);
    EXPECT_EQ(store.GetDataPointer("old&one", "b")[1], 2);
    EXPECT_EQ(store.GetValueAsString("old&one", "c", 1), "word");
    EXPECT_EQ(store.GetRowCount("second"), 2u);
    EXPECT_EQ(store.GetDataPointer("second", "q")[1], 7);
}

TEST(XmlDataReader, NoSourceGivesNoStream) {
    for (const std::string& xml : {std::string("<gs:graphSources/>"), std::string("grxml-1.4.xsd"),
                                   std::string("<embeddedSource id=\"unterminated")}) {
        XmlDataHandler handler(xml);
        unsigned length = 5;
        std::unique_ptr<unsigned char[]> s(handler.GetDataStream(length));
        if (xml.find("unterminated") == std::string::npos) {
            EXPECT_EQ(s, nullptr) << xml;
            EXPECT_EQ(length, 0u);
        }
    }
}

TEST(XmlDataReader, SparseRowsCannotClaimUnboundedMemory) {
    // Tens of thousands of variables in one row, then a row claimed far down: every array would
    // have to grow to it.
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
    XmlDataHandler handler(body);
    unsigned length = 0;
    std::unique_ptr<unsigned char[]> s(handler.GetDataStream(length));
    EXPECT_EQ(s, nullptr);
    EXPECT_EQ(length, 0u);
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(20));
}

TEST(XmlDataRoundTrip, StreamToXmlAndBack) {
    VarDataProcessor store;
    store.AddDataSource("first", 0);
    for (unsigned r = 0; r < 50; ++r) {
        store.SetVariableValue("first", "num", r, r * 1.1 - 7);
        if (r % 7 == 0)
            store.SetStringVariableValue("first", "label", r, "row " + std::to_string(r));
    }
    store.SetVariableValue("second", "v", 0, 1); // refused
    store.AddVariable("second", "v");
    store.SetVariableValue("second", "v", 2, 1e-300);
    VarDataProcessor back = storeOf(xmlOf(store));
    for (const char* source : {"first", "second"}) {
        std::vector<std::string> vars;
        store.GetVariableNames(source, vars);
        ASSERT_EQ(back.GetRowCount(source), store.GetRowCount(source));
        for (const std::string& v : vars)
            for (unsigned r = 0; r < store.GetRowCount(source); ++r)
                EXPECT_EQ(back.GetValueAsString(source, v, r), store.GetValueAsString(source, v, r));
    }
}

TEST(XmlDataWriter, OutputValidatesWithXmllint) {
    if (std::system("xmllint --version >/dev/null 2>&1") != 0)
        GTEST_SKIP() << "xmllint is not installed";
    VarDataProcessor store;
    store.AddVariable("ds1", "a<b");
    store.SetStringVariableValue("ds1", "a<b", 0, "x;\"y\"");
    store.SetVariableValue("ds1", "c", 1, 2.5);
    store.AddDataSource("empty", 0);
    char dir[] = "/tmp/chartdataXXXXXX";
    ASSERT_NE(::mkdtemp(dir), nullptr);
    const std::string folder = dir;
    const std::string schemas = std::string(PLOTAID_SOURCE_DIR) + "/resources/schemas/";
    std::ofstream(folder + "/catalog.xml")
        << "<?xml version=\"1.0\"?>\n<catalog xmlns=\"urn:oasis:names:tc:entity:xmlns:xml:catalog\">\n"
        << "<rewriteSystem systemIdStartString=\"http://plotaid.org/grxml/data/\" rewritePrefix=\"file://"
        << schemas
        << "\"/>\n<rewriteSystem systemIdStartString=\"http://plotaid.org/grxml/\" rewritePrefix=\"file://"
        << schemas << "\"/>\n</catalog>\n";
    std::ofstream(folder + "/data.xml", std::ios::binary) << xmlOf(store);
    const std::string command = "XML_CATALOG_FILES=" + folder +
                                "/catalog.xml xmllint --nonet --noout --schema " + schemas +
                                "grxml-data-2.1.xsd " + folder + "/data.xml 2>&1";
    FILE* pipe = ::popen(command.c_str(), "r");
    ASSERT_NE(pipe, nullptr);
    std::string output;
    char buf[512];
    for (std::size_t n; (n = std::fread(buf, 1, sizeof buf, pipe)) > 0;)
        output.append(buf, n);
    const int status = ::pclose(pipe);
    std::remove((folder + "/catalog.xml").c_str());
    std::remove((folder + "/data.xml").c_str());
    ::rmdir(dir);
    EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0) << output;
}

namespace {
// The row-level steps, as a subclass reaches them.
struct StepHandler : XmlDataHandler {
    StepHandler() : XmlDataHandler(nullptr, 0) {}
    using XmlDataHandler::Count_1_4_Rows;
    using XmlDataHandler::CountRows;
    using XmlDataHandler::ExtractName;
    using XmlDataHandler::Process_1_4_Row;
    using XmlDataHandler::ProcessRow;
};
} // namespace

TEST(XmlDataSteps, RowsNamesAndSingleRows) {
    StepHandler h;
    EXPECT_EQ(h.CountRows("<row>1</row><row/><row>2</row></embeddedSource><row>3</row>"), 2u);
    EXPECT_EQ(h.Count_1_4_Rows("<row></row></source><row></row>"), 1u);
    EXPECT_EQ(h.CountRows(nullptr), 0u);
    std::string name = "old";
    EXPECT_TRUE(h.ExtractName("a&amp;b\" rest", name));
    EXPECT_EQ(name, "a&b");
    EXPECT_FALSE(h.ExtractName("no quote", name));
    EXPECT_EQ(name, "");

    VarDataProcessor store;
    store.AddDataSource("s", 0);
    h.ProcessRow(store, "s", {"a", "b", "c"}, 4, "<row>1;;3;9</row><row>5</row>");
    EXPECT_EQ(store.GetRowCount("s"), 5u);
    EXPECT_EQ(store.GetDataPointer("s", "a")[4], 1);
    EXPECT_EQ(store.GetDataPointer("s", "c")[4], 3);
    std::vector<std::string> vars;
    EXPECT_EQ(store.GetVariableNames("s", vars), 2) << "an empty field creates no variable";
    h.Process_1_4_Row(store, "s", 1200,
                      "<dataValue name=\"b\">2.5</dataValue></row><dataValue name=\"x\">1</dataValue>");
    EXPECT_EQ(store.GetDataPointer("s", "b")[1200], 2.5);
    EXPECT_GE(store.GetCapacity("s"), 1201u);
    EXPECT_EQ(store.GetVariableNames("s", vars), 3);
    h.ProcessRow(store, "absent", {"a"}, 0, "<row>1</row>");
    EXPECT_EQ(store.GetCapacity("absent"), 0u);
}
