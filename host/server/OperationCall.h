// What every operation works with: the request, who asks, and the answer as it grows.
#pragma once

#include "IntrinsicParameters.h"
#include "Operations.h"

#include <string>

namespace qelo::server {

// Collects what is written into pieces of a size that is worth sending.
class Answer {
public:
    Answer(const AnswerSink& sink, const cimxml::ResponseWriter& writer)
        : sink_(sink), writer_(writer) {}

    const cimxml::ResponseWriter& writer() const { return writer_; }
    std::string& text() { return text_; }

    // To be called when something has been appended to text().
    void sendIfWorth() {
        if (text_.size() >= kPiece) {
            send();
        }
    }
    void send();

    // Forgets what was written, to write an error instead; false when some of it has left.
    bool restart();

private:
    static constexpr std::size_t kPiece = 32UL * 1024;

    const AnswerSink& sink_;
    const cimxml::ResponseWriter& writer_;
    std::string text_;
    bool sent_ = false;
};

struct OperationCall {
    const Operations::Services& services;
    const cimxml::Request& request;
    const broker::OperationContext& context;
    Answer& answer;

    const std::string& nameSpace() const { return request.target.nameSpace(); }
    broker::Router& router() const { return *services.router; }
    const schema::ClassRepository& repository() const { return *services.repository; }
    cim::ObjectPath classPath(const std::string& className) const {
        return {nameSpace(), className};
    }

    // CimError 2 unless the user may change something.
    void requirePermission() const;

    // Writes begin, what `results` writes, and end.
    template <class Results> void answerWith(Results results) const {
        answer.writer().begin(answer.text());
        results();
        answer.writer().end(answer.text());
        answer.send();
    }
    void answerWithNothing() const;

    // One path among the results.
    void answerPath(const cim::ObjectPath& path, cimxml::PathForm form) const;
};

// Writes instances with what the client wants to know of each.
class InstanceWriting {
public:
    InstanceWriting(const OperationCall& call, const IntrinsicParameters& parameters);

    void write(const cim::Instance& instance, cimxml::InstanceForm form);

private:
    const OperationCall& call_;
    cimxml::InstanceOptions options_;
    std::string className_; // of options_.declaration
};

using Operation = void (*)(const OperationCall& call);

// The operation of that name (ignoring case), or null when there is none here.
Operation findOperation(const std::string& name);

// One table for each file of operations.
struct NamedOperation {
    const char* name;
    Operation operation;
};
struct OperationTable {
    const NamedOperation* begin;
    const NamedOperation* end;
};
OperationTable instanceOperations();
OperationTable associationOperations();
OperationTable classOperations();

// Extrinsic methods.
void callMethod(const OperationCall& call);

} // namespace qelo::server
