// xmlcheck FILE: reads any XML file through the lmx pull reader, visiting
// every element, attribute and text run, and says whether it read cleanly.
#include <cstring>
#include <iostream>

#include "tools/xml_walk.h"

int main(int argc, char **argv) {
    if (argc == 2 && (std::strcmp(argv[1], "--help") == 0 || std::strcmp(argv[1], "-h") == 0)) {
        std::cout << "usage: xmlcheck FILE\n"
                     "Reads FILE through the lmx reader (every element, attribute and text run).\n"
                     "Prints \"OK\" with the counts, or the reader's error, and exits non-zero.\n";
        return 0;
    }
    if (argc != 2) {
        std::cerr << "usage: xmlcheck FILE\n";
        return 2;
    }
    tessarine_tools::xml_walk_result result = tessarine_tools::walk_xml_file(argv[1]);
    if (!result.ok()) {
        std::cout << result.message;
        return 1;
    }
    std::cout << "OK: " << result.elements << " elements, " << result.attributes << " attributes, "
              << result.text_runs << " text runs\n";
    return 0;
}
