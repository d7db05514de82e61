#include "embedded/EmbeddedFiles.h"

#include <cstring>
#include <stdexcept>
#include <string>

const char* embeddedText(const char* name) {
    for (const EmbeddedFile& file : embeddedFiles()) {
        if (std::strcmp(file.name, name) == 0) {
            return file.data;
        }
    }
    throw std::out_of_range(std::string("no embedded file ") + name);
}
