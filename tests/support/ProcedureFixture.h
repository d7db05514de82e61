#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "qitrmcwebsvc/ProcedureFactory.h"
#include "support/DriverTest.h"

using Texts = std::vector<std::string>;

// All procedures with their schemas and a session manager, over a recording driver that knows a
// small chassis: devices Mod1, Mod2, Mod3 and Bench; channels Mod1/ch0 to Mod1/ch2, Mod2/ch0; the
// area Mod1/user. Every session that the driver opens has the handle 7; properties that the driver
// defines open as 21, others as 22, and commands as 31.
class ProcedureFixture : public DriverTest {
  protected:
    void SetUp() override;
    void TearDown() override;

    // Opens the session "_session7" again, on the resources that these members of params name, and
    // forgets the calls.
    void openSession(const std::string& members = "");

    // Runs a method with "session_id" of that session and more members of params. Returns the
    // compact text of the result, or of the failure: its code and, after a blank, the details for
    // the translator, if any.
    std::string ask(const std::string& method, const std::string& members = "");
    // The same with the whole of params.
    std::string request(const std::string& method, const std::string& params);

    // Sets the driver's answers from now on.
    void give(const std::string& call, RecordingDriver::Value value);
    void fail(const std::string& call, std::int32_t code, const std::string& json = "");
    // Makes one of the calls with the same text fail; `earlier` of them are answered as before.
    void failLater(const std::string& call, int earlier, std::int32_t code);
    // The data type of every property.
    void giveDataType(std::int32_t number);

    // Declares that the code under test gives the driver one array of its own to free.
    void expectOwnArray() { driver.lend(); }

    // The text of the latest failure's status.
    std::string statusText;

  private:
    std::map<std::string, RecordingDriver::Reply> given;
    std::unique_ptr<nQITRMCWEBSVC100::ProcedureFactory> factory;
};

// The call that reads the names of all devices.
inline const std::string readDevices = "getSystemPropertyStringArray(7, \"Sys.Devices\")";

// The calls after the one that reads a property's data type.
Texts afterOpening(const Texts& calls);

// The text of a failure with one detail.
std::string failure(std::int32_t code, const std::string& usage, const std::string& value);
std::string internalError(const std::string& comment);
