// The interlocks of a machine: rules are equations over its signals, and all of them must hold.
// usage: embedding RULES [--trace NAME] [--trace-lines COUNT] [SIGNAL=0|1...]
// RULES has lines "name = equation". Writes one log: each rule's value, the signals that decide it,
// refused texts with the library's own diagnostics, and the trace of the rule NAME.
// Exit status: 0 all rules hold, 1 one does not, 2 one was refused or the usage is wrong.
#include <algorithm>
#include <cstdio>
#include <exception>
#include <fstream>
#include <limits>

#include "../shared/refusal_words.h"
#include "diagnostics.h"
#include "rule.h"

namespace {

// The number of library lines about a refused text that the log shows.
constexpr size_t kMaxDiagnostics = 20;

struct Options {
    std::string file;
    std::string traced;
    size_t maxTraceLines = 100;
    Signals signals;
};

void Log(const char* level, const std::string& text)
{
    std::printf("%-7s %s\n", level, text.c_str());
}

std::string Joined(const std::vector<std::string>& names)
{
    std::string text;
    for (const std::string& name : names)
        text += (text.empty() ? "" : ", ") + name;
    return text;
}

std::string Trimmed(const std::string& text)
{
    const size_t start = text.find_first_not_of(" \t\r");
    return start == std::string::npos
               ? ""
               : text.substr(start, text.find_last_not_of(" \t\r") + 1 - start);
}

bool ReadOptions(int argc, char** argv, Options& options)
{
    for (int place = 1; place < argc; ++place) {
        const std::string argument = argv[place];
        const size_t sign = argument.rfind('=');
        if (argument == "--trace" && place + 1 < argc) {
            options.traced = argv[++place];
        } else if (argument == "--trace-lines" && place + 1 < argc) {
            const std::string count = argv[++place];
            if (count.empty() || count.size() > 6 ||
                count.find_first_not_of("0123456789") != std::string::npos)
                return false;
            options.maxTraceLines = std::stoul(count);
        } else if (sign != std::string::npos) {
            const std::string value = argument.substr(sign + 1);
            if (value != "0" && value != "1")
                return false;
            options.signals[argument.substr(0, sign)] = value == "1";
        } else if (options.file.empty()) {
            options.file = argument;
        } else {
            return false;
        }
    }
    return !options.file.empty();
}

// Sets the rule's equation. A refused text is logged with its position, and below it what the
// library said: most refusals are silent, but a wrong structure shows the node to blame.
bool ReadEquation(Rule& rule, const std::string& place, const std::string& text, size_t column)
{
    const Diagnostics diagnostics(std::numeric_limits<size_t>::max());
    if (rule.equation.SetEquation(text.c_str()))
        return true;
    const Kq_BoolEquation::Refusal refusal = Kq_BoolEquation::FindRefusal(text.c_str());
    Log("error", place + "column " + std::to_string(column + refusal.offset + 1) + ": " +
                     examples::Words(refusal, text.substr(refusal.offset, refusal.length)));
    Log("", "  " + text);
    Log("", "  " + std::string(refusal.offset, ' ') +
                std::string(std::max<size_t>(1, refusal.length), '^'));
    const std::vector<std::string>& lines = diagnostics.GetLines();
    for (size_t shown = 0; shown < std::min(lines.size(), kMaxDiagnostics); ++shown)
        Log("library", "  " + lines[shown]);
    if (lines.size() > kMaxDiagnostics)
        Log("library", "  lines not shown: " + std::to_string(lines.size() - kMaxDiagnostics));
    return false;
}

// Evaluates in debug mode, in which the library reports each step.
void Trace(const Rule& rule, const std::string& place, size_t maxLines)
{
    const Diagnostics diagnostics(maxLines);
    std::string cut;
    try {
        const DebugMode debugMode;
        rule.equation.Eval();
    } catch (const Diagnostics::TooMany& fault) {
        cut = fault.what();
    }
    for (const std::string& line : diagnostics.GetLines())
        Log("trace", line);
    if (!cut.empty())
        Log("warning", place + "trace cut: " + cut);
}

// Logs everything there is to say about the rule; returns its value.
bool Report(const Rule& rule, const std::string& place, const std::vector<std::string>& missing)
{
    if (!missing.empty())
        Log("warning", place + "no value for " + Joined(missing) + "; taken as 0");
    const bool holds = rule.equation.Eval() != 0;
    const std::string deciding = Joined(FindDeciding(rule));
    Log(holds ? "info" : "alarm", place + rule.name + (holds ? " holds" : " does NOT hold") +
                                      (deciding.empty() ? ", whatever single signal changes"
                                                        : "; it changes with each of " + deciding));
    return holds;
}

int Run(const Options& options)
{
    std::ifstream stream(options.file);
    if (!stream) {
        Log("error", options.file + ": cannot be read");
        return 2;
    }
    int status = 0;
    bool isTraced = false;
    Rule rule;
    std::string text;
    for (size_t number = 1; std::getline(stream, text); ++number) {
        if (Trimmed(text).empty() || Trimmed(text)[0] == '#')
            continue;
        const std::string place = options.file + ":" + std::to_string(number) + ": ";
        const size_t sign = text.find('=');
        if (sign == std::string::npos) {
            Log("error", place + "there is no '='; write NAME = EQUATION");
            status = 2;
            continue;
        }
        rule.name = Trimmed(text.substr(0, sign));
        const size_t column = std::min(text.find_first_not_of(" \t\r", sign + 1), text.size());
        if (!ReadEquation(rule, place, Trimmed(text.substr(column)), column)) {
            status = 2; // the other rules are still checked
            continue;
        }
        const std::vector<std::string> missing = SetSignals(rule, options.signals);
        if (!Report(rule, place, missing))
            status = std::max(status, 1);
        if (rule.name == options.traced) {
            Trace(rule, place, options.maxTraceLines);
            isTraced = true;
        }
    }
    if (!options.traced.empty() && !isTraced)
        Log("warning", options.file + ": no rule " + options.traced + " was there to be traced");
    return status;
}

} // namespace

int main(int argc, char** argv)
{
    Options options;
    if (!ReadOptions(argc, argv, options)) {
        std::fprintf(stderr, "usage: embedding RULES [--trace NAME] [--trace-lines COUNT] "
                             "[SIGNAL=0|1...]\n");
        return 2;
    }
    try {
        return Run(options);
    } catch (const std::exception& fault) {
        std::fprintf(stderr, "embedding: %s\n", fault.what());
        return 2;
    }
}
