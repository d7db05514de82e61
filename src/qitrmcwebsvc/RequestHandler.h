// Folder qitrmcwebsvc: the plug-in itself: HTTP checks, JSON-RPC, sessions, schemas, resources.
#pragma once

#include <map>
#include <memory>
#include <string>

#include "qitrmcwebsvc/IProcedure.h"
#include "qitrmcwebsvc/Json.h"
#include "qitrmcwebsvc/ProcedureFactory.h"
#include "qitrmcwebsvc/RequestAccessLock.h"

namespace nQITRMCWEBSVC100 {

// Processes the text of an HTTP body and returns the text of the HTTP response. One object is used
// by all server threads concurrently. The destructor closes all sessions; no request may be running
// then.
class RequestHandler {
  public:
    // Creates all procedures and compiles their schemas. Throws InternalError for an invalid
    // schema.
    RequestHandler();
    virtual ~RequestHandler() = default;
    RequestHandler(const RequestHandler&) = delete;
    RequestHandler& operator=(const RequestHandler&) = delete;

    // Processes a single request or a batch. Returns one complete JSON text, also for an error.
    // Throws if the text of an error cannot be produced or memory runs out.
    std::string handleRequest(const std::string& body);

  private:
    void answer(const std::string& body, JsonDocument& requestDocument,
                JsonDocument& responseDocument);
    void addDefaultParams(JsonValue& value, JsonAllocator& allocator) const;
    bool handleSingleRequest(JsonValue& requestValue, JsonValue& responseValue,
                             JsonAllocator& allocator);
    void handleBatchRequest(JsonValue& requests, JsonValue& responseValue,
                            JsonAllocator& allocator);
    IProcedure& getProcedure(const std::string& method) const;

    ProcedureFactory procedureFactory;
    std::map<std::string, std::shared_ptr<IProcedure>> procedures;
    RequestAccessLock accessLock;
};

}  // namespace nQITRMCWEBSVC100
