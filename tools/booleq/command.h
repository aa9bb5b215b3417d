// What a command is, and what it was asked to do. All commands are in one table (commands.cpp); the
// parser, the help, the man page and the completion are made from it.
#ifndef BOOLEQ_COMMAND_H
#define BOOLEQ_COMMAND_H

#include <map>
#include <stdexcept>
#include <string>
#include <vector>

#include "listed_inputs.h"
#include "output.h"

namespace booleq {

// The command line makes no sense; the text says why, and what to write instead.
class UsageError : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

struct Option {
    const char* name;  // "--rows"
    const char* value; // what stands for its value in the help ("N|all"); null for a flag
    const char* text;  // one sentence without a full stop
};

struct Command;

struct Request {
    const Command* command = nullptr;
    // With lines, all operands besides the texts; otherwise the text comes first.
    std::vector<std::string> operands;
    bool hasLines = false; // "-" or --file: texts are the lines of 'file'
    std::string file;      // "-" is standard input
    Reading reading;
    bool json = false;
    bool debug = false;                        // lets the library's diagnostics through
    std::map<std::string, std::string> values; // of the command's own options that were given

    bool Has(const std::string& option) const { return values.count(option) != 0; }
    // Empty for an option that was not given.
    std::string Get(const std::string& option) const
    {
        const auto found = values.find(option);
        return found == values.end() ? std::string() : found->second;
    }
};

struct Command {
    const char* name;     // two words for a group: "netlist diff"
    const char* operands; // "EQUATION NAME=VALUE..."
    size_t minOperands;   // including the text
    size_t maxOperands;
    const char* summary; // one line without a full stop
    const char* text;    // everything else to know, in lines of at most 90 characters
    std::vector<Option> options;
    std::vector<const char*> examples; // whole command lines
    // Writes answers to 'output', complaints to standard error; returns the exit status.
    // Fails: UsageError; IoError.
    int (*run)(const Request& request, Output& output);
    bool takesFiles = false; // the operands are files, "-" among them, and no equation is read
};

constexpr size_t kAnyNumber = static_cast<size_t>(-1);

// In the order of the help; the first one is used when no command is named.
const std::vector<Command>& Commands();
// The command that the words begin with, and how many of them are its name; null without one.
const Command* FindCommand(const std::vector<std::string>& words, size_t& numWords);
// The commands of a group, by its word ("netlist"); empty when there is no such group.
std::vector<const Command*> CommandsOfGroup(const std::string& word);
// The command whose name is most like the word, a letter or two apart; null without one. A word
// that must be a command may be short, or the beginning of a name.
const Command* NearestCommand(const std::string& word, bool isCommand);
// The options of every command, or of every command that takes files.
const std::vector<Option>& CommonOptions(bool takesFiles);

} // namespace booleq

#endif
