#include "qitrmcwebsvc/compactJson.h"

#include <cmath>

namespace nQITRMCWEBSVC100 {
namespace {

class FiniteWriter : public JsonWriter {
  public:
    using JsonWriter::JsonWriter;

    bool Double(double value) { return std::isfinite(value) ? JsonWriter::Double(value) : Null(); }
};

}  // namespace

std::string compactJson(const JsonValue& value) {
    JsonBuffer text;
    FiniteWriter writer(text);
    value.Accept(writer);
    return std::string(text.GetString(), text.GetSize());
}

}  // namespace nQITRMCWEBSVC100
