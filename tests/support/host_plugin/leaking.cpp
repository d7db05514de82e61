// A plug-in that does not free what the driver lends it.

#include <qitrmcapi.h>

#include <cstdint>

namespace {

std::int32_t keepNoDetails(qierr_Status*, std::uint32_t) {
    return 0;
}

}  // namespace

extern "C" {
void qitrmcInit() {
    qierr_Status status = {0, 0, keepNoDetails, nullptr};
    nQITRMCAPI100_Session session = 0;
    nQITRMCAPI100_initializeSessionWithoutResources(&session, &status);
    // The driver's own list keeps the text reachable, so no leak checker reports it.
    char* text = nullptr;
    nQITRMCAPI100_getGenericPropertyString(session, "Mod1", "Dev.ProductName", &text, &status);
    nQITRMCAPI100_Property property = 0;
    nQITRMCAPI100_openDriverDefinedProperty(session, "Dev.Name", &property, &status);
    nQITRMCAPI100_openDriverDefinedProperty(session, "Sys.Devices", &property, &status);
}
void qitrmcPause() {}
void qitrmcResume() {}
void qitrmcFinalize() {}
void qitrmcRun(void*, void*) {}
}
