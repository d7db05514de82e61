#include <qirelocations.h>

#include <cstdint>
#include <cstring>

// Moves one directory, fills the whole buffer for another, fails for a third and keeps the rest.
extern "C" __attribute__((visibility("default"))) std::int32_t get_relocated_dir(
    const char* key, char* buffer, std::uint32_t bufferSize) {
    if (std::strcmp(key, "bindir") == 0) {
        std::strcpy(buffer, "/moved/bin");
        return 10;
    }
    if (std::strcmp(key, "docdir") == 0) {
        std::memset(buffer, 'd', bufferSize);
        return static_cast<std::int32_t>(bufferSize);
    }
    return std::strcmp(key, "libdir") == 0 ? -1 : 0;
}
