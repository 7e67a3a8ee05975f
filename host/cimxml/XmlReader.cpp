#include "XmlReader.h"

#include <cim/ObjectPath.h>
#include <secrecy/Forget.h>

#include <algorithm>
#include <expat.h>
#include <new>
#include <string>

namespace qelo::cimxml {
namespace {

// What the parser takes at once; its lengths are ints.
constexpr std::size_t kPiece = std::size_t{1} << 20;

// The longest tag or comment. The parser begins such a token anew with every piece, which
// would take quadratic time if it never ended.
constexpr std::uint64_t kLongestToken = std::uint64_t{1} << 20;

constexpr std::size_t kMostAttributes = 64;

std::string_view withoutPrefix(std::string_view name) {
    const std::size_t colon = name.rfind(':');
    return colon == std::string_view::npos ? name : name.substr(colon + 1);
}

// The parser keeps pieces of the document, which may hold a password.
XML_Parser makeParser() {
    static const XML_Memory_Handling_Suite memory = {secrecy::allocate, secrecy::reallocate,
                                                     secrecy::release};
    return XML_ParserCreate_MM("UTF-8", &memory, nullptr);
}

} // namespace

// What the C library calls. Nothing may be thrown through its frames, so each failure is
// kept until the parser has returned.
struct XmlReader::Handlers {
    template <class Action> static void guarded(void* self, Action action) {
        auto& reader = *static_cast<XmlReader*>(self);
        if (reader.failure_) {
            return;
        }
        try {
            action(reader);
        } catch (...) {
            reader.failure_ = std::current_exception();
            XML_StopParser(reader.parser_, XML_FALSE);
        }
    }

    static void begin(void* self, const XML_Char* name, const XML_Char** attributes) {
        guarded(self, [&](XmlReader& reader) { reader.beginElement(name, attributes); });
    }
    static void end(void* self, const XML_Char*) {
        guarded(self, [](XmlReader& reader) { reader.endElement(); });
    }
    static void text(void* self, const XML_Char* text, int length) {
        guarded(self, [&](XmlReader& reader) {
            reader.addText(std::string_view(text, static_cast<std::size_t>(length)));
        });
    }
    static void documentType(void* self, const XML_Char*, const XML_Char*, const XML_Char*, int) {
        guarded(self,
                [](XmlReader&) { throw NotValid("document type declarations are not accepted"); });
    }
    static void declaration(void* self, const XML_Char*, const XML_Char* encoding, int) {
        guarded(self, [&](XmlReader&) {
            if (encoding != nullptr && !cim::sameName(encoding, "utf-8")) {
                throw NotValid("only the encoding UTF-8 is accepted");
            }
        });
    }
};

XmlReader::XmlReader(const XmlLimits& limits, Visitor visitor)
    : limits_(limits), visitor_(std::move(visitor)), parser_(makeParser()) {
    if (parser_ == nullptr) {
        throw std::bad_alloc();
    }
    XML_SetUserData(parser_, this);
    XML_SetElementHandler(parser_, Handlers::begin, Handlers::end);
    XML_SetCharacterDataHandler(parser_, Handlers::text);
    XML_SetStartDoctypeDeclHandler(parser_, Handlers::documentType);
    XML_SetXmlDeclHandler(parser_, Handlers::declaration);
}

XmlReader::~XmlReader() { XML_ParserFree(parser_); }

void XmlReader::feed(std::string_view piece) {
    while (!piece.empty()) {
        const std::size_t length = std::min(piece.size(), kPiece);
        parse(piece.substr(0, length), false);
        piece.remove_prefix(length);
    }
}

Element XmlReader::finish() {
    parse({}, true);
    return std::move(root_);
}

// The parser recognises UTF-16 by its first two bytes, whatever it was told to expect.
void XmlReader::requireUtf8(std::string_view piece) const {
    for (std::size_t i = 0; i < piece.size() && bytesFed_ + i < 2; ++i) {
        const auto byte = static_cast<unsigned char>(piece[i]);
        if (byte == 0 || byte >= 0xFE) {
            throw NotValid("only the encoding UTF-8 is accepted");
        }
    }
}

void XmlReader::parse(std::string_view piece, bool last) {
    requireUtf8(piece);
    const XML_Status status =
        XML_Parse(parser_, piece.data(), static_cast<int>(piece.size()), last ? 1 : 0);
    if (failure_) {
        std::rethrow_exception(failure_);
    }
    if (status != XML_STATUS_OK) {
        if (XML_GetErrorCode(parser_) == XML_ERROR_NO_MEMORY) {
            throw std::bad_alloc();
        }
        throw NotWellFormed("line " + std::to_string(XML_GetCurrentLineNumber(parser_)) + ": " +
                            XML_ErrorString(XML_GetErrorCode(parser_)));
    }
    bytesFed_ += piece.size();
    const XML_Index position = XML_GetCurrentByteIndex(parser_);
    if (position >= 0 && bytesFed_ - std::min(bytesFed_, static_cast<std::uint64_t>(position)) >
                             kPiece + kLongestToken) {
        throw NotValid("a tag is too long");
    }
}

void XmlReader::beginElement(const char* name, const char** attributes) {
    if (limits_.depthOutside + open_.size() >= limits_.depth) {
        throw NotValid("elements are nested too deeply");
    }
    if (held_.elements >= limits_.elements) {
        throw NotValid("there are too many elements");
    }
    marks_.push_back(held_);
    ++held_.elements;
    ++elementsRead_;
    Element element;
    element.name = withoutPrefix(name);
    element.depth = limits_.depthOutside + open_.size() + 1;
    countBytes(element.name.size());
    for (std::size_t count = 0; *attributes != nullptr; attributes += 2, ++count) {
        if (count == kMostAttributes) {
            throw NotValid(element.name + " has too many attributes");
        }
        element.attributes.emplace_back(attributes[0], attributes[1]);
        countBytes(element.attributes.back().first.size() +
                   element.attributes.back().second.size());
    }
    open_.push_back(std::move(element));
}

void XmlReader::endElement() {
    Element element = std::move(open_.back());
    const Mark before = marks_.back();
    open_.pop_back();
    marks_.pop_back();
    if (visitor_ && visitor_(element, open_)) {
        held_ = before;
    } else if (open_.empty()) {
        root_ = std::move(element);
    } else {
        open_.back().children.push_back(std::move(element));
    }
}

void XmlReader::addText(std::string_view text) {
    countBytes(text.size());
    open_.back().text += text;
}

void XmlReader::countBytes(std::size_t bytes) {
    held_.bytes += bytes;
    if (held_.bytes > limits_.bytes) {
        throw NotValid("the document is too large");
    }
}

} // namespace qelo::cimxml
