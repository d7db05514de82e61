#pragma once

#include <qixlatormgr.h>

#include <cstdlib>
#include <cstring>
#include <functional>
#include <map>
#include <string>
#include <vector>

#include "qierr/Status.h"
#include "qixlator/Registration.h"

// A registered translator that returns texts set by the test. Only one of a name may exist.
class TestXlator {
  public:
    explicit TestXlator(const char* name)
        : registration(qixlator::localRegistrations(), name, "the registration text", create) {
        registry()[name] = this;
    }
    ~TestXlator() { registry().erase(registration.name); }

    // The description of each code; a code that is missing has none.
    std::map<std::int32_t, std::string> descriptions;
    // The json1 text for every status.
    std::string json1;
    // The code with which a description fails.
    std::int32_t failure = 0;
    // The calls, in order; of long JSON texts only the beginnings.
    std::vector<std::string> calls;
    // The names of the translators that were destroyed, those of other objects of this class too.
    static std::vector<std::string>& destroyed() {
        static std::vector<std::string> names;
        return names;
    }

  private:
    struct Instance : XlatorInterface {
        TestXlator* owner;
        std::string name;
    };

    static std::map<std::string, TestXlator*>& registry() {
        static std::map<std::string, TestXlator*> xlators;
        return xlators;
    }

    static XlatorInterface* create(const char* name, const char* info, qierr_Status* status) {
        TestXlator* owner = registry()[name];
        owner->calls.push_back(std::string("create ") + name + " with " + info);
        if (owner->failure != 0) {
            qierr_Status_setCode(status, owner->failure);
            return nullptr;
        }
        return new Instance{{16, destroy, getStaticDesc, getDynamicDesc}, owner, name};
    }

    static void destroy(XlatorInterface* self) {
        auto* instance = static_cast<Instance*>(self);
        destroyed().push_back(instance->name);
        // A session may outlive the test's object.
        const auto owner = registry().find(instance->name);
        if (owner != registry().end()) {
            owner->second->calls.push_back("destroy");
        }
        delete instance;
    }

    static char* allocated(const std::string& text, qixlator_Alloc alloc, void* allocContext,
                           qierr_Status* status) {
        const auto size = static_cast<std::uint32_t>(text.size() + 1);
        auto* copy = static_cast<char*>(alloc(nullptr, size, allocContext, status));
        return copy == nullptr ? nullptr : std::strcpy(copy, text.c_str());
    }

    static char* getStaticDesc(XlatorInterface* self, std::int32_t code, std::uint32_t attributes,
                               qixlator_Alloc alloc, void* allocContext, qierr_Status* status) {
        TestXlator* owner = static_cast<Instance*>(self)->owner;
        owner->calls.push_back("static " + std::to_string(code) + " " + std::to_string(attributes));
        const auto found = owner->descriptions.find(code);
        return found == owner->descriptions.end()
                   ? nullptr
                   : allocated(found->second, alloc, allocContext, status);
    }

    static char* getDynamicDesc(XlatorInterface* self, const char* json, std::uint32_t,
                                const char* format, qixlator_Alloc alloc, void* allocContext,
                                qierr_Status* status) {
        TestXlator* owner = static_cast<Instance*>(self)->owner;
        owner->calls.push_back(
            (std::string("dynamic ") + format + " ").append(json, strnlen(json, 200)));
        return owner->json1.empty() ? nullptr
                                    : allocated(owner->json1, alloc, allocContext, status);
    }

    qixlator::XlatorRegistration registration;
};
