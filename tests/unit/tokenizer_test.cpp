// Text to tokens: every spelling, what is skipped and what is refused.
#include <cctype>

#include <gtest/gtest.h>

#include "unit_support.h"

namespace {

struct OperatorRow {
    const char* spelling;
    const char* tree;
};

TEST(Tokenizer, EverySpellingOfABinaryOperatorIsRead)
{
    const OperatorRow rows[] = {
        {"&", "AND(a, b)"},     {"*", "AND(a, b)"},       {".AND.", "AND(a, b)"},
        {"|", "OR(a, b)"},      {"+", "OR(a, b)"},        {".OR.", "OR(a, b)"},
        {"^", "XOR(a, b)"},     {"@", "XOR(a, b)"},       {".XOR.", "XOR(a, b)"},
        {"~&", "NAND(a, b)"},   {"!&", "NAND(a, b)"},     {"~*", "NAND(a, b)"},
        {"!*", "NAND(a, b)"},   {".NAND.", "NAND(a, b)"}, {"~|", "NOR(a, b)"},
        {"!|", "NOR(a, b)"},    {"~+", "NOR(a, b)"},      {"!+", "NOR(a, b)"},
        {".NOR.", "NOR(a, b)"}, {"~^", "NXOR(a, b)"},     {"!^", "NXOR(a, b)"},
        {"~@", "NXOR(a, b)"},   {"!@", "NXOR(a, b)"},     {".NXOR.", "NXOR(a, b)"}};
    for (const OperatorRow& row : rows) {
        const std::string closeUp = std::string("a") + row.spelling + "b";
        const std::string spaced = std::string("a ") + row.spelling + "\t\nb";
        EXPECT_EQ(row.tree, TreeOf(closeUp.c_str())) << closeUp;
        EXPECT_EQ(row.tree, TreeOf(spaced.c_str())) << spaced;
        Engine engine;
        engine.SetEquation(closeUp.c_str());
        EXPECT_EQ(row.spelling, Std(engine.GetRoot()->GetToken())) << "the spelling is kept";
    }
}

TEST(Tokenizer, EverySpellingOfNotIsRead)
{
    for (const char* text : {"~a", "!a", "~ a", ".NOT.a", ".NOT. a"})
        EXPECT_EQ("NOT(a)", TreeOf(text)) << text;
    EXPECT_EQ("NOT(NOT(a))", TreeOf("!!a"));
    EXPECT_EQ("NOT(NOT(a))", TreeOf("~.NOT.a"));
}

TEST(Tokenizer, NegationTakesAnOperatorWrittenRightBehindIt)
{
    EXPECT_EQ("NAND(a, b)", TreeOf("a~&b"));
    EXPECT_EQ("NOT(AND(a, b))", TreeOf("a~ &b"));
    EXPECT_EQ("NOT(NAND(a, b))", TreeOf("a~~&b"));
    EXPECT_EQ("NOT(AND(a, b))", TreeOf("a~.AND.b"));
}

TEST(Tokenizer, ConstantsAreOneCharacterEach)
{
    EXPECT_EQ("0", TreeOf("0"));
    EXPECT_EQ("1", TreeOf("1"));
    EXPECT_EQ("refused", TreeOf("10"));
    EXPECT_EQ("refused", TreeOf("1A"));
    EXPECT_EQ("AND(A, 1)", TreeOf("A&1"));
}

TEST(Tokenizer, PlainNames)
{
    for (const char* text : {"_", "a", "Z", "A1_b", "x9", "__0"})
        EXPECT_EQ(text, TreeOf(text));
    EXPECT_EQ("AND(a, A)", TreeOf("a&A")) << "case counts";
}

TEST(Tokenizer, QuotedNamesKeepTheirQuotes)
{
    for (const char* text : {"'a b'", "''", "'1&~(.'", "'A[0]'", "'\r\n\x80'"})
        EXPECT_EQ(text, TreeOf(text));
    EXPECT_EQ("AND('A', A)", TreeOf("'A'&A")) << "quoted and plain are two names";
}

TEST(Tokenizer, UnterminatedQuotedNameClearsTheEquation)
{
    EXPECT_EQ("refused", TreeOf("'ab"));
    EXPECT_EQ("refused", TreeOf("A & '"));
    EXPECT_EQ("refused", TreeOf("'a' & 'b"));
}

TEST(Tokenizer, UnknownKeywordsAreRefused)
{
    for (const char* text :
         {"A .and. B", "A .XNOR. B", "A . AND. B", "A .AND B", "A .AND . B", "A .", "A .. B",
          "A .ANDX. B", "A .AN. B", "A.AND", "A .NAND B .OR. C"})
        EXPECT_EQ("refused", TreeOf(text)) << text;
    EXPECT_EQ("OR(AND(A, B), C)", TreeOf("A.AND.B.OR.C"));
}

TEST(Tokenizer, OnlyBlanksAndNamePartsMayFollowAName)
{
    const std::string accepted = " \t\n_";
    for (int value = 1; value < 256; ++value) {
        const std::string text = std::string("A") + static_cast<char>(value);
        const bool isAccepted = std::isalnum(value) != 0 ||
                                accepted.find(static_cast<char>(value)) != std::string::npos;
        EXPECT_EQ(isAccepted, TreeOf(text.c_str()) != "refused") << value;
    }
}

TEST(Tokenizer, UnknownCharactersAreRefusedWithoutAMessage)
{
    const Messages messages;
    for (const char* text :
         {"A & \r\nB", "A\r", "9", "A & 2", "A - B", "A / B", "A, B", "\x80", "A & \xc3\xa4", "#",
          "A & B;", "A[0]", "A{", "\"A\"", "A = B", "A && B ?", "\x01", "\x7f"}) {
        Engine engine;
        EXPECT_FALSE(engine.SetEquation(text)) << text;
    }
    EXPECT_EQ("", messages.Text());
}

TEST(Tokenizer, LineFeedSeparatesTokens)
{
    EXPECT_EQ("refused", TreeOf("A\nB")) << "two names in a row";
    EXPECT_EQ("AND(A, B)", TreeOf("A\n&\n\tB\n"));
}

TEST(Tokenizer, BlanksAloneAreNoEquation)
{
    for (const char* text : {" ", "\t", "\n", "    \t\n "})
        EXPECT_EQ("refused", TreeOf(text));
}

TEST(Tokenizer, ParenthesesMustBalanceInTotal)
{
    EXPECT_EQ("refused", TreeOf("(A"));
    EXPECT_EQ("refused", TreeOf("A)"));
    // Balanced in total: the tokenizer accepts it, but the builder refuses it and dumps a node.
    Messages messages;
    Engine engine;
    EXPECT_FALSE(engine.SetEquation("(A"));
    EXPECT_EQ("", messages.Text());
    EXPECT_FALSE(engine.SetEquation(")A("));
    EXPECT_NE("", messages.Text());
}

TEST(Tokenizer, LongTokensAreWhole)
{
    const std::string name(200000, 'n');
    const std::string quoted = "'" + std::string(200000, ' ') + "'";
    EXPECT_EQ("AND(" + name + ", " + quoted + ")", TreeOf((name + "&" + quoted).c_str()));
    EXPECT_EQ("refused", TreeOf(("A ." + std::string(200000, 'A') + ". B").c_str()));
}

TEST(StringPool, FindsOneStringForEachName)
{
    Engine::StringMgr pool;
    const String& ab = pool.find("AB");
    EXPECT_EQ("AB", Std(ab));
    EXPECT_EQ(&ab, &pool.find("AB"));
    const String& a = pool.find("A");
    EXPECT_EQ("A", Std(a));
    EXPECT_NE(&ab, &a);
    EXPECT_EQ("AB", Std(ab));
    EXPECT_EQ(&ab, &pool.find("AB"));
    EXPECT_NE(&pool.find("a"), &pool.find("A"));
    EXPECT_NE(&pool.find("'A'"), &pool.find("A"));
}

TEST(StringPool, EmptyNameHasAStringToo)
{
    Engine::StringMgr pool;
    const String& empty = pool.find("");
    EXPECT_EQ("", Std(empty));
    EXPECT_EQ(&empty, &pool.find(""));
    EXPECT_EQ(&empty, &pool.find(nullptr));
}

TEST(StringPool, NamesWithCommonBeginningsStayApart)
{
    Engine::StringMgr pool;
    std::vector<std::string> names;
    for (int number = 0; number < 2000; ++number)
        names.push_back("net_" + std::to_string(number * 7919 % 2000));
    names.push_back("net_");
    names.push_back("ne");
    names.push_back("net_1\x80");
    names.push_back(std::string(100000, 'n'));
    names.push_back(std::string(50000, 'n') + "m");
    std::vector<const String*> strings;
    for (const std::string& name : names)
        strings.push_back(&pool.find(name.c_str()));
    for (size_t index = 0; index < names.size(); ++index) {
        EXPECT_EQ(names[index], Std(*strings[index]));
        EXPECT_EQ(strings[index], &pool.find(names[index].c_str()));
    }
}

} // namespace
