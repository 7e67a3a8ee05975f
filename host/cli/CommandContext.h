// One run of the program after its command line has been understood: the options, where
// results go, and the object manager, which is connected to when the first command asks.
#pragma once

#include "Options.h"
#include "Output.h"

#include <client/Connection.h>

#include <functional>
#include <map>
#include <memory>
#include <stdexcept>
#include <string>
#include <utility>

namespace qelo::cli {

// A request that cannot be meant as it stands: the command line has to be changed.
class UsageError : public std::runtime_error {
public:
    explicit UsageError(const std::string& message, std::string command = {})
        : std::runtime_error(message), command_(std::move(command)) {}
    // The command whose help tells more; empty when that is not known.
    const std::string& command() const { return command_; }

private:
    std::string command_;
};

// What an answer is made from cannot be read: the store of the accounts, or the schema.
class StoreError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

// The ids of groups by their names; the class of groups has no property for them.
using GroupIds = std::function<std::map<std::string, std::string>()>;

// Why the last command was refused, in words for people; empty where that is not known.
using RefusalReason = std::function<std::string()>;

using ConnectionFactory = std::function<std::unique_ptr<client::Connection>(const Options&)>;

class CommandContext {
public:
    CommandContext(Options options, ConnectionFactory connect, Output& output,
                   GroupIds groupIds = {}, RefusalReason refusalReason = {})
        : options_(std::move(options)), connect_(std::move(connect)), output_(output),
          groupIds_(std::move(groupIds)), refusalReason_(std::move(refusalReason)) {}

    const Options& options() const { return options_; }
    Output& output() { return output_; }

    // Throws what the factory throws.
    client::Connection& connection() {
        if (!connection_) {
            connection_ = connect_(options_);
        }
        return *connection_;
    }

    // The same for a command that changes something, which not everybody may.
    client::Connection& connectionForChanges() {
        options_.changes = true;
        return connection();
    }

    // Empty where the ids are not known here; those of a server's groups never are.
    std::map<std::string, std::string> groupIds() {
        return groupIds_ && options_.url.empty() ? groupIds_()
                                                 : std::map<std::string, std::string>();
    }

    // Of the last method call that failed; empty where it is not known here.
    std::string refusalReason() const { return refusalReason_ ? refusalReason_() : std::string(); }

private:
    Options options_;
    ConnectionFactory connect_;
    Output& output_;
    GroupIds groupIds_;
    RefusalReason refusalReason_;
    std::unique_ptr<client::Connection> connection_;
};

} // namespace qelo::cli
