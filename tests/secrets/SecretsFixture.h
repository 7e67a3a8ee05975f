// A scratch account database, programs that log and trace everything they can, and all that
// anybody could see of them.
#pragma once

#include "Password.h"

#include "endtoend/Qelosim.h"
#include "endtoend/Server.h"

#include <memory>
#include <string>
#include <vector>

namespace qelo::secrets {

class Secrets : public testing::Test {
protected:
    Secrets();
    ~Secrets() override;
    void SetUp() override;

    // Each runs qelosim on the scratch root and keeps what it said.
    endtoend::Finished run(std::vector<std::string> arguments);
    endtoend::Finished runWithInput(const std::string& input, std::vector<std::string> arguments);
    endtoend::Finished runOnTerminal(const std::vector<std::string>& answers,
                                     std::vector<std::string> arguments);
    // Any program.
    endtoend::Finished runProgram(const std::vector<std::string>& command);

    // A server on the scratch root for the user `root` with that password.
    void serve(const Password& password, std::vector<std::string> more = {});
    void keep(const std::string& reply) { said_ += reply; }
    // With `url` instead of the scratch root.
    endtoend::Finished remote(std::vector<std::string> arguments, const std::string& url);
    endtoend::Finished wbemcli(const std::vector<std::string>& words);

    // A file for programs to read, which nobody looks into afterwards.
    std::string give(const std::string& name, const std::string& content) {
        return given_.write(name, content);
    }

    // The password is in nothing that was said, logged, traced or stored, and in no arguments or
    // environment of a program that was started. The server, if there was one, has ended then.
    void expectUnseen(const Password& password);
    // The hash field of an account; the account's password fits it.
    void expectPasswordOf(const std::string& account, const Password& password) const;

    const std::string& root() const { return root_; }
    endtoend::Server& server() { return *server_; }
    // What programs were started with.
    std::string starts() const;
    std::string logged() const;

    endtoend::Scratch scratch;

private:
    void setVariable(const char* name, const std::string& value);

    endtoend::Scratch given_;
    std::string root_;
    std::string said_;
    std::vector<std::pair<std::string, std::string>> before_; // of the environment
    std::unique_ptr<endtoend::Server> server_;
};

// The XML of a call of a method of ZANTH_Account with these arguments, all strings.
std::string methodCall(const std::string& method,
                       const std::vector<std::pair<std::string, std::string>>& arguments);

} // namespace qelo::secrets
