// What users type after a command: taken, or refused with UsageError.
#include "FuzzInput.h"

#include <cli/Arguments.h>
#include <cli/CommandContext.h>

#include <algorithm>

namespace {

using namespace qelo::cli;
using qelo::cim::ObjectPath;
using qelo::fuzz::require;

template <class Take> void takeOrRefuse(Take take) {
    try {
        take();
    } catch (const UsageError& error) {
        require(*error.what() != '\0');
    }
}

void checkPath(const std::string& text, const Options& options) {
    takeOrRefuse([&] {
        const ObjectPath path = anyPathOf(text, options);
        require(!path.nameSpace().empty());
        const bool isInstance = !path.keys().empty();
        require((isInstance ? instancePathOf(text, options) : classPathOf(text, options)) == path);
    });
    takeOrRefuse([&] { require(!instancePathOf(text, options).keys().empty()); });
    takeOrRefuse([&] { require(classPathOf(text, options).keys().empty()); });
}

void checkArguments(const std::vector<std::string>& texts) {
    takeOrRefuse([&] {
        const auto arguments = methodArgumentsOf(texts);
        require(arguments.size() == texts.size());
        for (std::size_t i = 0; i < texts.size(); ++i) {
            const auto& [name, value] = arguments[i];
            require(isName(name) && texts[i].compare(0, name.size(), name) == 0);
            require(!value.isNull() && !value.isArray());
            require(value.type() != qelo::cim::Type::String ||
                    texts[i].size() > value.asString().size());
        }
    });
    takeOrRefuse([&] {
        const auto list = propertyListOf(true, texts);
        require(list && list->size() <= texts.size());
        require(std::all_of(list->begin(), list->end(), isName));
    });
}

// Nothing is lost or added; only the two-letter options are written out.
void checkSpelledOut(const std::vector<std::string>& texts) {
    std::vector<const char*> given{"qelosim"};
    for (const std::string& text : texts) {
        given.push_back(text.c_str());
    }
    const auto result = spelledOut(static_cast<int>(given.size()), given.data());
    require(result.size() == texts.size());
    for (std::size_t i = 0; i < result.size(); ++i) {
        require(result[i] == texts[i].substr(0, texts[i].find('\0')) ||
                result[i].compare(0, 2, "--") == 0);
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    std::string_view text = qelo::fuzz::viewOf(data, size);
    std::vector<std::string> lines;
    Options options;
    checkPath(std::string(text), options);
    while (!text.empty() && lines.size() < 64) {
        lines.emplace_back(qelo::fuzz::takePart(text, '\n'));
    }
    checkArguments(lines);
    checkSpelledOut(lines);
    return 0;
}
