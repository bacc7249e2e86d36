// cxftool: the command-line tool on the CxF3 document classes. main.cpp
// forwards to RunCxftool, and the tests call it directly.
#ifndef TESSARINE_TOOLS_CXFTOOL_H
#define TESSARINE_TOOLS_CXFTOOL_H

#include <ostream>
#include <string>
#include <vector>

namespace cxftool {

// Runs one command line (without the program name), writing results to
// ar_out and complaints to ar_err; gives the exit code (see commands.h).
int RunCxftool(const std::vector<std::string> &ar_args, std::ostream &ar_out, std::ostream &ar_err);

} // namespace cxftool

#endif // TESSARINE_TOOLS_CXFTOOL_H
