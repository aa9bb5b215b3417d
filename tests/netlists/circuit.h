// Small netlists made at random, as tables over numbered nets; what they say is computed row by
// row, with nothing of the code under test. They are written as Yosys JSON or BLIF.
#ifndef TESTS_NETLISTS_CIRCUIT_H
#define TESTS_NETLISTS_CIRCUIT_H

#include <cstddef>
#include <random>
#include <string>
#include <vector>

typedef std::mt19937_64 Random;

// Up to, but without, 'end'.
size_t Pick(Random& random, size_t end);

constexpr int kZeroPin = -1; // a pin tied to a constant
constexpr int kOnePin = -2;

struct CircuitTable {
    std::string name;
    std::vector<int> pins;  // nets, the least significant first
    std::vector<bool> rows; // by the pins' value
    int output = 0;
    std::string place; // an attribute
};

struct Circuit {
    std::vector<std::string> nets;
    std::vector<CircuitTable> tables;
};

// One to eight tables of up to six pins, over nets of their own and each other's; every table
// depends on all its pins.
Circuit MakeCircuit(Random& random);

// The value for an assignment of all nets.
bool ValueOf(const CircuitTable& table, const std::vector<bool>& values);
// Whether two tables are one function of nets.  Cost: an assignment of all nets of both.
bool IsSameFunction(const CircuitTable& left, const CircuitTable& right);

// Changes that leave the function alone.
void ShufflePins(CircuitTable& table, Random& random);
void AddIdlePin(CircuitTable& table, int net, Random& random);
// A pin that is a constant, or a net that the table has on another pin, with anything in the rows
// that never count; or, where the rows shall be as if the pin were idle, a constant.
void AddFixedPin(CircuitTable& table, bool isAnything, Random& random);

std::string WriteJson(const Circuit& circuit, const char* key);
std::string WriteBlif(const Circuit& circuit);

#endif
