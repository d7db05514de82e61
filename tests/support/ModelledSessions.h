#pragma once

#include <cstdint>
#include <map>
#include <mutex>
#include <string>
#include <vector>

#include "support/RecordingDriver.h"

// Makes the recording driver keep sessions as a real driver does: it opens them under the handles
// 1, 2, 3 and so on, reserves the devices of their resources for them alone, and refuses any other
// call for a handle that is not open.
class ModelledSessions {
  public:
    using Handle = std::uint32_t;
    using Reply = RecordingDriver::Reply;

    static constexpr std::int32_t deviceReserved = -250811;
    static constexpr std::int32_t notOpen = -250955;

    // Replaces the replies to all calls that are modelled. May be called again to undo replies that
    // a test has set since. The driver must not be called after the model is destroyed.
    void answerCalls();

    // Every call that succeeds from now on returns this positive code and text.
    void warn(std::int32_t code, std::string json);

    // The handles of the sessions that are open now.
    std::vector<Handle> open() const;
    // How many sessions have been opened so far.
    Handle opened() const;
    // How many calls were made for sessions that were not open.
    int callsForClosedSessions() const;

  private:
    using Devices = std::vector<std::string>;

    Reply success(RecordingDriver::Value value) const;
    Reply openOn(const Devices& devices);
    Reply closeOf(const std::string& call);
    Reply reservedBy(const std::string& call);
    Reply check(const std::string& call);
    bool isReserved(const std::string& device) const;

    mutable std::mutex mutex;
    std::map<Handle, Devices> sessions;
    Handle lastHandle = 0;
    int strayCalls = 0;
    std::int32_t warningCode = 0;
    std::string warningText;
};
