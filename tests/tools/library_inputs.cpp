// The library's own answers about texts, for comparison with the tool and the Python module.
// In: [--lsb-first] [--reverse] [--inputs NAME...], and a text in each line.
// Out: for each text "refused", or hexadecimal column and inputs separated by tabs; "-" for no
// column.
#include <cstring>
#include <iostream>
#include <string>
#include <vector>

#include <Kq_BoolEquation.h>
#include <port/Port_MsgManData.h>

int main(int argc, char** argv)
{
    Port_MsgManData::setSink([](const char*, const char*, int, const char*, const char*) {});
    bool lsbFirst = false;
    bool reverse = false;
    int argument = 1;
    for (; argument < argc && std::strcmp(argv[argument], "--inputs") != 0; ++argument)
        (std::strcmp(argv[argument], "--reverse") == 0 ? reverse : lsbFirst) = true;
    const bool hasInputs = argument < argc;
    std::vector<Port::StringBase<char>> inputs;
    for (++argument; argument < argc; ++argument)
        inputs.push_back(argv[argument]);
    for (std::string text; std::getline(std::cin, text);) {
        Kq_BoolEquation equation;
        const bool isSet = hasInputs ? equation.SetEquationWithExplicitTerms(inputs, text.c_str(),
                                                                             lsbFirst, reverse)
                                     : equation.SetEquation(text.c_str());
        if (!isSet) {
            std::cout << "refused\n";
            continue;
        }
        const bool hasColumn = equation.GetNumVariables() >= 1 && equation.GetNumVariables() <= 30;
        std::cout << (hasColumn ? equation.GetEquationAsHexInitValue(false).c_str() : "-");
        for (const auto& variable : equation.GetVariables())
            std::cout << '\t' << variable.first.c_str();
        std::cout << '\n';
    }
    return 0;
}
