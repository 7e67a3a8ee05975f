// Takes the events of a JSON parser and builds nodes, refusing at once what does not belong
// to the form described in NodeFile.h. Without a document tree in between, hostile input
// costs no more memory than the nodes that it holds.
#pragma once

#include "NodeFile.h"

#include <nlohmann/json.hpp>

#include <variant>

namespace qelo::nodes {

class NodeHandler : public nlohmann::json_sax<nlohmann::json> {
public:
    bool null() override;
    bool boolean(bool value) override;
    bool number_integer(number_integer_t value) override;
    bool number_unsigned(number_unsigned_t value) override;
    bool number_float(number_float_t value, const string_t& text) override;
    bool string(string_t& value) override;
    bool binary(binary_t& value) override;
    bool start_object(std::size_t elements) override;
    bool key(string_t& name) override;
    bool end_object() override;
    bool start_array(std::size_t elements) override;
    bool end_array() override;
    bool parse_error(std::size_t position, const std::string& token,
                     const nlohmann::detail::exception& error) override;

    // The result, once the parser has returned. `complete` is what the parser returned.
    NodeDocument finish(bool complete);

private:
    // Where the parser stands: within which value, or before the value of which member.
    enum class Place {
        document,
        topMember,
        nodesValue,
        nodeList,
        nodeMember,
        typeValue,
        pathValue,
        propertiesValue,
        propertyName,
        propertyValue,
        list,
        done,
    };

    bool refuse(const std::string& what);
    bool refuseValue(const char* what);
    std::string where() const;
    // A list is of the kind of its first element.
    struct EmptyList {};
    using List = std::variant<EmptyList, std::vector<unsigned int>, std::vector<std::string>>;

    template <class T> bool addValue(T value);
    template <class T> bool addToList(T value);
    void addList();
    bool acceptPropertyName(const std::string& name);
    bool acceptNodeMember(const std::string& name);
    bool finishNode();
    void beginNode();

    Place place_ = Place::document;
    NodeDocument result_;
    std::size_t index_ = 0;
    std::optional<int> type_;
    std::optional<std::string> path_;
    bool hasProperties_ = false;
    bool hasNodes_ = false;
    Properties properties_;
    int property_ = 0;
    List list_;
};

} // namespace qelo::nodes
