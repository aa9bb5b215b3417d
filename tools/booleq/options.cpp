#include "options.h"

#include <algorithm>
#include <limits>

#include <CLI/CLI.hpp>

#include "help.h"
#include "text.h"

namespace booleq {

namespace {

bool IsOptionWord(const std::string& word)
{
    return word.size() > 1 && word[0] == '-' && (word[1] < '0' || word[1] > '9');
}

// What the parser left over: the operands, or a mistyped option. They are not a positional option
// of the parser, because it would read "[A]" and "%%" as lists.
std::vector<std::string> TakeOperands(std::vector<std::string> extras)
{
    // After "--" every word is an operand, whatever it begins with.
    const auto separator = std::find(extras.begin(), extras.end(), "--");
    const auto option = std::find_if(extras.begin(), separator, IsOptionWord);
    if (option != separator)
        throw UsageError("there is no option " + Visible(*option));
    if (separator != extras.end())
        extras.erase(separator);
    return extras;
}

void CheckOperands(Request& request, bool hasFile)
{
    const Command& command = *request.command;
    std::vector<std::string>& operands = request.operands;
    const size_t numGiven = operands.size() + (hasFile ? 1 : 0);
    const std::string usage = std::string("booleq ") + command.name + " " + command.operands;
    const bool isPlain = usage == std::string("booleq ") + command.name + " EQUATION";
    if (operands.empty() && !hasFile)
        throw UsageError(isPlain ? "no equation: give one ('A & B'), or '-' for lines of standard "
                                   "input"
                                 : "too few words: " + usage);
    if (numGiven < command.minOperands)
        throw UsageError("too few words: " + usage);
    if (numGiven > command.maxOperands && hasFile)
        throw UsageError("--file replaces the equation, so '" +
                         Excerpt(operands[command.maxOperands - 1]) + "' is one word too many");
    const Command* nearest =
        numGiven > command.maxOperands && isPlain ? NearestCommand(operands[0], true) : nullptr;
    if (nearest)
        throw UsageError("there is no command '" + Excerpt(operands[0]) + "'; the nearest is '" +
                         nearest->name + "'");
    if (numGiven > command.maxOperands && isPlain)
        throw UsageError("more than one equation, '" + Excerpt(operands[1]) +
                         "' is the second: put quotes around a whole equation ('A & B'), or give "
                         "many as lines with '-'");
    if (numGiven > command.maxOperands)
        throw UsageError("'" + Excerpt(operands[command.maxOperands]) +
                         "' is one word too many: " + usage);
    if (hasFile) {
        request.hasLines = true;
        return;
    }
    if (command.takesFiles)
        return;
    // It may be in any place; a second one is a text like any other.
    const auto dash = std::find(operands.begin(), operands.end(), "-");
    if (dash == operands.end())
        return;
    request.hasLines = true;
    request.file = "-";
    operands.erase(dash);
}

void CheckInputOptions(Request& request)
{
    Reading& reading = request.reading;
    const std::string list = request.Get("--inputs");
    reading.hasInputs = request.Has("--inputs");
    // The --from of 'permute' is such a list too.
    if (!reading.hasInputs && !request.Has("--from") && (reading.lsbFirst || reading.reverse))
        throw UsageError("--lsb-first and --reverse say how --inputs is read: give --inputs");
    if (!reading.hasInputs)
        return;
    // A word that begins with '-' is not a name; it is the option that follows a forgotten list.
    if (IsBlank(list) || list[0] == '-')
        throw UsageError("--inputs needs names: --inputs A,B");
    if (!SplitInputs(list, reading.inputs))
        throw UsageError("--inputs has a single quote that is not closed: " + Excerpt(list));
}

// An option of the table in the parser; its value goes to the request when it is given.
struct ParsedOption {
    const Option* option = nullptr;
    std::string value;
    bool isSet = false;
    const CLI::Option* parsed = nullptr;
};

void AddOption(CLI::App& app, ParsedOption& entry)
{
    const Option& option = *entry.option;
    if (option.value)
        entry.parsed = app.add_option(option.name, entry.value, option.text)
                           ->type_name(option.value)
                           ->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
    else
        entry.parsed = app.add_flag(option.name, entry.isSet, option.text);
}

void FillRequest(Request& request, const std::vector<ParsedOption>& entries)
{
    bool hasFile = false;
    for (const ParsedOption& entry : entries) {
        const std::string name = entry.option->name;
        if (entry.parsed->count() > 1 && entry.option->value)
            throw UsageError(name + " is given twice");
        if (entry.parsed->count() == 0)
            continue;
        if (name == "--file") {
            hasFile = true;
            request.file = entry.value;
        }
        request.values[name] = entry.value;
    }
    request.json = request.Has("--json");
    request.debug = request.Has("--debug");
    request.reading.lsbFirst = request.Has("--lsb-first");
    request.reading.reverse = request.Has("--reverse");
    CheckOperands(request, hasFile);
    CheckInputOptions(request);
}

} // namespace

// The words of a group: "stats, list, check or diff".
std::string GroupWords(const std::string& group)
{
    std::vector<std::string> words;
    for (const Command* const command : CommandsOfGroup(group))
        words.push_back(std::string(command->name).substr(group.size() + 1));
    const std::string last = words.back();
    words.pop_back();
    return Join(words, ", ") + " or " + last;
}

// 'booleq help' and 'booleq help COMMAND'.
std::string HelpFor(const std::vector<std::string>& arguments)
{
    if (arguments.size() == 1)
        return ToolHelp();
    const std::vector<std::string> words(arguments.begin() + 1, arguments.end());
    size_t numWords = 0;
    const Command* command = FindCommand(words, numWords);
    if (command && numWords == words.size())
        return CommandHelp(*command);
    if (words.size() == 1 && !CommandsOfGroup(words[0]).empty())
        return GroupHelp(words[0]);
    const Command* nearest = NearestCommand(arguments[1], true);
    throw UsageError("there is no command '" + Excerpt(Join(words, " ")) + "' to help with" +
                     (nearest ? std::string("; the nearest is '") + nearest->name + "'" : ""));
}

// A word that only begins the names of commands, without saying which of them.
bool AnswerForGroup(const std::vector<std::string>& arguments, std::string& answer)
{
    if (arguments.empty() || CommandsOfGroup(arguments.front()).empty())
        return false;
    const bool wantsHelp =
        arguments.size() == 2 && (arguments[1] == "--help" || arguments[1] == "-h");
    if (!wantsHelp)
        throw UsageError("'" + arguments.front() + "' is followed by " +
                         GroupWords(arguments.front()) +
                         (arguments.size() > 1 ? ", not by '" + Excerpt(arguments[1]) + "'" : ""));
    answer = GroupHelp(arguments.front());
    return true;
}

CommandLine ParseCommandLine(const std::vector<std::string>& arguments)
{
    CommandLine line;
    if (!arguments.empty() && arguments.front() == "help") {
        line.answer = HelpFor(arguments);
        return line;
    }
    Request& request = line.request;
    // Only the first words, so that elsewhere a variable named like a command stays an equation.
    size_t numNamed = 0;
    const Command* named = FindCommand(arguments, numNamed);
    request.command = named ? named : &Commands().front();
    if (!named && (AnswerForTool(arguments, line.answer) || AnswerForGroup(arguments, line.answer)))
        return line;

    const std::vector<Option>& common = CommonOptions(request.command->takesFiles);
    std::vector<ParsedOption> entries(request.command->options.size() + common.size());
    for (size_t index = 0; index < entries.size(); ++index) {
        const size_t numOwn = request.command->options.size();
        entries[index].option =
            index < numOwn ? &request.command->options[index] : &common[index - numOwn];
    }
    CLI::App app;
    app.allow_extras();
    app.set_help_flag(); // the help is made from the table
    bool wantsHelp = false;
    app.add_flag("-h,--help", wantsHelp);
    for (ParsedOption& entry : entries)
        AddOption(app, entry);

    // The parser takes its words from the end.
    std::vector<std::string> words(arguments.rbegin(),
                                   arguments.rend() - static_cast<std::ptrdiff_t>(numNamed));
    try {
        app.parse(std::move(words));
    } catch (const CLI::ParseError& error) {
        throw UsageError(error.what());
    }
    if (wantsHelp) {
        line.answer = named ? CommandHelp(*named) : ToolHelp();
        return line;
    }
    request.operands = TakeOperands(app.remaining());
    FillRequest(request, entries);
    const Command* nearest = !named && !request.hasLines && !request.operands.empty()
                                 ? NearestCommand(request.operands.front(), false)
                                 : nullptr;
    if (nearest)
        line.note = "note: '" + Excerpt(request.operands.front()) +
                    "' is taken for an equation; the nearest command is '" + nearest->name + "'";
    return line;
}

uint64_t ParseRows(const std::string& text)
{
    if (text == "all")
        return std::numeric_limits<uint64_t>::max();
    const bool isNumber = !text.empty() && text.size() <= 18 &&
                          text.find_first_not_of("0123456789") == std::string::npos;
    if (!isNumber)
        throw UsageError("--rows takes a number or 'all', not '" + Visible(text) + "'");
    return std::stoull(text);
}

} // namespace booleq
