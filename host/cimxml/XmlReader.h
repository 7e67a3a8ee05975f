// XML into a tree of elements, piece by piece, for documents from strangers: UTF-8 only, no
// document type declaration, no entities but the five of XML, and never more in memory than
// the limits allow. Prefixes of namespaces are cut off.
#pragma once

#include "Element.h"

#include <cstddef>
#include <cstdint>
#include <exception>
#include <functional>
#include <memory>
#include <stdexcept>
#include <string_view>
#include <vector>

struct XML_ParserStruct;

namespace qelo::cimxml {

// What XML itself forbids, and documents that end too early.
class NotWellFormed : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

struct XmlLimits {
    std::size_t depth = 64;         // elements inside each other, outer documents included
    std::size_t elements = 200'000; // in memory at the same time
    std::size_t bytes = SIZE_MAX;   // of names, attributes and text in memory
    std::size_t depthOutside = 0;   // how deep this document stands inside another one
};

class XmlReader {
public:
    // Sees each element as soon as it is complete, with those that it stands in, outermost
    // first. True: the element is done with and need not be kept.
    using Visitor = std::function<bool(const Element& element, const std::vector<Element>& around)>;

    explicit XmlReader(const XmlLimits& limits, Visitor visitor = {});
    ~XmlReader();
    XmlReader(const XmlReader&) = delete;
    XmlReader& operator=(const XmlReader&) = delete;

    // Reads the next piece. Throws NotWellFormed, NotValid (forbidden constructs, limits) and
    // whatever the visitor throws; after that the reader is of no further use.
    void feed(std::string_view piece);

    // Says that there is no more and returns the outermost element. Throws as feed() does.
    Element finish();

    // How many elements there were so far.
    std::size_t elementsRead() const { return elementsRead_; }

private:
    struct Handlers;
    // What was in memory before an element began.
    struct Mark {
        std::size_t elements;
        std::size_t bytes;
    };

    void requireUtf8(std::string_view piece) const;
    void parse(std::string_view piece, bool last);
    void beginElement(const char* name, const char** attributes);
    void endElement();
    void addText(std::string_view text);
    void countBytes(std::size_t bytes);

    XmlLimits limits_;
    Visitor visitor_;
    XML_ParserStruct* parser_;
    std::vector<Element> open_;
    std::vector<Mark> marks_;
    Element root_;
    Mark held_ = {0, 0};
    std::size_t elementsRead_ = 0;
    std::uint64_t bytesFed_ = 0;
    std::exception_ptr failure_;
};

} // namespace qelo::cimxml
