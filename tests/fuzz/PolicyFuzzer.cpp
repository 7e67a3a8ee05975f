// Settings for passwords and log-ins: files of settings and PAM stacks of any content give a
// policy of known rules, and every setting kept stands in the text.
#include "FuzzInput.h"

#include <ConfigText.h>
#include <PasswordPolicy.h>

#include <algorithm>

namespace {

using namespace qelo::nodes;
using qelo::fuzz::require;

bool isTrimmed(const std::string& text) {
    constexpr std::string_view blanks = " \t\r\v\f\n";
    return text.empty() || (blanks.find(text.front()) == std::string_view::npos &&
                            blanks.find(text.back()) == std::string_view::npos);
}

std::vector<Setting> checkedSettings(std::string_view text) {
    const std::vector<Setting> settings = readSettings(text);
    const auto lines = static_cast<std::size_t>(std::count(text.begin(), text.end(), '\n')) + 1;
    std::size_t last = 0;
    for (const Setting& setting : settings) {
        require(setting.line > last && setting.line <= lines);
        last = setting.line;
        require(isTrimmed(setting.name) && isTrimmed(setting.value));
        require(setting.name.find_first_of("=#\n") == std::string::npos);
        require(setting.value.find_first_of("#\n") == std::string::npos);
        require(qelo::fuzz::contains(text, setting.name) &&
                qelo::fuzz::contains(text, setting.value));
        const auto number = wholeNumber(setting.value);
        require(!number || !setting.value.empty());
    }
    return settings;
}

std::vector<PasswordModule> checkedModules(std::string_view text) {
    std::vector<PasswordModule> modules = readPasswordModules(text);
    for (const PasswordModule& module : modules) {
        require(module.name.find_first_of("/\n") == std::string::npos);
        for (const Setting& argument : module.arguments) {
            require(argument.line == 0 && argument.name.find('\n') == std::string::npos &&
                    argument.value.find('\n') == std::string::npos);
        }
    }
    return modules;
}

void checkPolicy(const PasswordPolicy& policy) {
    require(policy.rules.size() <= 7 && std::is_sorted(policy.rules.begin(), policy.rules.end()));
    require(std::adjacent_find(policy.rules.begin(), policy.rules.end()) == policy.rules.end());
    for (const unsigned int rule : policy.rules) {
        require(rule >= MinimumLength && rule <= Special);
    }
}

// The last line of a file counts, whatever stands before it.
void checkLastLine(std::string_view text) {
    PolicyReader reader;
    reader.readFaillock(readSettings(std::string(text) + "\n deny = 7 # times"));
    reader.readHistory(readSettings(std::string(text) + "\nremember=5\r\n"));
    reader.readQuality(readSettings(std::string(text) + "\nminlen\t=\t12"));
    const PasswordPolicy policy = reader.policy();
    checkPolicy(policy);
    require(policy.maxLoginFailures == 7U && policy.historyDepth == 5U);
    require(!policy.rules.empty() && policy.rules.front() == MinimumLength);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    std::string_view text = qelo::fuzz::viewOf(data, size);
    checkLastLine(text);
    // The files one after the other, a NUL between them.
    PolicyReader reader;
    reader.readFaillock(checkedSettings(qelo::fuzz::takePart(text, '\0')));
    reader.readHistory(checkedSettings(qelo::fuzz::takePart(text, '\0')));
    reader.readQuality(checkedSettings(qelo::fuzz::takePart(text, '\0')));
    reader.readModules(checkedModules(text));
    checkPolicy(reader.policy());
    return 0;
}
