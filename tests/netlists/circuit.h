// Small random netlists, as tables over numbered nets. Their functions are computed row by row,
// without the code under test. They are written as Yosys JSON or BLIF.
#ifndef TESTS_NETLISTS_CIRCUIT_H
#define TESTS_NETLISTS_CIRCUIT_H

#include <cstddef>
#include <random>
#include <string>
#include <vector>

typedef std::mt19937_64 Random;

// A random number below 'end'.
size_t Pick(Random& random, size_t end);

constexpr int kZeroPin = -1; // a pin tied to a constant
constexpr int kOnePin = -2;

struct CircuitTable {
    std::string name;
    std::vector<int> pins;  // nets, the least significant first
    std::vector<bool> rows; // by the value of the pins
    int output = 0;
    std::string place; // an attribute
};

struct Circuit {
    std::vector<std::string> nets;
    std::vector<CircuitTable> tables;
};

// One to eight tables of up to six pins, over inputs and each other's outputs; every table
// depends on all its pins.
Circuit MakeCircuit(Random& random);

// The value for an assignment of all nets.
bool ValueOf(const CircuitTable& table, const std::vector<bool>& values);
// Whether two tables are the same function of nets.  Cost: tries all assignments of the nets of
// both.
bool IsSameFunction(const CircuitTable& left, const CircuitTable& right);

// Changes that leave the function as it is.
void ShufflePins(CircuitTable& table, Random& random);
void AddIdlePin(CircuitTable& table, int net, Random& random);
// Adds a pin that is a constant, or a net that is on another pin already, with arbitrary values in
// the rows that are never reached; or, unless 'isAnything', a constant, with rows as if the pin
// were idle.
void AddFixedPin(CircuitTable& table, bool isAnything, Random& random);

std::string WriteJson(const Circuit& circuit, const char* key);
std::string WriteBlif(const Circuit& circuit);

#endif
