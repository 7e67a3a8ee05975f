// Stores that change between two populations of accounts while requests are at work.
//
// A request may find the one population or the other, whole; the two differ in every record,
// so that a mixture shows.
#pragma once

#include "MixedOperations.h"

#include <atomic>
#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <optional>
#include <string>

namespace qelo::test {

// By which readers know whether the store stood still during a request.
class Turns {
public:
    std::uint64_t now() const { return count_.load(); }
    void begin() { ++count_; }
    void end() { ++count_; }

    // The population that was there all the time between two looks at now(), if there was one.
    static std::optional<std::size_t> heldBetween(std::uint64_t first, std::uint64_t last) {
        const bool still = first == last && first % 2 == 0;
        return still ? std::optional<std::size_t>(first / 2 % 2) : std::nullopt;
    }

private:
    std::atomic<std::uint64_t> count_{0}; // odd while the store is changed
};

class ChangingStore {
public:
    ChangingStore() = default;
    virtual ~ChangingStore() = default;
    ChangingStore(const ChangingStore&) = delete;
    ChangingStore& operator=(const ChangingStore&) = delete;

    // For QELO_NODE_STORE.
    virtual std::string choice() const = 0;
    virtual Subjects subjects() const = 0;

    // How many states a reader may find: the two populations, and what lies between two files
    // that are replaced one after the other.
    virtual std::size_t states() const = 0;
    virtual void putState(std::size_t state) = 0;

    // From the other population to this one, in a way that depends on the turn. To be called
    // with 1, 2, 3 and so on, on a store in state 0; population turn % 2 is there afterwards.
    virtual void change(std::uint64_t turn) = 0;
};

// The account database in two directories that take each other's place at once, and in a
// third one whose files are replaced one by one, as account tools do it.
class ChangingAccounts : public ChangingStore {
public:
    explicit ChangingAccounts(std::filesystem::path root);

    std::string choice() const override { return "accounts:" + root_.native(); }
    Subjects subjects() const override;
    std::size_t states() const override { return 4; }
    void putState(std::size_t state) override;
    void change(std::uint64_t turn) override;

private:
    void fill(const std::string& directory, std::size_t passwd, std::size_t others) const;
    void show(const std::string& directory);
    void replace(const std::string& file, std::size_t population) const;

    std::filesystem::path root_;
};

// A node file that is renamed over, or reached through another link.
class ChangingNodeFile : public ChangingStore {
public:
    explicit ChangingNodeFile(std::filesystem::path directory);

    std::string choice() const override { return "file:" + file_.native(); }
    Subjects subjects() const override;
    std::size_t states() const override { return 2; }
    void putState(std::size_t state) override;
    void change(std::uint64_t turn) override;

private:
    std::filesystem::path directory_;
    std::filesystem::path file_;
};

} // namespace qelo::test
