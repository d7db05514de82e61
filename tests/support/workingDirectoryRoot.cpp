#include "qisysq/installRoot.h"

const char* qisysq_installRoot() {
    return ".";
}
