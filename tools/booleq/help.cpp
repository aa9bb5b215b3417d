#include "help.h"

#include <algorithm>

#include "text.h"

namespace booleq {

namespace {

constexpr char kSummary[] =
    "Boolean equations and look-up-table init values, explained and compared";

constexpr char kSyntax[] =
    "Operators: & * .AND.   | + .OR.   ^ @ .XOR.   ~ ! .NOT.   ~& ~| ~^ .NAND. .NOR. .NXOR.\n"
    "All binary operators have one precedence and group from the left: a | b & c is (a | b) & c.\n"
    "Init values: 0x... or 0b..., row k is bit k; the first input is the most significant bit of "
    "k.\n";

constexpr char kStatuses[] =
    "Exit status (for several lines, the highest):\n"
    "  0  done, or yes\n"
    "  1  no, or there are findings\n"
    "  2  wrong usage, a file that cannot be read or written, or out of memory\n"
    "  3  a text was refused; any others were answered\n"
    "  4  not decided within --seconds\n";

// Options of the tool itself.
const std::vector<Option>& ToolOptions()
{
    static const std::vector<Option> options = {
        {"--help", nullptr, "Print this help, or after a command its own"},
        {"--version", nullptr, "Print the version"},
        {"--man-page", nullptr, "Print the man page (roff)"},
        {"--completion", nullptr, "Print the completion for bash"},
    };
    return options;
}

std::string Spelling(const Option& option)
{
    return option.value ? std::string(option.name) + " " + option.value : option.name;
}

std::string Aligned(const std::string& left, const std::string& right)
{
    constexpr size_t kWidth = 22;
    return "  " + left + std::string(left.size() < kWidth ? kWidth - left.size() : 2, ' ') + right +
           "\n";
}

std::string Lines(const std::vector<Option>& options)
{
    std::string text;
    for (const Option& option : options)
        text += Aligned(Spelling(option), option.text);
    return text;
}

// Text for roff, with nothing in it that roff would read as a request or an escape.
std::string Roff(const std::string& text)
{
    std::string roff;
    for (size_t position = 0; position < text.size(); ++position) {
        const char character = text[position];
        const bool startsLine = position == 0 || text[position - 1] == '\n';
        if (startsLine && (character == '.' || character == '\''))
            roff += "\\&";
        if (character == '\\')
            roff += "\\e";
        else if (character == '-')
            roff += "\\-";
        else if (character == '\'')
            roff += "\\(aq";
        else if (character == '^')
            roff += "\\(ha";
        else if (character == '~')
            roff += "\\(ti";
        else if (character == '`')
            roff += "\\(ga";
        else
            roff += character;
    }
    return roff;
}

std::string RoffOptions(const std::vector<Option>& options)
{
    std::string roff;
    for (const Option& option : options) {
        roff += ".TP\n\\fB" + Roff(option.name) + "\\fR";
        if (option.value)
            roff += " \\fI" + Roff(option.value) + "\\fR";
        roff += "\n" + Roff(option.text) + ".\n";
    }
    return roff;
}

std::string RoffVerbatim(const std::string& text)
{
    return ".nf\n" + Roff(text) + ".fi\n";
}

std::string RoffCommand(const Command& command)
{
    std::string roff = ".SS booleq " + Roff(command.name) + " " + Roff(command.operands) + "\n";
    roff += Roff(command.summary) + ".\n.PP\n" + Roff(command.text);
    roff += RoffOptions(command.options);
    roff += ".PP\nExamples:\n.PP\n";
    std::string examples;
    for (const char* example : command.examples)
        examples += std::string("    ") + example + "\n";
    return roff + RoffVerbatim(examples);
}

std::string Names(const std::vector<Option>& options)
{
    std::string names;
    for (const Option& option : options)
        names += (names.empty() ? "" : " ") + std::string(option.name);
    return names;
}

// The fixed values of an option, "text|csv" as "text csv"; empty when any value will do.
std::string Choices(const Option& option)
{
    std::string choices = option.value ? option.value : "";
    const auto isOpen = [](char character) {
        return character != '|' && (character < 'a' || character > 'z') &&
               (character < '0' || character > '9');
    };
    if (choices.find('|') == std::string::npos ||
        std::any_of(choices.begin(), choices.end(), isOpen))
        return std::string();
    std::replace(choices.begin(), choices.end(), '|', ' ');
    return choices;
}

} // namespace

bool AnswerForTool(const std::vector<std::string>& arguments, std::string& answer)
{
    if (arguments.size() != 1)
        return false;
    const std::string& word = arguments.front();
    if (word == "--help" || word == "-h")
        answer = ToolHelp();
    else if (word == "--version")
        answer = "booleq " BOOLEQ_VERSION "\n";
    else if (word == "--man-page")
        answer = ManPage();
    else if (word == "--completion")
        answer = BashCompletion();
    return !answer.empty();
}

std::string ToolHelp()
{
    std::string text = std::string("booleq: ") + kSummary + "\n\n";
    text += "Usage: booleq [COMMAND] [OPTION...] EQUATION...\n\nCommands:\n";
    for (const Command& command : Commands())
        text += Aligned(command.name, command.summary);
    text += "\nOptions of every command:\n" + Lines(CommonOptions(false));
    text += "\nOptions instead of a command:\n" + Lines(ToolOptions());
    text += std::string("\n") + kSyntax;
    text +=
        "\n'booleq COMMAND --help' says more. Without a command, booleq means 'show'. To show an "
        "equation\nthat is just a variable called table, write 'booleq show table'.\n";
    return text + "\n" + kStatuses;
}

std::string CommandHelp(const Command& command)
{
    std::string text = std::string("booleq ") + command.name + ": " + command.summary + "\n\n";
    text +=
        std::string("Usage: booleq ") + command.name + " [OPTION...] " + command.operands + "\n";
    text += std::string("\n") + command.text;
    if (!command.options.empty())
        text += "\nOptions:\n" + Lines(command.options);
    text += std::string("\nOptions of every command") +
            (command.takesFiles ? " that reads a netlist" : "") + ":\n" +
            Lines(CommonOptions(command.takesFiles));
    text += "\nExamples:\n";
    for (const char* example : command.examples)
        text += std::string("  ") + example + "\n";
    return text + "\n" + kStatuses;
}

std::string GroupHelp(const std::string& word)
{
    std::string text;
    for (const Command* const command : CommandsOfGroup(word))
        text += Aligned(command->name, command->summary);
    return "Commands:\n" + text + "\n'booleq " + word + " ... --help' says more.\n";
}

std::string ManPage()
{
    std::string roff = ".TH BOOLEQ 1 \"\" \"booleq " BOOLEQ_VERSION "\" \"User Commands\"\n";
    roff += ".SH NAME\nbooleq \\- " + Roff(kSummary) + "\n";
    roff += ".SH SYNOPSIS\n.B booleq\n[\\fICOMMAND\\fR] [\\fIOPTION\\fR...] \\fIEQUATION\\fR...\n";
    roff += ".SH DESCRIPTION\n" + RoffVerbatim(kSyntax);
    roff += ".SH OPTIONS\nEvery command takes:\n" + RoffOptions(CommonOptions(false));
    roff += ".PP\nInstead of a command:\n" + RoffOptions(ToolOptions());
    roff += ".SH COMMANDS\nWithout a command, booleq means the first one.\n";
    for (const Command& command : Commands())
        roff += RoffCommand(command);
    return roff + ".SH EXIT STATUS\n" + RoffVerbatim(kStatuses);
}

// The distinct words of 'words', in order of first occurrence, with blanks between them.
std::string Once(const std::vector<std::string>& words)
{
    std::vector<std::string> once;
    for (const std::string& word : words)
        if (std::find(once.begin(), once.end(), word) == once.end())
            once.push_back(word);
    return Join(once, " ");
}

// What the completion knows about the commands: the patterns of a case and what to do for each.
struct CompletionCases {
    std::vector<std::string> firstWords;
    std::string groups;      // a group and the words that follow it
    std::string options;     // of each command
    std::string choices;     // of options with fixed values
    std::string fileReaders; // commands whose operands are files
};

CompletionCases CasesOfCommands()
{
    CompletionCases cases;
    for (const Command& command : Commands()) {
        const std::string name = command.name;
        const size_t blank = name.find(' ');
        cases.firstWords.push_back(name.substr(0, blank));
        if (blank != std::string::npos)
            cases.groups += "    " + name.substr(0, blank) + ") second+=\" " +
                            name.substr(blank + 1) + "\" ;;&\n";
        cases.options += "    '" + name + "') options+=\" " +
                         Names(CommonOptions(command.takesFiles)) + " " + Names(command.options) +
                         "\" ;;\n";
        if (command.takesFiles || name == "batch")
            cases.fileReaders += (cases.fileReaders.empty() ? "'" : "|'") + name + "'";
        for (const Option& option : command.options)
            if (!Choices(option).empty())
                cases.choices += "    '" + name + "," + option.name + "') words=\"" +
                                 Choices(option) + "\" ;;\n";
    }
    return cases;
}

// Options whose value is a file.
std::string FileOptions()
{
    std::vector<std::string> names = {"--file"};
    for (const Command& command : Commands())
        for (const Option& option : command.options)
            if (option.value && std::string(option.value) == "FILE")
                names.push_back(option.name);
    std::string pattern = Once(names);
    std::replace(pattern.begin(), pattern.end(), ' ', '|');
    return pattern;
}

std::string BashCompletion()
{
    const CompletionCases cases = CasesOfCommands();
    return "# bash completion for booleq; made by booleq --completion\n"
           "_booleq() {\n"
           "    local word=${COMP_WORDS[COMP_CWORD]} before=${COMP_WORDS[COMP_CWORD-1]}\n"
           "    local command=${COMP_WORDS[1]} second= words= isFile=\n"
           "    local options=--help\n"
           "    case $command in\n" +
           cases.groups +
           "    esac\n"
           "    local place=1\n"
           "    [ -z \"$second\" ] || { command+=\" ${COMP_WORDS[2]}\"; place=2; }\n"
           "    case $command in\n" +
           cases.options + "    *) options+=\" " + Names(CommonOptions(false)) +
           "\" ;;\n"
           "    esac\n"
           "    case $before in\n"
           "    " +
           FileOptions() +
           ") isFile=yes ;;\n"
           "    --*) ;;\n"
           "    *) if [[ $word != -* && $COMP_CWORD -gt $place ]]; then\n"
           "           case $command in " +
           cases.fileReaders +
           ") isFile=yes ;; esac\n"
           "       fi ;;\n"
           "    esac\n"
           "    if [ -n \"$isFile\" ]; then\n"
           "        mapfile -t COMPREPLY < <(compgen -f -- \"$word\")\n"
           "        return\n"
           "    fi\n"
           "    case $command,$before in\n" +
           cases.choices +
           "    *) if [ \"$COMP_CWORD\" -eq 1 ]; then\n"
           "           words=\"" +
           Once(cases.firstWords) + " " + Names(ToolOptions()) +
           "\"\n"
           "       elif [ \"$COMP_CWORD\" -eq \"$place\" ]; then\n"
           "           words=$second\n"
           "       fi\n"
           "       [[ $word != -* ]] || words+=\" $options\" ;;\n"
           "    esac\n"
           "    mapfile -t COMPREPLY < <(compgen -W \"$words\" -- \"$word\")\n"
           "}\n"
           "complete -F _booleq booleq\n";
}

} // namespace booleq
