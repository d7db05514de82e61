#include "Api.h"
#include "lending/Lending.h"

void nQITRMCAPI100_freeString(char* text) {
    simulator::takeBackText(text);
}

void nQITRMCAPI100_freeArray(void* array) {
    simulator::takeBackNumbers(array);
}

void nQITRMCAPI100_freeStringArray(char** array, std::uint32_t) {
    simulator::takeBackTexts(array);
}
