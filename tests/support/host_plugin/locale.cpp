// Gives the host the functions of the service, which it links, in a process that uses the locale of
// its user. That locale must have a decimal comma.

#include <clocale>
#include <cstdio>
#include <cstdlib>

__attribute__((constructor)) static void followLocale() {
    if (std::setlocale(LC_ALL, "") == nullptr || std::localeconv()->decimal_point[0] != ',') {
        std::fputs("The locale has no decimal comma.\n", stderr);
        std::abort();
    }
}
