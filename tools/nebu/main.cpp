// The nebu console: a host for the NEBU plug-in, driving a virtual board.
#include <iostream>

#if defined(_WIN32)
#include <fcntl.h>
#include <io.h>
#include <stdio.h>
#else
#include <unistd.h>
#endif

#include "App.h"

int main(int argc, char** argv) {
#if defined(_WIN32)
    const bool terminal = _isatty(_fileno(stdin)) != 0;
    // Line ends as on every other platform: the output is the same, byte for byte.
    _setmode(_fileno(stdout), _O_BINARY);
    _setmode(_fileno(stderr), _O_BINARY);
#else
    const bool terminal = isatty(STDIN_FILENO) != 0;
#endif
    return nebu::runNebu(argc, argv, std::cin, std::cout, std::cerr, terminal);
}
