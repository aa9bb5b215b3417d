// Reads a netlist and prints it, for tests that compare netlists.
// usage: show_design FILE [REFERENCE], show_design --count FILE
// Without a reference: its tables, cell by cell. With one: its tables as functions of nets, under
// the names that the nets have in the reference.
#include <cstdio>

#include "design_check.h"

namespace {

bool MustRead(const char* file, booleq::Design& design)
{
    std::string fault;
    if (!ReadDesign(file, booleq::ReadOptions(), design, fault)) {
        std::fprintf(stderr, "%s\n", fault.c_str());
        return false;
    }
    fault = tests::BrokenInvariant(design);
    if (!fault.empty())
        std::fprintf(stderr, "%s\n", fault.c_str());
    return fault.empty();
}

} // namespace

int main(int argc, char** argv)
{
    booleq::Design design;
    booleq::Design reference;
    if (argc == 3 && std::string(argv[1]) == "--count") { // only reads the file, for measurements
        std::string fault;
        const bool isRead = ReadDesign(argv[2], booleq::ReadOptions(), design, fault);
        std::printf("%zu tables %s\n", design.tables.size(), fault.c_str());
        return isRead ? 0 : 2;
    }
    if (argc < 2 || argc > 3 || !MustRead(argv[1], design) ||
        (argc == 3 && !MustRead(argv[2], reference)))
        return 2;
    for (const std::string& line :
         argc == 3 ? tests::FunctionLines(design, reference) : tests::TableLines(design))
        std::printf("%s\n", line.c_str());
    return 0;
}
