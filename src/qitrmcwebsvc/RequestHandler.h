#pragma once

#include <map>
#include <memory>
#include <string>

#include "qitrmcwebsvc/IProcedure.h"
#include "qitrmcwebsvc/Json.h"
#include "qitrmcwebsvc/ProcedureFactory.h"
#include "qitrmcwebsvc/RequestAccessLock.h"

namespace nQITRMCWEBSVC100 {

// Turns the text of one HTTP body into the text of one HTTP response. One object serves all server
// threads at once; no request may be running when it ends, which closes all sessions.
class RequestHandler {
  public:
    // Makes all procedures, and so compiles all schemas. Throws InternalError for a bad one.
    RequestHandler();
    virtual ~RequestHandler() = default;
    RequestHandler(const RequestHandler&) = delete;
    RequestHandler& operator=(const RequestHandler&) = delete;

    // Answers a single request or a batch. Returns one complete JSON text, an error text included;
    // throws when not even an error can be put into words or memory is exhausted.
    std::string handleRequest(const std::string& body);

  private:
    void answer(const std::string& body, JsonDocument& responseDocument);
    void addDefaultParams(JsonValue& value, JsonPool& allocator) const;
    bool handleSingleRequest(JsonValue& requestValue, JsonValue& responseValue,
                             JsonPool& allocator);
    void handleBatchRequest(JsonValue& requests, JsonValue& responseValue, JsonPool& allocator);
    std::shared_ptr<IProcedure> getProcedure(const std::string& method) const;

    ProcedureFactory procedureFactory;
    std::map<std::string, std::shared_ptr<IProcedure>> procedures;
    RequestAccessLock accessLock;
};

}  // namespace nQITRMCWEBSVC100
