// The manual page against the program.
#include "HelpText.h"

#include <fstream>

namespace qelo::endtoend {
namespace {

// The page with its hyphens and font changes as plain text.
std::string manual() {
    std::ifstream file(QELOSIM_MANUAL, std::ios::binary);
    std::ostringstream content;
    content << file.rdbuf();
    const std::string hyphens = std::regex_replace(content.str(), std::regex(R"(\\-)"), "-");
    return std::regex_replace(hyphens, std::regex(R"(\\f[RPBI])"), " ");
}

bool tellsOf(const std::string& text, const std::string& word) {
    return std::regex_search(text, std::regex("(^|[^-a-z])" + word + "([^-a-z]|$)"));
}

TEST(Manual, It_tells_of_every_command) {
    const std::string text = manual();
    for (const std::string& command : commandsOfHelp()) {
        EXPECT_TRUE(tellsOf(text, command)) << command;
    }
}

TEST(Manual, It_tells_of_every_option) {
    const std::string text = manual();
    for (const std::string& command : commandsOfHelp()) {
        for (const std::string& option : optionsOfHelp(command)) {
            EXPECT_TRUE(tellsOf(text, option)) << command << " " << option;
        }
    }
}

TEST(Manual, It_can_be_formatted_without_a_warning) {
    const Finished page = runProcess({"man", "-l", "--warnings", "-E", "UTF-8", QELOSIM_MANUAL},
                                     {{"LC_ALL", "C.UTF-8"}, {"MANWIDTH", "80"}});
    if (page.status == 127) {
        GTEST_SKIP() << "there is no man here to format the page";
    }
    EXPECT_EQ(page.status, 0);
    EXPECT_EQ(page.err, "");
}

} // namespace
} // namespace qelo::endtoend
