// The operations of "CIM Operations over HTTP" (DMTF DSP0200): takes a request apart, has the
// router and the class repository carry it out, and writes the answer while results arrive.
// Safe to use from several threads at once.
#pragma once

#include "Permissions.h"

#include <broker/Router.h>
#include <cimxml/Request.h>
#include <cimxml/ResponseWriter.h>
#include <schema/ClassRepository.h>

#include <functional>
#include <memory>
#include <string>
#include <string_view>

namespace qelo::server {

// Where an answer goes. `send` takes the next piece of it and may throw to end the operation.
// `restart` is asked when an operation fails: true, when nothing of what was sent so far has
// left, and it has been forgotten now.
struct AnswerSink {
    std::function<void(std::string_view)> send;
    std::function<bool()> restart;
};

// The answer cannot be ended well: part of it has left, and then the operation failed.
class AnswerCutShort : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

class Operations {
public:
    struct Services {
        std::shared_ptr<broker::Router> router;
        std::shared_ptr<const schema::ClassRepository> repository;
        // Whether a user may call methods and change instances.
        std::function<bool(const std::string& user)> mayChange;
        std::string hostName; // for paths that name no host
    };

    explicit Operations(Services services) : services_(std::move(services)) {}

    // Writes the whole answer, an error included. Throws what the sink throws, and
    // AnswerCutShort.
    void run(const cimxml::Request& request, const broker::OperationContext& context,
             const AnswerSink& sink) const;

private:
    const Services services_;
};

} // namespace qelo::server
