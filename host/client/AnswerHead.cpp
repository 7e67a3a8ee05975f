#include "AnswerHead.h"

#include "Connection.h"

#include <cim/ObjectPath.h>
#include <cim/ValueParser.h>

namespace qelo::client {
namespace {

constexpr unsigned int kFailed = 1;
constexpr unsigned int kAccessDenied = 2;
constexpr long kOk = 200;
constexpr long kUnauthorized = 401;

// What a server may contribute to a message.
constexpr std::size_t kLongestField = 1024;

std::string_view trimmed(std::string_view text) {
    const std::size_t first = text.find_first_not_of(" \t\r\n");
    if (first == std::string_view::npos) {
        return {};
    }
    return text.substr(first, text.find_last_not_of(" \t\r\n") - first + 1);
}

int hexDigit(char c) {
    if (c >= '0' && c <= '9') {
        return c - '0';
    }
    const char lower = static_cast<char>(c | 0x20);
    return lower >= 'a' && lower <= 'f' ? lower - 'a' + 10 : -1;
}

std::string percentDecoded(std::string_view text) {
    std::string result;
    for (std::size_t i = 0; i < text.size(); ++i) {
        const bool escape = text[i] == '%' && i + 2 < text.size() && hexDigit(text[i + 1]) >= 0 &&
                            hexDigit(text[i + 2]) >= 0;
        result += escape ? static_cast<char>(hexDigit(text[i + 1]) * 16 + hexDigit(text[i + 2]))
                         : text[i];
        i += escape ? 2 : 0;
    }
    return result;
}

// "application/xml; charset=utf-8" and its kin. A server that says nothing is believed.
bool isXml(std::string_view contentType) {
    const std::string_view type =
        trimmed(contentType.substr(0, std::min(contentType.find(';'), contentType.size())));
    return type.empty() || cim::sameName(type, "application/xml") ||
           cim::sameName(type, "text/xml");
}

long numberOf(std::string_view text) {
    std::string error;
    const auto number = cim::parseValue(cim::Type::UInt16, trimmed(text), error);
    return number ? static_cast<long>(number->asUnsigned()) : 0;
}

} // namespace

void AnswerHead::addLine(std::string_view line) {
    if (line.substr(0, 5) == "HTTP/") {
        const std::size_t space = std::min(line.find(' '), line.size());
        const std::string_view rest = trimmed(line.substr(space));
        *this = AnswerHead();
        status_ = numberOf(rest.substr(0, 3));
        reason_ =
            trimmed(rest.substr(std::min<std::size_t>(3, rest.size())).substr(0, kLongestField));
        return;
    }
    const std::size_t colon = line.find(':');
    if (colon == std::string_view::npos) {
        return;
    }
    const std::string_view name = line.substr(0, colon);
    const std::string_view value = trimmed(line.substr(colon + 1)).substr(0, kLongestField);
    const std::pair<const char*, std::string&> fields[] = {{"Content-Type", contentType_},
                                                           {"CIMError", cimError_},
                                                           {"PGErrorDetail", errorDetail_},
                                                           {"CIMStatusCode", lateStatus_},
                                                           {"CIMStatusCodeDescription", lateText_}};
    for (const auto& [known, target] : fields) {
        if (cim::sameName(name, known)) {
            target = value;
        }
    }
}

void AnswerHead::requireSuccess(const std::string& server) const {
    if (status_ == kUnauthorized) {
        throw CimError(kAccessDenied, server + " does not accept this user and password");
    }
    if (status_ != kOk) {
        std::string text = server + " answered with HTTP status " + std::to_string(status_);
        text += reason_.empty() ? "" : " " + reason_;
        for (const std::string& detail : {cimError_, percentDecoded(errorDetail_)}) {
            text += detail.empty() ? "" : ", " + detail;
        }
        throw CimError(kFailed, text);
    }
    if (!isXml(contentType_)) {
        throw CimError(kFailed, server + " is no CIM server: it answered with " + contentType_);
    }
}

void AnswerHead::requireNoLateError() const {
    const long code = numberOf(lateStatus_);
    if (code != 0) {
        throw CimError(static_cast<unsigned int>(code), percentDecoded(lateText_));
    }
}

} // namespace qelo::client
