#include "joined_inputs.h"

#include <cassert>
#include <unordered_map>

namespace booleq {

std::vector<uint32_t> JoinInputs(const std::vector<std::string>& right,
                                 std::vector<std::string>& inputs)
{
    std::unordered_map<std::string, uint32_t> numbers;
    for (const std::string& name : inputs)
        numbers.emplace(name, static_cast<uint32_t>(numbers.size()));
    assert(numbers.size() == inputs.size());
    std::vector<uint32_t> places;
    for (const std::string& name : right) {
        const auto place = numbers.emplace(name, static_cast<uint32_t>(numbers.size())).first;
        if (place->second == inputs.size())
            inputs.push_back(name);
        places.push_back(place->second);
    }
    assert(numbers.size() == inputs.size());
    return places;
}

} // namespace booleq
