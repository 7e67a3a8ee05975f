#include "LocalReferences.h"
#include "OperationCall.h"

#include <utility>

namespace qelo::server {
namespace {

constexpr unsigned int kFailed = 1;
constexpr unsigned int kAccessDenied = 2;
constexpr unsigned int kInvalidNameSpace = 3;
constexpr unsigned int kNotSupported = 7;

void dispatch(const OperationCall& call) {
    if (!call.repository().hasNameSpace(call.nameSpace())) {
        throw client::CimError(kInvalidNameSpace,
                               "no such namespace: \"" + call.nameSpace() + "\"");
    }
    if (call.request.extrinsic) {
        callMethod(call);
        return;
    }
    const Operation operation = findOperation(call.request.method);
    if (operation == nullptr) {
        throw client::CimError(kNotSupported, call.request.method + " is not supported");
    }
    operation(call);
}

void answerError(Answer& answer, unsigned int code, const char* text) {
    if (!answer.restart()) {
        throw AnswerCutShort(text);
    }
    answer.writer().error(answer.text(), code, text);
    answer.send();
}

} // namespace

void Answer::send() {
    if (!text_.empty()) {
        sent_ = true;
        sink_.send(text_);
        text_.clear();
    }
}

bool Answer::restart() {
    text_.clear();
    if (sent_ && !sink_.restart()) {
        return false;
    }
    sent_ = false;
    return true;
}

void OperationCall::requirePermission() const {
    if (!services.mayChange(context.principal)) {
        throw client::CimError(
            kAccessDenied,
            (context.principal.empty() ? std::string("nobody") : "user " + context.principal) +
                " may not change anything here");
    }
}

void OperationCall::answerWithNothing() const {
    answer.writer().begin(answer.text(), false);
    answer.writer().end(answer.text(), false);
    answer.send();
}

// LocalOnly must be a boolean but has no effect on instances, as the standard advises: a client
// that leaves it at its default expects the inherited properties all the same.
InstanceWriting::InstanceWriting(const OperationCall& call, const IntrinsicParameters& parameters)
    : call_(call) {
    parameters.flag("LocalOnly", false);
    options_.includeClassOrigin = parameters.flag("IncludeClassOrigin", false);
    options_.includeQualifiers = parameters.flag("IncludeQualifiers", false);
}

// Instances of one class come one after the other, so the last declaration mostly fits.
void InstanceWriting::write(const cim::Instance& instance, cimxml::InstanceForm form) {
    const bool needed = options_.includeClassOrigin || options_.includeQualifiers;
    if (needed && className_ != instance.className()) {
        className_ = instance.className();
        options_.declaration = call_.repository().find(call_.nameSpace(), className_);
    }
    const auto local = withLocalReferences(instance, call_.services.hostName);
    call_.answer.writer().instance(call_.answer.text(), local ? *local : instance, form, options_);
    call_.answer.sendIfWorth();
}

void OperationCall::answerPath(const cim::ObjectPath& path, cimxml::PathForm form) const {
    const auto local = withLocalReferences(path, services.hostName);
    answer.writer().path(answer.text(), local ? *local : path, form);
    answer.sendIfWorth();
}

Operation findOperation(const std::string& name) {
    for (const OperationTable& table :
         {instanceOperations(), associationOperations(), classOperations()}) {
        for (const auto* entry = table.begin; entry != table.end; ++entry) {
            if (cim::sameName(entry->name, name)) {
                return entry->operation;
            }
        }
    }
    return nullptr;
}

void Operations::run(const cimxml::Request& request, const broker::OperationContext& context,
                     const AnswerSink& sink) const {
    const cimxml::ResponseWriter writer(request, services_.hostName, request.target.nameSpace());
    Answer answer(sink, writer);
    const OperationCall call{services_, request, context, answer};
    try {
        dispatch(call);
    } catch (const client::CimError& error) {
        answerError(answer, error.code(), error.what());
    } catch (const std::bad_alloc&) {
        answerError(answer, kFailed, "out of memory");
    }
}

} // namespace qelo::server
