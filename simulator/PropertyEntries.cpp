#include "Border.h"
#include "Lending.h"
#include "ListProperties.h"

using namespace simulator;

namespace {

void lendList(const std::vector<std::string>& texts, char*** array, uint32_t* count) {
    *array = lendTexts(texts);
    *count = static_cast<uint32_t>(texts.size());
}

}  // namespace

void nQITRMCAPI100_getSystemPropertyStringArray(nQITRMCAPI100_Session session, const char* property,
                                                char*** array, uint32_t* count,
                                                qierr_Status* status) {
    withSimulator(status, [&](Simulator& simulator, auto&) {
        *array = nullptr;
        *count = 0;
        simulator.sessions.get(session);
        lendList(systemList(simulator, required(property, "property")), array, count);
    });
}

void nQITRMCAPI100_getSessionPropertyStringArray(nQITRMCAPI100_Session session,
                                                 const char* property, char*** array,
                                                 uint32_t* count, qierr_Status* status) {
    withSimulator(status, [&](Simulator& simulator, auto&) {
        *array = nullptr;
        *count = 0;
        const Session& owner = simulator.sessions.get(session);
        lendList(sessionList(simulator, owner, required(property, "property")), array, count);
    });
}

void nQITRMCAPI100_getGenericPropertyStringArray(nQITRMCAPI100_Session session,
                                                 const char* resources, const char* property,
                                                 char*** array, uint32_t* count,
                                                 qierr_Status* status) {
    withSimulator(status, [&](Simulator& simulator, auto&) {
        *array = nullptr;
        *count = 0;
        const Session& user = simulator.sessions.get(session);
        const auto found = simulator.resolver(user).anyResources(required(resources, "resources"));
        expectSome(found);
        lendList(resourceList(*found.front(), required(property, "property")), array, count);
    });
}
