// Bodies of requests: nothing but RequestError escapes, and what was read can be written and
// is read again as the same request.
#include <cimxml/RequestWriter.h>

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>
#include <string_view>

namespace {

void require(bool condition) {
    if (!condition) {
        std::abort();
    }
}

// A refusal is one that HTTP can carry.
void check(const qelo::cimxml::RequestError& error) {
    require(error.httpStatus() == 400 || error.httpStatus() == 501);
    require(!error.cimError().empty() && *error.what() != '\0');
    require(error.cimError().find_first_not_of("abcdefghijklmnopqrstuvwxyz-") == std::string::npos);
}

// What is written is a fixed point: reading and writing it again changes nothing.
void checkRoundTrip(const qelo::cimxml::Request& request) {
    std::string first;
    writeRequest(first, request);
    // A namespace may be named by a text of slashes only, which has no written form.
    if (request.target.nameSpace().find_first_not_of('/') == std::string::npos) {
        return;
    }
    std::string second;
    qelo::cimxml::ReadLimits limits;
    limits.depth *= 2; // short forms may become longer ones
    limits.elements *= 4;
    writeRequest(second, qelo::cimxml::parseRequest(first, limits));
    require(first == second);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view body(reinterpret_cast<const char*>(data), size);
    try {
        checkRoundTrip(qelo::cimxml::parseRequest(body));
    } catch (const qelo::cimxml::RequestError& error) {
        check(error);
    }
    return 0;
}
