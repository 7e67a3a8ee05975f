// One call into a provider: the lifetime of the objects it makes, its context and its result,
// and the barrier that what a provider throws does not pass.
#pragma once

#include "Broker.h"
#include "Convert.h"
#include "Frame.h"
#include "Result.h"
#include "Slot.h"

#include <string>
#include <vector>

namespace qelo::broker {

// A list of names as providers get it: ending with null, or null for "all".
class NameList {
public:
    explicit NameList(const client::PropertyList& names);
    const char** data() { return given_ ? pointers_.data() : nullptr; }

private:
    bool given_;
    std::vector<const char*> pointers_;
};

// Null for the empty text, which stands for a filter that was not given.
inline const char* nullIfEmpty(const std::string& text) {
    return text.empty() ? nullptr : text.c_str();
}

// The CIM status code that a client is told for a provider's code: the same where CIM has it,
// else FAILED.
unsigned int cimStatusCode(CMPIrc code);

// "CIM_ERR_NOT_FOUND" and so on.
std::string statusName(unsigned int code);

class ProviderCall {
public:
    // Throws CimError when the thread is in too many calls already: providers that ask each
    // other without end must not exhaust the stack.
    ProviderCall(const Broker& broker, const OperationContext& context, ResultObject::Kind kind);

    Arena& arena() { return frame_.arena(); }
    const CMPIContext* context() const { return &context_->cmpi; }
    ContextObject& contextObject() { return *context_; }
    ResultObject& result() { return result_; }
    const CMPIResult* cmpiResult() const { return &result_.cmpi; }

    const CMPIObjectPath* path(const cim::ObjectPath& path) {
        return &fromCim(arena(), path, Ownership::Contained)->cmpi;
    }

    // Calls `function`, which answers a CMPIStatus. Throws CimError for any status but OK and
    // for what the function throws, and lets out what a sink threw meanwhile. `who` names
    // the provider in error texts.
    template <class Function> void run(const std::string& who, Function function) {
        finish(who, guarded(who, function));
    }

    // The same, but answers the status instead of throwing.
    template <class Function> CMPIStatus guarded(const std::string& who, Function function) {
        try {
            return function();
        } catch (...) {
            passForcedUnwind();
            return escapedException(who);
        }
    }

private:
    CMPIStatus escapedException(const std::string& who);
    void finish(const std::string& who, const CMPIStatus& status);

    Frame frame_;
    ContextObject* context_;
    ResultObject result_;
    const Broker& broker_;
};

} // namespace qelo::broker
