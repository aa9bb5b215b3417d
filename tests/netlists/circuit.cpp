#include "circuit.h"

#include <algorithm>
#include <set>

namespace {

size_t NumRows(const CircuitTable& table)
{
    return size_t(1) << table.pins.size();
}

bool DependsOnAll(const CircuitTable& table)
{
    for (size_t pin = 0; pin < table.pins.size(); ++pin) {
        bool depends = false;
        for (size_t row = 0; row < NumRows(table); ++row)
            depends = depends || table.rows[row] != table.rows[row ^ size_t(1) << pin];
        if (!depends)
            return false;
    }
    return true;
}

// The row that 'row' of a table with one more pin, at the place 'pin', is without that pin.
size_t WithoutPin(size_t row, size_t pin)
{
    const size_t low = row & ((size_t(1) << pin) - 1);
    return low | (row >> (pin + 1)) << pin;
}

void InsertPin(CircuitTable& table, size_t pin, int net)
{
    const std::vector<bool> before = table.rows;
    table.pins.insert(table.pins.begin() + static_cast<std::ptrdiff_t>(pin), net);
    table.rows.resize(NumRows(table));
    for (size_t row = 0; row < table.rows.size(); ++row)
        table.rows[row] = before[WithoutPin(row, pin)];
}

std::string Digits(const std::vector<bool>& rows)
{
    std::string digits;
    for (size_t row = rows.size(); row-- > 0;)
        digits += rows[row] ? '1' : '0';
    return digits;
}

std::string BitOf(int pin)
{
    if (pin == kZeroPin)
        return "\"0\"";
    return pin == kOnePin ? "\"1\"" : std::to_string(pin + 2);
}

} // namespace

size_t Pick(Random& random, size_t end)
{
    return static_cast<size_t>(random() % end);
}

Circuit MakeCircuit(Random& random)
{
    Circuit circuit;
    const size_t numInputs = 6 + Pick(random, 6);
    const size_t numTables = 1 + Pick(random, 8);
    for (size_t net = 0; net < numInputs; ++net)
        circuit.nets.push_back("in" + std::to_string(net));
    for (size_t number = 0; number < numTables; ++number) {
        CircuitTable table;
        table.name = "t" + std::to_string(number);
        table.place = "X" + std::to_string(Pick(random, 50)) + "/t" + std::to_string(number);
        const size_t width = 1 + Pick(random, 6);
        std::vector<int> nets(circuit.nets.size());
        for (size_t net = 0; net < nets.size(); ++net)
            nets[net] = static_cast<int>(net);
        std::shuffle(nets.begin(), nets.end(), random);
        table.pins.assign(nets.begin(), nets.begin() + static_cast<std::ptrdiff_t>(width));
        do {
            table.rows.assign(size_t(1) << width, false);
            for (size_t row = 0; row < table.rows.size(); ++row)
                table.rows[row] = (random() & 1) != 0;
        } while (!DependsOnAll(table));
        table.output = static_cast<int>(circuit.nets.size());
        circuit.nets.push_back("w" + std::to_string(number));
        circuit.tables.push_back(table);
    }
    return circuit;
}

bool ValueOf(const CircuitTable& table, const std::vector<bool>& values)
{
    size_t row = 0;
    for (size_t pin = 0; pin < table.pins.size(); ++pin) {
        const int net = table.pins[pin];
        const bool value = net >= 0 ? values[static_cast<size_t>(net)] : net == kOnePin;
        row |= size_t(value ? 1 : 0) << pin;
    }
    return table.rows[row];
}

bool IsSameFunction(const CircuitTable& left, const CircuitTable& right)
{
    std::set<int> both(left.pins.begin(), left.pins.end());
    both.insert(right.pins.begin(), right.pins.end());
    std::vector<int> nets;
    for (const int net : both)
        if (net >= 0)
            nets.push_back(net);
    std::vector<bool> values(nets.empty() ? 0 : static_cast<size_t>(nets.back()) + 1);
    for (size_t assignment = 0; assignment < size_t(1) << nets.size(); ++assignment) {
        for (size_t place = 0; place < nets.size(); ++place)
            values[static_cast<size_t>(nets[place])] = (assignment >> place & 1) != 0;
        if (ValueOf(left, values) != ValueOf(right, values))
            return false;
    }
    return true;
}

void ShufflePins(CircuitTable& table, Random& random)
{
    for (size_t count = 0; count < table.pins.size(); ++count) {
        const size_t first = Pick(random, table.pins.size());
        const size_t second = Pick(random, table.pins.size());
        std::swap(table.pins[first], table.pins[second]);
        const std::vector<bool> before = table.rows;
        for (size_t row = 0; row < before.size(); ++row) {
            const size_t low = row >> first & 1;
            const size_t high = row >> second & 1;
            size_t source = row & ~(size_t(1) << first) & ~(size_t(1) << second);
            source |= high << first | low << second;
            table.rows[row] = before[source];
        }
    }
}

void AddIdlePin(CircuitTable& table, int net, Random& random)
{
    InsertPin(table, Pick(random, table.pins.size() + 1), net);
}

void AddFixedPin(CircuitTable& table, bool isAnything, Random& random)
{
    const size_t place = Pick(random, table.pins.size() + 1);
    const size_t kind = Pick(random, isAnything ? 3 : 2);
    const int net = kind == 0   ? kZeroPin
                    : kind == 1 ? kOnePin
                                : table.pins[Pick(random, table.pins.size())];
    InsertPin(table, place, net);
    if (!isAnything)
        return;
    for (size_t row = 0; row < table.rows.size(); ++row) {
        const bool value = (row >> place & 1) != 0;
        bool counts = net >= 0 || value == (net == kOnePin);
        for (size_t pin = 0; net >= 0 && pin < table.pins.size(); ++pin)
            counts = counts && (table.pins[pin] != net || ((row >> pin & 1) != 0) == value);
        if (!counts)
            table.rows[row] = (random() & 1) != 0;
    }
}

std::string WriteJson(const Circuit& circuit, const char* key)
{
    std::string cells;
    for (const CircuitTable& table : circuit.tables) {
        std::string pins;
        for (const int pin : table.pins)
            pins += (pins.empty() ? "" : ", ") + BitOf(pin);
        cells += std::string(cells.empty() ? "" : ",\n") + "\"" + table.name +
                 "\": {\"hide_name\": 0, \"type\": \"$lut\", \"parameters\": {\"LUT\": \"" +
                 Digits(table.rows) + "\", \"WIDTH\": " + std::to_string(table.pins.size()) +
                 "}, \"attributes\": {\"" + key + "\": \"" + table.place +
                 "\"}, \"port_directions\": {\"A\": \"input\", \"Y\": \"output\"}, "
                 "\"connections\": {\"A\": [" +
                 pins + "], \"Y\": [" + BitOf(table.output) + "]}}";
    }
    std::string names;
    for (size_t net = 0; net < circuit.nets.size(); ++net)
        names += std::string(names.empty() ? "" : ",\n") + "\"" + circuit.nets[net] +
                 "\": {\"hide_name\": 0, \"bits\": [" + BitOf(static_cast<int>(net)) +
                 "], \"attributes\": {}}";
    return "{\"creator\": \"test\", \"modules\": {\"top\": {\"attributes\": {\"top\": \"1\"}, "
           "\"ports\": {}, \"cells\": {" +
           cells + "}, \"netnames\": {" + names + "}}}}\n";
}

// A constant pin becomes a net with its own table without inputs.
std::string WriteBlif(const Circuit& circuit)
{
    std::string text = ".model top\n.inputs";
    for (const std::string& net : circuit.nets)
        if (net.compare(0, 2, "in") == 0)
            text += " " + net;
    text += "\n.outputs\n.names constant_0\n.names constant_1\n1\n";
    for (const CircuitTable& table : circuit.tables) {
        text += ".names";
        for (const int pin : table.pins)
            text += " " + (pin == kZeroPin  ? std::string("constant_0")
                           : pin == kOnePin ? std::string("constant_1")
                                            : circuit.nets[static_cast<size_t>(pin)]);
        text += " " + circuit.nets[static_cast<size_t>(table.output)] + "\n";
        for (size_t row = 0; row < table.rows.size(); ++row) {
            if (!table.rows[row])
                continue;
            for (size_t pin = 0; pin < table.pins.size(); ++pin)
                text += (row >> pin & 1) != 0 ? '1' : '0';
            text += table.pins.empty() ? "1\n" : " 1\n";
        }
    }
    return text + ".end\n";
}
