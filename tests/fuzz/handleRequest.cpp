#include "harnesses.h"
#include "qitrmcwebsvc/RequestHandler.h"
#include "support/ModelledSessions.h"
#include "support/knownChassis.h"
#include "support/responseFault.h"

namespace {

using nQITRMCWEBSVC100::RequestHandler;

class Service {
  public:
    Service() {
        RecordingDriver::instance().reset();
        giveKnownChassis();
        sessions.answerCalls();
    }

    std::string answer(const std::string& body) { return handler.handleRequest(body); }

    // Closes the sessions that a request opened, so that the next one finds the service as it was.
    void closeAll() {
        for (const ModelledSessions::Handle session : sessions.open()) {
            const std::string id = std::to_string(session);
            answer(R"({"jsonrpc":"2.0","id":0,"method":"closeSession","params":)"
                   R"({"session_id":"_session)" +
                   id + "\"}}");
        }
        RecordingDriver& driver = RecordingDriver::instance();
        driver.takeCalls();
        fuzz::require(sessions.open().empty(), "a session cannot be closed by its id");
        fuzz::require(sessions.callsForClosedSessions() == 0, "a closed session was used");
        fuzz::require(driver.outstanding() == 0, "what the driver lent was kept");
    }

  private:
    ModelledSessions sessions;
    RequestHandler handler;
};

}  // namespace

void fuzz::handleRequest(std::string_view input) {
    static Service service;
    const std::string response = service.answer(std::string(input));
    require(responseFault(response).empty(), "the response is not sound");
    service.closeAll();
}
