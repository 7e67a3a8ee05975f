// The head of an HTTP answer, as far as a CIM client cares.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace qelo::client {

class AnswerHead {
public:
    // The next line, a status line or a field; fields behind the body count as well.
    void addLine(std::string_view line);

    // CimError unless the status is 200 and the body is XML. `server` stands in the text.
    void requireSuccess(const std::string& server) const;
    // CimError if the fields behind the body report that the operation failed after all.
    void requireNoLateError() const;

private:
    long status_ = 0;
    std::string reason_;
    std::string contentType_;
    std::string cimError_;
    std::string errorDetail_;
    std::string lateStatus_;
    std::string lateText_;
};

} // namespace qelo::client
