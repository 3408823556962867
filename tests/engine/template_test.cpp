#include "support/EngineSupport.h"

#include "../foundation/FoundationSupport.h"

#include "templates/InstructionWalk.h"
#include "templates/actions/Actions.h"

#include <plotaid/ChartErrorHandler.h>
#include <plotaid/ChartTemplate.h>

#include <kovar/KovarGoToCaller.h>

#include <xercesc/dom/DOM.hpp>
#include <xercesc/util/XMLException.hpp>

#include <filesystem>
#include <set>

using namespace XERCES_CPP_NAMESPACE;
using engine_test::Chart;
using engine_test::EngineTest;
using engine_test::Records;
using plotaid::detail::InstructionOutcome;
using plotaid::detail::WalkReport;

namespace {

const std::string kHead = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
                          "<template xmlns=\"http://plotaid.org/grxml\" "
                          "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
                          "xsi:schemaLocation=\"http://plotaid.org/grxml "
                          "http://plotaid.org/grxml/grxml-template-3.5.xsd\">";

std::string templateOf(const std::string& body) {
    return kHead + body + "</template>";
}

bool startsWith(const std::string& s, const std::string& prefix) {
    return s.compare(0, prefix.size(), prefix) == 0;
}

std::size_t countStartingWith(const std::vector<std::string>& v, const std::string& prefix) {
    std::size_t n = 0;
    for (const std::string& s : v)
        n += startsWith(s, prefix) ? 1 : 0;
    return n;
}

using ChartTemplateLoading = EngineTest;

TEST_F(ChartTemplateLoading, UnparsableCurrentFormFailsOnceWithTheTextAndAppliesNothing) {
    Chart chart = Chart::parse(engine_test::example("charts/simple-bar.xml"));
    ASSERT_TRUE(chart.vis);
    const std::string before = chart.vis->AsUTF8();
    const std::string text = templateOf("<setStyle>"); // not well-formed
    Records records;
    ChartTemplate t(*chart.vis, nullptr);
    EXPECT_FALSE(t.setTemplate(text));
    EXPECT_EQ(countStartingWith(records.errors(), "Failed to parse template "), 1u);
    EXPECT_NE(std::find(records.errors().begin(), records.errors().end(), "Failed to parse template " + text),
              records.errors().end());
    EXPECT_EQ(&t.applyTemplate(), chart.vis.get());
    EXPECT_EQ(chart.vis->AsUTF8(), before);
}

TEST_F(ChartTemplateLoading, LogRecordsNameTheirSourceAndLine) {
    foundation_test::DumpFolder dumps;
    Chart chart = Chart::empty();
    ChartTemplate t(*chart.vis, nullptr);
    EXPECT_FALSE(t.setTemplate(templateOf("<setStyle>")));
    ASSERT_TRUE(t.setTemplate(templateOf("<madeUp/>")));
    t.applyTemplate();
    const std::string log = dumps.log();
    EXPECT_NE(log.find("Failed to parse template <?xml"), std::string::npos) << log;
    EXPECT_NE(log.find("at file backend/chartxml/plotaid/src/templates/charttemplate, line 59"),
              std::string::npos);
    EXPECT_NE(log.find("Unsupported Template element encountered (<madeUp"), std::string::npos) << log;
    EXPECT_NE(log.find("at file backend/chartxml/plotaid/src/templates/applytemplate, line 436"),
              std::string::npos);
}

TEST_F(ChartTemplateLoading, InvalidInstructionContentIsRefusedByTheGrammar) {
    Chart chart = Chart::empty();
    ChartTemplate t(*chart.vis, nullptr);
    // Unknown tags pass the grammar (the walk reports them); text that is not well-formed does not.
    EXPECT_TRUE(t.setTemplate(templateOf("<setStyle type=\"interval\"/><unknownThing/>")));
    EXPECT_FALSE(t.setTemplate(templateOf("<setStyle><!ENTITY x \"y\"></setStyle>")));
}

TEST_F(ChartTemplateLoading, MarkerAnywhereMeansNoConversion) {
    foundation_test::DumpFolder dumps(std::string("0001"));
    Chart chart = Chart::empty();
    ChartTemplate t(*chart.vis, nullptr);
    // An old-form document that names the marker only in a comment: parsed as it is, and refused.
    const std::string withComment = "<?xml version=\"1.0\"?><!-- grxml-template- --><graph/>";
    EXPECT_FALSE(t.setTemplate(withComment));
    EXPECT_FALSE(std::filesystem::exists(dumps.dir().file("template_converted_01.sgt")));
    bool anyConverted = false;
    for (const auto& entry : std::filesystem::directory_iterator(dumps.dir().path()))
        anyConverted = anyConverted || startsWith(entry.path().filename().string(), "template_converted_");
    EXPECT_FALSE(anyConverted);
}

TEST_F(ChartTemplateLoading, EarlierFormIsConvertedDumpedAndAppliesNothing) {
    foundation_test::DumpFolder dumps(std::string("0001"));
    Chart chart = Chart::parse(engine_test::example("charts/simple-bar.xml"));
    ASSERT_TRUE(chart.vis);
    const std::string before = chart.vis->AsUTF8();
    ChartTemplate t(*chart.vis, nullptr);
    WalkReport report;
    // Even text that cannot be parsed at all is converted, from the nothing it built.
    EXPECT_TRUE(t.setTemplate("<graph><frame id=\"f\"><location/></frame></graph>"));
    EXPECT_TRUE(t.setTemplate("this is not XML"));
    t.applyTemplate();
    EXPECT_TRUE(report.outcomes().empty());
    EXPECT_EQ(chart.vis->AsUTF8(), before);

    std::vector<std::string> dumped;
    for (const auto& entry : std::filesystem::directory_iterator(dumps.dir().path()))
        if (startsWith(entry.path().filename().string(), "template_converted_"))
            dumped.push_back(entry.path().string());
    ASSERT_EQ(dumped.size(), 2u); // numbered by the process-wide converter count
    const std::string converted = engine_test::readText(dumped.front());
    EXPECT_NE(converted.find("grxml-template-1.0.xsd"), std::string::npos);
    EXPECT_NE(converted.find("<template"), std::string::npos);
    Chart other = Chart::empty();
    ChartTemplate again(*other.vis, nullptr);
    EXPECT_TRUE(again.setTemplate(converted)); // the converted form is itself a valid template
}

// ---- the walk --------------------------------------------------------------------------------------

// What the test actions saw, in order: tag and the number of "step" attributes already on the
// target when the action ran.
std::vector<std::string>& journal() {
    static std::vector<std::string> j;
    return j;
}

class Recording : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override {
        const GrxBaseElement& root = target_;
        const std::string seen = ChartString(root.GetAttribute(u"steps")).toUTF8();
        journal().push_back(ChartString(instruction_->getTagName()).toUTF8() + "@" + seen);
        target_.SetAttribute(u"steps", ChartString(seen + "x"));
        return true;
    }
};

class Throwing : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override {
        journal().push_back("throwing");
        throw std::runtime_error("boom");
    }
};

class Quiet : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override { return false; }
};

class Logging : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override {
        ChartErrorHandler().warning(ChartException("just so you know", "t", 1));
        ChartErrorHandler().error(ChartException("no axis of that role", "t", 2));
        return true;
    }
};

class HostUnwinding : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override { throw KovarGoToCaller(7); }
};

class FramesKeeper : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    void setFrameList(plotaid::detail::FrameList* frames) { frames_ = frames; }
    bool apply() override {
        journal().push_back("frames:" + std::to_string(frames_ ? frames_->size() : 99));
        if (frames_)
            frames_->push_back(&target_);
        return true;
    }

private:
    plotaid::detail::FrameList* frames_ = nullptr;
};

template <class E> class FailingToConstruct : public BaseTemplate {
public:
    FailingToConstruct(const GrxVisualization* s, GrxVisualization& t, const DOMElement* i)
        : BaseTemplate(s, t, i) {
        throw E();
    }
    bool apply() override { return true; }
};
struct AnyFault {};
struct XmlFault : XMLException {
    XmlFault() : XMLException("test", 1) {}
    const XMLCh* getType() const override { return u"XmlFault"; }
};
struct DomFault : DOMException {
    DomFault() : DOMException(DOMException::HIERARCHY_REQUEST_ERR) {}
};

using plotaid::detail::makeAction;
const plotaid::detail::InstructionEntry kTestTable[] = {
    {u"record", "Recording", makeAction<Recording>},
    {u"throw", "Throwing", makeAction<Throwing>},
    {u"quiet", "Quiet", makeAction<Quiet>},
    {u"log", "Logging", makeAction<Logging>},
    {u"host", "HostUnwinding", makeAction<HostUnwinding>},
    {u"frames", "FramesKeeper", makeAction<FramesKeeper>},
    {u"xmlFault", "", makeAction<FailingToConstruct<XmlFault>>},
    {u"domFault", "", makeAction<FailingToConstruct<DomFault>>},
    {u"anyFault", "", makeAction<FailingToConstruct<AnyFault>>},
    {u"later", "NotBuilt", nullptr},
};

class InstructionWalk : public EngineTest {
protected:
    void SetUp() override {
        journal().clear();
        chart_ = Chart::empty();
    }
    // Parses a template body (the test tags are outside the grammar's 59, which it accepts).
    const DOMElement* load(const std::string& body) {
        const DOMDocument* d =
            parser_.parse(templateOf(body), "test", ChartException("test template", "t", 0));
        return d ? d->getDocumentElement() : nullptr;
    }
    void walk(const DOMElement* root) {
        plotaid::detail::applyTemplateCommands(nullptr, *chart_.vis, root,
                                               {kTestTable, std::size(kTestTable)});
    }
    Chart chart_;
    plotaid::detail::ValidatingParser parser_;
};

TEST_F(InstructionWalk, AppliesInDocumentOrderEachSeeingTheEarlierChanges) {
    const DOMElement* root = load("\n  <!-- c --><record><record/></record>\n<?pi x?><record/>");
    ASSERT_NE(root, nullptr);
    walk(root);
    // The nested element belongs to its instruction and is never dispatched by itself.
    EXPECT_EQ(journal(), (std::vector<std::string>{"record@", "record@x"}));
}

TEST_F(InstructionWalk, UnknownPrefixedAndUnbuiltTagsAreReportedAlikeAndSkipped) {
    const DOMElement* root =
        load("<record/><nothing a=\"1\"/><g:record xmlns:g=\"http://plotaid.org/grxml\"/>"
             "<later/><record/>");
    ASSERT_NE(root, nullptr);
    Records records;
    WalkReport report;
    walk(root);
    EXPECT_EQ(journal(), (std::vector<std::string>{"record@", "record@x"}));
    const auto errors = records.errors();
    ASSERT_EQ(errors.size(), 3u);
    EXPECT_TRUE(startsWith(errors[0], "Unsupported Template element encountered (<nothing"));
    EXPECT_NE(errors[0].find("a=\"1\""), std::string::npos);
    EXPECT_EQ(errors[0].back(), ')');
    EXPECT_TRUE(startsWith(errors[1], "Unsupported Template element encountered (<g:record"));
    EXPECT_TRUE(startsWith(errors[2], "Unsupported Template element encountered (<later"));
    ASSERT_EQ(report.outcomes().size(), 5u);
    EXPECT_EQ(report.outcomes()[1].kind, InstructionOutcome::Unsupported);
    EXPECT_EQ(report.outcomes()[1].tag, "nothing");
    EXPECT_EQ(report.outcomes()[2].tag, "g:record");
    EXPECT_EQ(report.outcomes()[3].kind, InstructionOutcome::Unsupported);
    EXPECT_EQ(report.outcomes()[4].kind, InstructionOutcome::Applied);
    EXPECT_EQ(report.outcomes()[4].position, 5u);
}

TEST_F(InstructionWalk, AnActionsFailureCostsOnlyItsInstruction) {
    const DOMElement* root = load("<throw/><record/><quiet/><log/><xmlFault/><record/>");
    ASSERT_NE(root, nullptr);
    Records records;
    WalkReport report;
    walk(root);
    EXPECT_EQ(journal(), (std::vector<std::string>{"throwing", "record@", "record@x"}));
    ASSERT_EQ(report.outcomes().size(), 6u);
    EXPECT_EQ(report.outcomes()[0].kind, InstructionOutcome::Failed);
    EXPECT_EQ(report.outcomes()[0].reason, "boom");
    EXPECT_EQ(report.outcomes()[1].kind, InstructionOutcome::Applied);
    EXPECT_EQ(report.outcomes()[2].kind, InstructionOutcome::Failed);
    EXPECT_EQ(report.outcomes()[3].kind, InstructionOutcome::Failed);
    EXPECT_EQ(report.outcomes()[3].reason, "no axis of that role"); // the error, not the warning
    EXPECT_EQ(report.outcomes()[4].kind, InstructionOutcome::Failed);
    EXPECT_EQ(report.outcomes()[5].kind, InstructionOutcome::Applied);
    // The thrown action was swallowed without a record; the XML fault was logged.
    EXPECT_EQ(records.errors().size(), 2u);
}

TEST_F(InstructionWalk, FaultsWhileMakingAnActionEndTheWalk) {
    const DOMElement* root = load("<record/><anyFault/><record/>");
    ASSERT_NE(root, nullptr);
    Records records;
    try {
        walk(root);
        ADD_FAILURE() << "the walk went on";
    } catch (const ChartException& e) {
        EXPECT_TRUE(startsWith(e.what(), "Fatal Error occurred while applying template command: <anyFault"));
        EXPECT_EQ(e.line(), 483u);
    }
    EXPECT_EQ(journal(), (std::vector<std::string>{"record@"}));

    journal().clear();
    root = load("<record/><domFault/><record/>");
    EXPECT_THROW(walk(root), DOMException);
    EXPECT_EQ(journal(), (std::vector<std::string>{"record@x"}));
}

TEST_F(InstructionWalk, TheHostsUnwindingPassesThroughUntouched) {
    const DOMElement* root = load("<record/><host/><record/>");
    ASSERT_NE(root, nullptr);
    try {
        walk(root);
        ADD_FAILURE() << "the walk went on";
    } catch (const KovarGoToCaller& e) {
        EXPECT_EQ(e.code(), 7);
    }
    EXPECT_EQ(journal().size(), 1u);
}

TEST_F(InstructionWalk, FrameListLivesForOneWalk) {
    const DOMElement* root = load("<frames/><record/><frames/>");
    ASSERT_NE(root, nullptr);
    walk(root);
    walk(root);
    EXPECT_EQ(journal(), (std::vector<std::string>{"frames:0", "record@", "frames:1", "frames:0", "record@x",
                                                   "frames:1"}));
}

TEST_F(InstructionWalk, EmptyTemplateOrNoRootChangesNothing) {
    const std::string before = chart_.vis->AsUTF8();
    walk(load(""));
    walk(nullptr);
    EXPECT_EQ(chart_.vis->AsUTF8(), before);
}

TEST_F(InstructionWalk, ChartTemplateReportsAFatalWalkAndPassesTheHostsUnwinding) {
    plotaid::detail::ScopedInstructionTable table({kTestTable, std::size(kTestTable)});
    Records records;
    ChartTemplate fatal(*chart_.vis, nullptr);
    ASSERT_TRUE(fatal.setTemplate(templateOf("<record/><anyFault/><record/>")));
    try {
        fatal.applyTemplate();
        ADD_FAILURE() << "no exception";
    } catch (const ChartException& e) {
        EXPECT_STREQ(e.what(), "Fatal Error occurred while applying template");
        EXPECT_EQ(e.line(), 102u);
    }
    EXPECT_EQ(records.errors().back(), "Fatal Error occurred while applying template");
    // What the first instruction did stays: nothing is rolled back.
    EXPECT_EQ(ChartString(chart_.base().GetAttribute(u"steps")).toUTF8(), "x");

    ChartTemplate host(*chart_.vis, nullptr);
    ASSERT_TRUE(host.setTemplate(templateOf("<host/>")));
    EXPECT_THROW(host.applyTemplate(), KovarGoToCaller);
}

TEST(InstructionTable, AllFiftyNineTagsInOrderEachDeclaredByTheGrammar) {
    const plotaid::detail::InstructionTable table = plotaid::detail::instructionTable();
    ASSERT_EQ(table.count, 59u);
    const std::string grammar =
        engine_test::readText(std::string(PLOTAID_SOURCE_DIR) + "/resources/schemas/grxml-template-3.5.xsd");
    std::set<std::string> tags, classes;
    for (std::size_t i = 0; i < table.count; ++i) {
        const std::string tag = ChartString(table.entries[i].tag).toUTF8();
        EXPECT_TRUE(tags.insert(tag).second) << tag;
        EXPECT_TRUE(classes.insert(table.entries[i].actionClass).second) << table.entries[i].actionClass;
        EXPECT_NE(grammar.find("<xs:element name=\"" + tag + "\""), std::string::npos) << tag;
    }
    EXPECT_EQ(ChartString(table.entries[0].tag).toUTF8(), "setStyle");
    EXPECT_STREQ(table.entries[29].actionClass, "TAddPieEffects");
    EXPECT_EQ(ChartString(table.entries[31].tag).toUTF8(), "addDrillDown");
    EXPECT_EQ(ChartString(table.entries[58].tag).toUTF8(), "setGenericAttributes");
}

TEST_F(ChartTemplateLoading, BundledTemplateReportsEveryInstruction) {
    Chart chart = Chart::parse(engine_test::example("charts/simple-bar.xml"));
    ASSERT_TRUE(chart.vis);
    ChartTemplate t(*chart.vis, nullptr);
    WalkReport report;
    ASSERT_TRUE(t.setTemplate(engine_test::example("templates/bar-tidy.sgt")));
    t.applyTemplate();
    ASSERT_EQ(report.outcomes().size(), 5u);
    const plotaid::detail::InstructionTable table = plotaid::detail::instructionTable();
    for (const InstructionOutcome& o : report.outcomes()) {
        bool built = false;
        for (std::size_t i = 0; i < table.count; ++i)
            if (ChartString(table.entries[i].tag).toUTF8() == o.tag)
                built = table.entries[i].make != nullptr;
        EXPECT_EQ(o.kind == InstructionOutcome::Unsupported, !built) << o.tag;
    }
}

} // namespace
