#include "description/ErrorReport.h"

#include <cstdio>

#include "status/Refusal.h"

namespace simulator {

void reportError(const std::string& source, const DescriptionError& fault) {
    const std::string place = fault.pointer.empty() ? "" : oneLine(fault.pointer) + " ";
    std::fprintf(stderr, "qitrmcapi: %s: %s%s; %s\n", source.c_str(), place.c_str(),
                 oneLine(fault.wrong).c_str(), oneLine(fault.right).c_str());
}

void refuseStart(const std::string& source, const DescriptionError& fault) {
    reportError(source, fault);
    throw Refusal(code::chassisNotLoaded)
        .usage(tag::fileName, source)
        .usage(tag::jsonPointer, fault.pointer)
        .usage(tag::explanation, fault.wrong + "; " + fault.right);
}

}  // namespace simulator
