#include "RootCommand.h"

#include "../render/Display.h"

#include <commands/ScratchRoot.h>

#include <memory>

namespace qelo::cli {

void addRootCommand(CLI::App& app, Invocation& invocation) {
    const auto directory = std::make_shared<std::string>();
    CLI::App* command = addCommand(
        app, invocation, "init-root", "Make a scratch root directory to try commands on",
        [directory](CommandContext& context) {
            if (!context.options().url.empty()) {
                throw UsageError("a scratch root directory is made on this machine, not by a "
                                 "server");
            }
            const store::CommandOutcome outcome = store::initRoot(*directory);
            if (!outcome.accepted) {
                throw UsageError(outcome.status);
            }
            context.output().write("made " + displayText(*directory) + "; use it with --root " +
                                   displayText(*directory) + "\n");
        });
    command->add_option("DIR", *directory, "The directory")->required()->type_name("");
}

} // namespace qelo::cli
