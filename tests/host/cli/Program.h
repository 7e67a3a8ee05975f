// Runs the program on a fake object manager.
#pragma once

#include "FakeConnection.h"
#include "Printing.h"
#include "RecordingOutput.h"

#include <cli/Application.h>
#include <cli/ExitStatus.h>

#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <vector>

namespace qelo::cli {

class Program : public ::testing::Test {
protected:
    int run(const std::vector<std::string>& arguments) {
        std::vector<const char*> pointers = {"qelosim"};
        for (const std::string& argument : arguments) {
            pointers.push_back(argument.c_str());
        }
        const auto connect = [this](const Options& options) {
            options_ = options;
            return std::make_unique<FakeConnection>(manager);
        };
        return runApplication(static_cast<int>(pointers.size()), pointers.data(),
                              {connect, output, errors, furtherCommands, groupIds, refusalReason});
    }

    // The options that reached the object manager.
    const Options& options() const { return options_; }

    FakeManager manager;
    RecordingOutput output;
    RecordingOutput errors;
    std::vector<std::function<void(CLI::App&, Invocation&)>> furtherCommands;
    GroupIds groupIds;
    RefusalReason refusalReason;

private:
    Options options_;
};

inline cim::Instance accountInstance(const std::string& name, const std::string& fullName,
                                     unsigned int number, unsigned int state) {
    using cim::Type;
    using cim::Value;
    cim::ObjectPath path("root/cimv2", "ZANTH_Account");
    path.setKey("CreationClassName", Value::string("ZANTH_Account"));
    path.setKey("Name", Value::string(name));
    cim::Instance instance(path);
    instance.setProperty("Name", Value::string(name));
    instance.setProperty("Description", Value::string(fullName));
    instance.setProperty("FullName", Value::string(""));
    instance.setProperty("GroupId", Value::unsignedInteger(Type::UInt32, number));
    instance.setProperty("UserID", Value::string(std::to_string(number)));
    instance.setProperty("EnabledState", Value::unsignedInteger(Type::UInt16, state));
    instance.setProperty("HomeDirectory", Value::string("/home/" + name));
    instance.setProperty("ScriptPath", Value::string("/bin/bash"));
    return instance;
}

} // namespace qelo::cli
