#include "foundation/XercesRuntime.h"

#include <plotaid/ChartErrorHandler.h>

#include <xercesc/util/PlatformUtils.hpp>
#include <xercesc/util/XMLException.hpp>

#include <mutex>

using namespace XERCES_CPP_NAMESPACE;

namespace plotaid::detail {

namespace {

const char* const kSourceFile = "backend/chartxml/plotaid/src/chartbase";

std::mutex& runtimeLock() {
    static std::mutex lock;
    return lock;
}
unsigned gReferences = 0;
bool gFailed = false;

bool acquire() noexcept {
    const std::lock_guard<std::mutex> guard(runtimeLock());
    if (gFailed)
        return false;
    if (gReferences == 0) {
        try {
            XMLPlatformUtils::Initialize();
        } catch (const XMLException& e) {
            gFailed = true;
            ChartErrorHandler().error(e);
            return false;
        } catch (...) {
            gFailed = true;
            ChartErrorHandler().error(
                ChartException("XML parser library initialisation failed", kSourceFile, 0));
            return false;
        }
    }
    ++gReferences;
    return true;
}

void release() noexcept {
    const std::lock_guard<std::mutex> guard(runtimeLock());
    if (gReferences == 0 || --gReferences > 0)
        return;
    try {
        XMLPlatformUtils::Terminate();
    } catch (const XMLException& e) {
        ChartErrorHandler().error(e);
    } catch (...) {
        ChartErrorHandler().error(ChartException("XML parser library termination failed", kSourceFile, 0));
    }
}

} // namespace

XercesRuntime::XercesRuntime() noexcept : ready_(acquire()) {}

XercesRuntime::XercesRuntime(const XercesRuntime& other) noexcept : ready_(other.ready_ && acquire()) {}

XercesRuntime::~XercesRuntime() {
    if (ready_)
        release();
}

unsigned XercesRuntime::references() noexcept {
    const std::lock_guard<std::mutex> guard(runtimeLock());
    return gReferences;
}

} // namespace plotaid::detail
