// Equations for the functions of a comparison, over its nets.
// Cost: a short form for each distinct function, a millisecond or less.
#ifndef BOOLEQ_INSPECT_NET_EQUATIONS_H
#define BOOLEQ_INSPECT_NET_EQUATIONS_H

#include <map>
#include <string>

#include "comparison.h"
#include "equation_text.h"

namespace booleq {

class NetEquations {
  public:
    // Requires: the comparison outlives this object.
    explicit NetEquations(const Comparison& comparison);

    // The equation of a function in common numbers; empty if it has no short expression.
    std::string Of(const NetFunction& function);

  private:
    std::string Spell(NetId number) const;

    const Comparison& m_comparison;
    const Target& m_target;
    std::map<Rows, FunctionTexts> m_texts;
};

} // namespace booleq

#endif
