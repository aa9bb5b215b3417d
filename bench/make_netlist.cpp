// Writes a netlist of six-input tables to standard output, like one from synthesis: a few functions
// occur often. As in 22,542 tables of mapped arithmetic and control circuits, the function of rank
// k has a share in step with 1 / (k + 8)^1.2; a million tables have some 20,000 functions.
// usage: make_netlist json|blif|edif TABLES [SEED [shuffled]]
// 'shuffled' gives the same functions of the same nets, with each table's pins in another order.
#include <algorithm>
#include <array>
#include <cmath>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <random>
#include <string>
#include <vector>

namespace {

constexpr unsigned int kInputs = 6;
constexpr size_t kFunctions = 20000;
constexpr size_t kPrimaryInputs = 256;
constexpr size_t kWindow = 5000; // most inputs of a table come from those shortly before it
constexpr uint64_t kPatterns[kInputs] = {0xaaaaaaaaaaaaaaaa, 0xcccccccccccccccc,
                                         0xf0f0f0f0f0f0f0f0, 0xff00ff00ff00ff00,
                                         0xffff0000ffff0000, 0xffffffff00000000};

typedef std::mt19937_64 Random;

struct Table {
    uint64_t init;
    std::array<uint32_t, kInputs> inputs; // net numbers, the least significant pin first
};

// Unlike std::uniform_int_distribution, the result does not depend on the standard library.
size_t Below(Random& random, size_t end)
{
    return static_cast<size_t>(random() % end);
}

bool DependsOnAll(uint64_t function)
{
    for (unsigned int input = 0; input < kInputs; ++input)
        if (((function ^ function >> (1u << input)) & ~kPatterns[input]) == 0)
            return false;
    return true;
}

// A formula in which each input occurs once or twice: what a mapper puts into a table.
uint64_t MakeFunction(Random& random)
{
    std::vector<uint64_t> terms;
    for (unsigned int input = 0; input < kInputs; ++input)
        terms.push_back(kPatterns[input]);
    for (size_t extra = Below(random, 3); extra-- > 0;)
        terms.push_back(kPatterns[Below(random, kInputs)]);
    while (terms.size() > 1) {
        std::swap(terms[Below(random, terms.size())], terms.back());
        const uint64_t right = random() % 2 != 0 ? ~terms.back() : terms.back();
        terms.pop_back();
        uint64_t& left = terms[Below(random, terms.size())];
        const size_t kind = Below(random, 5);
        left = kind < 2 ? left & right : kind < 4 ? left | right : left ^ right;
    }
    return terms[0];
}

std::vector<uint64_t> MakeFunctions(Random& random)
{
    std::vector<uint64_t> functions;
    while (functions.size() < kFunctions) {
        const uint64_t function = MakeFunction(random);
        if (DependsOnAll(function))
            functions.push_back(function);
        if (functions.size() == kFunctions) {
            std::sort(functions.begin(), functions.end());
            functions.erase(std::unique(functions.begin(), functions.end()), functions.end());
        }
    }
    std::shuffle(functions.begin(), functions.end(), random);
    return functions;
}

// For each rank, the sum of the shares up to it.
std::vector<double> MakeShares()
{
    std::vector<double> shares;
    double sum = 0;
    for (size_t rank = 0; rank < kFunctions; ++rank)
        shares.push_back(sum += std::pow(static_cast<double>(rank + 9), -1.2));
    return shares;
}

void Shuffle(Table& table, Random& random)
{
    std::array<unsigned int, kInputs> order;
    for (unsigned int pin = 0; pin < kInputs; ++pin)
        order[pin] = pin;
    for (unsigned int pin = kInputs; pin-- > 1;)
        std::swap(order[pin], order[Below(random, pin + 1)]);
    Table shuffled = {0, {}};
    for (unsigned int pin = 0; pin < kInputs; ++pin)
        shuffled.inputs[pin] = table.inputs[order[pin]];
    for (unsigned int row = 0; row < 64; ++row) {
        unsigned int source = 0;
        for (unsigned int pin = 0; pin < kInputs; ++pin)
            source |= (row >> pin & 1u) << order[pin];
        shuffled.init |= (table.init >> source & 1u) << row;
    }
    table = shuffled;
}

std::vector<Table> MakeTables(size_t count, uint64_t seed, bool isShuffled)
{
    Random random(seed);
    Random shuffling(seed + 1);
    const std::vector<uint64_t> functions = MakeFunctions(random);
    const std::vector<double> shares = MakeShares();
    std::vector<Table> tables(count);
    for (size_t index = 0; index < count; ++index) {
        const double share = static_cast<double>(random() >> 11) * 0x1p-53 * shares.back();
        const auto rank = static_cast<size_t>(
            std::lower_bound(shares.begin(), shares.end(), share) - shares.begin());
        tables[index].init = functions[std::min(rank, kFunctions - 1)];
        const size_t numNets = kPrimaryInputs + index;
        for (unsigned int pin = 0; pin < kInputs; ++pin) {
            uint32_t net;
            do
                net =
                    static_cast<uint32_t>(numNets - 1 - Below(random, std::min(numNets, kWindow)));
            while (std::find(tables[index].inputs.begin(), tables[index].inputs.begin() + pin,
                             net) != tables[index].inputs.begin() + pin);
            tables[index].inputs[pin] = net;
        }
        if (isShuffled)
            Shuffle(tables[index], shuffling);
    }
    return tables;
}

// --- names, as synthesis gives them

std::string NetName(uint32_t net)
{
    return net < kPrimaryInputs ? "in[" + std::to_string(net) + "]"
                                : "$abc$4211$new_n" + std::to_string(net);
}

std::string CellName(size_t table)
{
    return "$abc$4211$auto$blifparse.cc:525:parse_blif$" + std::to_string(table + 4212);
}

std::string Binary(uint64_t init)
{
    std::string digits;
    for (unsigned int bit = 64; bit-- > 0;)
        digits += (init >> bit & 1u) != 0 ? '1' : '0';
    return digits;
}

void Put(const std::string& text)
{
    std::fwrite(text.data(), 1, text.size(), stdout);
}

// --- formats

void WriteJson(const std::vector<Table>& tables)
{
    const auto bit = [](size_t net) { return std::to_string(net + 2); };
    Put("{\n  \"creator\": \"make_netlist\",\n  \"modules\": {\n    \"top\": {\n      "
        "\"attributes\": {\n        \"top\": \"00000000000000000000000000000001\"\n      },\n      "
        "\"ports\": {\n        \"in\": {\n          \"direction\": \"input\",\n          \"bits\": "
        "[");
    for (size_t net = 0; net < kPrimaryInputs; ++net)
        Put((net == 0 ? " " : ", ") + bit(net));
    Put(" ]\n        },\n        \"out\": {\n          \"direction\": \"output\",\n          "
        "\"bits\": [ " +
        bit(kPrimaryInputs + tables.size() - 1) + " ]\n        }\n      },\n      \"cells\": {");
    for (size_t table = 0; table < tables.size(); ++table) {
        std::string text = std::string(table == 0 ? "" : ",") + "\n        \"" + CellName(table) +
                           "\": {\n          \"hide_name\": 1,\n          \"type\": \"$lut\",\n"
                           "          \"parameters\": {\n            \"LUT\": \"" +
                           Binary(tables[table].init) +
                           "\",\n            \"WIDTH\": \"00000000000000000000000000000110\"\n"
                           "          },\n          \"attributes\": {\n          },\n"
                           "          \"port_directions\": {\n            \"A\": \"input\",\n"
                           "            \"Y\": \"output\"\n          },\n"
                           "          \"connections\": {\n            \"A\": [";
        for (unsigned int pin = 0; pin < kInputs; ++pin)
            text += (pin == 0 ? " " : ", ") + bit(tables[table].inputs[pin]);
        Put(text + " ],\n            \"Y\": [ " + bit(kPrimaryInputs + table) +
            " ]\n          }\n        }");
    }
    Put("\n      },\n      \"netnames\": {");
    for (size_t table = 0; table < tables.size(); ++table)
        Put("\n        \"" + NetName(static_cast<uint32_t>(kPrimaryInputs + table)) +
            "\": {\n          \"hide_name\": 1,\n          \"bits\": [ " +
            bit(kPrimaryInputs + table) +
            " ],\n          \"attributes\": {\n          }\n        },");
    Put("\n        \"in\": {\n          \"hide_name\": 0,\n          \"bits\": [");
    for (size_t net = 0; net < kPrimaryInputs; ++net)
        Put((net == 0 ? " " : ", ") + bit(net));
    Put(" ],\n          \"attributes\": {\n          }\n        },\n        \"out\": {\n"
        "          \"hide_name\": 0,\n          \"bits\": [ " +
        bit(kPrimaryInputs + tables.size() - 1) +
        " ],\n          \"attributes\": {\n          }\n        }\n      }\n    }\n  }\n}\n");
}

void WriteBlif(const std::vector<Table>& tables)
{
    Put(".model top\n.inputs");
    for (uint32_t net = 0; net < kPrimaryInputs; ++net)
        Put(" " + NetName(net));
    Put("\n.outputs out\n");
    for (size_t table = 0; table < tables.size(); ++table) {
        std::string text = ".gate LUT6";
        for (unsigned int pin = 0; pin < kInputs; ++pin)
            text += " I" + std::to_string(pin) + "=" + NetName(tables[table].inputs[pin]);
        Put(text + " O=" + NetName(static_cast<uint32_t>(kPrimaryInputs + table)) + "\n.cname " +
            CellName(table) + "\n.param INIT " + Binary(tables[table].init) + "\n");
    }
    Put(".names " + NetName(static_cast<uint32_t>(kPrimaryInputs + tables.size() - 1)) +
        " out\n1 1\n.end\n");
}

// Nets list the pins that they join, so the pins are gathered by net.
void WriteEdif(const std::vector<Table>& tables)
{
    Put("(edif top\n  (edifVersion 2 0 0)\n  (edifLevel 0)\n  (keywordMap (keywordLevel 0))\n"
        "  (external LIB\n    (edifLevel 0)\n    (technology (numberDefinition))\n"
        "    (cell LUT6\n      (cellType GENERIC)\n      (view VIEW_NETLIST\n        (viewType "
        "NETLIST)\n        (interface");
    for (unsigned int pin = 0; pin < kInputs; ++pin)
        Put("\n          (port I" + std::to_string(pin) + " (direction INPUT))");
    Put("\n          (port O (direction OUTPUT))\n        )\n      )\n    )\n  )\n"
        "  (library DESIGN\n    (edifLevel 0)\n    (technology (numberDefinition))\n    (cell top\n"
        "      (cellType GENERIC)\n      (view VIEW_NETLIST\n        (viewType NETLIST)\n        "
        "(interface\n          (port (array in " +
        std::to_string(kPrimaryInputs) +
        ") (direction INPUT))\n          (port out (direction OUTPUT))\n        )\n        "
        "(contents");
    for (size_t table = 0; table < tables.size(); ++table) {
        char init[24];
        std::snprintf(init, sizeof init, "64'h%016llx",
                      static_cast<unsigned long long>(tables[table].init));
        Put("\n          (instance (rename id" + std::to_string(table) + " \"" + CellName(table) +
            "\")\n            (viewRef VIEW_NETLIST (cellRef LUT6 (libraryRef LIB)))\n"
            "            (property INIT (string \"" +
            init + "\")))");
    }
    std::vector<std::vector<uint32_t>> pins(kPrimaryInputs + tables.size()); // table * 8 + pin
    for (size_t table = 0; table < tables.size(); ++table)
        for (unsigned int pin = 0; pin < kInputs; ++pin)
            pins[tables[table].inputs[pin]].push_back(static_cast<uint32_t>(table * 8 + pin));
    for (uint32_t net = 0; net < pins.size(); ++net) {
        std::string text = "\n          (net (rename net" + std::to_string(net) + " \"" +
                           NetName(net) + "\") (joined";
        if (net < kPrimaryInputs)
            text += "\n              (portRef (member in " +
                    std::to_string(kPrimaryInputs - 1 - net) + "))";
        else
            text += "\n              (portRef O (instanceRef id" +
                    std::to_string(net - kPrimaryInputs) + "))";
        for (const uint32_t pin : pins[net])
            text += "\n              (portRef I" + std::to_string(pin % 8) + " (instanceRef id" +
                    std::to_string(pin / 8) + "))";
        if (net + 1 == pins.size())
            text += "\n              (portRef out)";
        Put(text + "\n            )\n          )");
    }
    Put("\n        )\n      )\n    )\n  )\n  (design top\n    (cellRef top (libraryRef DESIGN))\n  "
        ")\n)\n");
}

} // namespace

int main(int argc, char** argv)
{
    const std::string format = argc > 2 ? argv[1] : "";
    const size_t count = argc > 2 ? std::strtoul(argv[2], nullptr, 10) : 0;
    const uint64_t seed = argc > 3 ? std::strtoull(argv[3], nullptr, 10) : 1;
    const bool isShuffled = argc > 4 && std::string(argv[4]) == "shuffled";
    if (count == 0 || count > 100000000 || (argc > 4 && !isShuffled) || argc > 5 ||
        (format != "json" && format != "blif" && format != "edif")) {
        std::fprintf(stderr, "usage: make_netlist json|blif|edif TABLES [SEED [shuffled]]\n");
        return 2;
    }
    const std::vector<Table> tables = MakeTables(count, seed, isShuffled);
    if (format == "json")
        WriteJson(tables);
    else if (format == "blif")
        WriteBlif(tables);
    else
        WriteEdif(tables);
    return std::fflush(stdout) == 0 && std::ferror(stdout) == 0 ? 0 : 1;
}
