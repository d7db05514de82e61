#pragma once

// Sets up the recording driver with a small chassis, for sessions of any handle: the devices Mod1
// and Bench, of which Bench is a chassis that holds Mod1 in slot 2; the channel Mod1/ch0 and the
// area Mod1/user; the property Own of type Int32 and others of any type; and the command Zero.
void giveKnownChassis();
