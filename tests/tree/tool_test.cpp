// plotaid tree: options on the command line reach the display settings; the PMML is written as asked.
#include "TreeSupport.h"
#include "support/ToolRunner.h"

#include <fstream>

namespace {

TEST(TreeTool, OptionsModelsAndRefusals) {
    TempDir dir;
    const auto in = [&](const std::string& name) { return " '" + dir.file(name) + "'"; };
    std::ofstream(dir.file("bad.xml"))
        << "<PMML version=\"2.1\" xmlns=\"http://www.dmg.org/PMML-2_1\"><x/></PMML>";
    std::ofstream(dir.file("settings.xml")) << "<displaySettings/>";
    const std::string pmml = " --pmml '" + std::string(PLOTAID_EXAMPLES_DIR) + "/pmml/",
                      credit = pmml + "credit-risk.xml'";
    const std::vector<ToolRun> rows = {
        {credit + " --orientation left-to-right --zoom 250 --contents both --font Serif --colors swatch "
                  "'#FF010101,#FF020202' --language de-CH",
         0,
         {"olang=\"de-CH\"", "orientation=\"left-to-right\"", "factor=\"250\"", "contents=\"both\"",
          "family=\"Serif\"", "value=\"#FF020202\""}},
        {pmml + "churn-surrogates.xml' --pmml-out" + in("out.xml") + " --compressed-pmml-out" + in("out.z"),
         0,
         {}},
        {" --pmml" + in("out.z") + " --pmml-out" + in("again.xml"), 0, {}},
        {"", 2, {"no PMML file"}},
        {credit + " --zoom 501", 2, {"zoom '501' is not a whole number from 2 to 500"}},
        {credit + " --orientation sideways", 2, {"orientation 'sideways' is not"}},
        {credit + " --bogus x", 2, {"unknown option '--bogus'"}},
        {credit + " --pmml-out -", 2, {"name a file for the model"}},
        {credit + " --settings" + in("settings.xml"), 1, {"is not valid display settings"}},
        {" --pmml" + in("missing.xml"), 1, {"cannot open"}},
        {" --pmml" + in("bad.xml") + " --pmml-out" + in("o.xml"), 1, {"not a valid PMML 2.1 tree"}}};
    expectToolRuns("tree", rows);
    Reader reader;
    EXPECT_EQ(elements(reader.read(readAll(dir.file("out.xml"))), "CompoundPredicate").size(), 4u);
    EXPECT_EQ(readAll(dir.file("again.xml")), readAll(dir.file("out.xml")));
}

} // namespace
