// The command 'init': init values in both bit orders, and which texts read back.
#include <algorithm>

#include <kq_logic/permute.h>

#include "answer.h"
#include "bit_orders.h"
#include "commands.h"
#include "picture.h"
#include "text.h"

namespace booleq {

namespace {

// With more inputs, the digits are too long for one text in JSON.
constexpr size_t kMaxJsonInputs = 24;

// One of the two bit orders. The digits are made only when they are written: with 30 inputs they
// are 256 MB and 1 GB.
struct Order {
    const kq_logic::Function& column; // as seen by somebody who counts this way
    bool lsbFirst;
};

// Whether the library reads 'text' as this function, and renders it as 'rendering' afterwards.
bool ReadsBack(const kq_logic::Function& function, const std::string& text, bool lsbFirst,
               bool reverse, const std::string& rendering)
{
    Reading reading;
    reading.hasInputs = true;
    reading.inputs = function.Inputs();
    reading.lsbFirst = lsbFirst;
    reading.reverse = reverse;
    Kq_BoolEquation equation;
    kq_logic::Function read;
    kq_logic::Function inOrder;
    // For a name like 'a'+b the library reads the inputs of the expression that it stands for.
    if (!SetVerbatim(equation, text, reading) || !read.Set(equation) ||
        read.NumInputs() != function.NumInputs() ||
        !kq_logic::Permute(read, function.Inputs(), inOrder).empty() || inOrder != function)
        return false;
    const Port::StringBase<char> rendered = rendering[1] == 'x'
                                                ? equation.GetEquationAsHexInitValue(false)
                                                : equation.GetEquationAsBinaryInitValue();
    return rendering.compare(0, std::string::npos, rendered.c_str(), rendered.length()) == 0;
}

std::string Names(const kq_logic::Function& function)
{
    return Visible(Join(function.Inputs(), ", "));
}

// The digits are printed in full only once.
std::string Shortened(const std::string& digits)
{
    return digits.size() <= 40 ? digits : digits.substr(0, 40) + "...";
}

std::string Call(const kq_logic::Function& function, const std::string& text, bool lsbFirst,
                 bool reverse)
{
    return "SetEquationWithExplicitTerms({" + Names(function) + "}, \"" + Shortened(text) + "\", " +
           (lsbFirst ? "true" : "false") + ", " + (reverse ? "true" : "false") + ")";
}

void PutTried(const kq_logic::Function& function, const std::string& text, bool lsbFirst,
              bool reverse, const std::string& rendering, Output& output)
{
    const bool reads = ReadsBack(function, text, lsbFirst, reverse, rendering);
    PutField(output, reads ? "reads back" : "does not", Call(function, text, lsbFirst, reverse));
}

void PutReadsBack(const Order& msb, const Order& lsb, Output& output)
{
    const kq_logic::Function& function = msb.column;
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
    PutField(output, "",
             "  which renders " + Shortened(hex) + ", the first input most significant again");
    PutTried(function, turned, false, true, turned, output);
    PutField(output, "",
             "  which renders " + Shortened(turned) + ", " + Visible(function.Inputs().back()) +
                 " being the first variable now");
}

void PutConstant(const kq_logic::Function& function, Output& output)
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
    const kq_logic::Function& function = msb.column;
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
    PutBitOrders(msb.column, lsb.column, output);
    PutReadsBack(msb, lsb, output);
}

Json AsJson(const Order& msb, const Order& lsb)
{
    const kq_logic::Function& function = msb.column;
    Json result;
    result["inputs"] = function.Inputs();
    result["num_rows"] = function.NumInputs() == 0 ? 0 : function.NumRows();
    if (function.NumInputs() == 0)
        result["value"] = function.At(0) ? 1 : 0;
    const bool isTried = function.NumInputs() > 0;
    for (const Order* order : {&msb, &lsb}) {
        Json& json = result[order->lsbFirst ? "lsb_first" : "msb_first"];
        for (const bool isHex : {true, false}) {
            const auto digits = isHex ? &kq_logic::Function::Hex : &kq_logic::Function::Binary;
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

// The picture: the table with its rows from the top, the digits below it to the right, and an arrow
// from each row to its digit. Arrows do not cross, because the highest row comes first in the text.
constexpr size_t kMargin = 20;
constexpr size_t kRowHeight = 24;
constexpr size_t kRowNumberWidth = 64;
constexpr size_t kResultWidth = 64;
constexpr size_t kDigitWidth = 24;
constexpr size_t kTableTop = 110;

// Where the column of each input begins and, after these, that of the result.
std::vector<size_t> ColumnPlaces(const kq_logic::Function& function)
{
    std::vector<size_t> places = {kMargin + kRowNumberWidth};
    for (const std::string& name : function.Inputs())
        places.push_back(places.back() +
                         kCharacterWidth * std::max<size_t>(2, Visible(name).size()) +
                         kCharacterWidth);
    return places;
}

std::string SignificanceText(const kq_logic::Function& function)
{
    const std::string first = Visible(function.Inputs().front());
    if (function.NumInputs() == 1)
        return first + " is the only input";
    return first + " is the most significant input, " + Visible(function.Inputs().back()) +
           " the least";
}

void PutPictureTable(const kq_logic::Function& function, const std::vector<size_t>& places,
                     Output& output)
{
    output.Put(SvgText(kMargin, kTableTop - 32, "start", "row"));
    output.Put(SvgNote(kMargin, kTableTop - 10, "start", "weight"));
    output.Put(SvgText(places.back() + kResultWidth / 2, kTableTop - 32, "middle", "result"));
    for (size_t index = 0; index < function.NumInputs(); ++index) {
        const size_t middle = (places[index] + places[index + 1]) / 2;
        output.Put(SvgText(middle, kTableTop - 32, "middle", Visible(function.Inputs()[index])));
        const uint64_t weight = uint64_t(1) << (function.NumInputs() - 1 - index);
        output.Put(SvgNote(middle, kTableTop - 10, "middle", std::to_string(weight)));
    }
    for (size_t row = 0; row < function.NumRows(); ++row) {
        const size_t y = kTableTop + kRowHeight * row;
        const size_t base = y + kRowHeight / 2 + 5;
        output.Put(SvgText(kMargin + 3 * kCharacterWidth, base, "end", std::to_string(row)));
        for (size_t index = 0; index < function.NumInputs(); ++index)
            output.Put(SvgText((places[index] + places[index + 1]) / 2, base, "middle",
                               function.InputAt(row, index) ? "1" : "0"));
        output.Put(SvgBox(places.back(), y, kResultWidth, kRowHeight, function.At(row),
                          function.At(row) ? "1" : "0"));
    }
}

// The digits of both bases, one below the other, starting at 'left' and 'top'.
void PutPictureDigits(const kq_logic::Function& function, size_t left, size_t top, Output& output)
{
    const size_t numRows = function.NumRows();
    output.Put(SvgNote(left - kCharacterWidth, top - 8, "end", "bit"));
    output.Put(SvgText(left - kCharacterWidth, top + kRowHeight / 2 + 5, "end", "0b"));
    output.Put(SvgText(left - kCharacterWidth, top + 2 * kRowHeight + 5, "end", "0x"));
    for (size_t place = 0; place < numRows; ++place) {
        const size_t row = numRows - 1 - place;
        const size_t x = left + kDigitWidth * place;
        output.Put(SvgNote(x + kDigitWidth / 2, top - 8, "middle", std::to_string(row)));
        output.Put(SvgBox(x, top, kDigitWidth, kRowHeight, function.At(row),
                          function.At(row) ? "1" : "0"));
    }
    const std::string hex = function.Hex();
    const size_t rowsOfDigit = std::min<size_t>(4, numRows);
    for (size_t digit = 2; digit < hex.size(); ++digit)
        output.Put(SvgBox(left + kDigitWidth * rowsOfDigit * (digit - 2), top + kRowHeight * 3 / 2,
                          kDigitWidth * rowsOfDigit, kRowHeight, hex[digit] != '0',
                          std::string(1, hex[digit])));
}

void PutPicture(const kq_logic::Function& function, Output& output)
{
    const std::vector<size_t> places = ColumnPlaces(function);
    const size_t tableRight = places.back() + kResultWidth;
    const size_t digitsLeft = tableRight + 2 * kMargin;
    const size_t digitsTop = kTableTop + kRowHeight * (function.NumRows() + 2);
    const std::string captions[] = {SignificanceText(function), "row k is bit k of the init value"};
    const size_t width =
        std::max(digitsLeft + kDigitWidth * function.NumRows(),
                 kMargin + kCharacterWidth * std::max(captions[0].size(), captions[1].size()));
    output.Put(SvgHead(width + kMargin, digitsTop + kRowHeight * 5 / 2 + kMargin));
    output.Put(SvgText(kMargin, 25, "start", captions[0]));
    output.Put(SvgText(kMargin, 45, "start", captions[1]));
    PutPictureTable(function, places, output);
    for (size_t row = 0; row < function.NumRows(); ++row)
        output.Put(
            SvgArrow(tableRight, kTableTop + kRowHeight * row + kRowHeight / 2,
                     digitsLeft + kDigitWidth * (function.NumRows() - 1 - row) + kDigitWidth / 2,
                     digitsTop - kRowHeight, function.At(row)));
    PutPictureDigits(function, digitsLeft, digitsTop, output);
    output.Put(SvgTail());
}

int RunInit(const Request& request, Output& output)
{
    RefuseTwoFormats(request, "--svg");
    return ForEachText(request, output, [&](const Text& text) {
        kq_logic::Function function;
        if (!SetFunction(text, request, output, function))
            return kRefused;
        if (request.Has("--svg")) {
            if (!HasPicture(function, "a picture", text, request, output))
                return kRefused;
            PutPicture(function, output);
            return kDone;
        }
        const kq_logic::Function turned = Reversed(function);
        const Order msb = {function, false};
        const Order lsb = {turned, true};
        if (request.json && function.NumInputs() > kMaxJsonInputs) {
            Refuse(text, request, output,
                   "over " + std::to_string(kMaxJsonInputs) +
                       " inputs the digits are too long for one object: print them without --json");
            return kRefused;
        }
        return Say(text, request, output,
                   {kDone, "done", LineMark::Block, [&] { return AsJson(msb, lsb); },
                    [&] { PutInit(msb, lsb, output); }});
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
        "Prints all digits, up to 30 inputs. Each call listed under 'reads back' was tried: it\n"
        "gives the same function again.\n",
        {{"--svg", nullptr, "Print a picture of which row is which bit, up to six inputs"}},
        {"booleq init 'A & ~B'", "booleq init --inputs A,B,C 'A & B'",
         "booleq init --inputs A,B --lsb-first 0x2", "booleq init --svg 'A & ~B' > bits.svg"},
        RunInit};
}

} // namespace booleq
