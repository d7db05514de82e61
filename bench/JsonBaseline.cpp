#include "JsonBaseline.h"

#include <rapidjson/document.h>
#include <rapidjson/schema.h>
#include <rapidjson/stringbuffer.h>
#include <rapidjson/writer.h>

#include <stdexcept>

#include "embedded/EmbeddedFiles.h"

namespace {

void parse(rapidjson::Document& document, const char* text) {
    if (document.Parse(text).HasParseError()) {
        throw std::runtime_error("not a JSON text");
    }
}

}  // namespace

struct JsonBaseline::Documents {
    Documents(const char* schemaFile, const std::string& responseText) {
        parse(schema, embeddedText(schemaFile));
        parse(definitions, embeddedText("definitions.json"));
        schema.AddMember("definitions", definitions["definitions"], schema.GetAllocator());
        compiled = std::make_unique<rapidjson::SchemaDocument>(schema);
        parse(response, responseText.c_str());
    }

    bool isValid(const rapidjson::Value& request) const {
        rapidjson::SchemaValidator validator(*compiled);
        return request.Accept(validator);
    }

    rapidjson::Document definitions;
    rapidjson::Document schema;
    rapidjson::Document response;
    std::unique_ptr<rapidjson::SchemaDocument> compiled;
};

JsonBaseline::JsonBaseline(const char* schemaFile, const std::string& request,
                           const std::string& response)
    : documents(std::make_unique<Documents>(schemaFile, response)), request(request) {}

JsonBaseline::~JsonBaseline() = default;

std::size_t JsonBaseline::run() const {
    rapidjson::Document document;
    document.Parse(request.c_str());
    bool valid = !document.HasParseError();
    if (document.IsArray()) {
        for (const auto& element : document.GetArray()) {
            valid = valid && documents->isValid(element);
        }
    } else {
        valid = valid && documents->isValid(document);
    }
    rapidjson::StringBuffer text;
    rapidjson::Writer<rapidjson::StringBuffer> writer(text);
    documents->response.Accept(writer);
    return valid ? text.GetSize() : 0;
}
