// ChartTemplate and the instruction walk: loading a template, the source handed to the actions, the
// tool's report, and what a failing action costs.
#include "templates/TemplateSupport.h"

#include "support/ToolRunner.h"

#include <plotaid/ChartErrorHandler.h>

#include <kovar/KovarGoToCaller.h>

#include <xercesc/util/XMLException.hpp>

#include <filesystem>

using namespace template_test;
using namespace XERCES_CPP_NAMESPACE;
using engine_test::Records;

namespace {

bool startsWith(const std::string& s, const std::string& prefix) {
    return s.compare(0, prefix.size(), prefix) == 0;
}

// Files of the folder whose names start with the prefix, sorted.
std::vector<std::string> filesStartingWith(const TempDir& dir, const std::string& prefix) {
    std::vector<std::string> found;
    for (const auto& entry : std::filesystem::directory_iterator(dir.path()))
        if (startsWith(entry.path().filename().string(), prefix))
            found.push_back(entry.path().string());
    std::sort(found.begin(), found.end());
    return found;
}

// Dumps and the error log go to a fresh folder while it lives.
struct Dumps {
    explicit Dumps(const char* options) : options_("DumpChartXMLOptions", options) {}
    TempDir dir;
    ScopedEnv path_{"DumpChartXMLPath", dir.path()};
    ScopedEnv options_;
};

using ChartTemplateLoading = TemplateTest;

TEST_F(ChartTemplateLoading, UnparsableTemplateFailsOnceWithItsTextLogsWhereAndAppliesNothing) {
    Dumps dumps(nullptr);
    GrxVisualization& chart = sample("simple-bar.xml");
    const std::string before = chart.AsUTF8();
    const std::string text = templateOf("<setStyle>"); // not well-formed
    Records records;
    ChartTemplate t(chart, nullptr);
    EXPECT_FALSE(t.setTemplate(text));
    const std::vector<std::string> errors = records.errors();
    EXPECT_EQ(std::count(errors.begin(), errors.end(), "Failed to parse template " + text), 1);
    EXPECT_EQ(&t.applyTemplate(), &chart);
    EXPECT_EQ(chart.AsUTF8(), before);
    // Unknown tags pass the grammar (the walk reports them); a declaration inside an instruction does not.
    EXPECT_FALSE(t.setTemplate(templateOf("<setStyle><!ENTITY x \"y\"></setStyle>")));
    ASSERT_TRUE(t.setTemplate(templateOf("<setStyle type=\"interval\"/><madeUp/>")));
    t.applyTemplate();
    const std::string log = readAll(dumps.dir.file("chartxml_error.log"));
    for (const char* line : {"Failed to parse template <?xml",
                             "at file backend/chartxml/plotaid/src/templates/charttemplate, line 59",
                             "Unsupported Template element encountered (<madeUp",
                             "at file backend/chartxml/plotaid/src/templates/applytemplate, line 436"})
        EXPECT_NE(log.find(line), std::string::npos) << line << "\n" << log;
}

TEST_F(ChartTemplateLoading, EarlierFormIsConvertedDumpedAndAppliesNothing) {
    Dumps dumps("0001");
    GrxVisualization& chart = sample("simple-bar.xml");
    const std::string before = chart.AsUTF8();
    ChartTemplate t(chart, nullptr);
    // An old-form document that names the marker only in a comment is parsed as it is, and refused.
    EXPECT_FALSE(t.setTemplate("<?xml version=\"1.0\"?><!-- grxml-template- --><graph/>"));
    EXPECT_TRUE(filesStartingWith(dumps.dir, "template_converted_").empty());
    WalkReport report;
    // Text that does not validate is converted, from the nothing it built; text that is not XML is not.
    EXPECT_TRUE(t.setTemplate("<graph><frame id=\"f\"><location/></frame></graph>"));
    EXPECT_FALSE(t.setTemplate("this is not XML"));
    t.applyTemplate();
    EXPECT_TRUE(report.outcomes().empty());
    EXPECT_EQ(chart.AsUTF8(), before);
    const std::vector<std::string> dumped = filesStartingWith(dumps.dir, "template_converted_");
    ASSERT_EQ(dumped.size(), 1u); // numbered by the process-wide converter count
    const std::string converted = readAll(dumped.front());
    EXPECT_NE(converted.find("grxml-template-1.0.xsd"), std::string::npos);
    EXPECT_TRUE(ChartTemplate(empty(), nullptr).setTemplate(converted)) << "itself a valid template";
}

// Each built instruction reaching its action is shown on the container sample (kit_test.cpp); here,
// that the walk hands a source on: what the chart's own definition sets stays.
TEST_F(ChartTemplateLoading, TheWalkPassesTheSourceToItsActions) {
    GrxVisualization& target = sample("simple-bar.xml");
    plotaid::detail::applyTemplateCommands(
        &sample("simple-bar.xml"), target,
        templateRoot("<setStyle type=\"bar\"><style color=\"red\" font-family=\"Serif\"/></setStyle>"));
    EXPECT_EQ(attr(target.getStyleById(u"barStyle"), "color") + " " +
                  attr(target.getStyleById(u"barStyle"), "font-family"),
              "#3E58AC Serif");
}

TEST_F(ChartTemplateLoading, TheToolReportsEveryInstructionOfABundledTemplate) {
    WalkReport report;
    ChartTemplate t(sample("simple-bar.xml"), nullptr);
    ASSERT_TRUE(t.setTemplate(example("templates/bar-tidy.sgt")));
    t.applyTemplate();
    ASSERT_EQ(report.outcomes().size(), 6u);
    std::vector<std::string> expected;
    for (const InstructionOutcome& o : report.outcomes())
        expected.push_back("bar-tidy.sgt #" + std::to_string(o.position) + " " + o.tag + ": " + label(o) +
                           "\n");

    TempDir dir;
    const std::string examples = std::string("'") + PLOTAID_EXAMPLES_DIR;
    const std::string apply = "apply --chart " + examples + "/charts/simple-bar.xml' --template ";
    const ToolResult r =
        runTool(apply + examples + "/templates/bar-tidy.sgt' -o '" + dir.file("out.xml") + "' --report");
    EXPECT_EQ(r.exitCode, 0) << r.output;
    for (const std::string& line : expected)
        EXPECT_NE(r.output.find(line), std::string::npos) << r.output << "\nwanted " << line;
    EXPECT_EQ(runTool("validate '" + dir.file("out.xml") + "'").exitCode, 0);

    // A bad template fails the run, and the next one is still applied.
    std::ofstream(dir.file("bad.sgt")) << templateOf("<setStyle>");
    const ToolResult bad = runTool(apply + "'" + dir.file("bad.sgt") + "' --template " + examples +
                                   "/templates/bar-tidy.sgt' -o '" + dir.file("out.xml") + "' --report");
    EXPECT_EQ(bad.exitCode, 1) << bad.output;
    EXPECT_NE(bad.output.find("bad.sgt:2:204: expected end of tag 'setStyle'"), std::string::npos) << bad.output;
    EXPECT_NE(bad.output.find(expected.back()), std::string::npos) << bad.output;

    std::ofstream(dir.file("chart.xml"))
        << "<visualization xmlns=\"http://plotaid.org/grxml\"><nonsense/></visualization>";
    EXPECT_EQ(runTool("apply --chart '" + dir.file("chart.xml") + "' --template " + examples +
                      "/templates/bar-tidy.sgt'")
                  .exitCode,
              1);
    for (const std::string& args : {"apply --template " + examples + "/templates/bar-tidy.sgt'",
                                    "apply --chart " + examples + "/charts/simple-bar.xml' --bogus"})
        EXPECT_EQ(runTool(args).exitCode, 2) << args;
}

// What the test actions saw, in order: tag and the "steps" already on the target when it ran.
std::vector<std::string>& journal() {
    static std::vector<std::string> j;
    return j;
}

struct AnyFault {};
struct XmlFault : XMLException {
    XmlFault() : XMLException("test", 1) {}
    const XMLCh* getType() const override { return u"XmlFault"; }
};

// One test action whose behaviour its tag names.
class Scripted : public BaseTemplate {
public:
    Scripted(const GrxVisualization* s, GrxVisualization& t, const DOMElement* i) : BaseTemplate(s, t, i) {
        if (tag() == "xmlFault")
            throw XmlFault();
        if (tag() == "domFault")
            throw DOMException(DOMException::HIERARCHY_REQUEST_ERR);
        if (tag() == "anyFault")
            throw AnyFault();
    }
    void setFrameList(plotaid::detail::FrameList* frames) { frames_ = frames; }
    bool apply() override {
        if (tag() == "throw")
            throw std::runtime_error("boom");
        if (tag() == "host")
            throw KovarGoToCaller(7);
        if (tag() == "log") {
            ChartErrorHandler().warning(ChartException("just so you know", "t", 1));
            ChartErrorHandler().error(ChartException("no axis of that role", "t", 2));
        } else if (tag() == "frames") {
            journal().push_back("frames:" + std::to_string(frames_->size()));
            frames_->push_back(&target_);
        } else if (tag() == "record") {
            const std::string seen = u8(static_cast<const GrxBaseElement&>(target_).GetAttribute(u"steps"));
            journal().push_back("record@" + seen);
            target_.SetAttribute(u"steps", ChartString(seen + "x"));
        }
        return tag() != "quiet";
    }

private:
    std::string tag() const { return u8(instruction_->getTagName()); }
    plotaid::detail::FrameList* frames_ = nullptr;
};

using plotaid::detail::makeAction;
const plotaid::detail::InstructionEntry kTestTable[] = {
    {u"record", "Recording", makeAction<Scripted>},   {u"throw", "Throwing", makeAction<Scripted>},
    {u"quiet", "Quiet", makeAction<Scripted>},        {u"log", "Logging", makeAction<Scripted>},
    {u"host", "HostUnwinding", makeAction<Scripted>}, {u"frames", "FramesKeeper", makeAction<Scripted>},
    {u"xmlFault", "", makeAction<Scripted>},          {u"domFault", "", makeAction<Scripted>},
    {u"anyFault", "", makeAction<Scripted>},          {u"later", "NotBuilt", nullptr},
};

class InstructionWalk : public TemplateTest {
protected:
    void SetUp() override { journal().clear(); }
    // Walks a template body (the grammar accepts the test tags) with the test table.
    void walk(const std::string& body) {
        plotaid::detail::applyTemplateCommands(nullptr, chart_, templateRoot(body),
                                               {kTestTable, std::size(kTestTable)});
    }
    std::string kinds(const WalkReport& report) const {
        std::string out;
        for (const InstructionOutcome& o : report.outcomes())
            out += label(o) + " ";
        return out;
    }
    GrxVisualization& chart_ = empty();
};

TEST_F(InstructionWalk, AppliesInDocumentOrderEachSeeingTheEarlierChanges) {
    const std::string before = chart_.AsUTF8();
    walk("");
    plotaid::detail::applyTemplateCommands(nullptr, chart_, nullptr, {kTestTable, std::size(kTestTable)});
    EXPECT_EQ(chart_.AsUTF8(), before);
    // The nested element belongs to its instruction and is never dispatched by itself.
    walk("\n  <!-- c --><record><record/></record>\n<?pi x?><record/>");
    EXPECT_EQ(journal(), (std::vector<std::string>{"record@", "record@x"}));
}

TEST_F(InstructionWalk, UnknownPrefixedAndUnbuiltTagsAreReportedAlikeAndSkipped) {
    Records records;
    WalkReport report;
    walk("<record/><nothing a=\"1\"/><g:record xmlns:g=\"http://plotaid.org/grxml\"/><later/><record/>");
    EXPECT_EQ(journal(), (std::vector<std::string>{"record@", "record@x"}));
    const auto errors = records.errors();
    ASSERT_EQ(errors.size(), 3u);
    EXPECT_TRUE(startsWith(errors[0], "Unsupported Template element encountered (<nothing"));
    EXPECT_NE(errors[0].find("a=\"1\""), std::string::npos);
    EXPECT_EQ(errors[0].back(), ')');
    EXPECT_TRUE(startsWith(errors[1], "Unsupported Template element encountered (<g:record"));
    EXPECT_TRUE(startsWith(errors[2], "Unsupported Template element encountered (<later"));
    EXPECT_EQ(kinds(report), "applied unsupported unsupported unsupported applied ");
    EXPECT_EQ(report.outcomes()[2].tag, "g:record");
    EXPECT_EQ(report.outcomes()[4].position, 5u);
}

TEST_F(InstructionWalk, AnActionsFailureCostsOnlyItsInstructionAndFramesLiveForOneWalk) {
    Records records;
    WalkReport report;
    walk("<throw/><record/><quiet/><log/><xmlFault/><record/>");
    EXPECT_EQ(kinds(report), "failed applied failed failed failed applied ");
    EXPECT_EQ(report.outcomes()[0].reason, "boom");
    EXPECT_EQ(report.outcomes()[3].reason, "no axis of that role"); // the error, not the warning
    // The thrown action was swallowed without a record; the XML fault was logged.
    EXPECT_EQ(records.errors().size(), 2u);
    walk("<frames/><record/><frames/>");
    walk("<frames/><frames/>");
    EXPECT_EQ(journal(), (std::vector<std::string>{"record@", "record@x", "frames:0", "record@xx", "frames:1",
                                                   "frames:0", "frames:1"}));
}

TEST_F(InstructionWalk, FaultsWhileMakingAnActionEndTheWalkAndTheHostsUnwindingPasses) {
    Records records;
    try {
        walk("<record/><anyFault/><record/>");
        ADD_FAILURE() << "the walk went on";
    } catch (const ChartException& e) {
        EXPECT_TRUE(startsWith(e.what(), "Fatal Error occurred while applying template command: <anyFault"));
        EXPECT_EQ(e.line(), 483u);
    }
    EXPECT_THROW(walk("<record/><domFault/><record/>"), DOMException);
    try {
        walk("<record/><host/><record/>");
        ADD_FAILURE() << "the walk went on";
    } catch (const KovarGoToCaller& e) {
        EXPECT_EQ(e.code(), 7);
    }
    EXPECT_EQ(journal(), (std::vector<std::string>{"record@", "record@x", "record@xx"}));

    // Through ChartTemplate the fatal walk is reported once more; nothing is rolled back.
    plotaid::detail::ScopedInstructionTable table({kTestTable, std::size(kTestTable)});
    GrxVisualization& chart = empty();
    ChartTemplate fatal(chart, nullptr);
    ASSERT_TRUE(fatal.setTemplate(templateOf("<record/><anyFault/><record/>")));
    try {
        fatal.applyTemplate();
        ADD_FAILURE() << "no exception";
    } catch (const ChartException& e) {
        EXPECT_STREQ(e.what(), "Fatal Error occurred while applying template");
        EXPECT_EQ(e.line(), 102u);
    }
    EXPECT_EQ(records.errors().back(), "Fatal Error occurred while applying template");
    EXPECT_EQ(u8(static_cast<const GrxBaseElement&>(chart).GetAttribute(u"steps")), "x");
    ChartTemplate host(chart, nullptr);
    ASSERT_TRUE(host.setTemplate(templateOf("<host/>")));
    EXPECT_THROW(host.applyTemplate(), KovarGoToCaller);
}

} // namespace
