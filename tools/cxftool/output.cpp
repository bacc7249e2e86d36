#include "tools/cxftool/output.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstdio>

namespace cxftool {

namespace {

// Characters, not bytes: continuation bytes of UTF-8 do not count.
std::size_t DisplayWidth(const std::string &ar_text) {
    return static_cast<std::size_t>(std::count_if(ar_text.begin(), ar_text.end(), [](char a_byte) {
        return (static_cast<unsigned char>(a_byte) & 0xC0) != 0x80;
    }));
}

} // namespace

std::string FormatNumber(double a_value) {
    char buffer[32];
    const std::to_chars_result result = std::to_chars(buffer, buffer + sizeof buffer, a_value);
    return std::string(buffer, result.ptr);
}

std::string JsonNumber(double a_value) { return std::isfinite(a_value) ? FormatNumber(a_value) : "null"; }

std::string CsvField(const std::string &ar_text) {
    const bool needs_quotes = ar_text.find_first_of(",\"\r\n") != std::string::npos ||
                              (!ar_text.empty() && (ar_text.front() == ' ' || ar_text.back() == ' '));
    if (!needs_quotes)
        return ar_text;
    std::string field = "\"";
    for (char character : ar_text) {
        if (character == '"')
            field += '"';
        field += character;
    }
    return field + "\"";
}

std::string JsonString(const std::string &ar_text) {
    std::string out = "\"";
    for (char character : ar_text) {
        const unsigned char byte = static_cast<unsigned char>(character);
        switch (character) {
        case '"':
            out += "\\\"";
            break;
        case '\\':
            out += "\\\\";
            break;
        case '\n':
            out += "\\n";
            break;
        case '\r':
            out += "\\r";
            break;
        case '\t':
            out += "\\t";
            break;
        default:
            if (byte < 0x20 || byte == 0x7F) {
                char escape[8];
                std::snprintf(escape, sizeof escape, "\\u%04x", byte);
                out += escape;
            } else {
                out += character;
            }
        }
    }
    return out + "\"";
}

std::string TableText(const std::string &ar_text) {
    const bool has_control = std::any_of(ar_text.begin(), ar_text.end(), [](char a_byte) {
        return static_cast<unsigned char>(a_byte) < 0x20 || a_byte == 0x7F;
    });
    const bool plain = !ar_text.empty() && ar_text.front() != ' ' && ar_text.back() != ' ' && !has_control;
    return plain ? ar_text : JsonString(ar_text);
}

void WriteTable(std::ostream &ar_out, const std::vector<TableRow> &ar_rows, const std::string &ar_indent) {
    std::vector<std::size_t> widths;
    for (const TableRow &row : ar_rows) {
        widths.resize(std::max(widths.size(), row.size()), 0);
        for (std::size_t column = 0; column < row.size(); ++column)
            widths[column] = std::max(widths[column], DisplayWidth(row[column]));
    }
    for (const TableRow &row : ar_rows) {
        ar_out << ar_indent;
        for (std::size_t column = 0; column < row.size(); ++column) {
            ar_out << row[column];
            if (column + 1 < row.size())
                ar_out << std::string(widths[column] - DisplayWidth(row[column]) + 2, ' ');
        }
        ar_out << "\n";
    }
}

} // namespace cxftool
