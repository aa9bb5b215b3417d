// The command 'batch': a table of functions, CSV or JSON lines, line by line; it is never held as a
// whole.
#include "batch.h"

#include <algorithm>
#include <memory>
#include <optional>
#include <thread>
#include <utility>

#include "answer.h"
#include "commands.h"
#include "lines.h"
#include "messages.h"
#include "progress.h"
#include "table_format.h"
#include "text.h"
#include "work_queue.h"

namespace booleq {

namespace {

struct Line {
    std::string text;
    size_t number;
};

// Some lines, one after another, in one piece of memory: a thread that frees what another one has
// allocated waits for it.
struct Lines {
    struct Place {
        size_t end; // in 'text', where the next one begins
        size_t number;
    };
    std::string text;
    std::vector<Place> places;
};

int StatusOf(BatchOutcome outcome)
{
    switch (outcome) {
    case BatchOutcome::kOk:
    case BatchOutcome::kFilled:
        return kDone;
    case BatchOutcome::kDiffers:
    case BatchOutcome::kIncomplete:
        return kFindings;
    case BatchOutcome::kTextRefused:
        break;
    }
    return kRefused;
}

std::string Envelope(const Line& line, const Request& request, const BatchRow& row,
                     const BatchResult& result)
{
    Json json;
    json["inputs"] = row.inputs;
    json["equation"] = row.equation;
    json["init"] = row.init;
    json["outcome"] = OutcomeName(result.outcome);
    json["message"] = result.message.empty() ? Json() : Json(result.message);
    static constexpr const char* kNames[] = {"done", "findings", "", "refused"};
    return EnvelopeLine({line.text, line.number}, request, kNames[StatusOf(result.outcome)], json);
}

std::string Summary(const uint64_t (&counts)[5])
{
    uint64_t numRows = 0;
    std::string list;
    for (const BatchOutcome outcome :
         {BatchOutcome::kOk, BatchOutcome::kFilled, BatchOutcome::kDiffers,
          BatchOutcome::kIncomplete, BatchOutcome::kTextRefused}) {
        const uint64_t count = counts[static_cast<size_t>(outcome)];
        numRows += count;
        if (count > 0)
            list +=
                (list.empty() ? ": " : ", ") + std::to_string(count) + " " + OutcomeName(outcome);
    }
    return Count(numRows, "row") + list;
}

unsigned int ParseJobs(const Request& request)
{
    if (!request.Has("--jobs"))
        return std::max(std::thread::hardware_concurrency(), 1u);
    const std::string text = request.Get("--jobs");
    const bool isNumber = !text.empty() && text.size() <= 3 &&
                          text.find_first_not_of("0123456789") == std::string::npos;
    if (!isNumber || std::stoul(text) == 0)
        throw UsageError("--jobs takes a number from 1 to 999, not '" + Visible(text) + "'");
    return static_cast<unsigned int>(std::stoul(text));
}

// The answers to some lines, in the order of the lines.
struct Answered {
    struct Complaint {
        size_t end; // of the line's text
        std::string message;
    };
    std::string text;
    std::vector<Complaint> complaints;
    uint64_t counts[5] = {}; // by outcome
};

// Answers one line after another. It remembers what lines have in common.
class Answering {
  public:
    Answering(const Request& request, const TableFormat& header)
        : m_request(request), m_format(header.Clone())
    {
    }

    void Answer(const Line& line, Answered& answered)
    {
        BatchResult result = m_format->ReadRow(line.text, m_row);
        if (result.outcome == BatchOutcome::kOk)
            result = m_completer.Complete(m_row);
        ++answered.counts[static_cast<size_t>(result.outcome)];
        if (m_request.json) {
            answered.text += Envelope(line, m_request, m_row, result);
            return;
        }
        m_format->WriteRow(line.text, m_row, result, answered.text);
        if (!result.message.empty())
            answered.complaints.push_back(
                {answered.text.size(), "line " + std::to_string(line.number) + ": " +
                                           OutcomeName(result.outcome) + ": " + result.message});
    }

  private:
    const Request& m_request;
    std::unique_ptr<TableFormat> m_format;
    RowCompleter m_completer;
    BatchRow m_row; // of the line answered last
};

// Reads the lines of a table, one after another; empty lines and the header are not rows.
class TableReader {
  public:
    TableReader(const Request& request, Output& output)
        : m_request(request), m_output(output),
          m_reader(request.hasLines ? request.file : request.operands.front()),
          m_progress("rows", m_reader.GetSize())
    {
    }

    // Fails: false after the last line.
    bool Next(Line& line)
    {
        while (m_reader.Next(line.text)) {
            m_progress.Show(m_reader.GetPosition());
            line.number = ++m_number;
            if (m_number == 1)
                DropByteOrderMark(line.text);
            if (IsBlank(line.text) || line.text == "\r")
                continue;
            if (!m_format)
                m_format = MakeTableFormat(m_request, line.text);
            std::string header;
            if (!m_format->IsHeader(line.text, header))
                return true;
            if (!m_request.json)
                m_output.Put(header + "\n");
        }
        return false;
    }

    bool HasTable() const { return m_format != nullptr; }
    const TableFormat& Format() const { return *m_format; }

  private:
    const Request& m_request;
    Output& m_output;
    LineReader m_reader;
    Progress m_progress;
    std::unique_ptr<TableFormat> m_format;
    size_t m_number = 0;
};

// Writes answers and counts them.
class Answers {
  public:
    Answers(const Request& request, Output& output) : m_request(request), m_output(output) {}

    // A complaint comes right after its line.
    void Put(const Answered& answered)
    {
        for (size_t outcome = 0; outcome < 5; ++outcome) {
            m_counts[outcome] += answered.counts[outcome];
            if (answered.counts[outcome] > 0)
                m_status = std::max(m_status, StatusOf(static_cast<BatchOutcome>(outcome)));
        }
        size_t start = 0;
        for (const Answered::Complaint& complaint : answered.complaints) {
            m_output.Put(answered.text.data() + start, complaint.end - start);
            start = complaint.end;
            Complain(m_output, complaint.message);
        }
        m_output.Put(answered.text.data() + start, answered.text.size() - start);
        if (m_request.Has("--line-buffered"))
            m_output.Flush();
    }

    int Finish(bool hasTable)
    {
        if (!hasTable)
            Complain(m_output, "warning: the table is empty");
        Complain(m_output, Summary(m_counts));
        return m_status;
    }

  private:
    const Request& m_request;
    Output& m_output;
    uint64_t m_counts[5] = {};
    int m_status = kDone;
};

void RunAlone(const Request& request, TableReader& reader, Answers& answers)
{
    Line line;
    std::unique_ptr<Answering> answering;
    while (reader.Next(line)) {
        if (!answering)
            answering = std::make_unique<Answering>(request, reader.Format());
        Answered answered;
        answering->Answer(line, answered);
        answers.Put(answered);
    }
}

// Answers some lines in one thread; the answers keep the order of the lines.
Answered AnswerLines(const Lines& lines, const Request& request, const TableFormat& header)
{
    std::optional<NoMessages> silence; // of the thread that answers
    if (!request.debug)
        silence.emplace();
    Answering answering(request, header);
    Answered answered;
    Line line;
    size_t start = 0;
    for (const Lines::Place& place : lines.places) {
        line.text.assign(lines.text, start, place.end - start);
        line.number = place.number;
        answering.Answer(line, answered);
        start = place.end;
    }
    return answered;
}

// Limits the groups of lines in work at once, so memory does not grow with the table.
void RunTogether(const Request& request, unsigned int numJobs, TableReader& reader,
                 Answers& answers)
{
    constexpr size_t kLinesTogether = 512;
    WorkQueue<Answered> queue(numJobs, 4 * size_t(numJobs));
    Line line;
    for (bool isMore = true; isMore;) {
        const auto lines = std::make_shared<Lines>();
        while (lines->places.size() < kLinesTogether && (isMore = reader.Next(line))) {
            lines->text += line.text;
            lines->places.push_back({lines->text.size(), line.number});
        }
        if (lines->places.empty())
            break;
        if (queue.IsFull())
            answers.Put(queue.Take());
        const TableFormat& header = reader.Format();
        queue.Add([lines, &request, &header] { return AnswerLines(*lines, request, header); });
    }
    while (!queue.IsEmpty())
        answers.Put(queue.Take());
}

int RunBatch(const Request& request, Output& output)
{
    if (request.reading.hasInputs)
        throw UsageError("--inputs does not apply: the table has a column inputs");
    const unsigned int numJobs = ParseJobs(request);
    TableReader reader(request, output);
    Answers answers(request, output);
    if (numJobs == 1 || request.Has("--line-buffered"))
        RunAlone(request, reader, answers);
    else
        RunTogether(request, numJobs, reader, answers);
    return answers.Finish(reader.HasTable());
}

} // namespace

Command BatchCommand()
{
    return {
        "batch",
        "FILE",
        1,
        1,
        "Fill in and verify a table of functions",
        "FILE is a CSV table whose first line names the columns (inputs, equation and init, in\n"
        "any order, among others), or JSON lines with these members; - is standard input. Missing\n"
        "values are filled in, given ones are compared, and every row is written out again, in\n"
        "order, with a column result: ok, filled, differs, incomplete or refused. Standard error\n"
        "gives the reasons, by line. A quoted CSV field may not contain a line break. Status 0:\n"
        "all rows agree, 1: some differ or are incomplete, 3: some were refused.\n",
        {{"--format", "csv|jsonl", "Format of FILE (guessed: JSON lines begin with {)"},
         {"--jobs", "N", "Use N threads (one per processor)"}},
        {"booleq batch functions.csv > complete.csv", "booleq batch - < functions.jsonl"},
        RunBatch};
}

} // namespace booleq
