#ifndef PLOTAID_CHARTTRANSCODER_H
#define PLOTAID_CHARTTRANSCODER_H

#include <plotaid/Export.h>

#include <grx/ChartString.h>

#include <string>

namespace osport {
struct KovarMBConverter;
}

// Host multibyte text of one code page to chart text (UTF-16) and back. Not copyable: it owns the
// converter, which must be freed exactly once.
class PLOTAID_API ChartTranscoder {
public:
    // encoding: a code page name such as "CP1252" or "UTF-8". An unknown name is reported and
    // leaves a transcoder that converts nothing.
    explicit ChartTranscoder(const std::string& encoding);
    virtual ~ChartTranscoder();
    ChartTranscoder(const ChartTranscoder&) = delete;
    ChartTranscoder& operator=(const ChartTranscoder&) = delete;

    // Whether the code page was known.
    bool valid() const { return converter_ != nullptr; }

    // Empty (reported) when the text is not valid in the code page or the transcoder is not valid.
    ChartString transcode(const std::string& text) const;
    // Empty for null, and (reported) for text the code page cannot hold.
    std::string transcodeTo(const char16_t* text) const;

private:
    osport::KovarMBConverter* converter_;
    std::string encoding_;
};

#endif
