// The command 'init': init values in both orders of counting, and what reads back.
#include <algorithm>

#include "answer.h"
#include "commands.h"
#include "core/text.h"

namespace booleq {

namespace {

// The library reads an init value by way of an expression; above, that takes long.
constexpr size_t kMaxTriedInputs = 12;

// Above, the digits are too long to be one text in JSON.
constexpr size_t kMaxJsonInputs = 24;

// One of the two orders of counting. The digits are made when they are written: with 30 inputs
// they are 256 MB and 1 GB.
struct Order {
    const Function& column; // as somebody sees it who counts so
    bool lsbFirst;
};

// Whether the library reads 'text' as this function, and renders it as 'rendering' afterwards.
bool ReadsBack(const Function& function, const std::string& text, bool lsbFirst, bool reverse,
               const std::string& rendering)
{
    Reading reading;
    reading.hasInputs = true;
    reading.inputs = function.Inputs();
    reading.lsbFirst = lsbFirst;
    reading.reverse = reverse;
    Kq_BoolEquation equation;
    Function read;
    if (!SetFromText(equation, text, reading) || !FunctionOf(equation, read))
        return false;
    const std::string rendered =
        ToStd(rendering[1] == 'x' ? equation.GetEquationAsHexInitValue(false)
                                  : equation.GetEquationAsBinaryInitValue());
    return rendered == rendering && read.Over(function.Inputs()) == function;
}

std::string Names(const Function& function)
{
    std::string names;
    for (const std::string& name : function.Inputs())
        names += (names.empty() ? "" : ", ") + Visible(name);
    return names;
}

std::string Call(const Function& function, const std::string& text, bool lsbFirst, bool reverse)
{
    const std::string shown = text.size() <= 40 ? text : text.substr(0, 40) + "...";
    return "SetEquationWithExplicitTerms({" + Names(function) + "}, \"" + shown + "\", " +
           (lsbFirst ? "true" : "false") + ", " + (reverse ? "true" : "false") + ")";
}

// Two columns; the digits of the second are made when those of the first are written.
void PutBoth(const char* label, const Order& msb, const Order& lsb, size_t width,
             std::string (Function::*digits)() const, Output& output)
{
    PutLabel(output, label);
    {
        const std::string first = (msb.column.*digits)();
        output.Put(first);
        output.Put(std::string(std::max(width, first.size()) - first.size() + 2, ' '));
    }
    output.Put((lsb.column.*digits)());
    output.Put("\n");
}

void PutDigits(const Order& msb, const Order& lsb, Output& output)
{
    const std::string name = Visible(msb.column.Inputs().front());
    const std::string first = name + " most significant";
    // Longer digits are not aligned.
    const size_t width =
        std::max<size_t>(first.size(), std::min<uint64_t>(34, 2 + msb.column.NumRows()));
    PutLabel(output, "");
    output.Put(first + std::string(width - first.size() + 2, ' ') + name +
               " least (--lsb-first)\n");
    PutBoth("hexadecimal", msb, lsb, width, &Function::Hex, output);
    PutBoth("binary", msb, lsb, width, &Function::Binary, output);
}

void PutTried(const Function& function, const std::string& text, bool lsbFirst, bool reverse,
              const std::string& rendering, Output& output)
{
    const bool reads = ReadsBack(function, text, lsbFirst, reverse, rendering);
    PutField(output, reads ? "reads back" : "does not", Call(function, text, lsbFirst, reverse));
}

void PutReadsBack(const Order& msb, const Order& lsb, Output& output)
{
    const Function& function = msb.column;
    if (function.NumInputs() > kMaxTriedInputs) {
        PutField(output, "reads back",
                 "not tried over more than " + std::to_string(kMaxTriedInputs) + " inputs");
        return;
    }
    const std::string hex = function.Hex();
    if (function.NumInputs() == 1) {
        PutTried(function, function.Binary(), false, false, function.Binary(), output);
        PutTried(function, hex, false, false, hex, output);
        PutField(output, "note",
                 "one hexadecimal digit is four rows, so over one input only the "
                 "binary form reads back");
        return;
    }
    const std::string turned = lsb.column.Hex();
    PutTried(function, hex, false, false, hex, output);
    PutTried(function, turned, true, false, hex, output);
    PutField(output, "", "  which renders " + hex + ", the first input most significant again");
    PutTried(function, turned, false, true, turned, output);
    PutField(output, "",
             "  which renders " + turned + ", " + Visible(function.Inputs().back()) +
                 " being the first variable now");
}

void PutConstant(const Function& function, Output& output)
{
    const std::string value = function.At(0) ? "1" : "0";
    PutField(output, "inputs", "none: the equation is always " + value);
    PutField(output, "init value", "none: there are no rows to number");
    PutField(output, "note",
             "the library renders 0x0 and 0b, whatever the value, and neither reads back; it reads "
             "0b0 and 0b1 over no inputs, and both are 0");
}

void PutInit(const Order& msb, const Order& lsb, Output& output)
{
    const Function& function = msb.column;
    if (function.NumInputs() == 0) {
        PutConstant(function, output);
        return;
    }
    const std::vector<std::string>& names = function.Inputs();
    PutField(output, "inputs", std::to_string(names.size()) + ": " + Names(function));
    PutField(output, "bit order",
             names.size() == 1 ? "bit k, from the right, is row k: " + Visible(names[0]) + "=k"
                               : "bit k, from the right, is row k; bit 0 is all inputs 0, bit " +
                                     std::to_string(function.NumRows() - 1) + " all inputs 1");
    if (names.size() == 1) {
        PutField(output, "hexadecimal", function.Hex());
        PutField(output, "binary", function.Binary());
    } else {
        PutDigits(msb, lsb, output);
    }
    PutReadsBack(msb, lsb, output);
}

Json AsJson(const Order& msb, const Order& lsb)
{
    const Function& function = msb.column;
    Json result;
    result["inputs"] = function.Inputs();
    result["num_rows"] = function.NumInputs() == 0 ? 0 : function.NumRows();
    if (function.NumInputs() == 0)
        result["value"] = function.At(0) ? 1 : 0;
    const bool isTried = function.NumInputs() > 0 && function.NumInputs() <= kMaxTriedInputs;
    for (const Order* order : {&msb, &lsb}) {
        Json& json = result[order->lsbFirst ? "lsb_first" : "msb_first"];
        for (const bool isHex : {true, false}) {
            const auto digits = isHex ? &Function::Hex : &Function::Binary;
            const std::string name = isHex ? "hex" : "binary";
            const std::string text = (order->column.*digits)();
            json[name] = function.NumInputs() > 0 ? Json(text) : Json();
            json[name + "_reads_back"] =
                isTried
                    ? Json(ReadsBack(function, text, order->lsbFirst, false, (function.*digits)()))
                    : Json();
        }
    }
    return result;
}

int RunInit(const Request& request, Output& output)
{
    return ForEachText(request, output, [&](const Text& text) {
        Function function;
        if (!SetFunction(text, request, output, function))
            return kRefused;
        const Function turned = function.Reversed();
        const Order msb = {function, false};
        const Order lsb = {turned, true};
        if (request.json && function.NumInputs() > kMaxJsonInputs) {
            Refuse(text, request, output,
                   "over " + std::to_string(kMaxJsonInputs) +
                       " inputs the digits are too long for one object: print them without --json");
            return kRefused;
        }
        if (request.json) {
            PutJson(text, request, "done", AsJson(msb, lsb), output);
            return kDone;
        }
        if (text.line > 0)
            PutField(output, "line", std::to_string(text.line));
        PutInit(msb, lsb, output);
        if (text.line > 0)
            output.Put("\n");
        return kDone;
    });
}

} // namespace

Command InitCommand()
{
    return {
        "init",
        "EQUATION",
        1,
        1,
        "Print init values in both bit orders, and what reads back",
        "The digits are printed in full, up to 30 inputs. 'reads back' was tried: the call of the\n"
        "library shown gives the same function again.\n",
        {},
        {"booleq init 'A & ~B'", "booleq init --inputs A,B,C 'A & B'",
         "booleq init --inputs A,B --lsb-first 0x2"},
        RunInit};
}

} // namespace booleq
