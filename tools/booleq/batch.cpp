// The command 'batch': a table of functions, CSV or JSON lines, line by line; never held as a
// whole.
#include <algorithm>
#include <memory>
#include <utility>

#include "answer.h"
#include "batch.h"
#include "commands.h"
#include "lines.h"
#include "progress.h"
#include "table_rows.h"
#include "text.h"

namespace booleq {

namespace {

constexpr int kMaxJsonDepth = 100;
constexpr size_t kNoColumn = static_cast<size_t>(-1);

// Fields of one line of CSV. A line end inside a field is not accepted: one stray quote would
// swallow the rest of the file.  Fails: false when a quote is not closed or has text behind it.
bool SplitCsv(const std::string& line, std::vector<std::string>& fields)
{
    fields.assign(1, std::string());
    for (size_t position = 0; position < line.size(); ++position) {
        if (line[position] == ',') {
            fields.emplace_back();
            continue;
        }
        if (line[position] != '"' || !fields.back().empty()) {
            fields.back() += line[position];
            continue;
        }
        for (++position; position < line.size(); ++position) {
            const bool isQuote = line[position] == '"';
            if (isQuote && (position + 1 == line.size() || line[position + 1] != '"'))
                break;
            position += isQuote ? 1u : 0u;
            fields.back() += line[position];
        }
        if (position == line.size() || (position + 1 < line.size() && line[position + 1] != ','))
            return false;
    }
    return true;
}

BatchResult Refused(std::string message)
{
    return {BatchOutcome::kTextRefused, std::move(message)};
}

// One file in one format: a line in, its row and result out.
class Format {
  public:
    Format() = default;
    virtual ~Format() = default;
    Format(const Format&) = delete;
    Format& operator=(const Format&) = delete;

    // True for a line that is no row (a header); 'answer' is what to write for it.
    virtual bool IsHeader(const std::string& line, std::string& answer) = 0;
    virtual BatchResult ReadRow(const std::string& line, BatchRow& row) = 0;
    // The line with the row's members and the outcome.
    virtual std::string WriteRow(const std::string& line, const BatchRow& row,
                                 const BatchResult& result) = 0;
};

class CsvFormat : public Format {
  public:
    bool IsHeader(const std::string& line, std::string& answer) override
    {
        if (m_num_columns != 0)
            return false;
        std::vector<std::string> fields;
        if (!SplitCsv(WithoutLineEnd(line), fields))
            throw UsageError("the header of the table has a quote that is not closed");
        m_num_columns = fields.size();
        size_t* const columns[] = {&m_inputs, &m_equation, &m_init};
        const char* const names[] = {"inputs", "equation", "init"};
        for (size_t which = 0; which < 3; ++which) {
            const auto found = std::find(fields.begin(), fields.end(), names[which]);
            if (found != fields.end()) {
                *columns[which] = static_cast<size_t>(found - fields.begin());
                continue;
            }
            *columns[which] = fields.size();
            fields.emplace_back(names[which]);
        }
        if (fields.size() - m_num_columns == 3)
            throw UsageError("the first line of the table names its columns; none is called "
                             "inputs, equation or init");
        fields.emplace_back("result");
        answer = CsvLine(fields);
        return true;
    }

    BatchResult ReadRow(const std::string& line, BatchRow& row) override
    {
        m_fields.clear();
        if (!SplitCsv(WithoutLineEnd(line), m_fields))
            return Refused("a quote is not closed, or has more behind it than a comma");
        if (m_fields.size() != m_num_columns)
            return Refused(Count(m_fields.size(), "field") + " where the header has " +
                           std::to_string(m_num_columns));
        m_fields.resize(std::max({m_num_columns, m_inputs + 1, m_equation + 1, m_init + 1}));
        row.equation = m_fields[m_equation];
        row.init = m_fields[m_init];
        if (!IsBlank(m_fields[m_inputs]) && !SplitInputs(m_fields[m_inputs], row.inputs))
            return Refused("a single quote is not closed among the inputs");
        return {};
    }

    std::string WriteRow(const std::string& line, const BatchRow& row,
                         const BatchResult& result) override
    {
        const bool isComplete =
            result.outcome == BatchOutcome::kOk || result.outcome == BatchOutcome::kFilled;
        // A line that does not have the columns of the header comes out as one field.
        const size_t numFields =
            std::max({m_num_columns, m_inputs + 1, m_equation + 1, m_init + 1});
        if (!isComplete && m_fields.size() != numFields) {
            m_fields.assign(numFields, std::string());
            m_fields.front() = WithoutLineEnd(line);
        }
        if (isComplete) {
            m_fields[m_inputs] = Join(row.inputs, ",");
            m_fields[m_equation] = row.equation;
            m_fields[m_init] = row.init;
        }
        m_fields.emplace_back(OutcomeName(result.outcome));
        return CsvLine(m_fields);
    }

  private:
    // Many programs end lines of CSV with a carriage return too.
    static std::string WithoutLineEnd(const std::string& line)
    {
        return !line.empty() && line.back() == '\r' ? line.substr(0, line.size() - 1) : line;
    }

    static std::string CsvLine(const std::vector<std::string>& fields)
    {
        std::string line;
        for (size_t index = 0; index < fields.size(); ++index)
            line += (index == 0 ? "" : ",") + CsvField(fields[index]);
        return line;
    }

    size_t m_num_columns = 0; // of the file
    size_t m_inputs = kNoColumn;
    size_t m_equation = kNoColumn;
    size_t m_init = kNoColumn;
    std::vector<std::string> m_fields; // of the line read last
};

class JsonFormat : public Format {
  public:
    JsonFormat() {} // not noexcept, as an empty Json need not be

    bool IsHeader(const std::string&, std::string&) override { return false; }

    BatchResult ReadRow(const std::string& line, BatchRow& row) override
    {
        // The writer of JSON goes as deep as its reader was led.
        bool isDeep = false;
        const auto keep = [&isDeep](int depth, Json::parse_event_t, Json&) {
            isDeep = isDeep || depth > kMaxJsonDepth;
            return depth <= kMaxJsonDepth;
        };
        m_json = Json::parse(line, keep, false);
        if (isDeep)
            m_json = Json();
        if (!m_json.is_object())
            return Refused(isDeep ? "this is nested too deep" : "this is no JSON object");
        std::string list;
        if (!TakeText("equation", row.equation) || !TakeText("init", row.init))
            return Refused("equation and init are texts");
        const auto inputs = m_json.find("inputs");
        if (inputs == m_json.end() || inputs->is_null())
            return {};
        if (inputs->is_array()) {
            for (const Json& name : *inputs) {
                if (!name.is_string())
                    return Refused("inputs is a list of texts, or one text with commas");
                row.inputs.push_back(name.get<std::string>());
            }
            return {};
        }
        if (!TakeText("inputs", list))
            return Refused("inputs is a list of texts, or one text with commas");
        if (!IsBlank(list) && !SplitInputs(list, row.inputs))
            return Refused("a single quote is not closed among the inputs");
        return {};
    }

    std::string WriteRow(const std::string& line, const BatchRow& row,
                         const BatchResult& result) override
    {
        if (!m_json.is_object()) {
            m_json = Json::object();
            m_json["line"] = Excerpt(line);
        } else if (result.outcome == BatchOutcome::kOk || result.outcome == BatchOutcome::kFilled) {
            m_json["inputs"] = row.inputs;
            m_json["equation"] = row.equation;
            m_json["init"] = row.init;
        }
        m_json["result"] = OutcomeName(result.outcome);
        return JsonLine(m_json);
    }

  private:
    // A missing member is an empty text.  Fails: false for another type.
    bool TakeText(const char* name, std::string& text) const
    {
        const auto found = m_json.find(name);
        if (found == m_json.end() || found->is_null())
            return true;
        if (!found->is_string())
            return false;
        text = found->get<std::string>();
        return true;
    }

    Json m_json; // the line read last
};

std::unique_ptr<Format> MakeFormat(const Request& request, const std::string& firstLine)
{
    const std::string format = request.Get("--format");
    const size_t start = firstLine.find_first_not_of(" \t");
    const bool looksLikeJson = start != std::string::npos && firstLine[start] == '{';
    if (format == "jsonl" || (!request.Has("--format") && looksLikeJson))
        return std::make_unique<JsonFormat>();
    if (format == "csv" || !request.Has("--format"))
        return std::make_unique<CsvFormat>();
    throw UsageError("--format is csv or jsonl, not '" + Visible(format) + "'");
}

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

void PutEnvelope(const Text& text, const Request& request, const BatchRow& row,
                 const BatchResult& result, Output& output)
{
    Json json;
    json["inputs"] = row.inputs;
    json["equation"] = row.equation;
    json["init"] = row.init;
    json["outcome"] = OutcomeName(result.outcome);
    json["message"] = result.message.empty() ? Json() : Json(result.message);
    static constexpr const char* kNames[] = {"done", "findings", "", "refused"};
    PutJson(text, request, kNames[StatusOf(result.outcome)], json, output);
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

// A byte order mark in front of the first line says nothing.
void DropByteOrderMark(std::string& line)
{
    if (line.compare(0, 3, "\xef\xbb\xbf") == 0)
        line.erase(0, 3);
}

int RunBatch(const Request& request, Output& output)
{
    if (request.reading.hasInputs)
        throw UsageError("--inputs has no meaning here: the table's column inputs gives them");
    LineReader reader(request.hasLines ? request.file : request.operands.front());
    Progress progress("rows", reader.GetSize());
    std::unique_ptr<Format> format;
    Text text;
    int status = kDone;
    uint64_t counts[5] = {};
    while (reader.Next(text.text)) {
        if (++text.line == 1)
            DropByteOrderMark(text.text);
        if (IsBlank(text.text) || text.text == "\r")
            continue;
        if (!format)
            format = MakeFormat(request, text.text);
        std::string header;
        if (format->IsHeader(text.text, header)) {
            if (!request.json)
                output.Put(header + "\n");
            continue;
        }
        BatchRow row;
        BatchResult result = format->ReadRow(text.text, row);
        if (result.outcome == BatchOutcome::kOk)
            result = CompleteRow(row);
        ++counts[static_cast<size_t>(result.outcome)];
        status = std::max(status, StatusOf(result.outcome));
        if (request.json)
            PutEnvelope(text, request, row, result, output);
        else
            output.Put(format->WriteRow(text.text, row, result) + "\n");
        if (!result.message.empty() && !request.json)
            Complain(output, "line " + std::to_string(text.line) + ": " +
                                 OutcomeName(result.outcome) + ": " + result.message);
        progress.Show(reader.GetPosition());
    }
    Complain(output, Summary(counts));
    return status;
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
        "FILE is CSV, whose first line names the columns inputs, equation and init in any order\n"
        "among others, or JSON lines with these members; - is standard input. What is missing is\n"
        "filled in, what is given compared, and each row comes out again with a last column\n"
        "result: ok, filled, differs, incomplete or refused. The reasons go to standard error\n"
        "with their lines. A row of CSV is one line. Status: 0 all rows agree, 1 some differ or\n"
        "are incomplete, 3 some were refused.\n",
        {{"--format", "csv|jsonl", "What FILE is (by its first character, { is JSON lines)"}},
        {"booleq batch functions.csv > complete.csv", "booleq batch - < functions.jsonl"},
        RunBatch};
}

} // namespace booleq
