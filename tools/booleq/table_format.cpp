#include "table_format.h"

#include <algorithm>
#include <cassert>
#include <utility>

#include "answer.h"
#include "recent.h"
#include "table_rows.h"
#include "text.h"

namespace booleq {

namespace {

constexpr int kMaxJsonDepth = 100;
constexpr size_t kNoColumn = static_cast<size_t>(-1);

// Splits one line of CSV into fields. A line end inside a field is not accepted: one stray quote
// would swallow the rest of the file.  Fails: false when a quote is not closed or text follows it.
// Many programs end lines with a carriage return too.
bool SplitCsv(const std::string& line, std::vector<std::string>& fields)
{
    const size_t length = line.size() - (!line.empty() && line.back() == '\r' ? 1 : 0);
    size_t numFields = 0;
    // The texts of the line before are overwritten, so that their memory is used again.
    const auto next = [&]() -> std::string& {
        if (numFields == fields.size())
            fields.emplace_back();
        fields[numFields].clear();
        return fields[numFields++];
    };
    std::string* field = &next();
    bool isSplit = true;
    for (size_t position = 0; isSplit && position < length; ++position) {
        if (line[position] == ',') {
            field = &next();
            continue;
        }
        if (line[position] != '"') {
            const size_t end = std::min(line.find(',', position), length);
            field->assign(line, position, end - position);
            position = end - 1;
            continue;
        }
        for (++position; position < length; ++position) {
            const bool isQuote = line[position] == '"';
            if (isQuote && (position + 1 == length || line[position + 1] != '"'))
                break;
            position += isQuote ? 1u : 0u;
            *field += line[position];
        }
        isSplit = position < length && (position + 1 == length || line[position + 1] == ',');
    }
    fields.resize(numFields);
    return isSplit;
}

BatchResult Refused(std::string message)
{
    return {BatchOutcome::kTextRefused, std::move(message)};
}

class CsvFormat : public TableFormat {
  public:
    bool IsHeader(const std::string& line, std::string& answer) override
    {
        if (m_num_columns != 0)
            return false;
        std::vector<std::string> fields;
        if (!SplitCsv(line, fields))
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
        // A table that was completed earlier already has the column.
        const auto result = std::find(fields.begin(), fields.end(), "result");
        m_result = static_cast<size_t>(result - fields.begin());
        if (result == fields.end())
            fields.emplace_back("result");
        m_num_written = fields.size();
        AppendCsvLine(fields, answer);
        return true;
    }

    BatchResult ReadRow(const std::string& line, BatchRow& row) override
    {
        const bool isSplit = SplitCsv(line, m_fields);
        const size_t numFields = m_fields.size();
        row.inputs.clear();
        row.equation.clear();
        row.init.clear();
        m_fields.resize(m_num_columns); // what a bad row has too much is dropped
        m_fields.resize(m_num_written);
        if (!isSplit)
            return Refused("a quote is not closed, or has more after it than a comma");
        if (numFields > m_num_columns)
            return Refused(Count(numFields, "field") + " where the header has " +
                           std::to_string(m_num_columns) + "; what is beyond is left out");
        if (numFields < m_num_columns)
            return Refused(Count(numFields, "field") + " where the header has " +
                           std::to_string(m_num_columns));
        row.equation = m_fields[m_equation];
        row.init = m_fields[m_init];
        m_list = &m_lists.Get(m_fields[m_inputs], Split);
        if (!m_list->isClosed)
            return Refused("a single quote is not closed among the inputs");
        row.inputs = m_list->inputs;
        return {};
    }

    void WriteRow(const std::string&, const BatchRow& row, const BatchResult& result,
                  std::string& written) override
    {
        if (result.outcome == BatchOutcome::kOk || result.outcome == BatchOutcome::kFilled) {
            assert(m_list->inputs.empty() || m_list->inputs == row.inputs);
            m_fields[m_inputs] = m_list->inputs.empty() ? Join(row.inputs, ",") : m_list->joined;
            if (result.outcome == BatchOutcome::kFilled) {
                m_fields[m_equation] = row.equation;
                m_fields[m_init] = row.init;
            }
        }
        m_fields[m_result] = OutcomeName(result.outcome);
        AppendCsvLine(m_fields, written);
        written += '\n';
    }

    std::unique_ptr<TableFormat> Clone() const override
    {
        return std::make_unique<CsvFormat>(*this);
    }

  private:
    // The names in a field.
    struct InputList {
        std::vector<std::string> inputs;
        std::string joined;
        bool isClosed = true; // false: a quote is not closed
    };

    static InputList Split(const std::string& field)
    {
        InputList list;
        if (!IsBlank(field))
            list.isClosed = SplitInputs(field, list.inputs);
        list.joined = Join(list.inputs, ",");
        return list;
    }

    static void AppendCsvLine(const std::vector<std::string>& fields, std::string& line)
    {
        for (const std::string& field : fields) {
            AppendCsvField(field, line);
            line += ',';
        }
        line.pop_back(); // a header has at least one field
    }

    size_t m_num_columns = 0; // of the file
    size_t m_inputs = kNoColumn;
    size_t m_equation = kNoColumn;
    size_t m_init = kNoColumn;
    size_t m_result = kNoColumn;
    size_t m_num_written = 0;          // columns that are written
    std::vector<std::string> m_fields; // of the last line read
    Recent<std::string, InputList> m_lists;
    const InputList* m_list = nullptr; // of the last line read, once it has been split
};

class JsonFormat : public TableFormat {
  public:
    JsonFormat() {} // not noexcept, because an empty Json need not be

    bool IsHeader(const std::string&, std::string&) override { return false; }

    BatchResult ReadRow(const std::string& line, BatchRow& row) override
    {
        // The JSON writer recurses as deep as its reader was led.
        bool isDeep = false;
        const auto keep = [&isDeep](int depth, Json::parse_event_t, Json&) {
            isDeep = isDeep || depth > kMaxJsonDepth;
            return depth <= kMaxJsonDepth;
        };
        row = BatchRow();
        m_json = Json::parse(line, keep, false);
        if (isDeep)
            m_json = Json();
        if (!m_json.is_object())
            return Refused(isDeep ? "this is nested too deep" : "this is not a JSON object");
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

    void WriteRow(const std::string& line, const BatchRow& row, const BatchResult& result,
                  std::string& written) override
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
        written += JsonLine(m_json);
        written += '\n';
    }

    std::unique_ptr<TableFormat> Clone() const override { return std::make_unique<JsonFormat>(); }

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

    Json m_json; // the last line read
};

} // namespace

std::unique_ptr<TableFormat> MakeTableFormat(const Request& request, const std::string& firstLine)
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

} // namespace booleq
