// One rule of the program: a name and an equation that must be 1.
#ifndef EMBEDDING_RULE_H
#define EMBEDDING_RULE_H

#include <map>
#include <string>
#include <vector>

#include <Kq_BoolEquation.h>

typedef std::map<std::string, bool> Signals;

struct Rule {
    std::string name;
    Kq_BoolEquation equation; // its variables have the values of the signals
};

// Gives a rule the values of 'signals'; returns the names without a value, which are set to 0.
std::vector<std::string> SetSignals(Rule& rule, const Signals& signals);

// The signals that change the rule's value when only they change.
// Each is tried on a copy: copies share the equation and have their own values.
std::vector<std::string> FindDeciding(const Rule& rule);

#endif
