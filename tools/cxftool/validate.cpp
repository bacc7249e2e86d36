// cxftool validate FILE: whether the file is a CxF3 document that reads
// completely.
#include "tools/cxftool/commands.h"
#include "tools/cxftool/document.h"

namespace cxftool {

namespace {

int RunValidate(const Arguments &ar_args, std::ostream &ar_out, std::ostream &ar_err) {
    // The quick look at the root element tells a file of another kind apart
    // from a CxF3 file with an error inside; the full read is made either
    // way, for the reader's report of where it stopped.
    const bool is_cxf3 = CxF3::IsValidFile(ar_args.file);
    LoadedFile file;
    std::string error;
    const bool loaded = LoadFile(ar_args.file, file, error);
    if (is_cxf3 && loaded) {
        ar_out << "valid\n";
        return k_exit_ok;
    }
    ar_err << ar_args.file << ": invalid\n";
    if (!is_cxf3)
        ar_err << "Not a CxF3 file: it cannot be opened, or its root element is not cc:CxF.\n";
    ar_err << error;
    return k_exit_failure;
}

} // namespace

const Command &ValidateCommand() {
    static const Command command{
        "validate",
        "check that FILE is a CxF3 file that reads completely",
        "usage: cxftool validate FILE\n"
        "\n"
        "Checks that the root element of FILE is cc:CxF, then reads the whole file.\n"
        "Prints \"valid\" and exits 0 when it reads; otherwise writes the reader's\n"
        "error (error code, description, item, XML line) to standard error and\n"
        "exits 1.\n",
        {},
        RunValidate};
    return command;
}

} // namespace cxftool
