#pragma once

#include "qitrmcwebsvc/procedure/Procedure.h"

namespace nQITRMCWEBSVC100 {

// Renames the modules of a chassis after its new name and their slots, and the chassis last.
//
// Nothing is undone on failure: the modules before it keep their new names, those after it and the
// chassis their old ones. Throws BasicError -250812 for a device that is no chassis. Result:
// new_module_names, new_chassis_name.
class RenameChassisAndAllConnectedModules : public SessionProcedure {
  public:
    using SessionProcedure::SessionProcedure;

  private:
    void run(const JsonValue& params, const std::shared_ptr<SessionContext>& session,
             SingleResponse& response) override;
};

}  // namespace nQITRMCWEBSVC100
