// A HttpConnection to a scripted server.
#pragma once

#include "ScriptedServer.h"

#include <cimxml/ResponseWriter.h>
#include <client/HttpConnection.h>
#include <client/Unreachable.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>

namespace qelo::client {

class ConnectionFixture : public ::testing::Test {
protected:
    // Answers every request with these bytes.
    void serve(const ScriptedAnswer& answer) {
        serve([answer](const SeenRequest&) { return answer; });
    }
    void serve(ScriptedServer::Script script) {
        connection_.reset();
        server_ = std::make_unique<ScriptedServer>(std::move(script));
        options.server.host = "127.0.0.1";
        options.server.port = static_cast<std::uint16_t>(server_->port());
    }

    // Answers each request with what `write` makes of it, as a server would.
    template <class Write> void answerWith(Write write, bool hasResults = true) {
        serve([write, hasResults](const SeenRequest& seen) {
            const cimxml::Request request = cimxml::parseRequest(seen.body);
            const cimxml::ResponseWriter writer(request, "server", request.target.nameSpace());
            std::string body;
            if (request.extrinsic) {
                write(writer, body);
            } else {
                writer.begin(body, hasResults);
                write(writer, body);
                writer.end(body, hasResults);
            }
            return xmlAnswer(body);
        });
    }

    HttpConnection& connection() {
        if (!connection_) {
            connection_ = std::make_unique<HttpConnection>(options);
        }
        return *connection_;
    }

    std::vector<SeenRequest> requests() const { return server_->requests(); }
    cimxml::Request lastRequest() const { return cimxml::parseRequest(requests().back().body); }

    // "1: text" of the CimError that an operation throws, or "unreachable: text".
    std::string failure() {
        try {
            connection().enumerateInstanceNames(cim::ObjectPath("root/cimv2", "C"),
                                                [](const cim::ObjectPath&) {});
            return "none";
        } catch (const CimError& error) {
            return std::to_string(error.code()) + ": " + error.what();
        } catch (const Unreachable& error) {
            return std::string("unreachable: ") + error.what();
        }
    }

    HttpOptions options;

private:
    std::unique_ptr<ScriptedServer> server_;
    std::unique_ptr<HttpConnection> connection_;
};

} // namespace qelo::client
