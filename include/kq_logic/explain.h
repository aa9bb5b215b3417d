// What a function is, by the name engineers have for it.
//
//     kq_logic::Function function;
//     function.Set(Kq_BoolEquation("S & A | (~S & B) & (C | ~C)"));
//     const kq_logic::Explanation explanation = kq_logic::Explain(function);
//     std::cout << explanation.kind << '\n'; // multiplexer
//     std::cout << explanation.text << '\n'; // multiplexer, select S: A for S=1; B for S=0
//     std::cout << explanation.idle[0] << '\n'; // C
#ifndef KQ_LOGIC_EXPLAIN_H
#define KQ_LOGIC_EXPLAIN_H

#include <string>
#include <vector>

#include <kq_logic/function.h>

namespace kq_logic {

constexpr size_t kMaxExplainedInputs = 16; // more are refused

// What was found.
struct Explanation {
    std::string fault;                  // too many inputs: all else is empty
    std::vector<std::string> mattering; // inputs with an effect
    std::vector<std::string> idle;      // inputs without effect
    std::string kind;                   // "multiplexer", "AND", ...; empty: no common name
    std::string text;                   // the kind with its inputs, inverted ones as "~A"
};

// Fails: fault, with more than kMaxExplainedInputs inputs.
KQ_EXPORT Explanation Explain(const Function& function);

} // namespace kq_logic

#endif
