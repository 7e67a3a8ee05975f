// What a process finds around it: its arguments, in which secrets are hidden, and the description
// of the operating system.
#include "FuzzInput.h"

#include <computersystem/SystemFacts.h>
#include <secrecy/Process.h>

#include <vector>

namespace {

using qelo::fuzz::contains;
using qelo::fuzz::require;

// An argument keeps its length, and what it was is returned. Hiding twice changes nothing more.
std::string shown(std::string argument) {
    const std::string before = argument;
    char* pointer = argument.data();
    const std::vector<std::string> texts = qelo::secrecy::hideSecrets(1, &pointer);
    require(texts.size() == 1 && texts.front() == before && argument.size() == before.size());
    std::string again = argument;
    pointer = again.data();
    qelo::secrecy::hideSecrets(1, &pointer);
    require(again == argument);
    return argument;
}

void checkHiding(std::string_view text) {
    const std::string argument(text.substr(0, text.find('\0')));
    shown(argument);
    const std::string hidden = std::string(argument.size(), 'x');
    require(shown("UserPassword=" + argument) == "UserPassword=" + hidden);
    if (argument.find_first_of("@:") == std::string::npos) {
        require(shown("http://root:" + argument + "@host") == "http://root:" + hidden + "@host");
    }
}

// The last line with the name counts, whatever stands before it.
void checkRelease(const std::string& text) {
    const std::string value = qelo::computersystem::osReleaseValue(text, "PRETTY_NAME");
    require(value.size() <= text.size() && value.find('\n') == std::string::npos);
    require(value.empty() || contains(text, "PRETTY_NAME="));
    require(qelo::computersystem::osReleaseValue(text + "\nPRETTY_NAME=\"A \\\"b\\\" c\"",
                                                 "PRETTY_NAME") == "A \"b\" c");
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view text = qelo::fuzz::viewOf(data, size);
    checkHiding(text);
    checkRelease(std::string(text));
    return 0;
}
