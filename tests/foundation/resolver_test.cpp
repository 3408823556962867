#include "foundation/FoundationSupport.h"
#include "foundation/ValidatingParser.h"
#include "foundation/XercesRuntime.h"

#include <plotaid/ChartErrorHandler.h>

#include <xercesc/sax/InputSource.hpp>

#include <gtest/gtest.h>

#include <memory>

using namespace foundation_test;
using namespace XERCES_CPP_NAMESPACE;

namespace {

const std::string kMarker = "MARKER-OUTSIDE-THE-RESOURCE-FOLDER";

std::string utf8(const XMLCh* text) {
    std::string out;
    for (; text && *text; ++text)
        out += static_cast<char>(*text); // the paths here are ASCII
    return out;
}

class Resolver : public ::testing::Test {
protected:
    std::unique_ptr<InputSource> resolve(const std::u16string& systemId) {
        return std::unique_ptr<InputSource>(handler.resolveEntity(nullptr, systemId.c_str()));
    }
    std::string resourceFile(const std::string& name) {
        return std::filesystem::canonical(testData("resources/schemas/" + name)).string();
    }

    plotaid::detail::XercesRuntime runtime;
    TestResources resources;
    ChartErrorHandler handler;
};

TEST_F(Resolver, MapsTheFileNameIntoTheResourceFolder) {
    for (const std::u16string id :
         {u"http://plotaid.org/test/foundation-test.xsd",
          u"http://elsewhere.example/a/b/c/foundation-test.xsd", u"x/foundation-test.xsd"}) {
        const auto source = resolve(id);
        ASSERT_NE(source, nullptr);
        EXPECT_EQ(utf8(source->getSystemId()), resourceFile("foundation-test.xsd"));
    }
}

TEST_F(Resolver, RefusesWhatIsNotAResourceFileAndSaysSo) {
    DumpFolder dumps;
    const std::u16string refused[] = {
        u"foundation-test.xsd",                  // no '/': would be read from the working folder
        u"/foundation-test.xsd",                 // '/' only first
        u"http://plotaid.org/test/",             // no file name
        u"http://plotaid.org/test/..",           // the folder above
        u"http://plotaid.org/test/.",            //
        u"http://plotaid.org/a\\..\\marker.txt", // the other platform's separator
        u"http://plotaid.org/%2e%2e%2fmarker.txt",
        u"http://plotaid.org/test/missing.xsd", // not there
        u"file:///etc/passwd",
        u"",
    };
    for (const std::u16string& id : refused)
        EXPECT_EQ(resolve(id), nullptr) << utf8(id.c_str());
    EXPECT_EQ(handler.resolveEntity(nullptr, nullptr), nullptr);
    const std::string log = dumps.log();
    std::size_t records = 0;
    for (std::size_t at = log.find("Error -- ChartXML: resolveEntity refused"); at != std::string::npos;
         at = log.find("Error -- ChartXML: resolveEntity refused", at + 1))
        ++records;
    EXPECT_EQ(records, std::size(refused) + 1);
    EXPECT_NE(log.find("refused 'file:///etc/passwd'"), std::string::npos) << log;
}

TEST_F(Resolver, RefusesLinksLeadingOutOfTheResourceFolder) {
    TempDir root;
    std::filesystem::create_directories(root.file("res/schemas/sub"));
    std::filesystem::create_symlink(testData("marker.txt"), root.file("res/schemas/link.xsd"));
    writeFile(root.file("res/schemas/sub/inner.xsd"), "<x/>");
    std::filesystem::create_symlink(root.file("res/schemas/sub/inner.xsd"),
                                    root.file("res/schemas/inner.xsd"));
    writeFile(root.file("res/schemas/plain.xsd"), "<x/>");
    writeFile(root.file("res/beside.xsd"), "<x/>");
    ScopedEnv folder("PLOTAID_RESOURCE_DIR", root.file("res"));
    EXPECT_EQ(resolve(u"http://x/link.xsd"), nullptr);
    EXPECT_EQ(resolve(u"http://x/inner.xsd"), nullptr);
    EXPECT_EQ(resolve(u"http://x/sub"), nullptr);
    EXPECT_EQ(resolve(u"http://x/beside.xsd"), nullptr) << "only the schema folder is served";
    EXPECT_NE(resolve(u"http://x/plain.xsd"), nullptr);
}

// Documents that try to pull the marker file into the parse.
class EntityRefusal : public ::testing::TestWithParam<std::string> {};

TEST_P(EntityRefusal, MarkerNeverReachesTheDocument) {
    TestResources resources;
    DumpFolder dumps;
    // A document naming a bare file name must not find it in the working folder either.
    ScopedCwd beside(testData(""));
    const std::string markerPath = std::filesystem::canonical(testData("marker.txt")).string();
    const std::string dtdPath = std::filesystem::canonical(testData("marker.dtd")).string();
    std::string doctype = GetParam();
    for (const auto& [key, value] :
         {std::pair<std::string, std::string>{"@MARKER@", markerPath}, {"@DTD@", dtdPath}})
        for (auto at = doctype.find(key); at != std::string::npos; at = doctype.find(key))
            doctype.replace(at, key.size(), value);
    const std::string text =
        "<?xml version=\"1.0\"?>" + doctype +
        "<chart xmlns=\"http://plotaid.org/test\" "
        "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
        "xsi:schemaLocation=\"http://plotaid.org/test http://plotaid.org/test/foundation-test.xsd\">"
        "<label>&leaked;</label></chart>";
    plotaid::detail::ValidatingParser parser;
    EXPECT_EQ(parser.parse(text, "ChartBase", ChartException("refused", "test", 1)), nullptr);
    const std::string log = dumps.log();
    EXPECT_NE(log.find("resolveEntity refused"), std::string::npos) << log;
    EXPECT_EQ(log.find(kMarker), std::string::npos) << log;
    std::string errors;
    for (const std::string& e : parser.lastErrors())
        errors += e + "\n";
    EXPECT_NE(errors.find("refused to read"), std::string::npos) << errors;
    EXPECT_EQ(errors.find(kMarker), std::string::npos) << errors;
}

INSTANTIATE_TEST_SUITE_P(
    Foundation, EntityRefusal,
    ::testing::Values("<!DOCTYPE chart [<!ENTITY leaked SYSTEM \"file://@MARKER@\">]>",
                      "<!DOCTYPE chart [<!ENTITY leaked SYSTEM \"@MARKER@\">]>",
                      "<!DOCTYPE chart [<!ENTITY leaked SYSTEM \"marker.txt\">]>",
                      "<!DOCTYPE chart [<!ENTITY leaked SYSTEM \"http://plotaid.org/../../marker.txt\">]>",
                      "<!DOCTYPE chart SYSTEM \"marker.dtd\">", "<!DOCTYPE chart SYSTEM \"file://@DTD@\">",
                      "<!DOCTYPE chart PUBLIC \"-//Test//EN\" \"http://plotaid.org/marker.dtd\">",
                      "<!DOCTYPE chart [<!ENTITY % outside SYSTEM \"@DTD@\"> %outside;]>"));

} // namespace
