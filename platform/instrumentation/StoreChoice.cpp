#include "StoreChoice.h"

#include "AccountSource.h"
#include "NodeFileSource.h"
#include "Text.h"

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <list>
#include <mutex>

namespace qelo::nodes {

namespace {

constexpr const char* variable = "QELO_NODE_STORE";
constexpr const char* defaultChoice = "accounts:/";
constexpr std::size_t storesKept = 16;

// What a choice that names no store gives.
class NoSource : public Source {
public:
    explicit NoSource(std::string reason) : reason_(std::move(reason)) {}

    std::shared_ptr<const Snapshot> take() override {
        auto snapshot = std::make_shared<Snapshot>();
        snapshot->reports.push_back({variable, {}, reason_});
        snapshot->failAll(variable + (": " + reason_));
        return snapshot;
    }

private:
    std::string reason_;
};

// The part after a prefix, or nothing when the text has another prefix or no such part.
std::optional<std::string> partAfter(const std::string& prefix, const std::string& text) {
    const bool has = text.size() > prefix.size() && text.compare(0, prefix.size(), prefix) == 0;
    return has ? std::optional<std::string>(text.substr(prefix.size())) : std::nullopt;
}

std::unique_ptr<Source> makeSource(const std::string& choice, Files& files) {
    if (const auto root = partAfter("accounts:", choice)) {
        return std::make_unique<AccountSource>(std::filesystem::absolute(*root), files);
    }
    if (const auto path = partAfter("file:", choice)) {
        return std::make_unique<NodeFileSource>(std::filesystem::absolute(*path).string(), files);
    }
    return std::make_unique<NoSource>("\"" + printable(choice) +
                                      "\" is neither accounts:DIR nor file:PATH");
}

class Stores {
public:
    std::shared_ptr<NodeStore> get(const std::string& choice) {
        const std::lock_guard<std::mutex> lock(mutex_);
        const auto found = std::find_if(stores_.begin(), stores_.end(),
                                        [&](const Kept& kept) { return kept.first == choice; });
        if (found != stores_.end()) {
            stores_.splice(stores_.begin(), stores_, found);
        } else {
            stores_.emplace_front(choice, makeStore(choice, systemFiles()));
        }
        if (stores_.size() > storesKept) {
            stores_.pop_back();
        }
        return stores_.front().second;
    }

private:
    using Kept = std::pair<std::string, std::shared_ptr<NodeStore>>;
    std::mutex mutex_;
    std::list<Kept> stores_; // the last used first
};

} // namespace

std::shared_ptr<NodeStore> makeStore(const std::string& choice, Files& files) {
    return std::make_shared<NodeStore>(makeSource(choice, files), files);
}

std::shared_ptr<NodeStore> chosenStore() {
    static Stores stores;
    const char* value = ::secure_getenv(variable);
    return stores.get(value && *value != '\0' ? value : defaultChoice);
}

} // namespace qelo::nodes
