#include "description/StartRefusal.h"

#include <cstdio>

#include "status/Refusal.h"

namespace simulator {

void tellFault(const std::string& source, const DescriptionFault& fault) noexcept {
    std::fprintf(stderr, "qitrmcapi: %s: %s%s%s; %s\n", source.c_str(), fault.pointer.c_str(),
                 fault.pointer.empty() ? "" : " ", fault.wrong.c_str(), fault.right.c_str());
}

void refuseStart(const std::string& source, const DescriptionFault& fault) {
    tellFault(source, fault);
    throw Refusal(code::chassisNotLoaded)
        .usage(tag::fileName, source)
        .usage(tag::jsonPointer, fault.pointer)
        .usage(tag::explanation, fault.wrong + "; " + fault.right);
}

}  // namespace simulator
