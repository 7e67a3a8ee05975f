#include "RecordingPort.h"

#include <platform/CvLogger.h>

#include <sstream>

using qelo::test::RecordingPort;
using qelo::test::Sink;

namespace CvLog {

namespace {

std::string textOf(const char* text) { return text != nullptr ? text : "(null)"; }

} // namespace

void CvLogger::logLevelMessage(const char* function, const char* file, int line,
                               const std::string& component, int level, const char* reserved1,
                               int reserved2, int reserved3, const std::string& message) {
    RecordingPort::line({Sink::Log, textOf(function), textOf(file), line, component, level,
                         reserved1, reserved2, reserved3, message});
}

void CvLogger::traceLevelMessage(const char* function, const char* file, int line,
                                 const std::string& component, int level, const char* reserved1,
                                 int reserved2, int reserved3, const std::string& message) {
    RecordingPort::line({Sink::Trace, textOf(function), textOf(file), line, component, level,
                         reserved1, reserved2, reserved3, message});
}

struct CvMessageBuffer::Text {
    std::ostringstream stream;
};

CvMessageBuffer::CvMessageBuffer() : text_((RecordingPort::buffer(), new Text)) {}
CvMessageBuffer::~CvMessageBuffer() { delete text_; }

CvMessageBuffer& CvMessageBuffer::operator<<(const char* text) {
    if (text != nullptr) {
        text_->stream << text;
    }
    return *this;
}

CvMessageBuffer& CvMessageBuffer::operator<<(const std::string& text) {
    text_->stream << text;
    return *this;
}

CvMessageBuffer& CvMessageBuffer::operator<<(unsigned int number) {
    text_->stream << number;
    return *this;
}

CvMessageBuffer& CvMessageBuffer::operator<<(bool flag) {
    text_->stream << (flag ? '1' : '0');
    return *this;
}

CvMessageBuffer::operator std::ostream&() { return text_->stream; }

std::string CvMessageBuffer::str(CvMessageBuffer& buffer) { return buffer.text_->stream.str(); }

std::string CvMessageBuffer::str(std::ostream& stream) {
    const auto* text = dynamic_cast<std::ostringstream*>(&stream);
    return text != nullptr ? text->str() : std::string();
}

} // namespace CvLog
