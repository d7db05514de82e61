#pragma once

#include <map>
#include <string>
#include <vector>

namespace simulator {

// The properties that the driver itself defines, by category.
struct Catalogue {
    std::vector<std::string> system;
    std::vector<std::string> session;
    std::vector<std::string> device;
    std::vector<std::string> physChan;
    std::vector<std::string> nvmemArea;
};

}  // namespace simulator
