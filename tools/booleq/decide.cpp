#include "decide.h"

#include <cassert>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <optional>

#include "solver.h"
#include "text.h"
#include "watch.h"

namespace booleq {

namespace {

constexpr double kMaxSeconds = 1e9;

struct Shown {
    Progress progress{"working, seconds", 0};
    std::chrono::steady_clock::time_point start = std::chrono::steady_clock::now();
};
std::optional<Shown> shown;

void ShowSeconds()
{
    const auto passed = std::chrono::steady_clock::now() - shown->start;
    shown->progress.ShowNow(
        static_cast<uint64_t>(std::chrono::duration_cast<std::chrono::seconds>(passed).count()));
}

void WriteFile(const std::string& path, const std::string& text)
{
    FILE* const file = std::fopen(path.c_str(), "wb");
    if (!file)
        throw IoError("cannot open " + Visible(path), errno);
    const bool isWritten = std::fwrite(text.data(), 1, text.size(), file) == text.size();
    const int error = errno;
    if (std::fclose(file) != 0 || !isWritten)
        throw IoError("cannot write " + Visible(path), isWritten ? errno : error);
}

} // namespace

Option SecondsOption()
{
    return {"--seconds", "N", "Give up after N seconds: not decided, status 4"};
}

std::vector<Option> ClauseOptions()
{
    return {{"--cnf", "FILE", "Write the question as clauses (DIMACS), names in comments"},
            {"--proof", "FILE", "Write a proof (DRAT) that these clauses contradict each other"}};
}

double ParseSeconds(const Request& request, double seconds)
{
    if (!request.Has("--seconds"))
        return seconds;
    const std::string text = request.Get("--seconds");
    const bool isPlain = !text.empty() && text.size() <= 18 &&
                         text.find_first_not_of("0123456789.") == std::string::npos;
    char* end = nullptr;
    const double value = isPlain ? std::strtod(text.c_str(), &end) : 0;
    if (!isPlain || *end != '\0' || value <= 0 || value > kMaxSeconds)
        throw UsageError("--seconds takes a number above 0, such as 10 or 0.5, not '" +
                         Visible(text) + "'");
    return value;
}

WorkingProgress::WorkingProgress()
{
    assert(!shown);
    shown.emplace();
    SetWatch(ShowSeconds);
}

WorkingProgress::~WorkingProgress()
{
    SetWatch(nullptr);
    shown.reset();
}

bool WantsClauses(const Request& request)
{
    return request.Has("--cnf") || request.Has("--proof");
}

void CheckClauseOptions(const Request& request)
{
    if (WantsClauses(request) && request.hasLines)
        throw UsageError("--cnf and --proof write one file for one question: give one equation, "
                         "not lines");
    if (request.Has("--proof") && !Solver::IsThere())
        throw UsageError("--proof needs a solver, and this build has none");
}

int WriteClauses(const Request& request, Output& output, const Cnf& cnf, kq_logic::Verdict verdict,
                 double seconds)
{
    if (request.Has("--cnf"))
        WriteFile(request.Get("--cnf"), ToDimacs(cnf));
    if (!request.Has("--proof"))
        return kDone;
    const std::string path = request.Get("--proof");
    if (verdict == kq_logic::Verdict::Different) {
        Complain(output, "note: the clauses are satisfiable, so there is no proof: " +
                             Visible(path) + " was not written");
        return kDone;
    }
    errno = 0;
    const ProofEnd end = WriteProof(cnf, path, {seconds});
    if (end == ProofEnd::CannotWrite)
        throw IoError("cannot write " + Visible(path), errno);
    if (end == ProofEnd::Proved)
        return kDone;
    assert(end == ProofEnd::TimeIsOver);
    std::remove(path.c_str());
    Complain(output, "the proof was not finished in time: " + Visible(path) + " was not written");
    return kUndecided;
}

uint64_t RowOf(const kq_logic::Decision& decision)
{
    assert(IsDifferent(decision) && decision.assignment.size() <= 64);
    uint64_t row = 0;
    for (const bool value : decision.assignment)
        row = row << 1 | (value ? 1u : 0u);
    return row;
}

std::string NotDecidedIn(double seconds)
{
    char number[32];
    std::snprintf(number, sizeof number, "%g", seconds);
    return "not decided in " + std::string(number) + (seconds == 1 ? " second" : " seconds");
}

std::string UndecidedText(const kq_logic::Decision& decision, double seconds)
{
    assert(decision.verdict == kq_logic::Verdict::Undecided);
    return decision.isTimeOver ? NotDecidedIn(seconds) : "not decided: " + decision.reason;
}

Json AssignmentJson(const std::vector<std::string>& inputs, const std::vector<bool>& values)
{
    assert(inputs.size() == values.size());
    Json json = Json::object();
    for (size_t index = 0; index < inputs.size(); ++index)
        PutMember(json, inputs[index], values[index] ? 1 : 0);
    return json;
}

std::string PlaceText(const kq_logic::Decision& decision)
{
    const size_t numInputs = decision.inputs.size();
    if (numInputs > kq_logic::kMaxFunctionInputs)
        return "for one assignment of " + Count(numInputs, "input");
    return std::string(decision.isFirstRow ? "first at row " : "at row ") +
           std::to_string(RowOf(decision)) + " of " + std::to_string(uint64_t(1) << numInputs);
}

Json RowJson(const kq_logic::Decision& decision)
{
    return decision.inputs.size() > kq_logic::kMaxFunctionInputs ? Json() : Json(RowOf(decision));
}

} // namespace booleq
