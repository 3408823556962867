#ifndef TESTS_GRXCHART_GRXTESTSUPPORT_H
#define TESTS_GRXCHART_GRXTESTSUPPORT_H

#include <grx/grx.h>

#include <xercesc/dom/DOMImplementation.hpp>
#include <xercesc/dom/DOMImplementationRegistry.hpp>
#include <xercesc/util/PlatformUtils.hpp>

#include <gtest/gtest.h>

#include <string>

namespace grxtest {

constexpr XMLCh kChartNamespace[] = u"http://plotaid.org/grxml";

// The object model leaves Xerces-C to its user; the tests hold it for the whole run.
struct XercesEnvironment : ::testing::Environment {
    void SetUp() override { xercesc::XMLPlatformUtils::Initialize(); }
    void TearDown() override { xercesc::XMLPlatformUtils::Terminate(); }
};
inline ::testing::Environment* const xercesEnvironment =
    ::testing::AddGlobalTestEnvironment(new XercesEnvironment);

// An empty chart made through DOM calls only: a "visualization" root in the chart namespace.
inline xercesc::DOMDocument* newChartDocument() {
    xercesc::DOMDocument* doc =
        xercesc::DOMImplementationRegistry::getDOMImplementation(u"LS")->createDocument(
            kChartNamespace, GrxUni::_visualization, nullptr);
    doc->getDocumentElement()->setAttributeNS(
        u"http://www.w3.org/2001/XMLSchema-instance", u"xsi:schemaLocation",
        u"http://plotaid.org/grxml http://plotaid.org/grxml/grxml-2.9.xsd");
    return doc;
}

// An attribute's text as UTF-8 ("" when absent).
inline std::string attr(const GrxBaseElement& e, const XMLCh* name) {
    return ChartString(e.GetAttribute(name)).toUTF8();
}

} // namespace grxtest

#endif
