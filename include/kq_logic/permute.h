// A function over another order of its inputs, or over additional ones.
//
//     kq_logic::Function function;
//     kq_logic::Function permuted;
//     function.Set(Kq_BoolEquation("A & ~B"));
//     std::string fault = kq_logic::Permute(function, {"B", "A"}, permuted);
//     std::cout << function.Hex() << permuted.Hex() << '\n'; // 0x40x2
//     fault = kq_logic::Permute(function, {"A", "C"}, permuted);
//     std::cout << fault << '\n'; // B is not listed
#ifndef KQ_LOGIC_PERMUTE_H
#define KQ_LOGIC_PERMUTE_H

#include <string>
#include <vector>

#include <kq_logic/function.h>

namespace kq_logic {

// Sets 'permuted' to the same function over 'inputs', the first the most significant; names that
// the function does not have become inputs without effect. Returns the empty text. Fails: returns
// what is wrong and leaves 'permuted' alone if an input is not listed, is listed twice or is not a
// name, or if there are more than kMaxFunctionInputs.  Cost: O(inputs * rows / 64).
KQ_EXPORT std::string Permute(const Function& function, const std::vector<std::string>& inputs,
                              Function& permuted);

} // namespace kq_logic

#endif
