// The process around the program: its descriptors, signals and language.
#include "Application.h"
#include "local/GroupIds.h"
#include "local/LocalProviders.h"
#include "local/Refusals.h"
#include "local/RootCommand.h"
#include "local/ServeCommand.h"
#include "remote/ServerConnection.h"

#include <secrecy/Process.h>

#include <clocale>
#include <csignal>
#include <cstring>
#include <fcntl.h>
#include <langinfo.h>
#include <string>
#include <unistd.h>
#include <vector>

namespace {

// A descriptor that is closed at start would be taken by the first file that is opened, and
// results would end up in it. Read-only, it refuses whatever is written.
void occupyStandardDescriptors() {
    int descriptor = open("/dev/null", O_RDONLY);
    while (descriptor >= 0 && descriptor <= STDERR_FILENO) {
        descriptor = open("/dev/null", O_RDONLY);
    }
    if (descriptor >= 0) {
        close(descriptor);
    }
}

// Results are UTF-8 whatever the environment says; messages follow the environment.
void chooseLanguage() {
    // One that is not installed leaves the C locale, which will do.
    (void)setlocale(LC_MESSAGES, "");
    (void)setlocale(LC_CTYPE, "");
    if (std::strcmp(nl_langinfo(CODESET), "UTF-8") != 0) {
        (void)setlocale(LC_CTYPE, "C.UTF-8");
    }
}

std::unique_ptr<qelo::client::Connection> connect(const qelo::cli::Options& options) {
    return options.url.empty() ? qelo::cli::connectToLocalProviders(options)
                               : qelo::cli::connectToServer(options);
}

} // namespace

int main(int argc, char** argv) {
    // Passwords and their hashes pass through this process.
    qelo::secrecy::keepMemoryPrivate();
    const std::vector<std::string> texts = qelo::secrecy::hideSecrets(argc, argv);
    std::vector<const char*> arguments;
    arguments.reserve(texts.size());
    for (const std::string& text : texts) {
        arguments.push_back(text.c_str());
    }
    occupyStandardDescriptors();
    // A reader that goes is noticed when writing fails.
    (void)std::signal(SIGPIPE, SIG_IGN);
    chooseLanguage();
    qelo::cli::FileOutput output(STDOUT_FILENO);
    qelo::cli::FileOutput errors(STDERR_FILENO);
    return qelo::cli::runApplication(argc, arguments.data(),
                                     {connect,
                                      output,
                                      errors,
                                      {qelo::cli::addRootCommand, qelo::cli::addServeCommand},
                                      qelo::cli::localGroupIds,
                                      qelo::cli::overhearRefusals()});
}
