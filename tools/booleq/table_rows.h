// Truth-table rows in several formats, one by one; they are never held as a whole.
#ifndef BOOLEQ_TABLE_ROWS_H
#define BOOLEQ_TABLE_ROWS_H

#include <cstdint>
#include <functional>
#include <string>
#include <vector>

#include <Kq_BoolEquation.h>

#include "output.h"

namespace booleq {

enum class RowFormat { kText, kMarkdown, kCsv, kJson };

// True when a column of text is headed by its number, "#2", because the input's name is long or not
// printable.
bool HasNumberedColumn(const std::vector<std::string>& names);

// Prints the header and rows 0 to maxRows - 1, and in text how many more there are. kJson prints
// the elements of an array, [input..., result], without the array.
// Requires: at most kMaxFunctionInputs names.
void PrintRows(const std::vector<std::string>& names, uint64_t maxRows, RowFormat format,
               const std::function<bool(uint64_t)>& valueAt, Output& output);
// Roughly what PrintRows writes, without the rows after maxRows.
uint64_t EstimateBytes(const std::vector<std::string>& names, uint64_t maxRows, RowFormat format);

// The table of 'show': the equation's rows as text.
// Requires: 1 to kMaxFunctionInputs variables. Their values are changed.
// Cost: one evaluation for each printed row, or the packed column (2^n / 64 evaluations, 2^n / 8
// bytes) where that is less.
void PrintTable(Kq_BoolEquation& equation, uint64_t maxRows, Output& output);

// A CSV field, in double quotes where it must be.
std::string CsvField(const std::string& text);
void AppendCsvField(const std::string& text, std::string& line);

} // namespace booleq

#endif
