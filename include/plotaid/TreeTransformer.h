#ifndef PLOTAID_TREETRANSFORMER_H
#define PLOTAID_TREETRANSFORMER_H

#include <plotaid/ChartBase.h>
#include <plotaid/Export.h>
#include <plotaid/TreeEntityResolver.h>
#include <plotaid/xmlString.h>

#include <memory>
#include <string>
#include <vector>

// What the host's tree viewer needs for one decision tree: the tree model as PMML 2.1, kept only
// compressed, and the display-settings document that says how to draw it. Failures are logged
// (ChartErrorHandler), never thrown; display settings that do not parse leave every option
// operation without effect.
class PLOTAID_API TreeTransformer : public ChartBase {
public:
    enum TreeOrientation { TOP_DOWN = 0, LEFT_TO_RIGHT = 1, RIGHT_TO_LEFT = 2 };
    enum TreeDisplayOption { TABLE = 0, GRAPH = 1, BOTH = 2 };
    enum ColorIds { CHART_COLORS = 0, SWATCH_COLORS = 1 };

    // The system id under which texts are parsed, as reports name them.
    static const char* const s_membufid;

    // Empty display settings give the default ones.
    TreeTransformer(const std::string& pmml, const std::string& displaySettings);
    // pmmlLength is the length of the uncompressed text, 0 when not known.
    TreeTransformer(const std::string& compressedPmml, unsigned long pmmlLength,
                    const std::string& displaySettings);
    ~TreeTransformer() override;

    // Out-of-range values create the option's element but set nothing.
    void SetOrientation(TreeOrientation orientation);
    void SetTreeDisplayOption(TreeDisplayOption option);
    // Only 2 to 500; anything else changes nothing at all.
    void SetZoomFactor(int zoom);
    void ShowNodeDefs(bool show);
    void ShowBranchStatistics(bool show);
    // Texts are host multibyte text.
    void applyFont(std::string family);
    // Overwrites the existing colour items in order and appends the rest.
    void applyColors(ColorIds id, const std::vector<std::string>& colors);
    // "language" or "language-country".
    void SetOutputLanguage(std::string language, std::string country);
    void SetOutputLocale(std::string language, std::string country);
    void addPredictorPrecision(std::string varName, long precision);
    void addPredictorDate(std::string varName, std::string formatName, long width, long precision);
    // Always the same target "dateFormat" element.
    void addTargetDateFormat(std::string formatName, long width, long precision);

    // Appends the template's root attributes and children to the display settings; false when
    // the template is empty or not valid display settings.
    bool applyTemplate(const std::string& templateText);
    // The display settings as text in the encoding asked for (UTF-8 for null); empty when there
    // are none or the encoding is unknown.
    std::string getDisplayData(const XMLCh* encoding);
    // The compressed PMML as stored; *length (when given) gets its uncompressed length, 0 if not
    // known yet.
    std::string getCompressedPMML(unsigned long* length);
    // The PMML as a "PMML" document in the encoding asked for; when it does not validate, the
    // decompressed text as it is; empty when it cannot be decompressed.
    std::string getUncompressedPMML(const XMLCh* encoding);

protected:
    std::string SetupDisplayData();
    // Validating parse; the document belongs to this object's parser until its next parse.
    XERCES_CPP_NAMESPACE::DOMDocument* parseDocument(const std::string& text);
    XERCES_CPP_NAMESPACE::DOMElement* GetStatFormatElement();
    XERCES_CPP_NAMESPACE::DOMElement* GetNewPredictorItem();
    // `from`'s root attributes onto `to`'s root (overwriting), then deep copies of its children.
    bool mergeDOM(const XERCES_CPP_NAMESPACE::DOMDocument* from, XERCES_CPP_NAMESPACE::DOMDocument* to);
    // The parsed PMML, kept in `document_` until the next call; null when it does not decompress
    // or validate.
    XERCES_CPP_NAMESPACE::DOMDocument* setupPMMLDOM();
    // New empty output documents, owned by the caller (releaseDocument).
    XERCES_CPP_NAMESPACE::DOMDocument* createPMMLDocument(const XMLCh* encoding);
    XERCES_CPP_NAMESPACE::DOMDocument* createDisplayDocument(const XMLCh* encoding);
    std::string compressDocument(const XERCES_CPP_NAMESPACE::DOMDocument* document) const;
    // The display settings; null when they failed to parse.
    XERCES_CPP_NAMESPACE::DOMDocument* displayDocument() const;

private:
    struct Impl;
    std::unique_ptr<Impl> impl_;
    std::string compressedPmml_;
    unsigned long pmmlLength_ = 0;
};

#endif
