#include "options.h"

#include <algorithm>
#include <limits>

#include <CLI/CLI.hpp>

#include "text.h"

namespace booleq {

namespace {

constexpr char kDescription[] =
    "Show what a Boolean equation is: its renderings, inputs, init values and truth table.";

constexpr char kFooter[] =
    "Operators: & * .AND.   | + .OR.   ^ @ .XOR.   ~ ! .NOT.   ~& ~| ~^ .NAND. .NOR. .NXOR.\n"
    "All binary operators have one precedence and group from the left: a | b & c is (a | b) & c.\n"
    "\n"
    "The first word may be the command 'show', which changes nothing: 'booleq show show' shows\n"
    "the equation that is a variable called show. With '-' every line of standard input is an\n"
    "equation; blank lines are skipped.\n"
    "\n"
    "Exit status: 0 done, 2 wrong usage, 3 an equation was refused, 4 reading or writing failed.\n"
    "\n"
    "Examples:\n"
    "  booleq 'A & ~B'\n"
    "  booleq --inputs A,B,D 'A & B'\n"
    "  booleq --inputs A,B 0x8\n"
    "  booleq - < equations.txt\n"
    "  booleq --version\n";

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

// What the parser could not place: a mistyped option, or an equation that the shell took apart.
void RefuseExtras(std::vector<std::string> extras)
{
    // Behind "--" every word is an equation, whatever it begins with.
    const auto separator = std::find(extras.begin(), extras.end(), "--");
    const auto isOption = [](const std::string& word) { return word.size() > 1 && word[0] == '-'; };
    const auto option = std::find_if(extras.begin(), separator, isOption);
    if (option != separator)
        throw UsageError("there is no option " + Visible(*option));
    if (separator != extras.end())
        extras.erase(separator);
    if (!extras.empty())
        throw UsageError("more than one equation, '" + Excerpt(extras.front()) +
                         "' is the second: put quotes around a whole equation ('A & B'), or give "
                         "many as lines with '-'");
}

void CheckInputOptions(Options& options, const CLI::Option& inputs, const std::string& list)
{
    Reading& reading = options.reading;
    reading.hasInputs = inputs.count() > 0;
    if (!reading.hasInputs && (reading.lsbFirst || reading.reverse))
        throw UsageError("--lsb-first and --reverse say how --inputs is read: give --inputs");
    if (!reading.hasInputs)
        return;
    // A word that begins with '-' is no name; it is the option that follows a forgotten list.
    if (IsBlank(list) || list[0] == '-')
        throw UsageError("--inputs needs names: --inputs A,B");
    if (!SplitInputs(list, reading.inputs))
        throw UsageError("--inputs has a single quote that is not closed: " + Excerpt(list));
}

} // namespace

Options ParseOptions(const std::vector<std::string>& arguments)
{
    Options options;
    std::string list;
    std::string rows;
    CLI::App app(kDescription, "booleq [show]");
    app.footer(kFooter);
    app.allow_extras();
    app.set_version_flag("--version", "booleq " BOOLEQ_VERSION);
    const CLI::Option* equation = app.add_option("EQUATION", options.equation,
                                                 "The equation, an init value (0x8, 0b1000), or -");
    const CLI::Option* inputs =
        app.add_option("--inputs", list, "The inputs, most significant first; 'a,b' is one name")
            ->type_name("A,B,C")
            ->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
    app.add_flag("--lsb-first", options.reading.lsbFirst,
                 "Init value: its first input is bit 0 of the row number");
    app.add_flag("--reverse", options.reading.reverse,
                 "Init value: take --inputs from the last to the first");
    const CLI::Option* rowsOption = app.add_option("--rows", rows, "Truth-table rows to print (64)")
                                        ->type_name("N|all")
                                        ->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
    app.add_flag("--whole", options.wholeInit, "Print init values whole, also over 10 inputs");
    app.add_flag("--debug", options.debug, "Let the library's diagnostics go to standard error");

    // The first word only, so that a variable called like a command stays an equation elsewhere.
    const bool hasCommand = !arguments.empty() && arguments.front() == "show";
    // The parser takes its words from the back.
    std::vector<std::string> words(arguments.rbegin(), arguments.rend() - (hasCommand ? 1 : 0));
    try {
        app.parse(std::move(words));
    } catch (const CLI::CallForHelp&) {
        options.answer = app.help();
        return options;
    } catch (const CLI::CallForVersion& version) {
        options.answer = std::string(version.what()) + "\n";
        return options;
    } catch (const CLI::ParseError& error) {
        throw UsageError(error.what());
    }
    RefuseExtras(app.remaining());
    if (equation->count() == 0)
        throw UsageError("no equation: give one ('A & B'), or '-' for lines of standard input");
    for (const CLI::Option* option : {inputs, rowsOption})
        if (option->count() > 1)
            throw UsageError(option->get_name() + " is given twice");
    if (rowsOption->count() > 0)
        options.maxRows = ParseRows(rows);
    CheckInputOptions(options, *inputs, list);
    return options;
}

} // namespace booleq
