#include <cstdlib>

#include "Api.h"
#include "entries/Lending.h"

void nQITRMCAPI100_freeString(char* text) {
    std::free(text);
}

void nQITRMCAPI100_freeArray(void* array) {
    std::free(array);
}

void nQITRMCAPI100_freeStringArray(char** array, uint32_t count) {
    simulator::takeBackTexts(array, array == nullptr ? 0 : count);
}
