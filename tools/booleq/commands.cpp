// The table of commands.
#include "commands.h"

#include <algorithm>

namespace booleq {

const std::vector<Option>& CommonOptions(bool takesFiles)
{
    static const std::vector<Option> options = {
        {"--inputs", "A,B,C", "The inputs, most significant first; a quoted 'a,b' is one name"},
        {"--lsb-first", nullptr, "Read an init value with its first input as bit 0 of the row"},
        {"--reverse", nullptr, "Read an init value with --inputs from last to first"},
        {"--file", "FILE", "Answer each line of FILE; - is standard input"},
        {"--line-buffered", nullptr, "Write each answer at once, not in blocks"},
        {"--json", nullptr, "Answer each equation with one line of JSON"},
        {"--debug", nullptr, "Print the library's diagnostics on standard error"},
    };
    static const std::vector<Option> fileOptions = {
        {"--json", nullptr, "Answer with one line of JSON"},
        {"--debug", nullptr, "Print the library's diagnostics on standard error"},
    };
    return takesFiles ? fileOptions : options;
}

const std::vector<Command>& Commands()
{
    static const std::vector<Command> commands = {
        ShowCommand(),         CheckCommand(),       EvalCommand(),         TableCommand(),
        InitCommand(),         EqualCommand(),       SatCommand(),          ExplainCommand(),
        PermuteCommand(),      MatchCommand(),       ConvertCommand(),      LintCommand(),
        TreeCommand(),         KmapCommand(),        BatchCommand(),        MinimizeCommand(),
        NetlistStatsCommand(), NetlistListCommand(), NetlistCheckCommand(), NetlistDiffCommand(),
    };
    return commands;
}

const Command* FindCommand(const std::vector<std::string>& words, size_t& numWords)
{
    for (numWords = 1; numWords <= 2 && numWords <= words.size(); ++numWords) {
        const std::string name = numWords == 1 ? words[0] : words[0] + " " + words[1];
        for (const Command& command : Commands())
            if (name == command.name)
                return &command;
    }
    numWords = 0;
    return nullptr;
}

std::vector<const Command*> CommandsOfGroup(const std::string& word)
{
    std::vector<const Command*> group;
    for (const Command& command : Commands())
        if (std::string(command.name).rfind(word + " ", 0) == 0)
            group.push_back(&command);
    return group;
}

// The number of letters to insert, delete, change or swap with the next one (Damerau).
size_t EditDistance(const std::string& left, const std::string& right)
{
    std::vector<std::vector<size_t>> distance(left.size() + 1,
                                              std::vector<size_t>(right.size() + 1));
    for (size_t row = 0; row <= left.size(); ++row)
        for (size_t column = 0; column <= right.size(); ++column) {
            size_t& own = distance[row][column];
            if (row == 0 || column == 0) {
                own = row + column;
                continue;
            }
            const bool isSame = left[row - 1] == right[column - 1];
            own = std::min({distance[row - 1][column] + 1, distance[row][column - 1] + 1,
                            distance[row - 1][column - 1] + (isSame ? 0u : 1u)});
            if (row > 1 && column > 1 && left[row - 1] == right[column - 2] &&
                left[row - 2] == right[column - 1])
                own = std::min(own, distance[row - 2][column - 2] + 1);
        }
    return distance[left.size()][right.size()];
}

const Command* NearestCommand(const std::string& word, bool isCommand)
{
    const size_t minLength = isCommand ? 3 : 4; // shorter ones are the names of inputs
    constexpr size_t kMaxLength = 8;
    const Command* nearest = nullptr;
    size_t least = 3;
    if (word.size() < minLength || word.size() > kMaxLength)
        return nullptr;
    for (const Command& command : Commands()) {
        if (isCommand && std::string(command.name).compare(0, word.size(), word) == 0)
            return &command;
        const size_t distance = EditDistance(word, command.name);
        if (distance < least && distance * 3 <= word.size()) {
            least = distance;
            nearest = &command;
        }
    }
    return nearest;
}

} // namespace booleq
