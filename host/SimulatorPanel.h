#pragma once

#include <qitrmcapi.h>
#include <qitrmcsim.h>

#include <memory>
#include <string>

#include "host/Site.h"

namespace host {

// What a panel of the simulated chassis needs, below /simulator/, for clients at a loopback address
// alone:
//
//   GET  /simulator/devices      the devices with their slots, states and registers
//   GET  /simulator/faults       the faults and events in force
//   POST /simulator/faults       replaces them; an event "pulled" pulls a module
//   GET  /simulator/trace/N      the calls of the driver from the Nth on
//
// include/qitrmcsim.h describes the JSON texts.
class SimulatorPanel : public SitePart {
  public:
    // Null when the plug-in has loaded another driver than the simulated one.
    static std::unique_ptr<SitePart> find();

    bool has(const std::string& path) const override;
    SiteResponse answer(const SiteRequest& request) const override;

  private:
    SimulatorPanel();

    SiteResponse read(const std::string& path) const;
    SiteResponse setFaults(const std::string& json) const;
    SiteResponse respond(std::int32_t code, char* json) const;

    decltype(nQITRMCAPI100_freeString)* const freeString;
    decltype(qitrmcsim_describeDevices)* const describeDevices;
    decltype(qitrmcsim_getFaults)* const getFaults;
    decltype(qitrmcsim_setFaults)* const replaceFaults;
    decltype(qitrmcsim_readTrace)* const readTrace;
};

}  // namespace host
