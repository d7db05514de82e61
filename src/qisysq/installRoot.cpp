#include "qisysq/installRoot.h"

const char* qisysq_installRoot() {
    return QITRMC_ROOT;
}
