#include "NodeHandler.h"

#include "Text.h"

#include <charconv>
#include <limits>

namespace qelo::nodes {

namespace {

constexpr std::size_t longestQuote = 200;

// Part of the document for an error text.
std::string quote(const std::string& text) {
    const bool cut = text.size() > longestQuote;
    return "\"" + printable(text.substr(0, longestQuote)) + (cut ? "...\"" : "\"");
}

// A number in plain decimal form: no sign, no leading zeros.
std::optional<int> propertyNumber(const std::string& name) {
    int number = 0;
    const char* end = name.data() + name.size();
    const auto result = std::from_chars(name.data(), end, number);
    const bool plain = result.ec == std::errc() && result.ptr == end && number >= 0 &&
                       std::to_string(number) == name;
    return plain ? std::optional<int>(number) : std::nullopt;
}

} // namespace

std::string NodeHandler::where() const {
    std::string text = "node " + std::to_string(index_);
    switch (place_) {
    case Place::document:
    case Place::topMember:
    case Place::nodesValue:
    case Place::done:
        return "document";
    case Place::propertyValue:
    case Place::list:
        return text + (path_ ? " " + quote(*path_) : "") + ", property " +
               std::to_string(property_);
    default:
        return text + (path_ ? " " + quote(*path_) : "");
    }
}

bool NodeHandler::refuse(const std::string& what) {
    result_.error = where() + ": " + what;
    return false;
}

bool NodeHandler::refuseValue(const char* what) {
    switch (place_) {
    case Place::document:
        return refuse("an object is needed, not " + std::string(what));
    case Place::nodesValue:
        return refuse("\"nodes\" has to be a list, not " + std::string(what));
    case Place::nodeList:
        return refuse("has to be an object, not " + std::string(what));
    case Place::typeValue:
        return refuse("\"type\" has to be a whole number from 0 to 2147483647, not " +
                      std::string(what));
    case Place::pathValue:
        return refuse("\"path\" has to be a text, not " + std::string(what));
    case Place::propertiesValue:
        return refuse("\"properties\" has to be an object, not " + std::string(what));
    default:
        return refuse("a value cannot be " + std::string(what));
    }
}

bool NodeHandler::null() { return refuseValue("null"); }

bool NodeHandler::boolean(bool) { return refuseValue("true or false"); }

bool NodeHandler::number_integer(number_integer_t) { return refuseValue("a negative number"); }

bool NodeHandler::number_float(number_float_t, const string_t&) {
    return refuseValue("a number with a fraction or exponent, or one that is too large");
}

bool NodeHandler::binary(binary_t&) { return refuseValue("binary data"); }

bool NodeHandler::number_unsigned(number_unsigned_t value) {
    if (place_ == Place::typeValue) {
        if (value > static_cast<number_unsigned_t>(std::numeric_limits<int>::max())) {
            return refuseValue("a larger number");
        }
        type_ = static_cast<int>(value);
        place_ = Place::nodeMember;
        return true;
    }
    if (place_ != Place::propertyValue && place_ != Place::list) {
        return refuseValue("a number");
    }
    if (value > std::numeric_limits<unsigned int>::max()) {
        return refuseValue("a number above 4294967295");
    }
    return addValue(static_cast<unsigned int>(value));
}

bool NodeHandler::string(string_t& value) {
    if (place_ == Place::pathValue) {
        path_ = std::move(value);
        place_ = Place::nodeMember;
        return true;
    }
    if (place_ == Place::propertyValue || place_ == Place::list) {
        return addValue(std::move(value));
    }
    return refuseValue("a text");
}

template <class T> bool NodeHandler::addValue(T value) {
    if (place_ == Place::list) {
        return addToList(std::move(value));
    }
    properties_.add(property_, value);
    place_ = Place::propertyName;
    return true;
}

template <class T> bool NodeHandler::addToList(T value) {
    if (std::holds_alternative<EmptyList>(list_)) {
        list_ = std::vector<T>();
    }
    auto* elements = std::get_if<std::vector<T>>(&list_);
    if (!elements) {
        return refuse("a list has to be of numbers or of texts, not of both");
    }
    elements->push_back(std::move(value));
    return true;
}

void NodeHandler::addList() {
    if (const auto* numbers = std::get_if<std::vector<unsigned int>>(&list_)) {
        properties_.add(property_, *numbers);
    } else if (const auto* texts = std::get_if<std::vector<std::string>>(&list_)) {
        properties_.add(property_, *texts);
    } else {
        properties_.addEmptyList(property_);
    }
    list_ = EmptyList();
}

bool NodeHandler::start_object(std::size_t) {
    switch (place_) {
    case Place::document:
        place_ = Place::topMember;
        return true;
    case Place::nodeList:
        beginNode();
        return true;
    case Place::propertiesValue:
        place_ = Place::propertyName;
        return true;
    default:
        return refuseValue("an object");
    }
}

bool NodeHandler::key(string_t& name) {
    switch (place_) {
    case Place::topMember:
        if (name != "nodes") {
            return refuse("unknown member " + quote(name));
        }
        if (hasNodes_) {
            return refuse("\"nodes\" is given twice");
        }
        hasNodes_ = true;
        place_ = Place::nodesValue;
        return true;
    case Place::nodeMember:
        return acceptNodeMember(name);
    default:
        return acceptPropertyName(name);
    }
}

bool NodeHandler::acceptNodeMember(const std::string& name) {
    const bool twice = (name == "type" && type_) || (name == "path" && path_) ||
                       (name == "properties" && hasProperties_);
    if (twice) {
        return refuse(quote(name) + " is given twice");
    }
    if (name == "type") {
        place_ = Place::typeValue;
    } else if (name == "path") {
        place_ = Place::pathValue;
    } else if (name == "properties") {
        hasProperties_ = true;
        place_ = Place::propertiesValue;
    } else {
        return refuse("unknown member " + quote(name));
    }
    return true;
}

bool NodeHandler::acceptPropertyName(const std::string& name) {
    const auto number = propertyNumber(name);
    if (!number) {
        return refuse("a property is named by a decimal number, not " + quote(name));
    }
    property_ = *number;
    place_ = Place::propertyValue;
    return true;
}

bool NodeHandler::end_object() {
    switch (place_) {
    case Place::topMember:
        if (!hasNodes_) {
            return refuse("\"nodes\" is missing");
        }
        place_ = Place::done;
        return true;
    case Place::nodeMember:
        return finishNode();
    default: // the properties
        place_ = Place::nodeMember;
        return properties_.seal() || refuse("a property is given twice");
    }
}

bool NodeHandler::start_array(std::size_t) {
    switch (place_) {
    case Place::nodesValue:
        place_ = Place::nodeList;
        return true;
    case Place::propertyValue:
        list_ = EmptyList();
        place_ = Place::list;
        return true;
    default:
        return refuseValue("a list");
    }
}

bool NodeHandler::end_array() {
    if (place_ == Place::list) {
        addList();
        place_ = Place::propertyName;
    } else {
        place_ = Place::topMember;
    }
    return true;
}

void NodeHandler::beginNode() {
    place_ = Place::nodeMember;
    type_.reset();
    path_.reset();
    hasProperties_ = false;
    properties_ = Properties();
}

bool NodeHandler::finishNode() {
    if (!type_) {
        return refuse("\"type\" is missing");
    }
    if (!path_) {
        return refuse("\"path\" is missing");
    }
    result_.nodes.emplace_back(*type_, Node(std::move(*path_), std::move(properties_)));
    path_.reset();
    ++index_;
    place_ = Place::nodeList;
    return true;
}

bool NodeHandler::parse_error(std::size_t position, const std::string&,
                              const nlohmann::detail::exception& error) {
    // The library's text may quote the document at any length.
    return refuse("not JSON in UTF-8 at byte " + std::to_string(position) + ": " +
                  quote(error.what()));
}

NodeDocument NodeHandler::finish(bool complete) {
    if (!complete && !result_.error) {
        result_.error = "not a node document";
    }
    if (result_.error) {
        result_.nodes.clear();
    }
    return std::move(result_);
}

} // namespace qelo::nodes
