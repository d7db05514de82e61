#include "host/SimulatedDriver.h"

#include <dlfcn.h>
#include <qitrmcapi.h>
#include <qitrmcsim.h>

#include <memory>

#include "host/Failure.h"

namespace host {

namespace {

// Null when the plug-in has not loaded the driver. The plug-in keeps it loaded, so no reference to
// it stays here.
void* loadedDriver() {
    void* const driver = dlopen("libqitrmcapi.so.1", RTLD_NOW | RTLD_NOLOAD);
    if (driver != nullptr) {
        dlclose(driver);
    }
    return driver;
}

template <typename Function>
Function* find(const char* name) {
    return reinterpret_cast<Function*>(driverFunction(name));
}

void addCount(std::string& text, std::uint32_t count, const char* things) {
    if (count != 0) {
        text += (text.empty() ? "" : ", ") + std::to_string(count) + " " + things;
    }
}

}  // namespace

void* driverFunction(const char* name) {
    void* const driver = loadedDriver();
    return driver == nullptr ? nullptr : dlsym(driver, name);
}

std::string startSimulatedDriver() {
    const auto start = find<decltype(qitrmcsim_start)>("qitrmcsim_start");
    const auto freeString = find<decltype(nQITRMCAPI100_freeString)>("nQITRMCAPI100_freeString");
    if (start == nullptr || freeString == nullptr) {
        return "";
    }
    char* text = nullptr;
    if (start(&text) != 0) {
        throw Failure(
            "The simulated chassis does not start. Mend what the line above names, and try again.");
    }
    const std::unique_ptr<char, decltype(freeString)> owner(text, freeString);
    return text;
}

std::string thingsNotGivenBack() {
    const auto countOutstanding =
        find<decltype(qitrmcsim_countOutstanding)>("qitrmcsim_countOutstanding");
    if (countOutstanding == nullptr) {
        return "";
    }
    qitrmcsim_Outstanding counts;
    countOutstanding(&counts);
    std::string text;
    addCount(text, counts.texts, "texts");
    addCount(text, counts.numberArrays, "arrays of numbers");
    addCount(text, counts.textArrays, "arrays of texts");
    addCount(text, counts.openProperties, "open properties");
    addCount(text, counts.openCommands, "open commands");
    return text;
}

std::optional<std::uint64_t> countDriverCalls() {
    const auto countCalls = find<decltype(qitrmcsim_countCalls)>("qitrmcsim_countCalls");
    if (countCalls == nullptr) {
        return std::nullopt;
    }
    return countCalls();
}

}  // namespace host
