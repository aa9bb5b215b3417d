// The reasons that booleq gives for a refusal are facts: no text that the library accepts has one.
// Random texts from a fixed seed; prints the counts and every accepted text with a reason.
#include <cstdint>
#include <cstdio>
#include <random>

#include <Kq_BoolEquation.h>
#include <port/Port_MsgManData.h>

#include "refusal.h"
#include "core/text.h"

namespace {

constexpr unsigned int kSeed = 7;
constexpr int kNumTexts = 1000000;

// The first 20 are what equations are made of, the others what they stumble over.
const char* const kPieces[] = {"A", "B",    "'x y'", "(",  ")",  "&",  "|",  "+",  "*",  "^", "@",
                               "~", ".OR.", "!",     " ",  "0",  "1",  "0x", "0b", "~&", "'", ".",
                               "2", "10",   "8",     "b2", "\n", "\r", "[",  "-",  "x"};
constexpr unsigned int kNumPieces = sizeof(kPieces) / sizeof(kPieces[0]);

std::string RandomText(std::mt19937& random)
{
    std::string text;
    for (unsigned int left = 1 + random() % 8; left > 0; --left)
        text += kPieces[random() % (random() % 3 != 0 ? 20 : kNumPieces)];
    return text;
}

booleq::Reading RandomReading(std::mt19937& random)
{
    booleq::Reading reading;
    reading.inputs.assign({"A", "B", "C"});
    reading.inputs.resize(random() % 4);
    reading.hasInputs = !reading.inputs.empty();
    reading.lsbFirst = reading.hasInputs && random() % 2 == 0;
    return reading;
}

// What is said when the text shows no single fact.
bool IsGeneral(const std::string& reason)
{
    return reason.rfind("operators and operands do not fit together", 0) == 0;
}

// The tool never asks about blank texts; one digit over no inputs is accepted for what it is.
bool IsAsked(const std::string& text, const booleq::Reading& reading)
{
    const bool isOneDigit = text.size() == 3 && text[0] == '0' && (text[1] | 32) == 'b';
    return !booleq::IsBlank(text) && (reading.hasInputs || !isOneDigit);
}

} // namespace

int main()
{
    Port_MsgManData::setSink([](const char*, const char*, int, const char*, const char*) {});
    std::mt19937 random(kSeed);
    int numAccepted = 0;
    int numExplained = 0;
    int numWrong = 0;
    for (int count = 0; count < kNumTexts; ++count) {
        const std::string text = RandomText(random);
        const booleq::Reading reading = RandomReading(random);
        if (!IsAsked(text, reading))
            continue;
        Kq_BoolEquation equation;
        const bool accepted = booleq::SetFromText(equation, text, reading);
        const std::string reason = booleq::ExplainRefusal(text, reading);
        numAccepted += accepted;
        numExplained += !accepted && !IsGeneral(reason);
        if (!accepted || IsGeneral(reason))
            continue;
        ++numWrong;
        std::printf("accepted: %s\n  %s\n", booleq::Visible(text).c_str(), reason.c_str());
    }
    std::printf("seed %u, %d texts: %d accepted, %d refused for a fact, %d wrong reasons\n", kSeed,
                kNumTexts, numAccepted, numExplained, numWrong);
    return numWrong == 0 && numAccepted > 0 && numExplained > 0 ? 0 : 1;
}
