// Small stores for the stand-alone platform to read, with something to serve for each provider.
#pragma once

#include <cstddef>
#include <filesystem>
#include <ostream>
#include <string>
#include <vector>

namespace qelo::test {

// The libraries of the platform whose allocations are swept: the node store with its commands,
// and those that make and look at texts.
std::vector<std::string> platformLibraries();

class SweptStore {
public:
    enum class Kind { Accounts, NodeFile };

    // Writes the store's files into a directory that is there, and waits until the platform
    // will trust what it has read of them.
    SweptStore(Kind kind, const std::filesystem::path& directory);

    // From now on the process asks this store.
    void choose() const;

    // The platform knows what is in the account database below `root`, and trusts it, when it is
    // asked next; for long enough that it will not read again unless something changes.
    static void makeKnown(const std::filesystem::path& root);
    // The platform forgets what it knows of this store and of all others. It has kept as many
    // blocks afterwards as it had before.
    static void forget();

private:
    std::string choice_;
};

inline void PrintTo(SweptStore::Kind kind, std::ostream* stream) {
    *stream << (kind == SweptStore::Kind::Accounts ? "Accounts" : "NodeFile");
}

} // namespace qelo::test
