// The nebu console: a host for the NEBU plug-in, driving a virtual board.
#include <iostream>

#if defined(_WIN32)
#include <io.h>
#include <stdio.h>
#else
#include <unistd.h>
#endif

#include "App.h"

int main(int argc, char** argv) {
#if defined(_WIN32)
    const bool terminal = _isatty(_fileno(stdin)) != 0;
#else
    const bool terminal = isatty(STDIN_FILENO) != 0;
#endif
    return nebu::runNebu(argc, argv, std::cin, std::cout, std::cerr, terminal);
}
