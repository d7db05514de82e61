#pragma once

#include <optional>
#include <string_view>
#include <vector>

#include "model/Chassis.h"
#include "sessions/Reservations.h"
#include "sessions/Sessions.h"

namespace simulator {

// Turns the names that come with a call of a session into resources. The tokens, such as
// "$DefaultDevices", stand for the session's own lists. Needs the simulator's mutex to be held.
class Resolver {
  public:
    Resolver(const Chassis& chassis, const Reservations& reservations, const Session& session)
        : chassis(chassis), reservations(reservations), session(session) {}

    // The resources of a joined text in its order, each as often as it is named. A name that is
    // unknown or of another kind is refused with the status of the kind, and one that belongs to
    // a device which does not answer with connectionLost or deviceRemoved.
    std::vector<Resource*> resources(Kind kind, std::string_view joined) const;
    // As above for resources of any kind.
    std::vector<Resource*> anyResources(std::string_view joined) const;
    // The resource of a text that is a single name; null for a list, a range or a token. Refuses
    // like anyResources().
    Resource* singleResource(std::string_view joined) const;
    // Devices, each once. Refuses with noResources when there is none.
    std::vector<Device*> devices(std::string_view joined) const;
    // As above, together with devices whose connection is lost.
    std::vector<Device*> devicesToConnect(std::string_view joined) const;

    // The one resource that a text must name. Refuse with noResources and severalResources.
    Device& oneDevice(std::string_view joined) const;
    NvmemArea& oneNvmemArea(std::string_view joined) const;

    std::vector<Device*> reservedDevices() const;

    // Those resources of a joined text that there are, up to a range that is not valid.
    std::vector<Resource*> mentioned(std::string_view joined) const;

  private:
    std::optional<std::vector<Resource*>> tokenResources(std::string_view name) const;
    Resource& named(Kind kind, std::string_view name) const;
    Resource& named(std::string_view name) const;
    std::vector<Resource*> ofKind(Kind kind, std::string_view joined) const;
    template <typename Find>
    std::vector<Resource*> collect(std::string_view joined, Find find) const;

    const Chassis& chassis;
    const Reservations& reservations;
    const Session& session;
};

// Refuses with noResources when the list is empty.
void expectSome(const std::vector<Resource*>& resources);
// As above, and with severalResources when there is more than one.
void expectOne(const std::vector<Resource*>& resources);

// The resources without repetitions, in their order.
std::vector<Resource*> distinct(const std::vector<Resource*>& resources);

// The devices that resources belong to, each once, in the order of the resources.
std::vector<Device*> owners(const std::vector<Resource*>& resources);

}  // namespace simulator
