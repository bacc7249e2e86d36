// The XML-aware layer of the input stream: white space skipping, literal
// matching, quoted values, the XML declaration, comments, processing
// instructions and the end of a start tag.
#ifndef LMX_LMXXMLINPUT_H
#define LMX_LMXXMLINPUT_H

#include <string>

#include "lmxentities.h"

namespace lmx {

class c_get_for_xml : public c_get_with_entities {
public:
    c_get_for_xml(c_read &ar_reader, c_error &ar_error, bool a_is_reading_xsd)
        : c_get_with_entities(ar_reader, ar_error, a_is_reading_xsd) {}

    // The next value that is not white space; -1 stops it.
    int get_non_ws() {
        skip_white_run();
        int c;
        do
            c = get();
        while (is_white(c));
        return c;
    }
    // True if the input continues with exactly these bytes.
    bool read_specified_string_from_input(const char *ap_input_string_to_be_read);
    // Skips white space, then reads a value in either quote, unexpanded.
    bool get_simple_quoted_value(std::string *ap_value);
    // Reads the XML declaration after "<?xml" and a white space character.
    bool read_xml_decl();
    // Skips a comment after "<!--"; false at the end of input.
    bool skip_comment();
    // Skips up to the first "?>"; false at the end of input.
    bool skip_PI();
    // Reads on to the first ">" (or "/", if a_stop_at_slash) that stands
    // outside quotes and gives it, or -1 at the end of input. Every byte passed
    // over goes to ap_copy, if one is given.
    int skip_to_tag_char(bool a_stop_at_slash, std::string *ap_copy = nullptr);
    // Moves past the ">" of the current start tag, quotes respected;
    // *ap_end_of_element tells whether it was "/>".
    bool move_to_start_tag_end(bool *ap_end_of_element);
};

// Reads the characters after "&" from the stream itself.
class c_entity_name_reader_for_c_get : public c_entity_name_reader {
public:
    explicit c_entity_name_reader_for_c_get(c_get_for_xml &ar_getter) : ar_getter(ar_getter) {}
    int get() override { return ar_getter.get(); }
    void unget(int a_c) override { ar_getter.unget(a_c); }

private:
    c_get_for_xml &ar_getter;
};

} // namespace lmx

#endif
