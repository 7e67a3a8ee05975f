#include "RecordingState.h"

#include <algorithm>
#include <stdexcept>

namespace qelo::test {

namespace {

const char* typeName(const PropertyValue& value) {
    static constexpr const char* names[] = {"string", "uint32", "uint32 list", "string list"};
    return names[value.index()];
}

std::string print(const std::string& value) { return value; }
std::string print(unsigned int value) { return std::to_string(value); }

template <class Element> std::string print(const std::vector<Element>& list) {
    std::string text = "[";
    for (const Element& element : list) {
        text += (text.size() > 1 ? "," : "") + print(element);
    }
    return text + "]";
}

std::string printed(const PropertyValue& value) {
    return std::visit([](const auto& held) { return print(held); }, value);
}

// One call of the store: counted, subjected to the fault plan and recorded with its result.
class Call {
public:
    Call(RecordingPlatform::State& state, const CursorState& cursor, const char* operation)
        : state_(state), cursor_(cursor.number), operation_(operation) {}

    // True when the call is to answer false. Throws when it is to throw.
    template <class Arguments> bool refused(Arguments arguments) {
        if (state_.records.on) {
            text_ = operation_ + arguments();
        }
        const std::optional<StoreFault> fault = state_.faults.next(operation_);
        if (!fault || *fault == StoreFault::ReturnsFalse) {
            return fault.has_value();
        }
        done([] { return "->threw"; });
        if (*fault == StoreFault::ThrowsForeign) {
            throw ForeignFailure{};
        }
        throw std::runtime_error(storeFailureText);
    }

    template <class Result> void done(Result result) {
        if (state_.records.on) {
            state_.records.add({cursor_, operation_, text_ + result()});
        }
    }
    void done() {
        done([] { return ""; });
    }

private:
    RecordingPlatform::State& state_;
    unsigned int cursor_;
    std::string operation_;
    std::string text_;
};

std::string noArguments() { return "()"; }
std::string outcome(bool result) { return result ? "->1" : "->0"; }

bool liesUnder(const StoreNode& node, const std::string& parent) {
    return node.path.compare(0, parent.size() + 1, parent + "/") == 0;
}

std::optional<PropertyValue> entryCount(const StoreModel& store, const StoreNode& node) {
    const auto scripted = store.entryCounts.find(node.type);
    if (scripted != store.entryCounts.end()) {
        return scripted->second ? std::optional<PropertyValue>(*scripted->second) : std::nullopt;
    }
    const auto ofType = std::count_if(store.nodes.begin(), store.nodes.end(),
                                      [&](const auto& other) { return other->type == node.type; });
    return static_cast<unsigned int>(ofType);
}

std::optional<PropertyValue> find(const StoreModel& store, const StoreNode* node,
                                  Tesk::NodeLexicon::Properties id) {
    if (node == nullptr) {
        return std::nullopt;
    }
    const auto found = node->properties.find(id);
    if (found != node->properties.end()) {
        return found->second;
    }
    if (id == Tesk::NodeLexicon::EntryCount) {
        return entryCount(store, *node);
    }
    return std::nullopt;
}

bool store(RecordingPlatform::State& state, StoreNode* node, Tesk::NodeLexicon::Properties id,
           const PropertyValue& value) {
    const bool accepted = node != nullptr && state.store.refused.count(id) == 0;
    const bool command =
        id == Tesk::NodeLexicon::AdminCommand && std::holds_alternative<std::string>(value);
    if (command) {
        state.records.commands.push_back(std::get<std::string>(value));
    }
    if (accepted && command) {
        node->properties.erase(id);
        if (state.store.commandStatus) {
            node->properties[id] = *state.store.commandStatus;
        }
    } else if (accepted) {
        node->properties[id] = value;
    }
    return accepted;
}

std::string quoted(const PropertyValue& value) {
    return std::holds_alternative<std::string>(value) ? "\"" + printed(value) + "\""
                                                      : printed(value);
}

} // namespace

void RecordingPort::open(CursorState& cursor) {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    cursor.number = ++state.store.cursorsOpened;
    Call call(state, cursor, "Instrumentation");
    call.refused(noArguments);
    ++state.store.cursorsOpen;
    call.done();
}

void RecordingPort::close(CursorState& cursor) {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    --state.store.cursorsOpen;
    if (state.records.on) {
        state.records.add({cursor.number, "~Instrumentation", "~Instrumentation()"});
    }
}

bool RecordingPort::select(CursorState& cursor, NodeType type) {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    Call call(state, cursor, "selectNode");
    cursor.position = 0;
    cursor.selection.clear();
    if (!call.refused([&] { return "(" + std::to_string(type) + ")"; })) {
        std::copy_if(state.store.nodes.begin(), state.store.nodes.end(),
                     std::back_inserter(cursor.selection),
                     [type](const auto& node) { return node->type == type; });
    }
    call.done();
    return cursor.node() != nullptr;
}

bool RecordingPort::narrow(CursorState& cursor, int kind, const std::string& path) {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    Call call(state, cursor, "setFilter");
    const bool refused =
        call.refused([&] { return "(" + std::to_string(kind) + "," + path + ")"; });
    auto& selection = cursor.selection;
    selection.erase(
        std::remove_if(selection.begin(), selection.end(),
                       [&](const auto& node) { return refused || !liesUnder(*node, path); }),
        selection.end());
    cursor.position = 0;
    call.done();
    return cursor.node() != nullptr;
}

bool RecordingPort::valid(CursorState& cursor) {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    Call call(state, cursor, "operator bool");
    const bool result = !call.refused(noArguments) && cursor.node() != nullptr;
    call.done([&] { return outcome(result); });
    return result;
}

void RecordingPort::advance(CursorState& cursor) {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    Call call(state, cursor, "operator++");
    cursor.position = call.refused(noArguments) ? cursor.selection.size() : cursor.position + 1;
    call.done();
}

std::optional<PropertyValue> RecordingPort::read(CursorState& cursor, Properties id,
                                                 const PropertyValue& wanted) {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    Call call(state, cursor, "getProperty");
    std::optional<PropertyValue> value;
    if (!call.refused([&] { return "(" + std::to_string(id) + "," + typeName(wanted) + ")"; })) {
        value = find(state.store, cursor.node(), id);
    }
    if (value && value->index() != wanted.index()) {
        value.reset();
    }
    call.done([&] { return "->" + (value ? printed(*value) : "absent"); });
    return value;
}

bool RecordingPort::write(CursorState& cursor, Properties id, const PropertyValue& value) {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    Call call(state, cursor, "setProperty");
    const bool refused =
        call.refused([&] { return "(" + std::to_string(id) + "," + quoted(value) + ")"; });
    const bool result = store(state, refused ? nullptr : cursor.node(), id, value);
    call.done([&] { return outcome(result); });
    return result;
}

std::string RecordingPort::path(CursorState& cursor) {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    Call call(state, cursor, "getPathToNode");
    const StoreNode* node = call.refused(noArguments) ? nullptr : cursor.node();
    std::string result = node != nullptr ? node->path : "";
    call.done([&] { return "->" + result; });
    return result;
}

std::string RecordingPort::printablePath(CursorState& cursor, const std::string& path) {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    Call call(state, cursor, "convertPathToString");
    const bool refused = call.refused([&] { return "(" + path + ")"; });
    std::string result = refused ? "" : "node:" + path;
    call.done([&] { return "->" + result; });
    return result;
}

unsigned int RecordingPort::size(CursorState& cursor) {
    auto& state = *RecordingPlatform::instance().state_;
    std::lock_guard lock(state.mutex);
    Call call(state, cursor, "getNodeSize");
    const auto result =
        call.refused(noArguments) ? 0U : static_cast<unsigned int>(cursor.selection.size());
    call.done([&] { return "->" + std::to_string(result); });
    return result;
}

} // namespace qelo::test
