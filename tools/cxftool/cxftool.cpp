// cxftool COMMAND FILE [options]: finds the command, parses its arguments
// and runs it. Every command takes exactly one FILE; options come before or
// after it, as "--name value" or "--name=value".
#include "tools/cxftool/cxftool.h"

#include "tools/cxftool/commands.h"

#include <algorithm>
#include <exception>

namespace cxftool {

namespace {

const std::vector<const Command *> &Commands() {
    static const std::vector<const Command *> commands = {&InfoCommand(), &ValidateCommand(), &DumpCommand(),
                                                          &ExampleCommand()};
    return commands;
}

const Command *FindCommand(const std::string &ar_name) {
    for (const Command *p_command : Commands())
        if (p_command->name == ar_name)
            return p_command;
    return nullptr;
}

bool IsHelp(const std::string &ar_arg) { return ar_arg == "--help" || ar_arg == "-h"; }

void WriteToolHelp(std::ostream &ar_out) {
    ar_out << "usage: cxftool COMMAND FILE [options]\n"
              "       cxftool COMMAND --help\n"
              "\n"
              "Reads and writes CxF3 colour exchange files.\n"
              "\n"
              "Commands:\n";
    std::size_t width = 0;
    for (const Command *p_command : Commands())
        width = std::max(width, p_command->name.size());
    for (const Command *p_command : Commands())
        ar_out << "  " << p_command->name << std::string(width - p_command->name.size() + 2, ' ')
               << p_command->summary << "\n";
    ar_out << "\n"
              "Exit codes: 0 success, 1 the file cannot be read or written, is invalid or\n"
              "lacks what was asked for, 2 a wrong command line. Errors are written to\n"
              "standard error.\n";
}

// The parse of a command's arguments: either help was asked for, or the
// arguments are complete.
struct Parse {
    bool ok = false;
    bool help = false;
    Arguments arguments;
};

Parse Fail(std::ostream &ar_err, const Command &ar_command, const std::string &ar_message) {
    ar_err << "cxftool " << ar_command.name << ": " << ar_message << "\n"
           << "Run 'cxftool " << ar_command.name << " --help' for its usage.\n";
    return Parse();
}

// Reads an option at ar_args[ar_index], and its value when it takes one;
// ar_index is left on the last argument used.
bool ReadOption(const Command &ar_command, const std::vector<std::string> &ar_args, std::size_t &ar_index,
                Arguments &ar_arguments, std::string &ar_message) {
    const std::string &arg = ar_args[ar_index];
    const std::size_t equals = arg.find('=');
    const std::string name = arg.substr(0, equals);
    const auto &value_options = ar_command.valueOptions;
    if (std::find(value_options.begin(), value_options.end(), name) == value_options.end()) {
        ar_message = "unknown option '" + name + "'";
        return false;
    }
    if (equals != std::string::npos) {
        ar_arguments.options[name] = arg.substr(equals + 1);
        return true;
    }
    if (ar_index + 1 >= ar_args.size()) {
        ar_message = "option '" + name + "' needs a value";
        return false;
    }
    ar_arguments.options[name] = ar_args[++ar_index];
    return true;
}

// The arguments after the command's name. "--" ends the options, so that a
// file whose name starts with a dash can be given.
Parse ParseArguments(const Command &ar_command, const std::vector<std::string> &ar_args, std::ostream &ar_err) {
    Parse parse;
    std::vector<std::string> files;
    bool options_ended = false;
    for (std::size_t index = 0; index < ar_args.size(); ++index) {
        const std::string &arg = ar_args[index];
        if (options_ended || arg.size() < 2 || arg[0] != '-') {
            files.push_back(arg);
        } else if (arg == "--") {
            options_ended = true;
        } else if (IsHelp(arg)) {
            parse.ok = parse.help = true;
            return parse;
        } else {
            std::string message;
            if (!ReadOption(ar_command, ar_args, index, parse.arguments, message))
                return Fail(ar_err, ar_command, message);
        }
    }
    if (files.empty())
        return Fail(ar_err, ar_command, "missing FILE");
    if (files.size() > 1)
        return Fail(ar_err, ar_command, "unexpected argument '" + files[1] + "'");
    parse.arguments.file = files.front();
    parse.ok = true;
    return parse;
}

} // namespace

std::string Arguments::Option(const std::string &ar_name, const std::string &ar_fallback) const {
    const auto found = options.find(ar_name);
    return found == options.end() ? ar_fallback : found->second;
}

bool Arguments::HasOption(const std::string &ar_name) const { return options.count(ar_name) > 0; }

int RunCxftool(const std::vector<std::string> &ar_args, std::ostream &ar_out, std::ostream &ar_err) {
    if (ar_args.empty()) {
        WriteToolHelp(ar_err);
        return k_exit_usage;
    }
    if (IsHelp(ar_args.front())) {
        WriteToolHelp(ar_out);
        return k_exit_ok;
    }
    const Command *p_command = FindCommand(ar_args.front());
    if (!p_command) {
        ar_err << "cxftool: unknown command '" << ar_args.front() << "'\n"
               << "Run 'cxftool --help' for the list of commands.\n";
        return k_exit_usage;
    }
    const std::vector<std::string> command_args(ar_args.begin() + 1, ar_args.end());
    const Parse parse = ParseArguments(*p_command, command_args, ar_err);
    if (!parse.ok)
        return k_exit_usage;
    if (parse.help) {
        ar_out << p_command->help;
        return k_exit_ok;
    }
    // The document classes throw on what they cannot make sense of; that
    // ends the command, not the program.
    try {
        return p_command->run(parse.arguments, ar_out, ar_err);
    } catch (const std::exception &ar_exception) {
        ar_err << "cxftool " << p_command->name << ": " << ar_exception.what() << "\n";
        return k_exit_failure;
    }
}

} // namespace cxftool
