#include "foundation/FoundationSupport.h"
#include "foundation/XercesRuntime.h"

#include <plotaid/ChartErrorHandler.h>

#include <xercesc/sax/InputSource.hpp>

#include <gtest/gtest.h>

#include <fstream>
#include <memory>

using namespace foundation_test;
using namespace XERCES_CPP_NAMESPACE;

namespace {

// The paths here are ASCII.
std::string utf8(const XMLCh* text) {
    return text ? std::string(text, text + std::char_traits<XMLCh>::length(text)) : std::string();
}

class Resolver : public ::testing::Test {
protected:
    std::unique_ptr<InputSource> resolve(const std::u16string& systemId) {
        return std::unique_ptr<InputSource>(handler.resolveEntity(nullptr, systemId.c_str()));
    }

    plotaid::detail::XercesRuntime runtime;
    TestResources resources;
    ChartErrorHandler handler;
};

TEST_F(Resolver, MapsTheFileNameIntoTheResourceFolderAndRefusesTheRestAndSaysSo) {
    const std::string file =
        std::filesystem::canonical(testData("resources/schemas/foundation-test.xsd")).string();
    for (const std::u16string id :
         {u"http://plotaid.org/test/foundation-test.xsd",
          u"http://elsewhere.example/a/b/c/foundation-test.xsd", u"x/foundation-test.xsd"}) {
        const auto source = resolve(id);
        ASSERT_NE(source, nullptr);
        EXPECT_EQ(utf8(source->getSystemId()), file);
    }

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
    std::ofstream(root.file("res/schemas/sub/inner.xsd")) << "<x/>";
    std::filesystem::create_symlink(root.file("res/schemas/sub/inner.xsd"),
                                    root.file("res/schemas/inner.xsd"));
    std::ofstream(root.file("res/schemas/plain.xsd")) << "<x/>";
    std::ofstream(root.file("res/beside.xsd")) << "<x/>";
    ScopedEnv folder("PLOTAID_RESOURCE_DIR", root.file("res"));
    EXPECT_EQ(resolve(u"http://x/link.xsd"), nullptr);
    EXPECT_EQ(resolve(u"http://x/inner.xsd"), nullptr);
    EXPECT_EQ(resolve(u"http://x/sub"), nullptr);
    EXPECT_EQ(resolve(u"http://x/beside.xsd"), nullptr) << "only the schema folder is served";
    EXPECT_NE(resolve(u"http://x/plain.xsd"), nullptr);
}

} // namespace
