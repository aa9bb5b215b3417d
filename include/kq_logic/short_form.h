// A short expression for a function.
//
//     kq_logic::Function function;
//     function.Set(Kq_BoolEquation("(a & b) | (a & c)"));
//     const kq_logic::ShortForm shortForm = kq_logic::FindShortForm(function);
//     std::cout << shortForm.text << '\n'; // a & (b | c)
//     std::cout << shortForm.numOperands << shortForm.isMinimal << '\n'; // 31
#ifndef KQ_LOGIC_SHORT_FORM_H
#define KQ_LOGIC_SHORT_FORM_H

#include <string>

#include <kq_logic/function.h>

namespace kq_logic {

constexpr size_t kMaxShortFormInputs = 16; // more are refused

// What was found.
struct ShortForm {
    std::string fault;      // why none was found; empty if one was
    std::string text;       // for Kq_BoolEquation; compared with the function row by row
    size_t numOperands = 0; // how many times it mentions an input
    bool isMinimal = false; // proved: no expression of & | ^ ~ and their negated forms has fewer
};

// Up to four inputs with an effect, the shortest expression; with more, the search may miss it.
// Fails: fault, with more than kMaxShortFormInputs inputs, or if every form found was too long.
KQ_EXPORT ShortForm FindShortForm(const Function& function);

} // namespace kq_logic

#endif
