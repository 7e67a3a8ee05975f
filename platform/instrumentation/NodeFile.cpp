#include "NodeFile.h"

#include "NodeHandler.h"

namespace qelo::nodes {

NodeDocument parseNodes(const std::string& text) {
    NodeHandler handler;
    const bool complete = nlohmann::json::sax_parse(text, &handler);
    return handler.finish(complete);
}

} // namespace qelo::nodes
