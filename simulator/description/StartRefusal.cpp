#include "description/StartRefusal.h"

#include <cstdio>

#include "status/Refusal.h"

namespace simulator {

void refuseStart(const std::string& source, const DescriptionFault& fault) {
    const std::string place = fault.pointer.empty() ? "" : fault.pointer + " ";
    std::fprintf(stderr, "qitrmcapi: %s: %s%s; %s\n", source.c_str(), place.c_str(),
                 fault.wrong.c_str(), fault.right.c_str());
    throw Refusal(code::chassisNotLoaded)
        .usage(tag::fileName, source)
        .usage(tag::jsonPointer, fault.pointer)
        .usage(tag::explanation, fault.wrong + "; " + fault.right);
}

}  // namespace simulator
