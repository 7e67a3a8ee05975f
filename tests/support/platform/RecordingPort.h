// The side of the recording platform that its five libraries use. Not for tests.
#pragma once

#include "RecordingPlatform.h"

#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace qelo::test {

// What one Tesk::Instrumentation stands on. Guarded by the platform's lock.
struct CursorState {
    unsigned int number = 0;
    std::vector<std::shared_ptr<StoreNode>> selection{};
    std::size_t position = 0;

    StoreNode* node() const {
        return position < selection.size() ? selection[position].get() : nullptr;
    }
};

class QELO_PLATFORM_API RecordingPort {
public:
    using NodeType = Tesk::NodeLexicon::NodeType;
    using Properties = Tesk::NodeLexicon::Properties;

    // The store. Each is one call: it counts it, records it and applies a fault set for it.
    static void open(CursorState& cursor);
    static void close(CursorState& cursor);
    static bool select(CursorState& cursor, NodeType type);
    static bool narrow(CursorState& cursor, int kind, const std::string& path);
    static bool valid(CursorState& cursor);
    static void advance(CursorState& cursor);
    // `wanted` has the alternative that is asked for. Nothing when the property is absent.
    static std::optional<PropertyValue> read(CursorState& cursor, Properties id,
                                             const PropertyValue& wanted);
    static bool write(CursorState& cursor, Properties id, const PropertyValue& value);
    static std::string path(CursorState& cursor);
    static std::string printablePath(CursorState& cursor, const std::string& path);
    static unsigned int size(CursorState& cursor);

    // The other libraries, to each of which a fault may be set as well.
    static void buffer(); // a message buffer is made
    static void line(LogLine line);
    static std::string narrow(std::string text);
    static std::string systemName();
    // What the next comparison is to answer, if a test has said so.
    static std::optional<bool> scriptedComparison();
    static void pathsCompared(PathComparison comparison);
    static std::string language();
    static std::wstring library(unsigned long number, const std::string& language);
    static std::wstring text(const std::wstring& library, const std::wstring& id);
    static bool inputAccepted(const std::string& value, const std::string& extra);
};

} // namespace qelo::test
