#include "SecretsFixture.h"

#include "Terminal.h"

#include <crypt.h>
#include <cstdlib>
#include <fstream>
#include <sstream>

namespace qelo::secrets {
namespace {

using endtoend::Finished;

std::string contentOf(const std::filesystem::path& path) {
    std::ifstream file(path, std::ios::binary);
    std::ostringstream text;
    text << file.rdbuf();
    return text.str();
}

std::vector<std::string> with(std::vector<std::string> arguments,
                              const std::vector<std::string>& more) {
    arguments.insert(arguments.end(), more.begin(), more.end());
    return arguments;
}

} // namespace

Secrets::Secrets() : root_(scratch.path("root")) {
    const std::string config =
        scratch.write("logging.conf", "log = file:" + scratch.path("log") +
                                          "\nlog.level = 0\ntrace = file:" + scratch.path("trace") +
                                          "\ntrace.level = 0\n");
    std::filesystem::permissions(config, std::filesystem::perms(0600));
    setVariable("QELO_LOG_CONFIG", config);
    setVariable("QELO_RECORDED_STARTS", scratch.path("starts"));
    setVariable("LC_ALL", "C.UTF-8");
    setVariable("ASAN_OPTIONS", "verify_asan_link_order=0");
    setVariable("LD_PRELOAD", QELO_RECORDED_STARTS);
}

Secrets::~Secrets() {
    server_.reset();
    for (const auto& [name, value] : before_) {
        value.empty() ? unsetenv(name.c_str()) : setenv(name.c_str(), value.c_str(), 1);
    }
}

void Secrets::setVariable(const char* name, const std::string& value) {
    const char* const before = std::getenv(name);
    before_.emplace_back(name, before == nullptr ? "" : before);
    setenv(name, value.c_str(), 1);
}

void Secrets::SetUp() {
    ASSERT_EQ(runProgram(endtoend::qelosimCommand({"init-root", root_})).status, 0) << said_;
    ASSERT_EQ(run({"create-user", "alice"}).status, 0) << said_;
}

Finished Secrets::runProgram(const std::vector<std::string>& command) {
    Finished finished = endtoend::runProcess(command);
    said_ += finished.out + finished.err;
    return finished;
}

Finished Secrets::run(std::vector<std::string> arguments) {
    return runProgram(endtoend::qelosimCommand(with(std::move(arguments), {"--root", root_})));
}

Finished Secrets::runWithInput(const std::string& input, std::vector<std::string> arguments) {
    Finished finished = endtoend::runProcessWithInput(
        input, endtoend::qelosimCommand(with(std::move(arguments), {"--root", root_})));
    said_ += finished.out + finished.err;
    return finished;
}

Finished Secrets::runOnTerminal(const std::vector<std::string>& answers,
                                std::vector<std::string> arguments) {
    Finished finished = runAndAnswer(endtoend::qelosimCommand(std::move(arguments)), answers);
    said_ += finished.out;
    return finished;
}

Finished Secrets::remote(std::vector<std::string> arguments, const std::string& url) {
    return runProgram(endtoend::qelosimCommand(with(std::move(arguments), {"--url", url})));
}

Finished Secrets::wbemcli(const std::vector<std::string>& words) {
    return runProgram(with({"wbemcli"}, words));
}

void Secrets::serve(const Password& password, std::vector<std::string> more) {
    const std::string users = give("users", endtoend::userLine("root", password.text()));
    server_ = std::make_unique<endtoend::Server>(
        with(std::move(more), {"--user-file", users, "--root", root_}));
    ASSERT_NE(server_->url(), "") << server_->errors();
}

std::string Secrets::starts() const { return contentOf(scratch.path("starts")); }

std::string Secrets::logged() const {
    return contentOf(scratch.path("log")) + contentOf(scratch.path("trace"));
}

void Secrets::expectUnseen(const Password& password) {
    if (server_) {
        EXPECT_EQ(server_->stop(), 0);
        said_ += server_->errors();
        server_.reset();
    }
    EXPECT_EQ(password.formsIn(said_), "") << said_;
    for (const auto& entry : std::filesystem::recursive_directory_iterator(scratch.path())) {
        if (entry.is_regular_file()) {
            EXPECT_EQ(password.formsIn(contentOf(entry.path())), "") << entry.path();
        }
        EXPECT_EQ(password.formsIn(entry.path().string()), "") << entry.path();
    }
}

void Secrets::expectPasswordOf(const std::string& account, const Password& password) const {
    std::istringstream lines(contentOf(root_ + "/etc/shadow"));
    for (std::string line; std::getline(lines, line);) {
        if (line.compare(0, account.size() + 1, account + ":") == 0) {
            const std::string hash = line.substr(
                account.size() + 1, line.find(':', account.size() + 1) - account.size() - 1);
            crypt_data data = {};
            const char* const made = crypt_r(password.text().c_str(), hash.c_str(), &data);
            EXPECT_EQ(made == nullptr ? "" : std::string(made), hash) << account;
            return;
        }
    }
    ADD_FAILURE() << "no account " << account;
}

std::string methodCall(const std::string& method,
                       const std::vector<std::pair<std::string, std::string>>& arguments) {
    std::string text = R"(<?xml version="1.0" encoding="utf-8"?><CIM CIMVERSION="2.0" )"
                       R"(DTDVERSION="2.0"><MESSAGE ID="1" PROTOCOLVERSION="1.0"><SIMPLEREQ>)"
                       "<METHODCALL NAME=\"" +
                       method +
                       R"("><LOCALCLASSPATH><LOCALNAMESPACEPATH><NAMESPACE NAME="root"/>)"
                       R"(<NAMESPACE NAME="cimv2"/></LOCALNAMESPACEPATH>)"
                       R"(<CLASSNAME NAME="ZANTH_Account"/></LOCALCLASSPATH>)";
    for (const auto& [name, value] : arguments) {
        text.append("<PARAMVALUE NAME=\"").append(name);
        text.append("\" PARAMTYPE=\"string\"><VALUE>").append(value);
        text.append("</VALUE></PARAMVALUE>");
    }
    return text + "</METHODCALL></SIMPLEREQ></MESSAGE></CIM>\n";
}

} // namespace qelo::secrets
