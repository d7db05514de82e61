#include "qitrmcwebsvc/SchemaRun.h"

#include <gtest/gtest.h>

#include <memory>
#include <random>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "embedded/EmbeddedFiles.h"

namespace nQITRMCWEBSVC100 {
namespace {

class Schema {
  public:
    explicit Schema(const char* file) {
        document.Parse(embeddedText(file));
        definitions.Parse(embeddedText("definitions.json"));
        document.AddMember("definitions", definitions["definitions"], document.GetAllocator());
        compiled = std::make_unique<JsonSchemaDocument>(document);
    }

    const JsonSchemaDocument& operator*() const { return *compiled; }

    std::vector<std::string> parameterNames() const {
        std::vector<std::string> names;
        for (const auto& member : document["properties"]["params"]["properties"].GetObject()) {
            names.push_back(member.name.GetString());
        }
        return names;
    }

  private:
    JsonDocument document;
    JsonDocument definitions;
    std::unique_ptr<JsonSchemaDocument> compiled;
};

std::string fragment(const JsonPointer& pointer) {
    JsonBuffer buffer;
    pointer.StringifyUriFragment(buffer);
    return buffer.GetString();
}

// The outcome when the JSON library itself passes the whole request to the validator.
std::string outcomeOfFullWalk(const Schema& schema, const JsonValue& request) {
    rapidjson::GenericSchemaValidator<JsonSchemaDocument> validator(*schema);
    if (request.Accept(validator)) {
        return "accepted";
    }
    return fragment(validator.GetInvalidDocumentPointer()) + " " +
           fragment(validator.GetInvalidSchemaPointer()) + " " +
           validator.GetInvalidSchemaKeyword();
}

std::string outcomeOfRun(const Schema& schema, const JsonValue& request) {
    SchemaRun run(*schema);
    if (run.accepts(request)) {
        return "accepted";
    }
    const SchemaFailure failure = run.failure();
    return failure.documentPointer + " " + failure.schemaPointer + " " + failure.keyword;
}

// Makes requests of which many pass the first checks, with containers at all depths.
class RequestMaker {
  public:
    explicit RequestMaker(std::vector<std::string> names) : names(std::move(names)) {}

    std::string request() {
        std::string params;
        for (const std::string& name : names) {
            if (chance(75)) {
                params += (params.empty() ? "\"" : ",\"") + name + "\":" + value(4);
            }
        }
        const std::string unknown = chance(20) ? R"("unknown":)" + value(4) + "," : "";
        return "{" + unknown + R"("id":1,"params":{)" + params + "}}";
    }

  private:
    bool chance(int percent) { return pick(100) < percent; }
    int pick(int count) { return static_cast<int>(random() % static_cast<unsigned>(count)); }

    std::string value(int depth) {
        if (depth > 0 && chance(30)) {
            return list("[", "]", depth, false);
        }
        if (depth > 0 && chance(10)) {
            return list("{", "}", depth, true);
        }
        return scalars[pick(static_cast<int>(scalars.size()))];
    }

    std::string list(const char* open, const char* close, int depth, bool named) {
        std::string text = open;
        const int count = pick(4);
        for (int i = 0; i < count; ++i) {
            if (i > 0) {
                text += ",";
            }
            if (named) {
                text += "\"m" + std::to_string(i) + "\":";
            }
            text += value(depth - 1);
        }
        return text + close;
    }

    std::mt19937 random{20201};
    const std::vector<std::string> names;
    const std::vector<const char*> scalars = {
        "\"_session1\"", "\"_session1\"", "\"text\"", "1", "8", "-1", "1.5", "true", "null"};
};

class SchemaRunOf : public testing::TestWithParam<const char*> {};

// The run replaces deep containers by null, which must never change the outcome.
TEST_P(SchemaRunOf, HasTheOutcomeOfAFullWalk) {
    const Schema schema(GetParam());
    RequestMaker maker(schema.parameterNames());
    std::set<std::string> outcomes;
    for (int i = 0; i < 3000; ++i) {
        const std::string text = maker.request();
        JsonDocument request;
        request.Parse(text.data(), text.size());
        ASSERT_FALSE(request.HasParseError()) << text;
        const std::string outcome = outcomeOfRun(schema, request);
        ASSERT_EQ(outcomeOfFullWalk(schema, request), outcome) << text;
        outcomes.insert(outcome);
    }
    // There must be more outcomes than parameters, or the requests would prove little.
    EXPECT_GT(outcomes.size(), schema.parameterNames().size());
}

INSTANTIATE_TEST_SUITE_P(Schemas, SchemaRunOf,
                         testing::Values("procedure_set_property.json",
                                         "procedure_set_nvmem_bytes.json",
                                         "procedure_execute_command.json",
                                         "procedure_read_register.json",
                                         "procedure_initialize_session.json"));

// A value that is nested a million times would take hours if each level cost a look at all others,
// and would overflow the call stack if each level were a call.
JsonValue nested(int levels, JsonAllocator& allocator) {
    JsonValue value(rapidjson::kArrayType);
    for (int i = 0; i < levels; ++i) {
        JsonValue outer(rapidjson::kArrayType);
        outer.Reserve(1, allocator);
        outer.PushBack(value, allocator);
        value = std::move(outer);
    }
    return value;
}

TEST(SchemaRun, IsFastOnDeeplyNestedValues) {
    constexpr int levels = 1000000;
    const Schema schema("procedure_set_property.json");
    JsonDocument request;
    request.Parse(R"({"params":{"session_id":"_session1","property":"p"}})");
    JsonAllocator& allocator = request.GetAllocator();

    request.AddMember("unknown", nested(levels, allocator), allocator);
    EXPECT_EQ(outcomeOfRun(schema, request), "#/params #/properties/params required");

    request["params"].AddMember("value", nested(levels, allocator), allocator);
    EXPECT_EQ(outcomeOfRun(schema, request), "#/params/value #/definitions/property_value oneOf");
}

TEST(SchemaRun, AcceptsAMemberOfTheRootThatIsDeeplyNested) {
    const Schema schema("procedure_initialize_session.json");
    JsonDocument request;
    request.Parse(R"({"params":{}})");
    request.AddMember("unknown", nested(1000000, request.GetAllocator()), request.GetAllocator());
    EXPECT_EQ(outcomeOfRun(schema, request), "accepted");
}

}  // namespace
}  // namespace nQITRMCWEBSVC100
