#pragma once

// A describeStatus for tests: the text of a status is its code and the usage items of its details,
// for example "-32602 kUsageTypeParameter=#/params kUsageTypeDetails=Wrong.", so that a response
// shows what was raised.
namespace plainDescriptions {

// Makes this many descriptions fail, from the one after `skipped` on, each with code -52006.
void failNext(int count, int skipped = 0);

}  // namespace plainDescriptions
