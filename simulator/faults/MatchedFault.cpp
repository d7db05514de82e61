#include "faults/MatchedFault.h"

#include <algorithm>

#include "faults/Outputs.h"

namespace simulator {

namespace {

bool isAbout(const Resource& mentioned, const Resource& resource) {
    return &mentioned == &resource ||
           (resource.kind == Kind::Device && mentioned.device == resource.device);
}

// The resources that a call names, looked up once and only if a fault is about a resource.
class Subjects {
  public:
    Subjects(Simulator& simulator, const Call& call) : simulator(simulator), call(call) {}

    bool include(const Resource& resource) {
        if (!areFound) {
            find();
        }
        return std::any_of(found.begin(), found.end(), [&](const Resource* mentioned) {
            return isAbout(*mentioned, resource);
        });
    }

  private:
    void find() {
        if (call.resourceNames() != nullptr) {
            const Session none;
            const Session* session = simulator.sessions.find(call.sessionHandle());
            found = simulator.resolver(session != nullptr ? *session : none)
                        .mentioned(call.resourceNames());
        }
        areFound = true;
    }

    Simulator& simulator;
    const Call& call;
    bool areFound = false;
    std::vector<Resource*> found;
};

}  // namespace

MatchedFault::MatchedFault(Simulator& simulator, Faults& faults, const Call& call)
    : simulator(simulator), faults(faults), call(call), plan(faults.plan()) {
    Subjects subjects(simulator, call);
    for (std::size_t place = 0; place < plan->faults.size(); ++place) {
        Fault& candidate = plan->faults[place];
        if (faults.isPast(candidate.begin) && !faults.isPast(candidate.end) &&
            candidate.matchesFunction(call.function()) &&
            (candidate.resource == nullptr || subjects.include(*candidate.resource)) &&
            candidate.countCall(plan->seed, place) && fault == nullptr) {
            fault = &candidate;
        }
    }
}

void MatchedFault::applyBefore(WriteLock& lock) const {
    if (fault == nullptr) {
        return;
    }
    // A call on a session that is not open fails by itself, and nothing could end its delay.
    const nQITRMCAPI100_Session session = call.sessionHandle();
    if (fault->delay > 0.0 && (session == 0 || simulator.sessions.find(session) != nullptr)) {
        faults.delay(session, fault->delay, lock);
    }
    if (fault->status && fault->status->code() < 0 && !fault->failsAfterwards) {
        throw Refusal(*fault->status);
    }
}

void MatchedFault::applyAfter() const {
    if (fault == nullptr) {
        return;
    }
    try {
        if (fault->output) {
            distortOutputs(call, *fault->output);
        }
        if (fault->status) {
            throw Refusal(*fault->status);
        }
    } catch (const Refusal& refusal) {
        if (refusal.code() < 0) {
            takeBackOutputs(simulator, call);
        }
        throw;
    } catch (...) {
        takeBackOutputs(simulator, call);
        throw;
    }
}

}  // namespace simulator
