#pragma once

#include <qierr_status.h>

#include "qitrmcwebsvc/Json.h"

namespace nQITRMCWEBSVC100 {

// One JSON-RPC response in the making: an envelope with an id, which gains a result or an error.
//
// Its values lie in a pool that it does not own and that must outlive them. Used by one thread.
// Nothing keeps a caller from setting both a result and an error, so a procedure sets its result
// when its work is done.
class SingleResponse {
  public:
    // With a null id.
    explicit SingleResponse(JsonPool* allocator);
    // With a deep copy of the id, of whatever type it is.
    SingleResponse(const JsonValue& id, JsonPool* allocator);
    virtual ~SingleResponse() = default;
    SingleResponse(const SingleResponse&) = delete;
    SingleResponse& operator=(const SingleResponse&) = delete;

    // Moves a value into "result".
    void setResult(JsonValue&& value);
    // Makes "result" an empty object.
    void setEmptyResult();
    // Makes "error" of a status. Throws qierr::Exception when its text cannot be made; nothing is
    // added then.
    void setError(const qierr_Status& status);
    // Moves an error object that another response made into "error".
    void setError(JsonValue&& error);

    // The whole response, to be moved out.
    JsonValue& getValue() { return response; }
    // The pool in which a procedure builds its result.
    JsonPool* getAllocator() const { return allocator; }

  private:
    JsonValue response;
    JsonPool* allocator;
};

}  // namespace nQITRMCWEBSVC100
