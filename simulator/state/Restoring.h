#pragma once

#include <map>
#include <string>

#include "model/Chassis.h"
#include "state/StateFile.h"

namespace simulator {

// The items under which what is no property is kept.
inline constexpr const char* contentItem = "";
inline constexpr const char* nameItem = "Dev.Name";
inline constexpr const char* changesItem = "Sys.ConfigChangeCount";

// Puts entries into a chassis that is as it was described. Entries for what the chassis does not
// have, or does not keep, are skipped; one that does not fit is reported on standard error, with
// the path of the folder.
void restore(const std::map<std::string, StateEntry>& entries, const char* folder,
             Chassis& chassis);

}  // namespace simulator
