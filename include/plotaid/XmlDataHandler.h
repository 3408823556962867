#ifndef PLOTAID_XMLDATAHANDLER_H
#define PLOTAID_XMLDATAHANDLER_H

#include <plotaid/Export.h>

#include <string>
#include <vector>

class VarDataProcessor;

// Converts chart data between the binary data stream and the XML data document (either possibly
// compressed), and reads the older XML data form. Works on the caller's text or stream, which must
// outlive the handler.
class PLOTAID_API XmlDataHandler {
public:
    explicit XmlDataHandler(const std::string& xml);
    XmlDataHandler(const std::string&&) = delete; // the handler keeps a reference
    XmlDataHandler(const unsigned char* stream, unsigned length);
    XmlDataHandler(const XmlDataHandler& other);
    XmlDataHandler& operator=(const XmlDataHandler& other);
    virtual ~XmlDataHandler();

    bool GetXmlData(std::string& out, bool compressed);
    // A new array (release with delete[]) holding the data stream, or null with length 0.
    unsigned char* GetDataStream(unsigned& length);

protected:
    bool BuildXmlData(std::string& out, bool compress);
    unsigned char* BuildDataStream(const std::string& xml, unsigned& length);
    unsigned char* Build_1_4_DataStream(const std::string& xml, unsigned& length);
    unsigned CountRows(const char* at);
    unsigned Count_1_4_Rows(const char* at);
    bool ExtractName(const char* at, std::string& name);
    void ProcessRow(VarDataProcessor& store, const std::string& source, const std::vector<std::string>& names,
                    unsigned row, const char* at);
    void Process_1_4_Row(VarDataProcessor& store, const std::string& source, unsigned row, const char* at);

private:
    const std::string* xmlText;
    std::string ownText;
    const unsigned char* stream = nullptr;
    unsigned streamLength = 0;
};

#endif
