// cxftool: see tools/cxftool/cxftool.cpp for the commands.
#include "tools/cxftool/cxftool.h"

#include <iostream>

int main(int argc, char **argv) {
    const std::vector<std::string> args(argv + 1, argv + argc);
    return cxftool::RunCxftool(args, std::cout, std::cerr);
}
