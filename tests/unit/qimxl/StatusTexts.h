#pragma once

#include <string>
#include <vector>

// Texts of statuses of the translator mxlator_qitrmc, with inputs that the scripts must handle.
namespace statusTexts {

inline std::string withEntries(const std::string& entries) {
    return "{\"error_constant\":\"x\",\"file\":\"f.cpp\",\"line\":12,\"component\":\"qitrmcsvc\","
           "\"translator\":\"mxlator_qitrmc\",\"translator_info\":{\"ordered_data\":[" +
           entries + "]}}";
}

inline std::string usage(const std::string& tag, const std::string& value,
                         const std::string& valueType) {
    return "{\"type\":\"usage\",\"usage\":\"" + tag + "\",\"value\":" + value +
           ",\"value_type\":" + valueType + "}";
}

// Valid and invalid ones, for comparing the two ways of running the scripts.
inline std::vector<std::string> ofEveryKind() {
    const std::string one = usage("kUsageTypeName", "\"n\"", "\"string\"");
    return {
        withEntries(one),
        withEntries(one + "," + usage("kUsageTypeOffset", "17", "\"uint32_t\"")),
        withEntries(usage("kUsageTypeReservedBySessions", "[\"a\",\"b\"]", "\"string\"")),
        withEntries(usage("kUsageTypeAttributeId", "[4660,1]", "\"uint32_t\"")),
        withEntries(usage("kUsageTypeNobodyKnows", "\"\\u00e9\\n\\\"\"", "\"string\"")),
        withEntries(usage("x", "3", "{\"type\":\"enum\",\"id\":9}")),
        withEntries(usage("x", "[]", "\"string\"") + ",{\"type\":\"empty\"}"),
        withEntries("{\"type\":\"elaboration\",\"usage\":\"kAuxTermAvailableAreas\"},"
                    "{\"type\":\"header\",\"usage\":\"h\"},{\"type\":\"comment\"},5,null,\"x\""),
        "{\"translator\":\"mxlator_qitrmc\"}",
        "{\"translator\":\"mxlator_qitrmc\",\"translator_info\":null}",
        "{\"translator\":\"mxlator_qitrmc\",\"broken",
        "{\"translator\":\"mxlator_qitrmc\",\"broken\":01x}",
        "{\"translator\":\"mxlator_qitrmc\",\"big\":1e999}",
        "{\"translator\":\"mxlator_qitrmc\",\"nested_error\":{\"code\":-5,\"translator\":"
        "\"mxlator_qitrmc\",\"internal_error\":{\"api\":\"x\",\"code\":[1,2,{\"y\":null}]}}}",
        "{\"translator\":\"mxlator_qitrmc\",\"deep\":" + std::string(2000, '[') +
            std::string(2000, ']') + "}",
        withEntries(usage("x", "{\"a\":{}}", "7")),
        withEntries(usage("kUsageTypeAttributeId", "\"no number\"", "\"string\"")),
        withEntries(usage("kUsageTypeAttributeId", "-1", "\"int32_t\"")),
    };
}

}  // namespace statusTexts
