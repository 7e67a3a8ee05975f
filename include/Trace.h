// Trace lines: their fixed formats, and the markers around a provider operation.
//
// Each formatter writes into one static buffer of its own, shared by all units and threads
// without a lock, and returns it; the text stands until the next call of the same
// formatter. Every call clears the buffer first and writes at most 511 characters (a longer
// text is cut), so the last byte is always zero: two threads at once can garble a line, and
// nothing more.
#pragma once

#include <platform/CvLogger.h>

#include <cstddef>
#include <cstring>
#include <string>

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
    using Buffer = char[capacity];

    explicit TraceLine(Buffer& buffer) : buffer_(buffer) { std::memset(buffer, 0, capacity); }

    TraceLine& operator<<(const char* text) {
        if (text != nullptr) {
            append(text, ::strnlen(text, capacity));
        }
        return *this;
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
        std::memcpy(buffer_ + used_, text, taken);
        used_ += taken;
    }

    Buffer& buffer_;
    std::size_t used_ = 0;
};

// Writes the part that lines with and without a parameter list share. For a MESSAGE line
// `func` carries the text of the message.
inline void writeTraceLine(TraceLine& out, const char* func, const char* file, int line,
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
inline const char* trace(const char* func, const char* file, int line, MessageType type) {
    static TraceLine::Buffer buffer;
    TraceLine out(buffer);
    writeTraceLine(out, func, file, line, type);
    return buffer;
}

// The same with the function's parameters.
inline const char* tracepara(const char* func, const char* file, int line, const char* params,
                             MessageType type) {
    static TraceLine::Buffer buffer;
    TraceLine out(buffer);
    writeTraceLine(out, func, file, line, type);
    out << ",Parameters List: " << params;
    return buffer;
}

// A variable with a number. The number is printed signed.
inline const char* trace(const char* name, const char* file, int line, unsigned int value) {
    static TraceLine::Buffer buffer;
    TraceLine out(buffer);
    out << "VARIABLE: '" << name << "' has Value '" << static_cast<int>(value) << "' at line "
        << line << " in " << file;
    return buffer;
}

// A variable with a text.
inline const char* trace(const char* name, const char* file, int line, const char* value) {
    static TraceLine::Buffer buffer;
    TraceLine out(buffer);
    out << "VARIABLE: '" << name << "' has Value '" << value << "' at line " << line << " in "
        << file;
    return buffer;
}

// Hands one line to the log, then to the trace. `format` is asked for the text once for
// each sink, and each starts from an empty buffer.
template <class Format>
void emitLine(const char* func, const char* file, int line, const std::string& component, int level,
              Format format) {
    {
        CvLog::CvMessageBuffer text;
        CvLog::CvLogger::logLevelMessage(func, file, line, component, level, nullptr, 0, 0,
                                         text.str(text << format()));
    }
    CvLog::CvMessageBuffer text;
    CvLog::CvLogger::traceLevelMessage(func, file, line, component, level, nullptr, 0, 0,
                                       text.str(text << format()));
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
