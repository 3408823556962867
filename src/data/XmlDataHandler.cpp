#include <plotaid/XmlDataHandler.h>

#include <plotaid/VarDataProcessor.h>

#include "data/Numbers.h"
#include "data/Report.h"
#include "data/StoreAccess.h"
#include "data/XmlDataForm.h"
#include "data/XmlText.h"

#include <zpack/zpack.h>

#include <algorithm>
#include <cctype>
#include <cstring>
#include <memory>
#include <string_view>
#include <unordered_map>

using plotaid::detail::guarded;
using plotaid::detail::kXmlDataFile;
using plotaid::detail::reportFailure;

namespace {

using Access = plotaid::detail::StoreAccess;
using Column = VarDataProcessor::_column;
using Bag = VarDataProcessor::_sourcebag;
constexpr auto npos = std::string_view::npos;

constexpr std::string_view kHead = "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"no\"?> \n"
                                   "<gs:graphSources xmlns=\"http://plotaid.org/grxml\" "
                                   "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\"\n"
                                   "xmlns:gs=\"http://plotaid.org/grxml/data\" "
                                   "xsi:schemaLocation=\"http://plotaid.org/grxml/data "
                                   "http://plotaid.org/grxml/data/grxml-data-2.1.xsd\">\n";
constexpr std::string_view kTail = "</gs:graphSources>\n";

constexpr std::string_view kSource = "embeddedSource";
constexpr std::string_view kSourceClose = "</embeddedSource>";
constexpr std::string_view kOldSource = "source";
constexpr std::string_view kOldSourceClose = "</source>";
constexpr std::string_view kOldValueOpen = "<dataValue name=\"";
constexpr std::string_view kRowOpen = "<row>";
constexpr std::string_view kRowClose = "</row>";
constexpr std::string_view kNamesOpen = "<names>";

// Rows of the XML form are sparse: a few bytes of text can claim a row far down, and every variable
// of its data source then grows to it. The arrays a text may cost are bounded by its length.
constexpr unsigned long long kAllocationFloor = 256ull << 20;
constexpr unsigned long long kAllocationPerTextByte = 32;

bool isOldForm(std::string_view xml) {
    return xml.find("grxml-1.4.xsd") != npos || xml.find("grxml-data-1.0.xsd") != npos;
}

std::string_view::size_type findBefore(std::string_view text, std::string_view what, std::size_t from,
                                       std::size_t end) {
    const std::size_t at = text.find(what, from);
    return at == npos || at + what.size() > end ? npos : at;
}

unsigned countRows(std::string_view text, std::size_t from, std::size_t end) {
    unsigned rows = 0;
    for (std::size_t at = findBefore(text, kRowOpen, from, end); at != npos && rows < UINT_MAX;
         at = findBefore(text, kRowOpen, at + kRowOpen.size(), end))
        ++rows;
    return rows;
}

bool isBlank(char c) {
    return c == ' ' || c == '\t' || c == '\n' || c == '\r' || c == '\v' || c == '\f';
}

bool isNameChar(char c) {
    return std::isalnum(static_cast<unsigned char>(c)) || c == '_' || c == '-' || c == '.' || c == ':' ||
           static_cast<unsigned char>(c) >= 0x80;
}

std::size_t skipBlanks(std::string_view text, std::size_t i) {
    while (i < text.size() && isBlank(text[i]))
        ++i;
    return i;
}

// The local name of the element tag whose name starts at text[at], and where the name ends.
std::string_view tagName(std::string_view text, std::size_t at, std::size_t& end) {
    end = at;
    while (end < text.size() && isNameChar(text[end]))
        ++end;
    std::string_view name = text.substr(at, end - at);
    const std::size_t colon = name.rfind(':');
    return colon == npos ? name : name.substr(colon + 1);
}

// A data source's start tag, read as markup: any prefix, attribute order, quotes and spacing.
struct SourceTag {
    std::string id;
    std::size_t content = npos; // just past the tag
    bool empty = false;         // "<.../>": no rows
};

// The next start tag of the local name at or after from, stepping over comments, character data
// sections, declarations, processing instructions and end tags; npos when there is none.
std::size_t nextSourceTag(std::string_view text, std::size_t from, std::string_view local, SourceTag& tag) {
    const std::size_t n = text.size();
    for (std::size_t at = text.find('<', from); at != npos; at = text.find('<', at + 1)) {
        const std::string_view rest = text.substr(at);
        const std::string_view skipTo = rest.substr(0, 4) == "<!--"        ? "-->"
                                        : rest.substr(0, 9) == "<![CDATA[" ? "]]>"
                                        : rest.substr(0, 2) == "<?"        ? "?>"
                                                                           : "";
        if (!skipTo.empty()) {
            at = text.find(skipTo, at + 2);
            if (at == npos)
                return npos;
            continue;
        }
        std::size_t i = 0;
        if (tagName(text, at + 1, i) != local || (i < n && !isBlank(text[i]) && text[i] != '>' && text[i] != '/'))
            continue;
        tag = SourceTag();
        while ((i = skipBlanks(text, i)) < n && text[i] != '>' && text[i] != '/') {
            std::size_t nameEnd = i;
            const std::string_view attribute = tagName(text, i, nameEnd);
            const bool isId = nameEnd - i == 2 && attribute == "id";
            i = skipBlanks(text, nameEnd == i ? i + 1 : nameEnd);
            if (i >= n || text[i] != '=')
                continue;
            i = skipBlanks(text, i + 1);
            if (i >= n || (text[i] != '"' && text[i] != '\''))
                continue;
            const std::size_t close = std::min(text.find(text[i], i + 1), n);
            if (isId)
                tag.id = plotaid::detail::unescape(text.substr(i + 1, close - i - 1));
            i = close + 1;
        }
        tag.empty = i < n && text[i] == '/';
        tag.content = std::min(n, tag.empty ? i + 2 : i + 1);
        return at;
    }
    return npos;
}

// Where the end tag of the local name starts, at or after from; the text's end when there is none.
std::size_t sourceEnd(std::string_view text, std::size_t from, std::string_view local) {
    for (std::size_t at = text.find("</", from); at != npos; at = text.find("</", at + 2)) {
        std::size_t end = 0;
        if (tagName(text, at + 2, end) == local && skipBlanks(text, end) < text.size() &&
            text[skipBlanks(text, end)] == '>')
            return at;
    }
    return text.size();
}

std::string extractName(std::string_view text, std::size_t from) {
    const std::size_t quote = text.find('"', from);
    if (quote == npos)
        return std::string();
    return plotaid::detail::unescape(text.substr(from, quote - from));
}

// The position just past a character or entity reference at text[amp] == '&', or npos.
std::size_t referenceEnd(std::string_view text, std::size_t amp) {
    std::size_t i = amp + 1;
    const bool numeric = i < text.size() && text[i] == '#';
    if (numeric)
        ++i;
    const bool hex = numeric && i < text.size() && (text[i] == 'x' || text[i] == 'X');
    if (hex)
        ++i;
    const std::size_t first = i;
    while (i < text.size() && i - first < 10) {
        const char c = text[i];
        const bool ok = numeric ? (std::isdigit(static_cast<unsigned char>(c)) ||
                                   (hex && std::isxdigit(static_cast<unsigned char>(c))))
                                : std::isalnum(static_cast<unsigned char>(c)) != 0;
        if (!ok)
            break;
        ++i;
    }
    return i > first && i < text.size() && text[i] == ';' ? i + 1 : npos;
}

// The end of the field that starts at start: the next ';' that does not close a reference (the
// writer's escapes hold semicolons of their own).
std::size_t fieldEnd(std::string_view text, std::size_t start) {
    const char* const base = text.data();
    const std::size_t n = text.size();
    std::size_t i = start;
    while (i < n) {
        const char c = base[i];
        if (c == ';')
            return i;
        if (c == '&') {
            const std::size_t ref = referenceEnd(text, i);
            if (ref != npos) {
                i = ref;
                continue;
            }
        }
        ++i;
    }
    return n;
}

std::string_view trimmed(std::string_view field) {
    const char* first = field.data();
    const char* last = first + field.size();
    while (first < last && isBlank(*first))
        ++first;
    while (last > first && isBlank(last[-1]))
        --last;
    return std::string_view(first, static_cast<std::size_t>(last - first));
}

// Fills one data source of the store from the text, straight into its records.
class SourceFiller {
public:
    SourceFiller(VarDataProcessor& store, const std::string& source, unsigned long long& budget)
        : store_(store), source_(source), budget_(budget) {}

    // Makes room for rows before any value is set, so that no array moves while the rows are read.
    bool prepare(unsigned rows) {
        auto& sources = Access::sources(store_);
        auto it = sources.find(source_);
        if (it == sources.end())
            return false;
        bag_ = &it->second;
        if (rows <= bag_->capacity)
            return true;
        const unsigned grown = plotaid::detail::grownCapacity(bag_->capacity, rows);
        if (!take(static_cast<unsigned long long>(grown - bag_->capacity) * bag_->variables.size()))
            return false;
        return Access::reallocBag(store_, *bag_, rows);
    }

    Column* column(const std::string& variable) {
        auto it = bag_->variables.find(variable);
        if (it != bag_->variables.end())
            return &it->second;
        if (!take(bag_->capacity) || !store_.AddVariable(source_, variable, nullptr))
            return nullptr;
        return &bag_->variables.find(variable)->second;
    }

    // A field as the data forms hold it (trimmed, not empty): a number, or else a string value.
    bool set(Column* column, const std::string& variable, unsigned row, std::string_view field) {
        if (field.front() == '<')
            return true;
        double value = 0;
        if (plotaid::detail::parseNumber(field.data(), field.data() + field.size(), value)) {
            column->values[row] = value;
            column->rowCount = std::max(column->rowCount, row + 1);
            return true;
        }
        return setString(column, variable, row, plotaid::detail::unescape(field));
    }

    bool failed() const { return failed_; }
    void fail() { failed_ = true; }

private:
    bool take(unsigned long long cells) {
        const unsigned long long bytes = cells * sizeof(double);
        if (bytes > budget_) {
            failed_ = true;
            return false;
        }
        budget_ -= bytes;
        return true;
    }

    bool setString(Column* column, const std::string& variable, unsigned row, const std::string& text) {
        VarDataProcessor::StringMap& map = Access::stringMaps(store_)[source_][variable];
        auto at = map.find(row);
        if (at != map.end() && at->second != VarDataProcessor::NoString)
            Access::removeString(store_, at->second);
        map[row] = static_cast<unsigned>(Access::addString(store_, text));
        column->rowCount = std::max(column->rowCount, row + 1);
        return true;
    }

    VarDataProcessor& store_;
    const std::string& source_;
    unsigned long long& budget_;
    Bag* bag_ = nullptr;
    bool failed_ = false;
};

// Reads the fields of one row, up to the '<' that ends it (fields hold none: the writer escapes
// it); returns where the row ended.
std::size_t processRow(SourceFiller& filler, const std::vector<std::string>& names,
                       std::vector<Column*>& columns, unsigned row, std::string_view text) {
    const char* const base = text.data();
    const std::size_t n = text.size();
    std::size_t start = 0;
    for (std::size_t i = 0;; ++i) {
        std::size_t end = start;
        while (end < n) {
            const char c = base[end];
            if (c == ';' || c == '<')
                break;
            if (c == '&') {
                const std::size_t ref = referenceEnd(text, end);
                if (ref != npos) {
                    end = ref;
                    continue;
                }
            }
            ++end;
        }
        if (i < names.size() && !filler.failed()) {
            const std::string_view field = trimmed(text.substr(start, end - start));
            if (!field.empty() && (columns[i] || (columns[i] = filler.column(names[i]))))
                filler.set(columns[i], names[i], row, field);
        }
        if (end >= n || base[end] == '<')
            return end;
        start = end + 1;
    }
}

void processOldRow(SourceFiller& filler, std::unordered_map<std::string, Column*>& columns, unsigned row,
                   std::string_view text) {
    std::size_t at = text.find(kOldValueOpen);
    while (at != npos) {
        const std::size_t nameStart = at + kOldValueOpen.size();
        const std::size_t quote = text.find('"', nameStart);
        if (quote == npos)
            return;
        const std::size_t close = text.find('>', quote);
        if (close == npos)
            return;
        const std::size_t valueEnd = std::min(text.find('<', close + 1), text.size());
        const std::string_view value = trimmed(text.substr(close + 1, valueEnd - close - 1));
        at = text.find(kOldValueOpen, valueEnd);
        if (value.empty())
            continue;
        const std::string name = plotaid::detail::unescape(text.substr(nameStart, quote - nameStart));
        Column*& column = columns[name];
        if (!column && !(column = filler.column(name)))
            return;
        filler.set(column, name, row, value);
    }
}

std::vector<std::string> splitNames(std::string_view list) {
    std::vector<std::string> names;
    if (list.empty())
        return names;
    std::size_t start = 0;
    for (;;) {
        const std::size_t end = fieldEnd(list, start);
        names.push_back(plotaid::detail::unescape(list.substr(start, end - start)));
        if (end == list.size())
            return names;
        start = end + 1;
    }
}

// Reads every data source of either form into the store; false when the text costs more memory
// than it can justify.
bool fillStore(VarDataProcessor& store, std::string_view text, bool oldForm) {
    const std::string_view local = oldForm ? kOldSource : kSource;
    unsigned long long budget = kAllocationFloor + kAllocationPerTextByte * text.size();
    SourceTag tag;
    for (std::size_t at = nextSourceTag(text, 0, local, tag); at != npos;
         at = nextSourceTag(text, tag.content, local, tag)) {
        const std::string& source = tag.id;
        const std::size_t end = tag.empty ? tag.content : sourceEnd(text, tag.content, local);
        const unsigned rows = countRows(text, at, end);
        store.AddDataSource(source, rows);
        SourceFiller filler(store, source, budget);
        if (!filler.prepare(rows))
            return false;

        std::vector<std::string> names;
        if (!oldForm) {
            const std::size_t list = findBefore(text, kNamesOpen, at, end);
            if (list != npos) {
                const std::size_t from = list + kNamesOpen.size();
                const std::size_t to = std::min(text.find('<', from), end);
                names = splitNames(text.substr(from, to - from));
            }
        }
        std::vector<Column*> columns(names.size(), nullptr);
        std::unordered_map<std::string, Column*> oldColumns;
        std::size_t row = findBefore(text, kRowOpen, at, end);
        for (unsigned r = 0; r < rows && row != npos; ++r) {
            const std::size_t from = row + kRowOpen.size();
            std::size_t to = 0;
            if (oldForm) {
                to = std::min(text.find(kRowClose, from), end);
                processOldRow(filler, oldColumns, r, text.substr(from, to - from));
            } else {
                to = from + processRow(filler, names, columns, r, text.substr(from, end - from));
            }
            if (filler.failed())
                return false;
            // An unclosed row of the older form may hold the next row's opening.
            row = findBefore(text, kRowOpen, oldForm ? from : to, end);
        }
    }
    return true;
}

bool isCompressed(const std::string& text) {
    return !text.empty() && static_cast<unsigned char>(text[0]) == 0x78;
}

} // namespace

namespace plotaid::detail {

void writeXmlData(VarDataProcessor& store, std::string& doc) {
    using plotaid::detail::EscapeKind;
    const auto& sources = Access::sources(store);
    const auto& stringMaps = Access::stringMaps(store);
    const auto& strings = Access::strings(store);
    unsigned long long expected = 4096;
    for (const auto& [name, bag] : sources)
        expected += 20ull * bag.variables.size() * store.GetRowCount(name) + 40 * bag.variables.size();
    doc.reserve(static_cast<std::size_t>(std::min<unsigned long long>(expected, 1ull << 30)));

    bool whole = true;
    doc.append(kHead);
    for (const auto& [name, bag] : sources) {
        doc.append("\t<embeddedSource id=\"");
        whole &= plotaid::detail::appendEscaped(doc, name, EscapeKind::SourceName);
        doc.append("\">\n\t\t<names>");
        // Per variable: its cells and, walked in step with the rows, its string values.
        struct Walk {
            const double* cells;
            VarDataProcessor::StringMap::const_iterator next, end;
        };
        std::vector<Walk> walks;
        auto maps = stringMaps.find(name);
        bool first = true;
        for (const auto& [variable, column] : bag.variables) {
            if (!first)
                doc += ';';
            first = false;
            whole &= plotaid::detail::appendEscaped(doc, variable, EscapeKind::VariableName);
            Walk w{column.values.data(), {}, {}};
            if (maps != stringMaps.end()) {
                auto m = maps->second.find(variable);
                if (m != maps->second.end()) {
                    w.next = m->second.begin();
                    w.end = m->second.end();
                }
            }
            walks.push_back(w);
        }
        doc.append("</names>\n\t\t<types>");
        for (std::size_t i = 0; i < walks.size(); ++i)
            doc.append(i == 0 ? "string" : ";string");
        doc.append("</types>\n");
        if (walks.empty())
            doc.append("\t\t<row/>\n");
        const unsigned rows = store.GetRowCount(name);
        for (unsigned r = 0; r < rows; ++r) {
            doc.append("\t\t<row>");
            for (std::size_t i = 0; i < walks.size(); ++i) {
                if (i > 0)
                    doc += ';';
                Walk& w = walks[i];
                while (w.next != w.end && w.next->first < r)
                    ++w.next;
                if (w.next != w.end && w.next->first == r && w.next->second < strings.size())
                    whole &= plotaid::detail::appendEscaped(doc, strings[w.next->second].text, EscapeKind::Value);
                else
                    plotaid::detail::appendCell(doc, w.cells[r]);
            }
            doc.append("</row>\n");
        }
        doc.append("\t</embeddedSource>\n");
    }
    doc.append(kTail);
    if (!whole)
        reportFailure("the data hold control characters that XML cannot hold; each was written as '?'",
                      kXmlDataFile, __LINE__);
}

bool readXmlData(VarDataProcessor& store, std::string_view xml) {
    return fillStore(store, xml, isOldForm(xml));
}

} // namespace plotaid::detail

XmlDataHandler::XmlDataHandler(const std::string& xml) : xmlText(&xml) {}

XmlDataHandler::XmlDataHandler(const unsigned char* data, unsigned length)
    : xmlText(&ownText), stream(data), streamLength(data ? length : 0) {}

// A copy made from a stream must point at its own empty text, not at the original's.
XmlDataHandler::XmlDataHandler(const XmlDataHandler& other)
    : xmlText(other.xmlText == &other.ownText ? &ownText : other.xmlText), ownText(other.ownText),
      stream(other.stream), streamLength(other.streamLength) {}

XmlDataHandler& XmlDataHandler::operator=(const XmlDataHandler& other) {
    if (this != &other) {
        ownText = other.ownText;
        xmlText = other.xmlText == &other.ownText ? &ownText : other.xmlText;
        stream = other.stream;
        streamLength = other.streamLength;
    }
    return *this;
}

XmlDataHandler::~XmlDataHandler() = default;

bool XmlDataHandler::GetXmlData(std::string& out, bool compressed) {
    return guarded(kXmlDataFile, __LINE__, "cannot make the XML data", false, [&] {
        const std::string& text = *xmlText;
        if (text.empty()) {
            if (stream && streamLength > 0)
                return BuildXmlData(out, compressed);
            return false;
        }
        if (compressed && !isCompressed(text)) {
            std::string packed;
            if (!zpack::compressString(text, packed)) {
                reportFailure("cannot compress the XML data", kXmlDataFile, __LINE__);
                return false;
            }
            out.swap(packed);
            return true;
        }
        if (!compressed && isCompressed(text)) {
            std::string plain;
            if (!zpack::decompressString(plain, text)) {
                reportFailure("cannot decompress the XML data", kXmlDataFile, __LINE__);
                return false;
            }
            out.swap(plain);
            return true;
        }
        out = text;
        return true;
    });
}

unsigned char* XmlDataHandler::GetDataStream(unsigned& length) {
    length = 0;
    unsigned char* const none = nullptr;
    unsigned char* const made = guarded(kXmlDataFile, __LINE__, "cannot make the data stream", none, [&]() -> unsigned char* {
        const std::string& text = *xmlText;
        if (!text.empty()) {
            if (!isCompressed(text))
                return BuildDataStream(text, length);
            std::string plain;
            if (!zpack::decompressString(plain, text)) {
                reportFailure("cannot decompress the XML data", kXmlDataFile, __LINE__);
                return nullptr;
            }
            return BuildDataStream(plain, length);
        }
        if (stream && streamLength > 0) {
            auto* copy = new unsigned char[streamLength];
            std::memcpy(copy, stream, streamLength);
            length = streamLength;
            return copy;
        }
        return nullptr;
    });
    if (made == nullptr)
        length = 0;
    return made;
}

bool XmlDataHandler::BuildXmlData(std::string& out, bool compress) {
    VarDataProcessor store;
    if (!store.ReadStreamData(const_cast<unsigned char*>(stream), streamLength))
        return false;
    std::string work;
    std::string& doc = compress ? work : out;
    doc.clear();
    plotaid::detail::writeXmlData(store, doc);
    if (compress && !zpack::compressString(work, out)) {
        reportFailure("cannot compress the XML data", kXmlDataFile, __LINE__);
        return false;
    }
    return true;
}

unsigned char* XmlDataHandler::BuildDataStream(const std::string& xml, unsigned& length) {
    length = 0;
    if (isOldForm(xml))
        return Build_1_4_DataStream(xml, length);
    SourceTag tag;
    if (nextSourceTag(xml, 0, kSource, tag) == npos)
        return nullptr;
    VarDataProcessor store;
    if (!plotaid::detail::readXmlData(store, xml)) {
        reportFailure("the XML data claim more rows than their text holds", kXmlDataFile, __LINE__);
        return nullptr;
    }
    return store.GetDataStream(length);
}

unsigned char* XmlDataHandler::Build_1_4_DataStream(const std::string& xml, unsigned& length) {
    length = 0;
    SourceTag tag;
    if (nextSourceTag(xml, 0, kOldSource, tag) == npos)
        return nullptr;
    VarDataProcessor store;
    if (!fillStore(store, xml, true)) {
        reportFailure("the XML data claim more rows than their text holds", kXmlDataFile, __LINE__);
        return nullptr;
    }
    return store.GetDataStream(length);
}

unsigned XmlDataHandler::CountRows(const char* at) {
    if (!at)
        return 0;
    const std::string_view text(at);
    const std::size_t end = std::min(text.find(kSourceClose), text.size());
    return countRows(text, 0, end);
}

unsigned XmlDataHandler::Count_1_4_Rows(const char* at) {
    if (!at)
        return 0;
    const std::string_view text(at);
    const std::size_t end = std::min(text.find(kOldSourceClose), text.size());
    return countRows(text, 0, end);
}

bool XmlDataHandler::ExtractName(const char* at, std::string& name) {
    name.clear();
    if (!at)
        return false;
    const std::string_view text(at);
    if (text.find('"') == npos)
        return false;
    name = extractName(text, 0);
    return true;
}

void XmlDataHandler::ProcessRow(VarDataProcessor& store, const std::string& source,
                                const std::vector<std::string>& names, unsigned row, const char* at) {
    if (!at || row == UINT_MAX)
        return;
    std::string_view text(at);
    if (text.substr(0, kRowOpen.size()) == kRowOpen)
        text.remove_prefix(kRowOpen.size());
    text = text.substr(0, std::min(text.find('<'), text.size()));
    unsigned long long budget = kAllocationFloor;
    SourceFiller filler(store, source, budget);
    if (!filler.prepare(row + 1))
        return;
    std::vector<Column*> columns(names.size(), nullptr);
    processRow(filler, names, columns, row, text);
}

void XmlDataHandler::Process_1_4_Row(VarDataProcessor& store, const std::string& source, unsigned row,
                                     const char* at) {
    if (!at || row == UINT_MAX)
        return;
    std::string_view text(at);
    text = text.substr(0, std::min(text.find(kRowClose), text.size()));
    unsigned long long budget = kAllocationFloor;
    SourceFiller filler(store, source, budget);
    if (!filler.prepare(row + 1))
        return;
    std::unordered_map<std::string, Column*> columns;
    processOldRow(filler, columns, row, text);
}
