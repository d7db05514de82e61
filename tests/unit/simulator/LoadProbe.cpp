// Reads chassis descriptions, or with the argument "faults" descriptions of faults in the built-in
// chassis, from standard input, each as its length in decimal digits, a newline and that many
// bytes, and answers each with a line: "loaded", or the JSON pointer of the fault, a tabulator,
// what is wrong, "; " and what would be right.

#include <cstdio>
#include <iostream>
#include <string>

#include "EmbeddedTexts.h"
#include "description/ChassisReader.h"
#include "description/Description.h"
#include "faults/FaultReader.h"

namespace {

void loadChassis(const std::string& description) {
    simulator::parseChassis(description);
}

void loadFaults(const std::string& description) {
    static const auto described = simulator::parseChassis(embedded::bench);
    simulator::readFaults(description, *described.chassis);
}

std::string answerTo(const std::string& description, void (*load)(const std::string&)) {
    try {
        load(description);
        return "loaded";
    } catch (const simulator::DescriptionError& fault) {
        return simulator::oneLine(fault.pointer) + "\t" +
               simulator::oneLine(fault.wrong + "; " + fault.right);
    }
}

}  // namespace

int main(int count, char** arguments) {
    const bool ofFaults = count > 1 && std::string(arguments[1]) == "faults";
    std::size_t length = 0;
    while (std::cin >> length && std::cin.get() == '\n') {
        std::string description(length, '\0');
        if (!std::cin.read(description.data(), static_cast<std::streamsize>(length))) {
            break;
        }
        std::cout << answerTo(description, ofFaults ? loadFaults : loadChassis) << std::endl;
    }
    return std::cin.eof() ? 0 : 1;
}
