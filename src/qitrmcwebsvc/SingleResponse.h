#pragma once

#include <qierr_status.h>

#include "qitrmcwebsvc/Json.h"

namespace nQITRMCWEBSVC100 {

// One JSON-RPC response under construction: an envelope with an id, and later a result or an error.
//
// Its values are allocated by an allocator that it does not own and that must outlive them. Used by
// one thread. A procedure must set its result last, since an error that is set later would be added
// beside the result.
class SingleResponse {
  public:
    // With a null id.
    explicit SingleResponse(JsonAllocator* allocator);
    // With a copy of the id, of whatever type. Texts that the id only refers to are not copied, so
    // they must outlive the response.
    SingleResponse(const JsonValue& id, JsonAllocator* allocator);
    virtual ~SingleResponse() = default;
    SingleResponse(const SingleResponse&) = delete;
    SingleResponse& operator=(const SingleResponse&) = delete;

    // Moves a value into "result".
    void setResult(JsonValue&& value);
    // Sets "result" to an empty object.
    void setEmptyResult();
    // Sets "error" from a status. Throws qierr::Exception if its text cannot be produced; the
    // response is then unchanged.
    void setError(const qierr_Status& status);
    // Moves the error object of another response into "error".
    void setError(JsonValue&& error);

    // The whole response, to be moved out.
    JsonValue& getValue() { return response; }
    // The allocator with which a procedure builds its result.
    JsonAllocator* getAllocator() const { return allocator; }

  private:
    JsonValue response;
    JsonAllocator* allocator;
};

}  // namespace nQITRMCWEBSVC100
