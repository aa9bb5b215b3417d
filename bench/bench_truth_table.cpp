// Truth tables: the engine's rows, the public rows, and the comparison of tables.
#include <algorithm>
#include <memory>

#include <Kq_BoolEquationImp.h>

#include "support/cases.h"
#include "support/formulas.h"
#include "support/texts.h"

namespace {

typedef std::shared_ptr<Kq_BoolEquation> EquationPointer;
typedef Kq_BoolEquation::TruthTable PublicTable;
typedef Kq_BoolEquationImp::TruthTable EngineTable;

// A row laid out like the engine's.
struct PlainRow {
    std::vector<unsigned int> values;
    unsigned int result;
};
static_assert(sizeof(PlainRow) == sizeof(EngineTable::Row), "the same layout");

// A row laid out like the public one, which hides its contents behind a pointer.
class PlainPublicRow {
  public:
    PlainPublicRow(const std::vector<unsigned int>& values, unsigned int result)
        : m_row(new PlainRow{values, result})
    {
    }
    PlainPublicRow(const PlainPublicRow& other) : m_row(new PlainRow(*other.m_row)) {}
    PlainPublicRow& operator=(const PlainPublicRow& other) = delete;
    ~PlainPublicRow() { delete m_row; }
    const PlainRow& Get() const { return *m_row; }

  private:
    PlainRow* m_row;
};

unsigned int GetBit(const std::vector<uint64_t>& words, size_t row)
{
    return words[row / 64] >> (row % 64) & 1u;
}

// Counts up by one; the last value is the lowest bit.
void Increment(std::vector<unsigned int>& values)
{
    size_t column = values.size();
    while (column > 0 && values[column - 1] == 1)
        values[--column] = 0;
    if (column > 0)
        values[column - 1] = 1;
}

// The plain loops: one reservation, one allocation for each vector, results taken from bits that
// exist already.
std::vector<PlainRow> MakePlainRows(const std::vector<uint64_t>& words, size_t numVariables)
{
    std::vector<PlainRow> rows;
    rows.reserve(size_t(1) << numVariables);
    std::vector<unsigned int> values(numVariables);
    for (size_t row = 0; row < size_t(1) << numVariables; ++row, Increment(values))
        rows.push_back(PlainRow{values, GetBit(words, row)});
    return rows;
}

std::vector<PlainPublicRow> MakePlainPublicRows(const std::vector<uint64_t>& words,
                                                size_t numVariables)
{
    std::vector<PlainPublicRow> rows;
    rows.reserve(size_t(1) << numVariables);
    std::vector<unsigned int> values(numVariables);
    for (size_t row = 0; row < size_t(1) << numVariables; ++row, Increment(values))
        rows.emplace_back(values, GetBit(words, row));
    return rows;
}

EquationPointer MakeEquation(const bench::Formula& formula)
{
    const EquationPointer equation = std::make_shared<Kq_BoolEquation>();
    bench::SetFormula(formula, *equation);
    return equation;
}

bench::Case MakeEngineRows(const bench::Formula& formula)
{
    const EquationPointer equation = MakeEquation(formula);
    const std::vector<uint64_t> words = bench::EvaluateColumn(*equation);
    const size_t numVariables = formula.numVariables;
    const double numRows = double(uint64_t(1) << numVariables);
    bench::Case made;
    made.isRight = [=] {
        const std::vector<PlainRow> expected = MakePlainRows(words, numVariables);
        const EngineTable table(*equation->GetImp());
        return table.GetRows().size() == expected.size() &&
               std::equal(expected.begin(), expected.end(), table.GetRows().begin(),
                          [](const PlainRow& plain, const EngineTable::Row& row) {
                              return row.GetVariableValues() == plain.values &&
                                     row.GetResultValue() == plain.result;
                          });
    };
    made.ours = [=](benchmark::State& state) {
        for (auto _ : state) {
            const EngineTable table(*equation->GetImp());
            benchmark::DoNotOptimize(table.GetRows().data());
        }
        bench::SetItems(state, numRows, "row");
    };
    made.baseline = [=](benchmark::State& state) {
        for (auto _ : state) {
            const std::vector<PlainRow> rows = MakePlainRows(words, numVariables);
            benchmark::DoNotOptimize(rows.data());
        }
        bench::SetItems(state, numRows, "row");
    };
    return made;
}

bench::Case MakePublicRows(const bench::Formula& formula)
{
    const EquationPointer equation = MakeEquation(formula);
    const std::vector<uint64_t> words = bench::EvaluateColumn(*equation);
    const size_t numVariables = formula.numVariables;
    const double numRows = double(uint64_t(1) << numVariables);
    bench::Case made;
    made.isRight = [=] {
        const std::vector<PlainPublicRow> expected = MakePlainPublicRows(words, numVariables);
        const std::vector<PublicTable::Row> rows = PublicTable(*equation).GetRows();
        return rows.size() == expected.size() &&
               std::equal(expected.begin(), expected.end(), rows.begin(),
                          [](const PlainPublicRow& plain, const PublicTable::Row& row) {
                              return row.GetVariableValues() == plain.Get().values &&
                                     row.GetResultValue() == plain.Get().result;
                          });
    };
    made.ours = [=](benchmark::State& state) {
        const PublicTable table(*equation);
        for (auto _ : state) {
            const std::vector<PublicTable::Row> rows = table.GetRows();
            benchmark::DoNotOptimize(rows.data());
        }
        bench::SetItems(state, numRows, "row");
    };
    made.baseline = [=](benchmark::State& state) {
        for (auto _ : state) {
            const std::vector<PlainPublicRow> rows = MakePlainPublicRows(words, numVariables);
            benchmark::DoNotOptimize(rows.data());
        }
        bench::SetItems(state, numRows, "row");
    };
    return made;
}

// The public table of a text, made and destroyed each time.
bench::Case MakePublicTable(const std::string& text, size_t numVariables)
{
    const EquationPointer equation = std::make_shared<Kq_BoolEquation>(text.c_str());
    bench::Case made;
    made.isRight = [=] {
        const std::vector<uint64_t> words = bench::EvaluateColumn(*equation);
        const std::vector<PublicTable::Row> rows = equation->GetTruthTable().GetRows();
        bool isRight = rows.size() == size_t(1) << numVariables;
        for (size_t row = 0; isRight && row < rows.size(); ++row)
            isRight = rows[row].GetResultValue() == GetBit(words, row);
        return isRight;
    };
    made.ours = [=](benchmark::State& state) {
        for (auto _ : state)
            benchmark::DoNotOptimize(!equation->GetTruthTable());
        bench::SetItems(state, double(uint64_t(1) << numVariables), "row");
    };
    return made;
}

// Two equal tables, so that every row is compared.
bench::Case MakeComparison(const bench::Formula& formula)
{
    const EquationPointer equation = MakeEquation(formula);
    const auto left = std::make_shared<PublicTable>(*equation);
    const auto right = std::make_shared<PublicTable>(*equation);
    bench::Case made;
    made.isRight = [=] {
        return *left == *right && *left != PublicTable(Kq_BoolEquation("a & b"));
    };
    made.ours = [=](benchmark::State& state) {
        for (auto _ : state)
            benchmark::DoNotOptimize(*left == *right);
        bench::SetItems(state, double(uint64_t(1) << formula.numVariables), "row");
    };
    return made;
}

} // namespace

void bench::AddCases()
{
    for (unsigned int numVariables : {10u, 16u}) {
        const std::string size = "n=" + std::to_string(numVariables) + "/";
        for (const Formula& formula : GetColumnFormulas(numVariables)) {
            if (formula.seed != 1)
                continue;
            AddPair("engine_rows/" + size + formula.GetName(),
                    [=] { return MakeEngineRows(formula); });
            AddPair("public_rows/" + size + formula.GetName(),
                    [=] { return MakePublicRows(formula); });
            if (formula.GetName() == "tree/1")
                AddSingle("compare_tables/tree/n=" + std::to_string(numVariables),
                          [=] { return MakeComparison(formula); });
        }
    }
    for (unsigned int numVariables : {2u, 4u, 6u, 8u, 12u, 16u}) {
        const std::string size = "/n=" + std::to_string(numVariables);
        AddSingle("public_table/wide" + size, [=] {
            return MakePublicTable(MakeWide(4 * numVariables + 1, numVariables), numVariables);
        });
        AddSingle("public_table/deep" + size, [=] {
            return MakePublicTable(MakeDeep(10 * numVariables + 1, numVariables), numVariables);
        });
    }
}
