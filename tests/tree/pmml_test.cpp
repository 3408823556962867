// PMML kept compressed, handed out compressed or as a freshly printed "PMML" document.
#include "TreeSupport.h"

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
    return text.substr(0, length);
}

std::string deflate(const std::string& text) {
    uLongf length = compressBound(text.size());
    std::string packed(length, '\0');
    compress(reinterpret_cast<Bytef*>(packed.data()), &length, reinterpret_cast<const Bytef*>(text.data()),
             text.size());
    return packed.substr(0, length);
}

class TreePmmlExamples : public ::testing::TestWithParam<const char*> {};

TEST_P(TreePmmlExamples, CompressedInflatesToTheOriginalAndPlainIsTheSameValidTree) {
    const std::string pmml = example(GetParam());
    ASSERT_FALSE(pmml.empty());
    TestTree tree(pmml, "");
    unsigned long length = 0;
    const std::string packed = tree.getCompressedPMML(&length);
    EXPECT_EQ(length, pmml.size());
    EXPECT_EQ(inflate(packed, pmml.size()), pmml);
    EXPECT_EQ(tree.getCompressedPMML(nullptr), packed);

    const std::string text = tree.getUncompressedPMML(nullptr);
    Reader reader, original;
    DOMDocument* out = reader.read(text);
    ASSERT_NE(out, nullptr) << (reader.errors().empty() ? text : reader.errors().front());
    EXPECT_EQ(attr(out->getDocumentElement(), "version"), "2.1");
    EXPECT_NE(text.find("<?xml version=\"1.0\" encoding=\"UTF-8\""), std::string::npos);
    EXPECT_NE(tree.getUncompressedPMML(u"ISO-8859-1").find("encoding=\"ISO-8859-1\""), std::string::npos);
    EXPECT_EQ(tree.getUncompressedPMML(u"no-such-encoding"), "");
    // Every node, predicate and score distribution, in order.
    DOMDocument* source = original.read(pmml);
    ASSERT_NE(source, nullptr);
    for (const char* name :
         {"Node", "SimplePredicate", "CompoundPredicate", "ScoreDistribution", "DataField", "Header"})
        for (const char* key : {"id", "value", "recordCount", "description"})
            EXPECT_EQ(values(source, name, key), values(out, name, key)) << name << " " << key;
    EXPECT_EQ(grammar_test::lintFaults("pmml-2-1.xsd", text), "");
}

INSTANTIATE_TEST_SUITE_P(Examples, TreePmmlExamples,
                         ::testing::Values("credit-risk.xml", "house-prices.xml", "churn-surrogates.xml"));

TEST(TreePmml, CompressedInputDecompressesWhateverItsLengthHint) {
    const std::string pmml = example("house-prices.xml");
    TestTree tree(deflate(pmml), 0, "");
    unsigned long length = 99;
    tree.getCompressedPMML(&length);
    EXPECT_EQ(length, 0u);
    ASSERT_NE(tree.setupPMMLDOM(), nullptr);
    tree.getCompressedPMML(&length);
    EXPECT_EQ(length, pmml.size()) << "an unknown length is learnt";
    EXPECT_EQ(tree.pmmlDocument(), tree.setupPMMLDOM()) << "the parsed model is the base's document";
    for (unsigned long hint : {10ul, 4000000000ul})
        EXPECT_NE(TestTree(deflate(pmml), hint, "").getUncompressedPMML(nullptr).find("<PMML"),
                  std::string::npos)
            << hint;
}

TEST(TreePmml, UnusableModelGivesEmptyTextOrComesBackAsItWas) {
    engine_test::Records records;
    const std::string packed = deflate(example("credit-risk.xml"));
    TestTree cut(packed.substr(0, packed.size() / 2), 0, "");
    EXPECT_EQ(cut.getUncompressedPMML(nullptr), "");
    EXPECT_EQ(cut.setupPMMLDOM(), nullptr);
    EXPECT_EQ(TestTree("<PMML/>", 7, "").getUncompressedPMML(nullptr), "");
    EXPECT_TRUE(mentions(records, "setupPMMLDOM fatal error"));

    const std::string notPmml = "<PMML version=\"2.1\" xmlns=\"http://www.dmg.org/PMML-2_1\"><Bogus/></PMML>";
    TestTree tree(notPmml, "");
    EXPECT_EQ(tree.getUncompressedPMML(nullptr), notPmml);
    EXPECT_EQ(tree.pmmlDocument(), nullptr);
    // Valid display settings, not a model: handed back, never passed off as PMML.
    const std::string settings = TestTree("", "").getDisplayData(nullptr);
    EXPECT_EQ(TestTree(settings, "").getUncompressedPMML(nullptr), settings);
}

TEST(TreePmml, OutputDocumentAndCompressDocument) {
    TestTree tree(example("house-prices.xml"), "");
    DOMDocument* created = tree.createPMMLDocument(nullptr);
    ASSERT_NE(created, nullptr);
    EXPECT_EQ(u8(created->getDocumentElement()->getLocalName()), "PMML");
    EXPECT_EQ(attr(created->getDocumentElement(), "xsi:schemaLocation"),
              "http://www.dmg.org/PMML-2_1 http://www.dmg.org/PMML-2_1/pmml-2-1.xsd");
    ChartBase::releaseDocument(created);

    ASSERT_NE(tree.setupPMMLDOM(), nullptr);
    const std::string text = inflate(tree.compressDocument(tree.setupPMMLDOM()), 1 << 16);
    EXPECT_EQ(text.find('\n', text.find("?>") + 3), std::string::npos) << "printed without white space";
    Reader reader;
    EXPECT_EQ(elements(reader.read(text), "Node").size(), 5u);
    EXPECT_EQ(inflate(tree.compressDocument(nullptr), 16), "");
}

TEST(TreeEntityResolution, OnlyTheTwoGrammarsFromTheResourceFolder) {
    TreeEntityResolver resolver;
    EXPECT_EQ(resolver.resolveEntity(nullptr, u"pmml-2-1.xsd"), nullptr)
        << "nothing without the parser library";
    const TestTree keepsXercesUp("", "");
    const std::pair<const char16_t*, const char*> cases[] = {
        {u"http://www.dmg.org/PMML-2_1/pmml-2-1.xsd", "/schemas/pmml-2-1.xsd"},
        {u"../../../tmp/evil-pmml-2-1.xsd", "/schemas/pmml-2-1.xsd"},
        {u"treeview-1.0.xsd", "/schemas/treeview-1.0.xsd"},
        {u"http://plotaid.org/treeview/1.0/treeview-1.0.xsd", "/schemas/treeview-1.0.xsd"},
        {u"/etc/passwd", nullptr},
        {u"file:///etc/hostname", nullptr},
        {nullptr, nullptr},
    };
    for (const auto& [id, ending] : cases) {
        const std::unique_ptr<InputSource> source(resolver.resolveEntity(nullptr, id));
        ASSERT_EQ(source != nullptr, ending != nullptr) << u8(id);
        const std::string path = source ? u8(source->getSystemId()) : "", end = ending ? ending : "";
        EXPECT_TRUE(path.size() >= end.size() && path.compare(path.size() - end.size(), end.size(), end) == 0)
            << path;
    }
}

TEST(TreeText, EachXmlStringOwnsItsBuffer) {
    const std::u16string expected = u"Gr\u00f6\u00dfe";
    xmlString a(std::string("Gr\xc3\xb6\xc3\x9f"
                            "e"));
    ASSERT_NE(a.getChars(), nullptr);
    EXPECT_EQ(std::u16string(a.getChars()), expected);
    xmlString b(a);
    xmlString c("other");
    c = a;
    for (const xmlString* copy : {&b, &c}) {
        EXPECT_NE(copy->getChars(), a.getChars());
        EXPECT_EQ(std::u16string(copy->getChars()), expected);
    }
    c = c;
    EXPECT_EQ(std::u16string(c.getChars()), expected);
    xmlString moved(std::move(b));
    EXPECT_EQ(std::u16string(moved.getChars()), expected);
    EXPECT_EQ(xmlString(static_cast<const char*>(nullptr)).getChars(), nullptr);
    xmlString invalid(std::string("\xff", 1));
    EXPECT_EQ(invalid.getChars(), nullptr);
    EXPECT_EQ(xmlString(invalid).getChars(), nullptr);
}

} // namespace
