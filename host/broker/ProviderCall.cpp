#include "ProviderCall.h"

#include <algorithm>
#include <array>

namespace qelo::broker {
namespace {

// Far more than providers need that ask each other for related objects.
constexpr int maximumCallDepth = 64;

std::string oneLine(std::string text) {
    std::replace_if(
        text.begin(), text.end(), [](unsigned char c) { return c < 0x20 || c == 0x7f; }, ' ');
    return text;
}

} // namespace

NameList::NameList(const client::PropertyList& names) : given_(names.has_value()) {
    if (!names) {
        return;
    }
    for (const std::string& name : *names) {
        pointers_.push_back(name.c_str());
    }
    pointers_.push_back(nullptr);
}

unsigned int cimStatusCode(CMPIrc code) {
    const auto number = static_cast<unsigned int>(code);
    const bool isCim = (number >= 1 && number <= 17) || (number >= 20 && number <= 29);
    return isCim ? number : static_cast<unsigned int>(CMPI_RC_ERR_FAILED);
}

std::string statusName(unsigned int code) {
    static constexpr std::array<const char*, 18> names = {
        "OK",
        "CIM_ERR_FAILED",
        "CIM_ERR_ACCESS_DENIED",
        "CIM_ERR_INVALID_NAMESPACE",
        "CIM_ERR_INVALID_PARAMETER",
        "CIM_ERR_INVALID_CLASS",
        "CIM_ERR_NOT_FOUND",
        "CIM_ERR_NOT_SUPPORTED",
        "CIM_ERR_CLASS_HAS_CHILDREN",
        "CIM_ERR_CLASS_HAS_INSTANCES",
        "CIM_ERR_INVALID_SUPERCLASS",
        "CIM_ERR_ALREADY_EXISTS",
        "CIM_ERR_NO_SUCH_PROPERTY",
        "CIM_ERR_TYPE_MISMATCH",
        "CIM_ERR_QUERY_LANGUAGE_NOT_SUPPORTED",
        "CIM_ERR_INVALID_QUERY",
        "CIM_ERR_METHOD_NOT_AVAILABLE",
        "CIM_ERR_METHOD_NOT_FOUND",
    };
    return code < names.size() ? names[code] : "status " + std::to_string(code);
}

ProviderCall::ProviderCall(const Broker& broker, const OperationContext& context,
                           ResultObject::Kind kind)
    : frame_(Frame::Kind::Call), context_(nullptr), result_(kind), broker_(broker) {
    if (callDepth() > maximumCallDepth) {
        throw client::CimError(CMPI_RC_ERR_FAILED, "providers call each other too deeply");
    }
    context_ = fromCim(arena(), context, Ownership::Contained);
}

CMPIStatus ProviderCall::escapedException(const std::string& who) {
    CMPIStatus status = currentFailure();
    const StringObject* text = liveObject<StringObject>(status.msg);
    const std::string what = text ? std::string(text->view()) : "an unknown exception";
    const std::string message = who + " threw: " + what;
    broker_.log(CMPI_SEV_ERROR, {}, message);
    return {CMPI_RC_ERR_FAILED, &newString(arena(), message, Ownership::Call)->cmpi};
}

void ProviderCall::finish(const std::string& who, const CMPIStatus& status) {
    if (result_.sinkFailure) {
        std::rethrow_exception(result_.sinkFailure);
    }
    if (status.rc == CMPI_RC_OK) {
        return;
    }
    const unsigned int code = cimStatusCode(status.rc);
    const StringObject* text = liveObject<StringObject>(status.msg);
    if (text && text->length != 0) {
        throw client::CimError(code, oneLine(std::string(text->view())));
    }
    if (result_.error && *result_.error->what()) {
        throw client::CimError(code, oneLine(result_.error->what()));
    }
    throw client::CimError(code,
                           who + " answered " + statusName(static_cast<unsigned int>(status.rc)));
}

} // namespace qelo::broker
