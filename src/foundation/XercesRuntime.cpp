#include "foundation/XercesRuntime.h"

#include <plotaid/ChartErrorHandler.h>

#include <xercesc/util/PlatformUtils.hpp>
#include <xercesc/util/XMLException.hpp>

#include <cstddef>
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
// A fixed table: registering happens while Xerces-C is up, and must not fail.
constexpr std::size_t kMaxDrops = 4;
void (*gDrops[kMaxDrops])() = {};

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
    for (std::size_t i = kMaxDrops; i-- > 0;) {
        if (gDrops[i] == nullptr)
            continue;
        try {
            gDrops[i]();
        } catch (...) {
        }
    }
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

void XercesRuntime::beforeTermination(void (*drop)()) noexcept {
    const std::lock_guard<std::mutex> guard(runtimeLock());
    for (auto& slot : gDrops) {
        if (slot == drop)
            return;
        if (slot == nullptr) {
            slot = drop;
            return;
        }
    }
}

unsigned XercesRuntime::references() noexcept {
    const std::lock_guard<std::mutex> guard(runtimeLock());
    return gReferences;
}

} // namespace plotaid::detail
