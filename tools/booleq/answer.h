// How every command takes its texts and answers: one text or many lines, refusals worded in one
// way, and JSON answers in one envelope, an object on its own line for each text:
//   {"command":...,"line":...,"text":...,"status":...,"result":{...}}
#ifndef BOOLEQ_ANSWER_H
#define BOOLEQ_ANSWER_H

#include <functional>
#include <string>

#include <nlohmann/json.hpp>

#include <Kq_BoolEquation.h>
#include <kq_logic/function.h>

#include "command.h"
#include "output.h"
#include "refusal.h"
#include "status.h"

namespace booleq {

typedef nlohmann::ordered_json Json; // keys stay in the order that the documentation gives

// One text to answer, and where it is from.
struct Text {
    std::string text;
    size_t line = 0; // 0: it is on the command line
};

// Calls 'answer' for the text on the command line, or for every line that is not blank, and returns
// the highest status. On a terminal, shows how much of a file has been read.
// Fails: IoError, also for a missing file.
int ForEachText(const Request& request, Output& output,
                const std::function<int(const Text&)>& answer);

// Sets 'equation' from the text as the request says (--inputs, --lsb-first, --reverse).
// Fails: false, and the refusal has been printed or, with --json, answered: return kRefused.
bool SetEquation(const Text& text, const Request& request, Output& output,
                 Kq_BoolEquation& equation);
// The same, and then the function over the equation's inputs in their order.
// Fails: false as above, also for more than kMaxFunctionInputs inputs.
bool SetFunction(const Text& text, const Request& request, Output& output,
                 kq_logic::Function& function);

// Fails: UsageError, when both --json and 'option', which asks for another format, are given.
void RefuseTwoFormats(const Request& request, const std::string& option);

// Refuses a text for a reason of the command itself, in the form of SetEquation's refusals.
void Refuse(const Text& text, const Request& request, Output& output, const std::string& reason);

// A refusal as it appears in the envelope of a refused text, instead of the result.
Json RefusalAsJson(const RefusalReport& report);
// The envelope around 'result'. 'status' is "done", "yes", "no" or "findings".
void PutJson(const Text& text, const Request& request, const char* status, const Json& result,
             Output& output);
// The same as a text with its line end.
std::string EnvelopeLine(const Text& text, const Request& request, const char* status,
                         const Json& result);

// How an answer shows which line it belongs to, where there are many.
enum class LineMark {
    Nothing,
    Prefix,  // "line 3: " in front
    Heading, // "line 3" on its own line
    Block    // a field, and an empty line at the end
};

// What a command found for one text.
struct Reply {
    int status;
    const char* word; // the same in JSON: "done", "yes", "no", "findings", "undecided"
    LineMark mark;
    std::function<Json()> toJson;
    std::function<void()> putText;
};
// Prints it in the format that was asked for, and returns its status. Every command whose answer is
// an object or a text ends with this.
int Say(const Text& text, const Request& request, Output& output, const Reply& reply);

// The envelope in two halves, for a result whose last member is written piece by piece between
// them: 'result' ends with an empty array, and the pieces are its elements.
std::pair<std::string, std::string> JsonAroundArray(const Text& text, const Request& request,
                                                    const char* status, const Json& result);
// A text or name for JSON: bytes that are not UTF-8 become U+FFFD when they are written.
std::string JsonLine(const Json& json);

// Adds a member to an object. Names that differ only in bytes that are not UTF-8 look alike when
// they are written; the later one gets a number, because no key is written twice.
void PutMember(Json& object, const std::string& name, const Json& value);

// "label           value"; the values of one answer are aligned.
void PutLabel(Output& output, const std::string& label);
void PutField(Output& output, const std::string& label, const std::string& value);

} // namespace booleq

#endif
