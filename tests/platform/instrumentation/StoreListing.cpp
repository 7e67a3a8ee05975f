#include "StoreListing.h"

#include <stdexcept>

namespace qelo::nodes::tests {

using namespace Tesk::NodeLexicon;

std::vector<std::string> namesOf(const std::shared_ptr<NodeStore>& store, int type) {
    std::vector<std::string> names;
    NodeCursor cursor(store);
    for (cursor.select(type); cursor.valid(); cursor.advance()) {
        std::string name = "(none)";
        cursor.read(Name, name);
        names.push_back(name);
    }
    return names;
}

NodeCursor cursorOn(const std::shared_ptr<NodeStore>& store, int type, const std::string& name) {
    NodeCursor cursor(store);
    std::string found;
    for (cursor.select(type); cursor.valid(); cursor.advance()) {
        if (cursor.read(Name, found) && found == name) {
            break;
        }
    }
    return cursor;
}

std::optional<std::string> accountText(const std::shared_ptr<NodeStore>& store,
                                       const std::string& name, int id) {
    std::string value;
    return cursorOn(store, UserAccount, name).read(id, value) ? std::optional(value) : std::nullopt;
}

std::optional<unsigned int> accountNumber(const std::shared_ptr<NodeStore>& store,
                                          const std::string& name, int id) {
    unsigned int value = 0;
    return cursorOn(store, UserAccount, name).read(id, value) ? std::optional(value) : std::nullopt;
}

std::shared_ptr<NodeStore> storeOf(const ScratchRoot& root) {
    return makeStore(root.choice(), systemFiles());
}

std::string errorOf(const std::function<void()>& action) {
    try {
        action();
    } catch (const std::runtime_error& error) {
        return error.what();
    }
    return {};
}

} // namespace qelo::nodes::tests
