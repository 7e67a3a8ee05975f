// Trace lines: their fixed formats, and the markers around a provider operation.
//
// Each formatter writes into one static buffer of its own, shared by all units and threads
// without a lock, and returns it; the text stands until the next call of the same
// formatter. Every call clears the buffer first and writes at most 511 characters (a longer
// text is cut) and a zero: two threads at once can garble a line, and nothing more.
#pragma once

#include <platform/CvLogger.h>

#include <atomic>
#include <cstddef>
#include <cstring>
#include <string>
#include <string_view>

namespace Tesk {

// The kinds of a trace line. The numbers are fixed; any other number counts as ENTERING.
enum MessageType : int {
    ENTERING = 0,
    EXITING = 1,
    METHOD = 2,
    MESSAGE = 3,
};

// The levels of the lines.
namespace TraceLevel {
constexpr int progress = 3000; // entry, exit and other progress lines
constexpr int detail = 4000;   // markers and variables
constexpr int failure = 6000;  // a step failed
} // namespace TraceLevel

// Fills one formatter's buffer, never beyond its end.
class TraceLine {
public:
    static constexpr std::size_t capacity = 512;

    // Behind the line that is in it a buffer is zero, so clearing that line clears all of it.
    struct Buffer {
        char text[capacity];
        std::size_t used;
    };

    explicit TraceLine(Buffer& buffer) : buffer_(buffer) {
        std::memset(buffer.text, 0, buffer.used);
    }
    TraceLine(const TraceLine&) = delete;
    TraceLine& operator=(const TraceLine&) = delete;

    // A piece of a format. Where it fits, as it nearly always does, it is copied by a few moves
    // and not by a call.
    template <std::size_t size> TraceLine& operator<<(const char (&literal)[size]) {
        if (capacity - 1 - used_ >= size - 1) {
            std::memcpy(buffer_.text + used_, literal, size - 1);
            used_ += size - 1;
        } else {
            append(literal, size - 1);
        }
        return *this;
    }

    TraceLine& operator<<(std::string_view text) {
        append(text.data(), text.size());
        return *this;
    }

    // Ends the line and gives it; a zero follows it. What another thread wrote behind it
    // meanwhile is no part of it.
    std::string_view end() {
        buffer_.text[used_] = '\0';
        buffer_.used = used_;
        return {buffer_.text, used_};
    }

    TraceLine& operator<<(int number) {
        char digits[12];
        char* first = digits + sizeof digits;
        // Counted down as a negative number, whose range reaches the smallest int.
        int rest = number < 0 ? number : -number;
        do {
            *--first = static_cast<char>('0' - rest % 10);
            rest /= 10;
        } while (rest != 0);
        if (number < 0) {
            *--first = '-';
        }
        append(first, static_cast<std::size_t>(digits + sizeof digits - first));
        return *this;
    }

private:
    void append(const char* text, std::size_t length) {
        const std::size_t room = capacity - 1 - used_;
        const std::size_t taken = length < room ? length : room;
        std::memcpy(buffer_.text + used_, text, taken);
        used_ += taken;
    }

    Buffer& buffer_;
    std::size_t used_ = 0;
};

// As much of a text as a line can hold; nothing of none. The formatters below take texts whose
// length is known, as that of a function's name is when it is compiled, and texts that end
// with a zero.
inline std::string_view traceText(const char* text) {
    return text == nullptr ? std::string_view("")
                           : std::string_view(text, ::strnlen(text, TraceLine::capacity));
}

// Writes the part that lines with and without a parameter list share. For a MESSAGE line
// `func` carries the text of the message.
inline void writeTraceLine(TraceLine& out, std::string_view func, std::string_view file, int line,
                           MessageType type) {
    switch (type) {
    case MESSAGE:
        out << "MESSAGE [File: " << file << ", Line: " << line << "]: " << func;
        return;
    case METHOD:
        out << "METHOD: " << func << "() was invoked in ";
        break;
    case EXITING:
        out << "EXITING: " << func << "() in ";
        break;
    default:
        out << "ENTERING: " << func << "() in ";
        break;
    }
    out << file << " [Line: " << line << "]";
}

// A line of the given kind.
inline std::string_view trace(std::string_view func, std::string_view file, int line,
                              MessageType type) {
    static TraceLine::Buffer buffer;
    TraceLine out(buffer);
    writeTraceLine(out, func, file, line, type);
    return out.end();
}
inline const char* trace(const char* func, const char* file, int line, MessageType type) {
    return trace(traceText(func), traceText(file), line, type).data();
}

// The same with the function's parameters.
inline std::string_view tracepara(std::string_view func, std::string_view file, int line,
                                  std::string_view params, MessageType type) {
    static TraceLine::Buffer buffer;
    TraceLine out(buffer);
    writeTraceLine(out, func, file, line, type);
    out << ",Parameters List: " << params;
    return out.end();
}
inline const char* tracepara(const char* func, const char* file, int line, const char* params,
                             MessageType type) {
    return tracepara(traceText(func), traceText(file), line, traceText(params), type).data();
}

// A variable with a number. The number is printed signed.
inline std::string_view trace(std::string_view name, std::string_view file, int line,
                              unsigned int value) {
    static TraceLine::Buffer buffer;
    TraceLine out(buffer);
    out << "VARIABLE: '" << name << "' has Value '" << static_cast<int>(value) << "' at line "
        << line << " in " << file;
    return out.end();
}
inline const char* trace(const char* name, const char* file, int line, unsigned int value) {
    return trace(traceText(name), traceText(file), line, value).data();
}

// A variable with a text.
inline std::string_view trace(std::string_view name, std::string_view file, int line,
                              std::string_view value) {
    static TraceLine::Buffer buffer;
    TraceLine out(buffer);
    out << "VARIABLE: '" << name << "' has Value '" << value << "' at line " << line << " in "
        << file;
    return out.end();
}
inline const char* trace(const char* name, const char* file, int line, const char* value) {
    return trace(traceText(name), traceText(file), line, traceText(value)).data();
}

// The text of one line, as the logger takes it. Function after function tells of itself, so
// the memory of one text is kept for the next; only lines within lines, and those of several
// threads at once, need memory of their own.
class LineText {
public:
    explicit LineText(std::string_view text)
        : kept_(!keeper().taken.test_and_set(std::memory_order_acquire)),
          text_(kept_ ? keeper().text : own_) {
        text_.assign(text);
    }
    ~LineText() {
        if (kept_) {
            keeper().taken.clear(std::memory_order_release);
        }
    }
    LineText(const LineText&) = delete;
    LineText& operator=(const LineText&) = delete;

    operator const std::string&() const { return text_; }

private:
    struct Keeper {
        std::atomic_flag taken = ATOMIC_FLAG_INIT;
        std::string text;
    };
    static Keeper& keeper() {
        static Keeper keeper;
        return keeper;
    }

    bool kept_;
    std::string own_;
    std::string& text_;
};

// Hands one line to the log, then to the trace. Both get the text that `format` makes; it is
// made once, since that is most of what a line costs that nobody wants to see.
template <class Format>
void emitLine(const char* func, const char* file, int line, const std::string& component, int level,
              Format format) {
    const LineText text(format());
    CvLog::CvLogger::logLevelMessage(func, file, line, component, level, nullptr, 0, 0, text);
    CvLog::CvLogger::traceLevelMessage(func, file, line, component, level, nullptr, 0, 0, text);
}

// The line of 78 "=" characters that sets one operation off from the next.
inline const char* traceBanner() {
    return "=======================================" // 39
           "=======================================";
}

// Marks that a provider operation begins: the banner, then an ENTERING line that names the
// caller. `component` is the caller's logger.
inline void markProviderEntry(const std::string& component, const char* func, const char* file,
                              int line) {
    emitLine(__func__, "Trace", __LINE__, component, TraceLevel::detail, traceBanner);
    emitLine(__func__, "Trace", __LINE__, component, TraceLevel::detail,
             [=] { return trace(func, file, line, ENTERING); });
}

// Marks that a provider operation ends: an EXITING line, then the banner.
inline void markProviderExit(const std::string& component, const char* func, const char* file,
                             int line) {
    emitLine(__func__, "Trace", __LINE__, component, TraceLevel::detail,
             [=] { return trace(func, file, line, EXITING); });
    emitLine(__func__, "Trace", __LINE__, component, TraceLevel::detail, traceBanner);
}

} // namespace Tesk
