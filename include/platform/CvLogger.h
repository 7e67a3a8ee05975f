// Logging interface of the platform (libqeloCvLogger.so.1).
//
// Two sinks, the log and the trace, take single lines. Each has a threshold per component;
// a line whose level lies below it is dropped. Every function may be called from any
// thread. None keeps a pointer or reference past its return.
#pragma once

#include "PlatformApi.h"

#include <ostream>
#include <string>

namespace CvLog {

class QELO_PLATFORM_API CvLogger {
public:
    // Writes one line to the log if the component's log threshold admits the level.
    //   function, file, line  where the line was raised; the strings are NUL-terminated
    //   component             dotted component name, for example "Corvane.SimAccountObj"
    //   level                 3000 progress, 4000 detail markers and variables, 6000 failures
    //   reserved*             passed as null, 0 and 0
    //   message               the text, without a line end
    static void logLevelMessage(const char* function, const char* file, int line,
                                const std::string& component, int level, const char* reserved1,
                                int reserved2, int reserved3, const std::string& message);

    // The same for the trace sink and its threshold.
    static void traceLevelMessage(const char* function, const char* file, int line,
                                  const std::string& component, int level, const char* reserved1,
                                  int reserved2, int reserved3, const std::string& message);
};

// Collects the text of one line piece by piece. Not for use by several threads at once.
class QELO_PLATFORM_API CvMessageBuffer {
public:
    CvMessageBuffer();
    ~CvMessageBuffer();
    CvMessageBuffer(const CvMessageBuffer&) = delete;
    CvMessageBuffer& operator=(const CvMessageBuffer&) = delete;

    // Each appends its argument and returns this buffer. A null text appends nothing;
    // a bool appends 0 or 1, a number its decimal digits.
    CvMessageBuffer& operator<<(const char* text);
    CvMessageBuffer& operator<<(const std::string& text);
    CvMessageBuffer& operator<<(unsigned int number);
    CvMessageBuffer& operator<<(bool flag);

    // The buffer as a stream, for values that have no insertion of their own. Owned by the
    // buffer and valid as long as it.
    operator std::ostream&();

    // The text accumulated so far, by a copy. Both forms read this buffer's own text when
    // given this buffer or its stream; another buffer's when given that or its stream, and a
    // std::ostringstream's when given one. Any other stream stands for this buffer.
    std::string str(CvMessageBuffer& buffer);
    std::string str(std::ostream& stream);

private:
    struct Text;
    Text* text_;
};

} // namespace CvLog
