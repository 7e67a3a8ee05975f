// Node files: read or refused with a text for the log, and what was read is written in another
// form and reads as the same nodes.
#include "FuzzInput.h"

#include <NodeFile.h>
#include <Text.h>

#include <nlohmann/json.hpp>

namespace {

using namespace qelo::nodes;
using qelo::fuzz::require;

// The value of a property in JSON; it reads as one type only, an empty list as both.
nlohmann::json valueOf(const Node& node, int id) {
    std::string text;
    unsigned int number = 0;
    std::vector<unsigned int> numbers;
    std::vector<std::string> texts;
    const bool isText = node.read(id, text);
    const bool isNumber = node.read(id, number);
    const bool isNumbers = node.read(id, numbers);
    const bool isTexts = node.read(id, texts);
    require(isText + isNumber + isNumbers + isTexts == (isNumbers && isTexts ? 2 : 1));
    require(!isNumbers || !isTexts || (numbers.empty() && texts.empty()));
    if (isText) {
        return text;
    }
    if (isNumber) {
        return number;
    }
    return isNumbers ? nlohmann::json(numbers) : nlohmann::json(texts);
}

// The document without limits of its own, as a reference. Its numbers of properties are those
// that the nodes have to have.
nlohmann::json written(const NodeDocument& document, const nlohmann::json& reference) {
    nlohmann::json list = nlohmann::json::array();
    std::size_t index = 0;
    for (const auto& [type, node] : document.nodes) {
        nlohmann::json item = {{"type", type}, {"path", node.path()}};
        const nlohmann::json& model = reference.at("nodes").at(index++);
        if (model.contains("properties")) {
            item["properties"] = nlohmann::json::object();
            for (const auto& [name, value] : model.at("properties").items()) {
                const int id = std::stoi(name);
                require(node.has(id));
                item["properties"][name] = valueOf(node, id);
            }
        }
        list.push_back(std::move(item));
    }
    return {{"nodes", std::move(list)}};
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string text(qelo::fuzz::viewOf(data, size));
    const NodeDocument document = parseNodes(text);
    if (document.error) {
        require(document.nodes.empty() && !document.error->empty());
        require(document.error->size() < 1500 && printable(*document.error) == *document.error);
        return 0;
    }
    const nlohmann::json reference = nlohmann::json::parse(text, nullptr, false);
    require(!reference.is_discarded());
    require(written(document, reference) == reference);
    return 0;
}
