// Decides random pairs and writes them for other programs: decide_pairs DIRECTORY FIRST LAST.
// Prints for each pair a line "NUMBER VERDICT PROOF REWRITTEN MICROSECONDS", and writes to the
// directory NUMBER.cnf, NUMBERa.blif, NUMBERb.blif, and the texts NUMBERa.txt, NUMBERb.txt.
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <string>

#include "cnf.h"
#include "decision.h"
#include "network.h"
#include "notation_writer.h"
#include "pairs.h"

namespace {

constexpr uint32_t kMaxInputs = 300;

void Write(const std::string& path, const std::string& text)
{
    std::ofstream file(path);
    file << text;
    if (!file.flush()) {
        std::fprintf(stderr, "decide_pairs: cannot write %s\n", path.c_str());
        std::exit(2);
    }
}

std::string OwnText(const booleq::Expression& expression)
{
    return WriteOwn(expression, booleq::OwnSyntax::First, booleq::Parentheses::Clear);
}

const char* WordOf(booleq::Verdict verdict)
{
    switch (verdict) {
    case booleq::Verdict::Equal:
        return "equal";
    case booleq::Verdict::Different:
        return "different";
    case booleq::Verdict::Undecided:
        break;
    }
    return "undecided";
}

const char* WordOf(booleq::Proof proof)
{
    switch (proof) {
    case booleq::Proof::None:
        break;
    case booleq::Proof::Structure:
        return "structure";
    case booleq::Proof::Rows:
        return "rows";
    case booleq::Proof::RandomRows:
        return "random";
    case booleq::Proof::Solver:
        return "solver";
    }
    return "none";
}

} // namespace

int main(int argc, char** argv)
{
    if (argc != 4) {
        std::fprintf(stderr, "usage: decide_pairs DIRECTORY FIRST LAST\n");
        return 2;
    }
    const std::string directory = argv[1];
    const uint64_t last = std::strtoull(argv[3], nullptr, 10);
    for (uint64_t number = std::strtoull(argv[2], nullptr, 10); number <= last; ++number) {
        const decide_pairs::Pair pair = decide_pairs::MakePair(number, kMaxInputs);
        const auto start = std::chrono::steady_clock::now();
        const booleq::Decision decision = booleq::DecideEqual(pair.left, pair.right, {60});
        const auto passed = std::chrono::steady_clock::now() - start;
        const std::string path = directory + "/" + std::to_string(number);
        Write(path + ".cnf", ToDimacs(booleq::ClausesOfDifference(pair.left, pair.right)));
        const booleq::UnitNames names = {pair.left.names, "y", "pair"};
        Write(path + "a.blif", WriteBlif(pair.left, names));
        Write(path + "b.blif", WriteBlif(pair.right, names));
        Write(path + "a.txt", OwnText(pair.left));
        Write(path + "b.txt", OwnText(pair.right));
        std::printf("%llu %s %s %s %lld\n", static_cast<unsigned long long>(number),
                    WordOf(decision.verdict), WordOf(decision.proof),
                    pair.isRewritten ? "rewritten" : "changed",
                    static_cast<long long>(
                        std::chrono::duration_cast<std::chrono::microseconds>(passed).count()));
    }
    return 0;
}
