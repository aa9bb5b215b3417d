// Why and where a text is refused: exact places; and for every short sequence of tokens, that the
// reason given is true of the tokens there.
#include <gtest/gtest.h>

#include "unit_support.h"

namespace {

typedef Kq_BoolEquation::Refusal Refusal;

// "code offset length", or "" for an accepted text.
std::string RefusalText(const Refusal& refusal)
{
    if (refusal.code == Refusal::NONE)
        return "";
    return std::to_string(refusal.code) + " " + std::to_string(refusal.offset) + " " +
           std::to_string(refusal.length);
}

std::string RefusalOf(const String& text)
{
    return RefusalText(Kq_BoolEquation::FindRefusal(text));
}

std::string Expected(Refusal::CODE code, size_t offset, size_t length)
{
    return std::to_string(code) + " " + std::to_string(offset) + " " + std::to_string(length);
}

TEST(Refusal, AcceptedTextsHaveNone)
{
    for (const char* text : {"A", "A & ~B", "()", "()A", "(A ~ & B)", "0b0", "A | (~ & B)"})
        EXPECT_EQ("", RefusalOf(text)) << text;
}

TEST(Refusal, CharactersWordsAndQuotes)
{
    EXPECT_EQ(Expected(Refusal::EMPTY, 0, 0), RefusalOf(""));
    EXPECT_EQ(Expected(Refusal::EMPTY, 0, 3), RefusalOf(" \t\n"));
    EXPECT_EQ(Expected(Refusal::CHARACTER, 1, 1), RefusalOf("A[0]"));
    EXPECT_EQ(Expected(Refusal::CHARACTER, 5, 1), RefusalOf("A & B\r"));
    EXPECT_EQ(Expected(Refusal::CHARACTER, 0, 1), RefusalOf("2"));
    EXPECT_EQ(Expected(Refusal::WORD, 2, 6), RefusalOf("A .XNOR. B"));
    EXPECT_EQ(Expected(Refusal::WORD, 2, 1), RefusalOf("A .AND B"));
    EXPECT_EQ(Expected(Refusal::QUOTE, 1, 1), RefusalOf("A' & B"));
}

TEST(Refusal, Parentheses)
{
    EXPECT_EQ(Expected(Refusal::PAREN, 0, 1), RefusalOf("(A & B"));
    EXPECT_EQ(Expected(Refusal::PAREN, 4, 1), RefusalOf("A & (B | (C)"));
    EXPECT_EQ(Expected(Refusal::PAREN, 5, 1), RefusalOf("A & B)"));
    EXPECT_EQ(Expected(Refusal::PAREN, 0, 1), RefusalOf(")A("));
    EXPECT_EQ(Expected(Refusal::PAREN, 2, 1), RefusalOf("A ) & ( B"));
}

TEST(Refusal, OperandsAndOperators)
{
    EXPECT_EQ(Expected(Refusal::OPERAND, 2, 2), RefusalOf("A BC"));
    EXPECT_EQ(Expected(Refusal::OPERAND, 1, 1), RefusalOf("10"));
    EXPECT_EQ(Expected(Refusal::OPERAND, 1, 2), RefusalOf("0x8"));
    EXPECT_EQ(Expected(Refusal::OPERAND, 4, 1), RefusalOf("(A) B"));
    EXPECT_EQ(Expected(Refusal::OPERAND, 2, 1), RefusalOf("A ~ B & C"));
    EXPECT_EQ(Expected(Refusal::NO_LEFT_OPERAND, 0, 2), RefusalOf("~& A"));
    EXPECT_EQ(Expected(Refusal::NO_LEFT_OPERAND, 5, 5), RefusalOf("A & (.AND. B)"));
    EXPECT_EQ(Expected(Refusal::NO_RIGHT_OPERAND, 2, 1), RefusalOf("A && B"));
    EXPECT_EQ(Expected(Refusal::NO_RIGHT_OPERAND, 2, 1), RefusalOf("A &"));
    EXPECT_EQ(Expected(Refusal::NO_OPERAND, 4, 1), RefusalOf("A & ~"));
    EXPECT_EQ(Expected(Refusal::NEGATED_OPERATOR, 4, 1), RefusalOf("A & ~ | B"));
    EXPECT_EQ(Expected(Refusal::OPERAND, 4, 1), RefusalOf("(A) ~ & B"));
}

TEST(Refusal, InitValuesOverTerms)
{
    const std::vector<String> terms = {"A", "B"};
    const auto over = [&terms](const char* text) {
        return RefusalText(Kq_BoolEquation::FindRefusal(text, &terms));
    };
    EXPECT_EQ("", over("0x8"));
    EXPECT_EQ("", over("A & D"));
    EXPECT_EQ(Expected(Refusal::INIT_DIGIT, 1, 1), over("0 | A"));
    EXPECT_EQ(Expected(Refusal::INIT_DIGIT, 3, 1), over("0b12"));
    EXPECT_EQ(Expected(Refusal::INIT_WIDTH, 2, 2), over("0x88"));
    const std::vector<String> lenient = {"'a'+b"};
    EXPECT_EQ("", RefusalText(Kq_BoolEquation::FindRefusal("0b10", &lenient)));
    const std::vector<String> broken = {"'a' b"};
    EXPECT_EQ(Expected(Refusal::INIT_NAME, 0, 4),
              RefusalText(Kq_BoolEquation::FindRefusal("0b10", &broken)));
}

TEST(Refusal, AskingSetsAndDumpsNothing)
{
    const Messages messages;
    const DebugMode debugMode;
    EXPECT_NE("", RefusalOf("A B"));
    EXPECT_EQ("", RefusalOf("A & B"));
    EXPECT_EQ("", messages.Text());
}

// The tokens of the exhaustive test, as single characters with a blank after each.
bool IsOperand(char token)
{
    return token == 'A' || token == '1';
}

bool IsTrue(const Refusal& refusal, const std::string& tokens)
{
    const size_t place = refusal.offset / 2;
    if (refusal.offset % 2 != 0 || refusal.length != 1 || place >= tokens.size())
        return false;
    const char token = tokens[place];
    const char before = place > 0 ? tokens[place - 1] : '(';
    const char behind = place + 1 < tokens.size() ? tokens[place + 1] : ')';
    switch (refusal.code) {
    case Refusal::PAREN:
        return token == '(' || token == ')';
    case Refusal::OPERAND:
        return (IsOperand(token) || token == '(' || token == '~') &&
               (IsOperand(before) || before == ')');
    case Refusal::NO_LEFT_OPERAND:
        return token == '&' && before == '(';
    case Refusal::NO_RIGHT_OPERAND:
        return token == '&' && (behind == ')' || behind == '&');
    case Refusal::NO_OPERAND:
        return token == '~' && behind == ')';
    case Refusal::NEGATED_OPERATOR:
        return token == '~' && behind == '&';
    default:
        return false;
    }
}

// Whether, by counting alone, a ")" is too many or a "(" is not closed.
bool IsCountTrue(const Refusal& refusal, const std::string& tokens)
{
    int open = 0;
    const bool isParen = refusal.code == Refusal::PAREN;
    if (isParen && tokens[refusal.offset / 2] == ')') {
        for (size_t place = 0; place <= refusal.offset / 2; ++place)
            open += tokens[place] == '(' ? 1 : tokens[place] == ')' ? -1 : 0;
        return open < 0;
    }
    if (isParen) {
        for (size_t place = refusal.offset / 2; place < tokens.size(); ++place) {
            open += tokens[place] == '(' ? 1 : tokens[place] == ')' ? -1 : 0;
            if (open == 0)
                return false;
        }
    }
    return true;
}

TEST(Refusal, IsTrueOfEverySequenceOfSevenTokens)
{
    const Messages messages; // dumps of the refusals
    const std::string alphabet = "A1()&~";
    size_t numRefused = 0;
    size_t numAccepted = 0;
    for (size_t length = 1; length <= 7; ++length) {
        size_t numTexts = 1;
        for (size_t digit = 0; digit < length; ++digit)
            numTexts *= alphabet.size();
        for (size_t number = 0; number < numTexts; ++number) {
            std::string tokens;
            std::string text;
            for (size_t rest = number; tokens.size() < length; rest /= alphabet.size()) {
                tokens += alphabet[rest % alphabet.size()];
                text += {tokens.back(), ' '};
            }
            Engine engine;
            const bool isAccepted = engine.SetEquation(text.c_str());
            const Refusal refusal = Engine::FindRefusal(text.c_str());
            ++(isAccepted ? numAccepted : numRefused);
            ASSERT_EQ(isAccepted, refusal.code == Refusal::NONE) << text;
            if (!isAccepted) {
                ASSERT_TRUE(IsTrue(refusal, tokens)) << text << RefusalText(refusal);
                ASSERT_TRUE(IsCountTrue(refusal, tokens)) << text << RefusalText(refusal);
            }
        }
    }
    EXPECT_EQ(335922u, numAccepted + numRefused);
    EXPECT_GT(numAccepted, 1000u);
}

} // namespace
