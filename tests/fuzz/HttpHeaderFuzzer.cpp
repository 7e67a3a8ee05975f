// The header of an HTTP request, as far as it is checked here: it is taken or refused with an
// answer that HTTP can carry, and what is taken says the same as the body.
#include "FuzzInput.h"

#include <cim/ObjectPath.h>
#include <schema/Names.h>
#include <server/RequestHeaders.h>

#include <algorithm>
#include <map>

namespace {

using namespace qelo::server;
using qelo::fuzz::require;

constexpr std::size_t largestBody = 1000000;

// The first line is "METHOD PATH", the others are fields.
struct Head {
    std::string method;
    std::string path;
    std::map<std::string, std::string> fields;
};

Head headOf(std::string_view text) {
    Head head;
    std::string_view first = qelo::fuzz::takePart(text, '\n');
    head.method = qelo::fuzz::takePart(first, ' ');
    head.path = first;
    while (!text.empty()) {
        std::string_view line = qelo::fuzz::takePart(text, '\n');
        const std::string name(qelo::fuzz::takePart(line, ':'));
        head.fields.emplace(name, line);
    }
    return head;
}

HeaderLookup lookupIn(const Head& head) {
    return [&head](const char* name) -> std::optional<std::string> {
        const auto found =
            std::find_if(head.fields.begin(), head.fields.end(),
                         [&](const auto& field) { return qelo::cim::sameName(field.first, name); });
        return found == head.fields.end() ? std::nullopt : std::make_optional(found->second);
    };
}

void checkRefusal(const HttpRefusal& refusal) {
    require(refusal.status >= 400 && refusal.status <= 501 && !refusal.text.empty());
    require(refusal.text.find_first_of("\r\n") == std::string::npos);
    require(refusal.cimError.find_first_not_of("abcdefghijklmnopqrstuvwxyz-") == std::string::npos);
}

void checkAccepted(const Head& head, const HeaderLookup& header) {
    require(head.method == "POST" && (head.path == "/cimom" || head.path == "/"));
    require(header("Content-Type") && header("CIMOperation") && !header("CIMBatch"));
    const auto length = header("Content-Length");
    require(!length ||
            (!length->empty() && length->find_first_not_of("0123456789") == std::string::npos &&
             std::stoull(*length) <= largestBody));
}

// Escapes stand for bytes, and nothing else is changed.
void checkDecoding(const std::string& text) {
    std::string escaped;
    for (const char c : text) {
        constexpr char digits[] = "0123456789aBcDeF";
        const auto byte = static_cast<unsigned char>(c);
        escaped += {'%', digits[byte >> 4U], digits[byte & 0xFU]};
    }
    require(percentDecoded(escaped) == text);
    const auto decoded = percentDecoded(text);
    const auto escapes = static_cast<std::size_t>(std::count(text.begin(), text.end(), '%'));
    require(decoded ? decoded->size() <= text.size() && (text.size() - decoded->size()) % 2 == 0
                    : escapes > 0);
    require(escapes > 0 || decoded == text);
}

void checkMatch(const HeaderLookup& header, bool extrinsic) {
    qelo::cimxml::Request request;
    request.extrinsic = extrinsic;
    request.method = extrinsic ? "CreateUser" : "GetInstance";
    request.target.setNameSpace("root/cimv2");
    if (extrinsic) {
        request.target.setClassName("ZANTH_Account");
    }
    if (const HttpRefusal refusal = checkHeaderMatch(request, header)) {
        require(refusal.cimError == "header-mismatch");
        checkRefusal(refusal);
        return;
    }
    // What stands between here and the client goes by these words.
    const auto method = percentDecoded(header("CIMMethod").value());
    const auto object = percentDecoded(header("CIMObject").value());
    require(qelo::fuzz::contains(qelo::schema::foldedName(*method),
                                 qelo::schema::foldedName(request.method)));
    require(qelo::fuzz::contains(qelo::schema::foldedName(*object), "root/cimv2"));
    require(!extrinsic ||
            qelo::fuzz::contains(qelo::schema::foldedName(*object), ":zanth_account"));
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view text = qelo::fuzz::viewOf(data, size);
    const Head head = headOf(text);
    const HeaderLookup header = lookupIn(head);
    if (const HttpRefusal refusal =
            checkRequestHeader(head.method, head.path, header, largestBody)) {
        checkRefusal(refusal);
    } else {
        checkAccepted(head, header);
    }
    checkMatch(header, false);
    checkMatch(header, true);
    checkDecoding(std::string(text));
    return 0;
}
