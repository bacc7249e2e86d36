// Text forms shared by the commands: numbers, CSV fields, JSON strings and
// aligned tables.
#ifndef TESSARINE_TOOLS_CXFTOOL_OUTPUT_H
#define TESSARINE_TOOLS_CXFTOOL_OUTPUT_H

#include <ostream>
#include <string>
#include <vector>

namespace cxftool {

// The shortest text that reads back as the same double ("0.1", "42", "1e-07").
std::string FormatNumber(double a_value);
// A JSON number; null for NaN and the infinities, which JSON cannot hold.
std::string JsonNumber(double a_value);
// The field as it is when it holds no comma, quote, line break or leading or
// trailing space; quoted with doubled quotes otherwise.
std::string CsvField(const std::string &ar_text);
// A quoted JSON string. UTF-8 passes through; quotes, backslashes and control
// characters are escaped.
std::string JsonString(const std::string &ar_text);

// Text for a table cell: as it is, or as a JSON string when it is empty, has
// a space at an edge or holds a control character, so that every cell keeps
// to its line and shows where it starts and ends.
std::string TableText(const std::string &ar_text);

using TableRow = std::vector<std::string>;
// One row per line, each column padded to its widest cell (counted in UTF-8
// characters), the last one not padded.
void WriteTable(std::ostream &ar_out, const std::vector<TableRow> &ar_rows, const std::string &ar_indent);

} // namespace cxftool

#endif // TESSARINE_TOOLS_CXFTOOL_OUTPUT_H
