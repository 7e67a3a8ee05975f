// The header of a server's answer: success or CimError with a text of bounded length,
// whatever the server sends.
#include "FuzzInput.h"

#include <client/AnswerHead.h>
#include <client/Connection.h>

namespace {

using namespace qelo::client;
using qelo::fuzz::require;

const std::string server = "https://server:5989";

void checkError(const CimError& error) {
    require(error.code() >= 1 && error.code() <= 0xFFFF);
    require(std::string(error.what()).size() < 4000);
}

bool succeeds(const AnswerHead& head) {
    try {
        head.requireSuccess(server);
        return true;
    } catch (const CimError& error) {
        checkError(error);
        require(qelo::fuzz::contains(error.what(), server));
        return false;
    }
}

bool endsWell(const AnswerHead& head) {
    try {
        head.requireNoLateError();
        return true;
    } catch (const CimError& error) {
        checkError(error);
        return false;
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    std::string_view text = qelo::fuzz::viewOf(data, size);
    AnswerHead head;
    require(!succeeds(head) && endsWell(head));
    while (!text.empty()) {
        head.addLine(qelo::fuzz::takePart(text, '\n'));
    }
    succeeds(head);
    endsWell(head);
    // A status line starts over: what came before (a 100, a 401) counts no more.
    head.addLine("HTTP/1.1 200 OK\r\n");
    require(succeeds(head) && endsWell(head));
    head.addLine("CIMStatusCode: 5\r\n");
    require(succeeds(head) && !endsWell(head));
    head.addLine("HTTP/1.1 401 Unauthorized\r\n");
    require(!succeeds(head));
    return 0;
}
