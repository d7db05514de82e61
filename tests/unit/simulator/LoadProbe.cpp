// Reads chassis descriptions from standard input, each as its length in decimal digits, a newline
// and so many bytes, and answers each with a line: "loaded", or the place of the fault as a JSON
// pointer, a tabulator, what is wrong, "; " and what would be right.

#include <cstdio>
#include <iostream>
#include <string>

#include "description/ChassisFile.h"
#include "description/Description.h"

namespace {

std::string answerTo(const std::string& description) {
    try {
        return simulator::parseChassis(description) != nullptr ? "loaded" : "nothing";
    } catch (const simulator::DescriptionFault& fault) {
        return simulator::oneLine(fault.pointer) + "\t" +
               simulator::oneLine(fault.wrong + "; " + fault.right);
    }
}

}  // namespace

int main() {
    std::size_t length = 0;
    while (std::cin >> length && std::cin.get() == '\n') {
        std::string description(length, '\0');
        if (!std::cin.read(description.data(), static_cast<std::streamsize>(length))) {
            break;
        }
        std::cout << answerTo(description) << std::endl;
    }
    return std::cin.eof() ? 0 : 1;
}
