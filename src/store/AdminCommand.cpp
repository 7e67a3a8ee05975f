#include "AdminCommand.h"

#include "../frame/BrokerAccess.h"

#include <platform/ProviderUtilities.h>

#include <cstring>

namespace Tesk {
namespace SimpleIdentityManagementProvider {
namespace {

// A command text under construction, cut where it is full. It may hold a password, so it is
// wiped when done.
class CommandText {
public:
    CommandText() = default;
    ~CommandText() { ::explicit_bzero(text_, sizeof text_); }
    CommandText(const CommandText&) = delete;
    CommandText& operator=(const CommandText&) = delete;

    CommandText& operator<<(const char* piece) {
        const std::size_t taken = ::strnlen(piece, longest - used_);
        std::memcpy(text_ + used_, piece, taken);
        used_ += taken;
        return *this;
    }

    const char* text() const { return text_; }

private:
    static constexpr std::size_t longest = 1023;
    char text_[longest + 1] = {};
    std::size_t used_ = 0;
};

// A text that is wiped when it goes.
struct Secret {
    std::string text;
    ~Secret() { ::explicit_bzero(text.data(), text.size()); }
};

bool hasValue(const CMPIData& argument) {
    return (argument.state & (CMPI_nullValue | CMPI_badValue)) == 0;
}

// The text of a string; empty for none. `status` receives that of reading it.
const char* readText(const CMPIString* string, CMPIStatus* status) {
    if (string == nullptr || isNull(string)) {
        return "";
    }
    const char* text = string->ft->getCharPtr(string, status);
    return text != nullptr ? text : "";
}

// The text of a string argument; empty for a null value.
const char* stringOf(const CMPIData& argument, CMPIStatus* status) {
    return hasValue(argument) ? readText(argument.value.string, status) : "";
}

std::string numberOf(const CMPIData& argument) {
    // Signed, as the store's own "%d" reads it: 4294967295 is sent as -1.
    return hasValue(argument) ? std::to_string(static_cast<int>(argument.value.uint32)) : "";
}

const char* dateOf(const CMPIData& argument, CMPIStatus* status) {
    const CMPIDateTime* date = hasValue(argument) ? argument.value.dateTime : nullptr;
    const CMPIString* format = isNull(date) ? nullptr : CMGetStringFormat(date, status);
    return status->rc == CMPI_RC_OK ? readText(format, status) : "";
}

// Appends the type and the value of one argument; false when the gate refuses it. `status`
// receives that of reading the value.
bool appendValue(CommandText& command, const CMPIData& argument, CMPIStatus* status) {
    switch (argument.type) {
    case CMPI_string: {
        command << ":CMPI_string";
        Secret value{stringOf(argument, status)};
        if (!ProviderUtilities::ValidateInput(value.text, "")) {
            return false;
        }
        command << ":" << value.text.c_str();
        return true;
    }
    case CMPI_uint32:
        command << ":CMPI_uint32:" << numberOf(argument).c_str();
        return true;
    case CMPI_dateTime:
        command << ":CMPI_dateTime:" << dateOf(argument, status);
        return true;
    default:
        return true;
    }
}

} // namespace

bool packCommand(const char* methodName, const CMPIArgs* in, std::string& command) {
    CommandText text;
    text << (methodName != nullptr ? methodName : "");
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPICount count = isNull(in) ? 0 : CMGetArgCount(in, &status);
    for (CMPICount i = 0; i < count && status.rc == CMPI_RC_OK; ++i) {
        CMPIString* name = nullptr;
        const CMPIData argument = CMGetArgAt(in, i, &name, &status);
        if (status.rc == CMPI_RC_OK) {
            text << "," << readText(name, &status);
        }
        if (status.rc == CMPI_RC_OK && !appendValue(text, argument, &status)) {
            return false;
        }
    }
    command = text.text();
    // A command that lacks an argument, or the text of one, may mean another thing; better none.
    return status.rc == CMPI_RC_OK;
}

CommandOutcome sendCommand(const UnitTrace& unit, Instrumentation& cursor, const char* methodName,
                           const CMPIArgs* in, TraceSite site) {
    cursor.selectNode(NodeLexicon::UserAdministration);
    if (!cursor) {
        return CommandOutcome::NoAdministration;
    }
    unit.variable("methodName", methodName, site);
    Secret command;
    if (!packCommand(methodName, in, command.text)) {
        return CommandOutcome::Refused;
    }
    if (!cursor.setProperty(NodeLexicon::AdminCommand, command.text)) {
        // The text serves every method, of accounts and groups alike.
        unit.message("Failed to Create User\n", TraceLevel::failure, site);
        return CommandOutcome::NotAccepted;
    }
    return CommandOutcome::Accepted;
}

} // namespace SimpleIdentityManagementProvider
} // namespace Tesk
