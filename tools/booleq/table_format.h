// Tables of functions, CSV or JSON lines: a line becomes a row, a row with its result becomes a
// line. A format keeps the last line read, so each thread needs its own: Clone.
#ifndef BOOLEQ_TABLE_FORMAT_H
#define BOOLEQ_TABLE_FORMAT_H

#include <memory>
#include <string>

#include "batch.h"
#include "command.h"

namespace booleq {

class TableFormat {
  public:
    TableFormat() = default;
    virtual ~TableFormat() = default;

    // True for a line that is not a row (a header); 'answer' is what to write for it.
    // Fails: UsageError for a header without any of the columns.
    virtual bool IsHeader(const std::string& line, std::string& answer) = 0;
    // Sets all of the row; the memory of its texts is used again.
    virtual BatchResult ReadRow(const std::string& line, BatchRow& row) = 0;
    // Appends the last line read with the row's members and the outcome, and a line end.
    virtual void WriteRow(const std::string& line, const BatchRow& row, const BatchResult& result,
                          std::string& written) = 0;
    // Another one that knows the header.
    virtual std::unique_ptr<TableFormat> Clone() const = 0;

  protected:
    TableFormat(const TableFormat&) = default;
    TableFormat& operator=(const TableFormat&) = default;
};

// By --format, or by the first character of the table. Fails: UsageError for another format.
std::unique_ptr<TableFormat> MakeTableFormat(const Request& request, const std::string& firstLine);

} // namespace booleq

#endif
