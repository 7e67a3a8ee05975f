// One-line trace points for a source unit.
//
//   CallTrace call(unit, parameters(" name=", name));   entry, with its parameter list
//   unit.variable("_name", _name);                      a variable
//   unit.message("it failed");                          a failed step
//   return call.leave(result);                          exit, with the entry's list
//
// The function and the line are those of the caller.
#pragma once

#include "Trace.h"

#include <cstddef>
#include <cstdint>
#include <locale>
#include <ostream>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>

namespace Tesk {

// Where a trace point stands.
struct TraceSite {
    constexpr TraceSite(const char* inFunction, int atLine)
        : function(inFunction), line(atLine), length(std::char_traits<char>::length(inFunction)) {}

    const char* function;
    int line;
    std::size_t length; // of the function's name

    std::string_view name() const { return {function, length}; }

    // As a default argument: the place of the call.
    static constexpr TraceSite here(const char* function = __builtin_FUNCTION(),
                                    int line = __builtin_LINE()) {
        return {function, line};
    }
};

// The trace points of one source unit. It keeps references to its arguments, which live as
// long as the unit.
class UnitTrace {
public:
    UnitTrace(const std::string& component, const char* file)
        : component_(component), file_(file), fileName_(file) {}

    const std::string& component() const { return component_; }
    const char* file() const { return file_; }

    // "METHOD: ..." at progress level.
    void method(TraceSite site = TraceSite::here()) const {
        line(TraceLevel::progress, site, METHOD);
    }

    // The same where nothing may be thrown: a line that cannot be written is dropped.
    void methodQuietly(TraceSite site = TraceSite::here()) const noexcept {
        try {
            method(site);
        } catch (...) { // a destructor has nobody to tell
        }
    }

    // "ENTERING: ..." and "EXITING: ..." without a parameter list.
    void entering(TraceSite site = TraceSite::here()) const {
        line(TraceLevel::progress, site, ENTERING);
    }
    void exiting(TraceSite site = TraceSite::here()) const {
        line(TraceLevel::progress, site, EXITING);
    }

    // "MESSAGE ...: text", at failure level unless another is given.
    void message(const char* text, int level = TraceLevel::failure,
                 TraceSite site = TraceSite::here()) const {
        emit(level, site, [&] { return trace(traceText(text), fileName_, site.line, MESSAGE); });
    }

    // "VARIABLE: ..." with a number (printed signed) or a text.
    void variable(const char* name, unsigned int value, TraceSite site = TraceSite::here()) const {
        emit(TraceLevel::detail, site,
             [&] { return trace(traceText(name), fileName_, site.line, value); });
    }
    void variable(const char* name, const char* value, TraceSite site = TraceSite::here()) const {
        emit(TraceLevel::detail, site,
             [&] { return trace(traceText(name), fileName_, site.line, traceText(value)); });
    }
    void variable(const char* name, const std::string& value,
                  TraceSite site = TraceSite::here()) const {
        variable(name, value.c_str(), site);
    }

    // A text as it stands, at progress level.
    void plain(const char* text, TraceSite site = TraceSite::here()) const {
        emit(TraceLevel::progress, site, [&] { return text; });
    }

    // A line with a parameter list.
    void withParameters(const std::string& params, MessageType type, TraceSite site) const {
        emit(TraceLevel::progress, site, [&] {
            return tracepara(site.name(), fileName_, site.line, traceText(params.c_str()), type);
        });
    }

    // A getter: traces that it was invoked and the field's value, and returns a copy of it.
    template <class Value>
    Value read(const char* name, const Value& field, TraceSite site = TraceSite::here()) const {
        method(site);
        variable(name, field, site);
        return field;
    }

    // A setter: traces entry (with `piece` and the value), the field after the assignment,
    // and exit. Returns false, which says that the value was taken.
    template <class Field, class Value>
    bool assign(const char* piece, const char* name, Field& field, Value value,
                TraceSite site = TraceSite::here()) const;

private:
    void line(int level, TraceSite site, MessageType type) const {
        emit(level, site, [&] { return trace(site.name(), fileName_, site.line, type); });
    }

    template <class Format> void emit(int level, const TraceSite& site, Format format) const {
        emitLine(site.function, file_, site.line, component_, level, format);
    }

    const std::string& component_;
    const char* file_;
    std::string_view fileName_;
};

// Adds a value to a parameter list: texts, numbers and flags as they are, anything else
// that is a pointer by its address.
inline void insertParameter(CvLog::CvMessageBuffer& list, const std::string& value) {
    list << value;
}
// A null text adds nothing; not every stream of characters takes one.
inline void insertParameter(CvLog::CvMessageBuffer& list, const char* value) {
    list << (value != nullptr ? value : "");
}
inline void insertParameter(CvLog::CvMessageBuffer& list, unsigned int value) { list << value; }
inline void insertParameter(CvLog::CvMessageBuffer& list, unsigned short value) {
    list << static_cast<unsigned int>(value);
}
inline void insertParameter(CvLog::CvMessageBuffer& list, bool value) { list << value; }
// What a stream writes for an address. Where the process has changed no locale, by hand: the
// making of a stream costs more than all the rest of a line.
inline void insertAddress(CvLog::CvMessageBuffer& list, const void* address) {
    if (address == nullptr || !(std::locale() == std::locale::classic())) {
        static_cast<std::ostream&>(list) << address;
        return;
    }
    char digits[sizeof "0x" + 2 * sizeof address];
    char* first = digits + sizeof digits - 1;
    *first = '\0';
    for (auto rest = reinterpret_cast<std::uintptr_t>(address); rest != 0; rest /= 16) {
        *--first = "0123456789abcdef"[rest % 16];
    }
    *--first = 'x';
    *--first = '0';
    list << first;
}
template <class Pointee>
void insertParameter(CvLog::CvMessageBuffer& list, const Pointee* address) {
    insertAddress(list, static_cast<const void*>(address));
}

inline void insertParameters(CvLog::CvMessageBuffer&) {}
template <class Value, class... Rest>
void insertParameters(CvLog::CvMessageBuffer& list, const char* piece, const Value& value,
                      const Rest&... rest) {
    list << piece;
    insertParameter(list, value);
    insertParameters(list, rest...);
}

// A parameter list from pieces such as " name=" (each brings its leading blank) and values.
template <class... PiecesAndValues> std::string parameters(const PiecesAndValues&... list) {
    CvLog::CvMessageBuffer text;
    insertParameters(text, list...);
    return text.str(text);
}

// Entry and exit of a function with parameters. The list is built once; the exit line
// repeats it. Left without leave() (by an exception, say), it traces no exit.
class CallTrace {
public:
    CallTrace(const UnitTrace& unit, std::string params, TraceSite site = TraceSite::here())
        : unit_(unit), params_(std::move(params)) {
        unit_.withParameters(params_, ENTERING, site);
    }

    void leave(TraceSite site = TraceSite::here()) const {
        unit_.withParameters(params_, EXITING, site);
    }

    // The same, passing on the function's result.
    template <class Result> Result leave(Result result, TraceSite site = TraceSite::here()) const {
        unit_.withParameters(params_, EXITING, site);
        return result;
    }

private:
    const UnitTrace& unit_;
    std::string params_;
};

template <class Field, class Value>
bool UnitTrace::assign(const char* piece, const char* name, Field& field, Value value,
                       TraceSite site) const {
    CallTrace call(*this, parameters(piece, value), site);
    field = std::move(value);
    variable(name, field, site);
    return call.leave(false, site);
}

} // namespace Tesk
