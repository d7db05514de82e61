#pragma once

#include <cstdint>
#include <list>
#include <map>
#include <set>
#include <string>
#include <vector>

#include "model/Chassis.h"
#include "sessions/Waits.h"

namespace simulator {

// The numbers of the enumeration "ReservationAccess".
inline constexpr std::int32_t readOnlyAccess = 1;
inline constexpr std::int32_t readWriteAccess = 3;

// The reservation of a device that a session holds or asks for.
struct Holding {
    nQITRMCAPI100_Session session;
    std::int32_t access;
    std::string group;

    // Whether two sessions cannot hold these at the same time. They can if both only read, or if
    // both name the same group.
    bool conflictsWith(const Holding& other) const;
};

// Which session holds which device. A session holds a device at most once; reserving it again
// replaces the access and the group. Every operation needs the simulator's mutex to be held.
class Reservations {
  public:
    Reservations(const Chassis& chassis, Waits& waits);

    // Reserves all of these devices or none. Calls that wait are served in the order of arrival
    // among those that want the same devices; for a call that does not wait, and at the end of a
    // wait, only the holders count. Refuses
    // with deviceReserved, and when the session is aborted or closed meanwhile. The mutex is
    // unlocked during the wait.
    void reserve(const std::vector<Device*>& devices, const Holding& wanted, double timeout,
                 WriteLock& lock);

    // Releases one device. Returns whether the session held it.
    bool release(nQITRMCAPI100_Session session, const Device& device);
    void releaseAll(nQITRMCAPI100_Session session);

    // The devices that a session holds, in the order of the chassis.
    std::vector<Device*> heldBy(nQITRMCAPI100_Session session) const;

    // To be called before a session changes a device. Refuses with
    // readOnlyReservation when the session holds the device for reading, and with deviceReserved
    // when it does not hold the device and another session does.
    void expectWritable(nQITRMCAPI100_Session session, const Device& device) const;

  private:
    struct ByPlace {
        using is_transparent = void;
        bool operator()(const Device* left, const Device* right) const {
            return left->place < right->place;
        }
    };
    using HeldDevices = std::map<nQITRMCAPI100_Session, std::set<Device*, ByPlace>>;

    // A reservation that is asked for. All memory is allocated beforehand, so that granting cannot
    // fail.
    struct Request {
        Request(const std::vector<Device*>& devices, const Holding& wanted);

        const std::vector<Device*>& devices;
        const Holding& wanted;
        std::list<Holding> holdings;
        HeldDevices held;
        Wait wait;
    };

    bool isFree(const Request& request) const;
    bool competes(const Request& earlier, const Request& later) const;
    bool mustQueue(const Request& request) const;
    void grant(Request& request) noexcept;
    void removeHolding(nQITRMCAPI100_Session session, const Device& device) noexcept;
    void serveQueue() noexcept;
    void waitInQueue(Request& request, double timeout, WriteLock& lock);
    [[noreturn]] void refuse(const Request& request) const;
    bool conflictsOn(const Device& device, const Holding& wanted) const;
    const Holding* find(nQITRMCAPI100_Session session, const Device& device) const;

    // By the places of the devices, and the same by session.
    std::vector<std::list<Holding>> holders;
    HeldDevices held;
    std::list<Request*> queue;
    Waits& waits;
};

}  // namespace simulator
