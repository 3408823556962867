// PMML kept compressed, handed out compressed or as a freshly printed "PMML" document.
#include "TreeSupport.h"

#include <plotaid/ChartErrorHandler.h>

#include <gtest/gtest.h>
#include <zlib.h>

#include <xercesc/sax/InputSource.hpp>

#include <memory>

using namespace XERCES_CPP_NAMESPACE;

namespace {

// zlib itself, not the library's wrapper, as any PMML reader of the host would.
std::string inflate(const std::string& packed, std::size_t size) {
    std::string text(size, '\0');
    uLongf length = size;
    if (uncompress(reinterpret_cast<Bytef*>(text.data()), &length,
                   reinterpret_cast<const Bytef*>(packed.data()), packed.size()) != Z_OK)
        return "<inflate failed>";
    text.resize(length);
    return text;
}

std::string deflate(const std::string& text) {
    uLongf length = compressBound(text.size());
    std::string packed(length, '\0');
    compress(reinterpret_cast<Bytef*>(packed.data()), &length, reinterpret_cast<const Bytef*>(text.data()),
             text.size());
    packed.resize(length);
    return packed;
}

class TreePmmlExamples : public ::testing::TestWithParam<const char*> {};

TEST_P(TreePmmlExamples, CompressedFormInflatesToTheOriginal) {
    const std::string pmml = example(GetParam());
    ASSERT_FALSE(pmml.empty());
    TestTree tree(pmml, "");
    unsigned long length = 0;
    const std::string packed = tree.getCompressedPMML(&length);
    EXPECT_EQ(length, pmml.size());
    ASSERT_FALSE(packed.empty());
    EXPECT_EQ(static_cast<unsigned char>(packed[0]), 0x78);
    EXPECT_EQ(inflate(packed, pmml.size()), pmml);
    EXPECT_EQ(tree.getCompressedPMML(nullptr), packed);
}

TEST_P(TreePmmlExamples, UncompressedIsAValidPmmlDocument) {
    const std::string pmml = example(GetParam());
    TestTree tree(pmml, "");
    const std::string text = tree.getUncompressedPMML(nullptr);
    Reader reader;
    DOMDocument* out = reader.read(text);
    ASSERT_NE(out, nullptr) << (reader.errors().empty() ? text : reader.errors().front());
    DOMElement* root = out->getDocumentElement();
    EXPECT_EQ(u8(root->getLocalName()), "PMML");
    EXPECT_EQ(u8(root->getNamespaceURI()), "http://www.dmg.org/PMML-2_1");
    EXPECT_EQ(attr(root, "version"), "2.1");
    EXPECT_NE(text.find("<?xml version=\"1.0\" encoding=\"UTF-8\""), std::string::npos);

    // The same tree as the original: every node, predicate and score distribution, in order.
    Reader original;
    DOMDocument* source = original.read(pmml);
    ASSERT_NE(source, nullptr);
    for (const char* name :
         {"Node", "SimplePredicate", "CompoundPredicate", "ScoreDistribution", "DataField"}) {
        const auto a = elements(source, name);
        const auto b = elements(out, name);
        ASSERT_EQ(a.size(), b.size()) << name;
        for (std::size_t i = 0; i < a.size(); ++i) {
            EXPECT_EQ(attr(a[i], "id"), attr(b[i], "id"));
            EXPECT_EQ(attr(a[i], "value"), attr(b[i], "value"));
            EXPECT_EQ(attr(a[i], "recordCount"), attr(b[i], "recordCount"));
        }
    }
    EXPECT_EQ(attr(elements(out, "Header").at(0), "description"),
              attr(elements(source, "Header").at(0), "description"));

    if (!haveXmllint())
        GTEST_SKIP() << "xmllint is not installed";
    TempDir dir;
    std::ofstream(dir.file("out.xml"), std::ios::binary) << text;
    EXPECT_EQ(xmllint(dir.file("out.xml"), "pmml-2-1.xsd"), 0) << text;
}

INSTANTIATE_TEST_SUITE_P(Examples, TreePmmlExamples,
                         ::testing::Values("credit-risk.xml", "house-prices.xml", "churn-surrogates.xml"));

TEST(TreePmml, CompressedInputWithUnknownLengthLearnsIt) {
    const std::string pmml = example("house-prices.xml");
    TestTree tree(deflate(pmml), 0, "");
    unsigned long length = 99;
    tree.getCompressedPMML(&length);
    EXPECT_EQ(length, 0u);
    ASSERT_NE(tree.setupPMMLDOM(), nullptr);
    tree.getCompressedPMML(&length);
    EXPECT_EQ(length, pmml.size());
    EXPECT_EQ(tree.pmmlDocument(), tree.setupPMMLDOM()) << "the parsed model is the base's document";
}

TEST(TreePmml, WrongLengthHintStillDecompresses) {
    const std::string pmml = example("credit-risk.xml");
    TestTree small(deflate(pmml), 10, "");
    EXPECT_NE(small.getUncompressedPMML(nullptr).find("<PMML"), std::string::npos);
    TestTree huge(deflate(pmml), 4000000000ul, "");
    EXPECT_NE(huge.getUncompressedPMML(nullptr).find("<PMML"), std::string::npos);
}

TEST(TreePmml, UndecompressibleGivesEmptyText) {
    TempDir logs;
    ScopedEnv log("DumpChartXMLPath", logs.path());
    const std::string packed = deflate(example("credit-risk.xml"));
    TestTree cut(packed.substr(0, packed.size() / 2), 0, "");
    EXPECT_EQ(cut.getUncompressedPMML(nullptr), "");
    EXPECT_EQ(cut.setupPMMLDOM(), nullptr);
    TestTree plain("<PMML/>", 7, "");
    EXPECT_EQ(plain.getUncompressedPMML(nullptr), "");
    EXPECT_NE(readAll(logs.file("chartxml_error.log")).find("setupPMMLDOM fatal error"), std::string::npos);
}

TEST(TreePmml, InvalidModelComesBackAsItWas) {
    const std::string notPmml = "<PMML version=\"2.1\" xmlns=\"http://www.dmg.org/PMML-2_1\"><Bogus/></PMML>";
    TestTree tree(notPmml, "");
    EXPECT_EQ(tree.getUncompressedPMML(nullptr), notPmml);
    EXPECT_EQ(tree.pmmlDocument(), nullptr);
    // Valid display settings, not a model: handed back, never passed off as PMML.
    const std::string settings = TestTree("", "").getDisplayData(nullptr);
    TestTree foreign(settings, "");
    EXPECT_EQ(foreign.getUncompressedPMML(nullptr), settings);
}

TEST(TreePmml, RequestedEncodingAndRepeatedCalls) {
    std::string pmml = example("credit-risk.xml");
    pmml.replace(pmml.find("Example data"), 12,
                 "Donn\xc3\xa9"
                 "es");
    TestTree tree(pmml, "");
    const std::string latin1 = tree.getUncompressedPMML(u"ISO-8859-1");
    EXPECT_NE(latin1.find("encoding=\"ISO-8859-1\""), std::string::npos);
    EXPECT_NE(latin1.find("Donn\xe9"
                          "es"),
              std::string::npos);
    const std::string again = tree.getUncompressedPMML(nullptr);
    EXPECT_NE(again.find("Donn\xc3\xa9"
                         "es"),
              std::string::npos);
    EXPECT_EQ(tree.getUncompressedPMML(u"no-such-encoding"), "");
}

TEST(TreePmml, OutputDocumentAndCompressDocument) {
    TestTree tree(example("house-prices.xml"), "");
    DOMDocument* created = tree.createPMMLDocument(nullptr);
    ASSERT_NE(created, nullptr);
    EXPECT_EQ(u8(created->getDocumentElement()->getLocalName()), "PMML");
    EXPECT_EQ(attr(created->getDocumentElement(), "version"), "2.1");
    EXPECT_EQ(attr(created->getDocumentElement(), "xsi:schemaLocation"),
              "http://www.dmg.org/PMML-2_1 http://www.dmg.org/PMML-2_1/pmml-2-1.xsd");
    ChartBase::releaseDocument(created);

    DOMDocument* model = tree.setupPMMLDOM();
    ASSERT_NE(model, nullptr);
    const std::string packed = tree.compressDocument(model);
    const std::string text = inflate(packed, 1 << 16);
    EXPECT_EQ(text.find('\n', text.find("?>") + 3), std::string::npos) << "printed without white space";
    Reader reader;
    ASSERT_NE(reader.read(text), nullptr);
    EXPECT_EQ(elements(reader.read(text), "Node").size(), 5u);
    EXPECT_EQ(inflate(tree.compressDocument(nullptr), 16), "");
}

TEST(TreeEntityResolution, OnlyTheTwoGrammarsFromTheResourceFolder) {
    TreeEntityResolver resolver;
    EXPECT_EQ(resolver.resolveEntity(nullptr, u"pmml-2-1.xsd"), nullptr)
        << "nothing without the parser library";
    const TestTree keepsXercesUp("", "");
    const auto resolved = [&](const char16_t* systemId) {
        return std::unique_ptr<InputSource>(resolver.resolveEntity(nullptr, systemId));
    };
    for (const char16_t* id : {u"http://www.dmg.org/PMML-2_1/pmml-2-1.xsd", u"../../../tmp/evil-pmml-2-1.xsd",
                               u"treeview-1.0.xsd", u"http://plotaid.org/treeview/1.0/treeview-1.0.xsd"}) {
        const auto source = resolved(id);
        ASSERT_NE(source, nullptr) << u8(id);
        const std::string path = u8(source->getSystemId());
        EXPECT_NE(path.find("/schemas/"), std::string::npos) << path;
        EXPECT_TRUE(path.size() > 4 && (path.substr(path.size() - 12) == "pmml-2-1.xsd" ||
                                        path.substr(path.size() - 16) == "treeview-1.0.xsd"))
            << path;
        EXPECT_EQ(path.find("evil"), std::string::npos);
    }
    EXPECT_EQ(resolved(u"/etc/passwd"), nullptr);
    EXPECT_EQ(resolved(u"file:///etc/hostname"), nullptr);
    EXPECT_EQ(resolved(nullptr), nullptr);
}

TEST(TreeText, EachXmlStringOwnsItsBuffer) {
    xmlString a(std::string("Gr\xc3\xb6\xc3\x9f"
                            "e"));
    ASSERT_NE(a.getChars(), nullptr);
    EXPECT_EQ(std::u16string(a.getChars()), u"Gr\u00f6\u00dfe");
    xmlString b(a);
    EXPECT_NE(b.getChars(), a.getChars());
    EXPECT_EQ(std::u16string(b.getChars()), std::u16string(a.getChars()));
    xmlString c("other");
    c = a;
    EXPECT_NE(c.getChars(), a.getChars());
    EXPECT_EQ(std::u16string(c.getChars()), std::u16string(a.getChars()));
    c = c;
    EXPECT_EQ(std::u16string(c.getChars()), u"Gr\u00f6\u00dfe");
    xmlString moved(std::move(b));
    EXPECT_EQ(std::u16string(moved.getChars()), std::u16string(a.getChars()));
    EXPECT_EQ(xmlString(static_cast<const char*>(nullptr)).getChars(), nullptr);
    EXPECT_EQ(xmlString(std::string("\xff", 1)).getChars(), nullptr);
    xmlString invalid(std::string("\xff", 1));
    xmlString copy(invalid);
    EXPECT_EQ(copy.getChars(), nullptr);
}

} // namespace
