// The barrier around every operation that a function table points at: its caller is C and
// cannot catch, so nothing thrown may pass.
#pragma once

#include "BrokerAccess.h"

#include <UnitTrace.h>

#include <cxxabi.h>
#include <exception>

namespace Tesk {
namespace SimpleIdentityManagementProvider {

// The status for something thrown that reached the end of an operation: failed, with the
// text as message. The text is traced first. Throws nothing itself.
CMPIStatus reportEscaped(const CMPIBroker* broker, const UnitTrace& unit, TraceSite site,
                         const char* text) noexcept;

// Runs an operation's body and returns its status, or the status above.
template <class Body>
CMPIStatus guarded(const CMPIBroker* broker, const UnitTrace& unit, TraceSite site, Body body) {
    try {
        return body();
    } catch (const abi::__forced_unwind&) {
        throw; // the thread is being cancelled; stopping that would end the process
    } catch (const std::exception& failure) {
        return reportEscaped(broker, unit, site, failure.what());
    } catch (...) {
        return reportEscaped(broker, unit, site, "unknown exception");
    }
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
