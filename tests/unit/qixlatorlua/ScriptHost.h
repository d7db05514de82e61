#pragma once

#include <string>

#include "qierr/Status.h"
#include "qixlator/qixlator.h"
#include "qixlatorlua/LuaXlator.h"
#include "support/TestRoot.h"

// Runs scripts of a test as translators, in states of the host.
class ScriptHost {
  public:
    explicit ScriptHost(qixlatorlua::LuaRuntime runtime) : runtime(runtime) {}

    // Stores a script as a module in the directory that the states search.
    void write(const std::string& module, const std::string& script) const {
        root.write("/scripts/" + module + ".lua", script);
    }

    std::string registration(const std::string& module) const {
        return "{\"qixlatorlua_xlator\":\"" + module + "\",\"qixlatorlua_path\":\"" +
               root.locate("/scripts") + "\"}";
    }

    XlatorInterface* create(const std::string& registrationInfo, qierr_Status* status) const {
        return qixlatorlua::createLuaXlator("test_name", registrationInfo.c_str(), runtime, status);
    }

    // The description of the code -1 by a translator that consists of this chunk: the text that the
    // chunk returns. "(null)" when there is none.
    std::string run(const std::string& chunk, qierr_Status* status) const {
        write("chunk", "return { getStaticDesc = function(code, lang, ade)\n" + chunk + "\nend }");
        XlatorInterface* xlator = create(registration("chunk"), status);
        if (xlator == nullptr) {
            return "(no translator)";
        }
        const std::string text =
            taken(xlator->getStaticDesc(xlator, -1, 0x203, qixlator_realloc, nullptr, status));
        xlator->destroy(xlator);
        return text;
    }

    static std::string taken(char* text) {
        const std::string copy = text == nullptr ? "(null)" : text;
        qixlator_realloc(text, 0, nullptr, nullptr);
        return copy;
    }

    TestRoot root;

  private:
    qixlatorlua::LuaRuntime runtime;
};

inline bool reported(const qierr_Status& status, const std::string& part) {
    return status.json != nullptr && std::string(status.json).find(part) != std::string::npos;
}
