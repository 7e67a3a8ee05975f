// Files in memory, with failures and time at the test's will.
#pragma once

#include "Files.h"

#include <functional>
#include <map>
#include <string>

namespace qelo::nodes::tests {

class FakeFiles : public Files {
public:
    FakeFiles();

    // Puts a file in place of what was there, old enough to be trusted.
    void put(const std::string& path, const std::string& content);
    // Changes a file so that its stamp does not tell.
    void changeUnseen(const std::string& path, const std::string& content);
    // The last change of a file, by the fake clock.
    void setChanged(const std::string& path, std::int64_t nanoseconds);
    // From now on reading fails with an errno value, 0 for success; looking still succeeds.
    void failRead(const std::string& path, int error);
    void remove(const std::string& path);

    FileStamp stamp(const std::string& path) override;
    FileContent read(const std::string& path, std::size_t limit) override;
    std::vector<std::string> list(const std::string& directory) override;
    std::int64_t now() override { return time; }

    std::int64_t time;
    std::function<void(const std::string& path)> afterRead; // called when a file was read
    std::map<std::string, int> reads;

private:
    struct File {
        FileStamp stamp;
        int readError = 0;
        std::string content;
    };
    std::map<std::string, File> files_;
    std::uint64_t lastInode_ = 1;
};

} // namespace qelo::nodes::tests
