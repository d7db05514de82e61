#include "qitrmcwebsvc/RequestHandler.h"

#include <cstddef>
#include <exception>

#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcwebsvc/compactJson.h"
#include "qitrmcwebsvc/findMember.h"
#include "qitrmcwebsvc/requestText.h"

namespace nQITRMCWEBSVC100 {

using namespace nQITRMCSHAREDCMN100;

namespace {

void addDefaultParamsToObject(JsonValue& value, JsonAllocator& allocator) {
    if (value.IsObject() && findMember(value, "params") == nullptr) {
        value.AddMember("params", JsonValue(rapidjson::kObjectType), allocator);
    }
}

// An element of a few bytes can cause a response of hundreds of bytes, while the exclusive lock is
// held. The limit is far above any realistic batch.
constexpr rapidjson::SizeType maxBatchElements = 100000;

bool isBatch(const JsonValue& root) {
    return root.IsArray() && !root.Empty() && root.Size() <= maxBatchElements;
}

// The memory of a document, as much as most requests and responses need. The allocator takes more
// in pieces of 64 KiB, which costs more than all else in a small request.
class DocumentMemory {
  public:
    JsonAllocator* get() { return &allocator; }

  private:
    alignas(std::max_align_t) char first[4096];
    JsonAllocator allocator{first, sizeof first};
};

// The id of a request, of whatever type, or null if there is none. It refers to texts of the
// request.
JsonValue copyId(const JsonValue& requestValue, JsonAllocator& allocator) {
    if (!requestValue.IsObject()) {
        return JsonValue();
    }
    const JsonValue* const id = findMember(requestValue, "id");
    return id == nullptr ? JsonValue() : JsonValue(*id, allocator);
}

void setErrorFrom(const std::exception& error, SingleResponse& response) {
    qierr::Status status;
    captureCurrentException(error, &status);
    response.setError(status);
}

// The error of the batch elements that are skipped. Its text is produced only once.
class SkippedError {
  public:
    void setOn(SingleResponse& response) {
        if (error.IsNull()) {
            error = make(*response.getAllocator());
        }
        JsonValue copy(error, *response.getAllocator());
        response.setError(std::move(copy));
    }

  private:
    static JsonValue make(JsonAllocator& allocator) {
        SingleResponse response(&allocator);
        response.setError(*BasicError(qierr::codes::skipped, QITRMC_HERE).status());
        return std::move(response.getValue()["error"]);
    }

    JsonValue error;
};

}  // namespace

RequestHandler::RequestHandler() {
    for (const Method& method : methodTable) {
        procedures.emplace(method.name, (procedureFactory.*method.make)());
    }
}

std::string RequestHandler::handleRequest(const std::string& body) {
    DocumentMemory requestMemory;  // The response contains the id, which may be a text in here.
    DocumentMemory responseMemory;
    JsonDocument requestDocument(requestMemory.get());
    JsonDocument responseDocument(responseMemory.get());
    try {
        answer(body, requestDocument, responseDocument);
    } catch (const std::exception& error) {
        requestMemory.get()->Clear();  // Memory may be what was missing.
        SingleResponse response(&responseDocument.GetAllocator());
        setErrorFrom(error, response);
        static_cast<JsonValue&>(responseDocument) = response.getValue();
    }
    return compactJson(responseDocument);
}

void RequestHandler::answer(const std::string& body, JsonDocument& requestDocument,
                            JsonDocument& responseDocument) {
    parseRequestText(body, requestDocument);
    addDefaultParams(requestDocument, requestDocument.GetAllocator());
    if (requestDocument.IsObject()) {
        SharedAccess access(accessLock);
        handleSingleRequest(requestDocument, responseDocument, responseDocument.GetAllocator());
    } else if (isBatch(requestDocument)) {
        ExclusiveAccess access(accessLock);
        handleBatchRequest(requestDocument, responseDocument, responseDocument.GetAllocator());
    } else {
        throw BasicError(qierr::codes::invalidRequest, QITRMC_HERE);
    }
}

void RequestHandler::addDefaultParams(JsonValue& value, JsonAllocator& allocator) const {
    if (value.IsArray()) {
        for (JsonValue& element : value.GetArray()) {
            addDefaultParamsToObject(element, allocator);
        }
    } else {
        addDefaultParamsToObject(value, allocator);
    }
}

bool RequestHandler::handleSingleRequest(JsonValue& requestValue, JsonValue& responseValue,
                                         JsonAllocator& allocator) {
    SingleResponse response(copyId(requestValue, allocator), &allocator);
    bool succeeded = true;
    try {
        SingleRequest request(requestValue);
        getProcedure(request.getMethod()).execute(request, response);
    } catch (const std::exception& error) {
        setErrorFrom(error, response);
        succeeded = false;
    }
    responseValue = response.getValue();
    return succeeded;
}

// After the first failure, the remaining requests are answered with an error and not executed.
void RequestHandler::handleBatchRequest(JsonValue& requests, JsonValue& responseValue,
                                        JsonAllocator& allocator) {
    responseValue.SetArray();
    bool carryOn = true;
    SkippedError skippedError;
    for (JsonValue& element : requests.GetArray()) {
        JsonValue elementResponse;
        if (carryOn) {
            carryOn = handleSingleRequest(element, elementResponse, allocator);
        } else {
            SingleResponse response(copyId(element, allocator), &allocator);
            skippedError.setOn(response);
            elementResponse = response.getValue();
        }
        responseValue.PushBack(elementResponse, allocator);
    }
}

// Not an owner: all requests would write to the same count of owners.
IProcedure& RequestHandler::getProcedure(const std::string& method) const {
    const auto found = procedures.find(method);
    if (found == procedures.end()) {
        BasicError error(qierr::codes::unknownMethod, QITRMC_HERE);
        addUsageString(error.details(), "kUsageTypeMethod", method.c_str());
        throw error;
    }
    return *found->second;
}

}  // namespace nQITRMCWEBSVC100
