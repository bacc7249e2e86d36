// libFuzzer target: any bytes through the reader. Nothing may crash, hang or
// trip the sanitizers; every input ends with some result code.
//
// Build: cmake -DTESSARINE_FUZZ=ON -DCMAKE_CXX_COMPILER=clang++ ...
// Run:   build/tests/fuzz_reader -max_total_time=300 CORPUS_DIR
#include <cstddef>
#include <cstdint>
#include <string>

#include "tools/xml_walk.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t *ap_data, std::size_t a_size) {
    const char *p_text = reinterpret_cast<const char *>(ap_data);
    {
        lmx::c_xml_reader_memory reader(p_text, a_size);
        tessarine_tools::walk_xml(reader);
    }
    // The other ways of taking an element: captured whole, or read as a value.
    lmx::c_xml_reader_memory reader(p_text, a_size);
    std::string name, value;
    lmx::elmx_error error;
    for (int i = 0; i < 64; ++i) {
        int event = reader.get_element_event(&error, &name);
        if (event == lmx::xe_end_of_input || lmx::c_xml::is_error_event(event))
            break;
        if (event != lmx::xe_name)
            continue;
        bool is_empty;
        if (i % 2 == 0)
            reader.get_any_element(name, &value, lmx::ws_preserve, false);
        else
            reader.get_simple_type_value(name, lmx::ws_collapse, &value, &error, &is_empty);
    }
    return 0;
}
