#include <plotaid/ChartTranscoder.h>

#include "foundation/Report.h"

#include <osport/osport.h>

namespace {
const char* const kFile = "backend/chartxml/plotaid/src/charttranscoder";
}

using plotaid::detail::reportFailure;

ChartTranscoder::ChartTranscoder(const std::string& encoding)
    : converter_(osport::KovarMBConverterNew_A(0, encoding.c_str())), encoding_(encoding) {
    if (converter_ == nullptr)
        reportFailure("unknown code page '" + encoding + "'", kFile, __LINE__);
}

ChartTranscoder::~ChartTranscoder() {
    osport::KovarMBConverterDelete_A(converter_);
}

ChartString ChartTranscoder::transcode(const std::string& text) const {
    if (text.empty())
        return ChartString();
    std::u16string out;
    if (!osport::KovarMBGenericToU16(converter_, text, out)) {
        reportFailure("text is not valid " + encoding_, kFile, __LINE__);
        return ChartString();
    }
    return ChartString(std::move(out));
}

std::string ChartTranscoder::transcodeTo(const char16_t* text) const {
    std::string out;
    if (text == nullptr || *text == 0)
        return out;
    if (!osport::KovarMBU16ToGeneric(converter_, text, out)) {
        reportFailure("text cannot be written in " + encoding_, kFile, __LINE__);
        return std::string();
    }
    return out;
}
