// The log and trace of this process, whose configuration changes while lines are written.
#pragma once

#include <cstddef>
#include <filesystem>
#include <string>
#include <vector>

namespace qelo::test {

// There is one, as the logger reads its configuration from one place in the life of a process.
class ChangingLog {
public:
    // To be called before anything is logged.
    static ChangingLog& instance();

    // Logs nothing, as before the first turn.
    void silence();

    // The next configuration: everything traced, some of it, nothing, and so on; written over
    // the old one or in its place. Moves the files away that lines are being written to, as
    // log rotation does, and looks through those that no line can come to any more.
    void turn();

    // Looks through everything that is left, and removes it. No thread may be at work.
    void finish();

    std::size_t lines() const { return lines_; }
    // Lines that are not one whole line of the logger.
    const std::vector<std::string>& faulty() const { return faulty_; }

private:
    ChangingLog();
    ~ChangingLog();

    void configure(const std::string& text, bool inPlace);
    void rotate();
    void lookThrough(const std::filesystem::path& file);

    std::filesystem::path directory_;
    std::size_t turns_ = 0;
    std::size_t lines_ = 0;
    std::vector<std::string> faulty_;
};

} // namespace qelo::test
