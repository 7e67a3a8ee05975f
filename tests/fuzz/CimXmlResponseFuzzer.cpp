// Answers in pieces of any size: nothing but CimError escapes, and the sizes of the pieces
// make no difference.
#include <cimxml/ResponseReader.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string>
#include <string_view>

namespace {

using namespace qelo;

void require(bool condition) {
    if (!condition) {
        std::abort();
    }
}

// What an answer amounts to, as far as it can be compared.
struct Summary {
    std::string results;
    bool failed = false;
    unsigned int code = 0;
    std::size_t outputs = 0;
};

cimxml::ResponseSinks sinksOf(Summary& summary) {
    cimxml::ResponseSinks sinks;
    const auto note = [&summary](const std::string& text) { summary.results += text + "\n"; };
    sinks.instance = [note](const cim::Instance& item) {
        note(item.path().toText(true));
        for (const auto& property : item.properties()) {
            note(property.name + "=" + property.value.toText());
        }
    };
    sinks.path = [note](const cim::ObjectPath& item) { note(item.toText(true)); };
    sinks.declaration = [note](const cim::Class& item) {
        note(item.name + ":" + item.superclass + " " + std::to_string(item.properties.size()) +
             " " + std::to_string(item.methods.size()));
    };
    sinks.className = note;
    sinks.qualifierType = [note](const cim::QualifierType& item) {
        note(item.name + " " + item.defaultValue.toText());
    };
    sinks.value = [note](const cim::Value& item) { note(item.toText()); };
    return sinks;
}

// `seed` chooses the pieces; 0: all at once.
Summary read(std::string_view text, std::uint32_t seed) {
    Summary summary;
    cimxml::XmlLimits limits = cimxml::ResponseReader::kLimits;
    limits.elements = 5000;
    cimxml::ResponseReader reader(sinksOf(summary), limits);
    try {
        while (!text.empty()) {
            seed = seed * 1664525 + (seed == 0 ? 0 : 1013904223);
            const std::size_t wanted = seed == 0 ? text.size() : 1 + (seed >> 16) % 40;
            const std::size_t length = std::min(wanted, text.size());
            reader.feed(text.substr(0, length));
            text.remove_prefix(length);
        }
        reader.finish();
        summary.outputs = reader.methodResult().out.size();
    } catch (const client::CimError& error) {
        summary.failed = true;
        summary.code = error.code();
        require(error.code() != 0);
    }
    return summary;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view text(reinterpret_cast<const char*>(data), size);
    const Summary whole = read(text, 0);
    const Summary pieces = read(text, size == 0 ? 1U : 1U + data[size - 1]);
    require(whole.results == pieces.results);
    require(whole.failed == pieces.failed && whole.code == pieces.code);
    require(whole.outputs == pieces.outputs);
    return 0;
}
