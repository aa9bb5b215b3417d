#include "permute.h"

#include <unordered_set>

#include "listed_inputs.h"
#include "text.h"

namespace booleq {

std::string OrderFault(const std::vector<std::string>& names)
{
    const InputCheck check = CheckInputs(names);
    if (!check.illegal.empty())
        return "'" + Excerpt(check.illegal.front()) + "' is not a name";
    if (!check.repeated.empty())
        return Excerpt(check.repeated.front()) + " is listed twice";
    return std::string();
}

std::string FirstUnlisted(const std::vector<std::string>& inputs,
                          const std::vector<std::string>& order)
{
    const std::unordered_set<std::string> listed(order.begin(), order.end());
    for (const std::string& name : inputs)
        if (listed.count(name) == 0)
            return name;
    return std::string();
}

} // namespace booleq
