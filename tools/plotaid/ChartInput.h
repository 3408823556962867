#ifndef PLOTAID_TOOL_CHARTINPUT_H
#define PLOTAID_TOOL_CHARTINPUT_H

#include <plotaid/ChartTransformer.h>

#include <memory>
#include <string>

namespace plotaid::tool {

// A chart read from a file (plain or compressed) with its optional data file (a data stream or an
// XML data document, either plain or compressed), as one transformer. The stream, when there is
// one, lives here as long as the transformer that reads it.
class ChartInput {
public:
    // False with a readable reason when a file cannot be read or the chart cannot be built.
    bool load(const std::string& chartPath, const std::string& dataPath, std::string& error);
    ChartTransformer& transformer() { return *transformer_; }
    bool hasData() const { return hasData_; }

private:
    std::string stream_;
    std::unique_ptr<ChartTransformer> transformer_;
    bool hasData_ = false;
};

bool isCompressed(const std::string& bytes);
std::string compressed(const std::string& text);

} // namespace plotaid::tool

#endif
