#pragma once

namespace host {

// Has the driver that the plug-in has loaded open a session, so that a chassis that does not load
// is told at the start and not to the first client. A plug-in without a driver passes. Throws
// Failure; the driver itself says on standard error what is wrong. To be called before the first
// thread.
void checkDriver();

}  // namespace host
