// The commands of cxftool. Each command reads its parsed arguments and
// writes its results to one stream and its complaints to the other, so that
// the tests can run it without a process of its own.
#ifndef TESSARINE_TOOLS_CXFTOOL_COMMANDS_H
#define TESSARINE_TOOLS_CXFTOOL_COMMANDS_H

#include <map>
#include <ostream>
#include <string>
#include <vector>

namespace cxftool {

// Exit codes.
constexpr int k_exit_ok = 0;
constexpr int k_exit_failure = 1; // the file could not be read or written, is invalid or lacks what was asked for
constexpr int k_exit_usage = 2;   // the command line is wrong

// The arguments of one command after parsing: its FILE and the options that
// were given, by name with their dashes (e.g. "--format").
struct Arguments {
    std::string file;
    std::map<std::string, std::string> options;

    std::string Option(const std::string &ar_name, const std::string &ar_fallback) const;
    bool HasOption(const std::string &ar_name) const;
};

struct Command {
    std::string name;
    // One line in the tool's help.
    std::string summary;
    // The text of `cxftool NAME --help`.
    std::string help;
    // The options that take a value; any other option is refused.
    std::vector<std::string> valueOptions;
    int (*run)(const Arguments &ar_args, std::ostream &ar_out, std::ostream &ar_err);
};

const Command &InfoCommand();
const Command &ValidateCommand();
const Command &DumpCommand();
const Command &ExampleCommand();

} // namespace cxftool

#endif // TESSARINE_TOOLS_CXFTOOL_COMMANDS_H
