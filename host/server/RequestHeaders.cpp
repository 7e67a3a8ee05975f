#include "RequestHeaders.h"

#include <cim/ObjectPath.h>

#include <algorithm>
#include <cctype>
#include <charconv>

namespace qelo::server {
namespace {

constexpr unsigned int kBadRequest = 400;
constexpr unsigned int kNotFound = 404;
constexpr unsigned int kMethodNotAllowed = 405;
constexpr unsigned int kTooLarge = 413;
constexpr unsigned int kUnsupportedMediaType = 415;
constexpr unsigned int kNotImplemented = 501;

std::string trimmed(const std::string& text) {
    const auto isBlank = [](char c) { return c == ' ' || c == '\t'; };
    const auto begin = std::find_if_not(text.begin(), text.end(), isBlank);
    const auto end = std::find_if_not(text.rbegin(), text.rend(), isBlank).base();
    return begin < end ? std::string(begin, end) : std::string();
}

std::string unquoted(const std::string& text) {
    const bool quoted = text.size() >= 2 && text.front() == '"' && text.back() == '"';
    return quoted ? text.substr(1, text.size() - 2) : text;
}

// application/xml or text/xml, with no other character set than UTF-8.
bool isXml(const std::string& contentType) {
    const std::size_t semicolon = contentType.find(';');
    const std::string type = trimmed(contentType.substr(0, semicolon));
    if (!cim::sameName(type, "application/xml") && !cim::sameName(type, "text/xml")) {
        return false;
    }
    for (std::size_t at = semicolon; at != std::string::npos;) {
        const std::size_t next = contentType.find(';', at + 1);
        const std::string parameter = trimmed(contentType.substr(at + 1, next - at - 1));
        const std::size_t equals = parameter.find('=');
        if (cim::sameName(parameter.substr(0, equals), "charset") &&
            (equals == std::string::npos ||
             !cim::sameName(unquoted(parameter.substr(equals + 1)), "utf-8"))) {
            return false;
        }
        at = next;
    }
    return true;
}

HttpRefusal checkLength(const HeaderLookup& header, std::size_t largestBody) {
    const auto length = header("Content-Length");
    if (!length) {
        return {}; // sent in chunks: counted as they come
    }
    unsigned long long bytes = 0;
    const char* const end = length->data() + length->size();
    const auto [behind, error] = std::from_chars(length->data(), end, bytes);
    if (error == std::errc::result_out_of_range || (error == std::errc() && bytes > largestBody)) {
        return {kTooLarge, "the body is too large", ""};
    }
    if (error != std::errc() || behind != end) {
        return {kBadRequest, "Content-Length is no number", ""};
    }
    return {};
}

HttpRefusal checkCimHeaders(const HeaderLookup& header) {
    const auto operation = header("CIMOperation");
    if (header("CIMBatch")) {
        return {kNotImplemented, "one operation a request, please",
                "multiple-requests-unsupported"};
    }
    if (!operation || !cim::sameName(trimmed(*operation), "MethodCall")) {
        return {kBadRequest, "CIMOperation must be MethodCall", "unsupported-operation"};
    }
    const auto version = header("CIMProtocolVersion");
    if (version && trimmed(*version).compare(0, 2, "1.") != 0) {
        return {kNotImplemented, "protocol version 1.x is expected",
                "unsupported-protocol-version"};
    }
    return {};
}

int hexadecimal(char c) {
    if (c >= '0' && c <= '9') {
        return c - '0';
    }
    const int lower = std::tolower(static_cast<unsigned char>(c));
    return lower >= 'a' && lower <= 'f' ? lower - 'a' + 10 : -1;
}

HttpRefusal mismatch(const std::string& text) { return {kBadRequest, text, "header-mismatch"}; }

std::string withoutSlashes(std::string text) {
    text.erase(0, text.find_first_not_of('/') == std::string::npos ? text.size()
                                                                   : text.find_first_not_of('/'));
    while (!text.empty() && text.back() == '/') {
        text.pop_back();
    }
    return text;
}

// The header names the namespace, for a method with the class and the keys behind it, which
// clients spell in several ways; what firewalls go by is namespace and class.
bool namesTarget(const std::string& object, const cimxml::Request& request) {
    const std::string nameSpace = withoutSlashes(request.target.nameSpace());
    if (!request.extrinsic) {
        return cim::sameName(withoutSlashes(object), nameSpace);
    }
    const std::size_t colon = object.find(':');
    if (colon == std::string::npos) {
        return false;
    }
    const std::string instance = object.substr(colon + 1);
    return cim::sameName(withoutSlashes(object.substr(0, colon)), nameSpace) &&
           cim::sameName(instance.substr(0, instance.find('.')), request.target.className());
}

} // namespace

std::optional<std::string> percentDecoded(const std::string& text) {
    std::string decoded;
    decoded.reserve(text.size());
    for (std::size_t i = 0; i < text.size(); ++i) {
        if (text[i] != '%') {
            decoded += text[i];
            continue;
        }
        const int high = i + 2 < text.size() ? hexadecimal(text[i + 1]) : -1;
        const int low = i + 2 < text.size() ? hexadecimal(text[i + 2]) : -1;
        if (high < 0 || low < 0) {
            return std::nullopt;
        }
        decoded += static_cast<char>(high * 16 + low);
        i += 2;
    }
    return decoded;
}

HttpRefusal checkRequestHeader(const std::string& method, const std::string& path,
                               const HeaderLookup& header, std::size_t largestBody) {
    if (method == "M-POST") {
        return {kNotImplemented, "M-POST is not supported; use POST", ""};
    }
    if (method != "POST") {
        return {kMethodNotAllowed, "only POST is supported", ""};
    }
    if (path != "/cimom" && path != "/") {
        return {kNotFound, "CIM operations go to /cimom", ""};
    }
    if (HttpRefusal refusal = checkLength(header, largestBody)) {
        return refusal;
    }
    const auto type = header("Content-Type");
    if (!type || !isXml(*type)) {
        return {kUnsupportedMediaType, "the body must be application/xml in UTF-8", ""};
    }
    const auto encoding = header("Content-Encoding");
    if (encoding && !cim::sameName(trimmed(*encoding), "identity")) {
        return {kUnsupportedMediaType, "the body must not be encoded", ""};
    }
    return checkCimHeaders(header);
}

HttpRefusal checkHeaderMatch(const cimxml::Request& request, const HeaderLookup& header) {
    const auto method = header("CIMMethod");
    const auto object = header("CIMObject");
    const auto decodedMethod = method ? percentDecoded(trimmed(*method)) : std::nullopt;
    const auto decodedObject = object ? percentDecoded(trimmed(*object)) : std::nullopt;
    if (!decodedMethod || !cim::sameName(*decodedMethod, request.method)) {
        return mismatch("the header CIMMethod does not name the method of the body");
    }
    if (!decodedObject || !namesTarget(*decodedObject, request)) {
        return mismatch("the header CIMObject does not name the object of the body");
    }
    return {};
}

} // namespace qelo::server
