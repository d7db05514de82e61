#pragma once

// ASCII digits, whatever the locale. Shared by the plug-in, the simulator and the host.
namespace common {

constexpr bool isDigit(char c) {
    return c >= '0' && c <= '9';
}

// The value of a hexadecimal digit of either letter case, or -1.
constexpr int hexDigit(char c) {
    if (isDigit(c)) {
        return c - '0';
    }
    if (c >= 'a' && c <= 'f') {
        return c - 'a' + 10;
    }
    return c >= 'A' && c <= 'F' ? c - 'A' + 10 : -1;
}

}  // namespace common
