// The public classes: ownership, synonyms, forwarding, handles, public tables and rows; dumps.
#include <gtest/gtest.h>

#include <type_traits>

#include "unit_support.h"

namespace {

typedef Kq_BoolEquation Equation;
typedef Kq_BoolEquation::TruthTable Table;

TEST(Facade, HoldsOnePointer)
{
    EXPECT_EQ(sizeof(void*), sizeof(Equation));
    EXPECT_EQ(sizeof(void*), sizeof(Table));
    EXPECT_EQ(sizeof(void*), sizeof(Table::Row));
    EXPECT_EQ(sizeof(std::vector<unsigned int>), sizeof(Equation::Handle));
    EXPECT_EQ(sizeof(void*) + sizeof(std::vector<int>), sizeof(Engine)) << "store and variables";
}

TEST(Facade, RefusedTextLeavesAConstructedObject)
{
    const Equation refused("A $ B");
    EXPECT_TRUE(!refused);
    EXPECT_EQ(nullptr, static_cast<Kq_PtrTester*>(refused));
    const Equation accepted("A | B");
    EXPECT_FALSE(!accepted);
    EXPECT_EQ(reinterpret_cast<Kq_PtrTester*>(1), static_cast<Kq_PtrTester*>(accepted));
    EXPECT_TRUE(!Equation());
}

TEST(Facade, ThreeNamesForAssignment)
{
    const Equation source("A & B");
    Equation assigned;
    Equation copied;
    Equation set;
    assigned = source;
    copied.Copy(source);
    set.SetEquationFromEquation(source);
    const Equation constructed(source);
    const Equation* const equations[] = {&assigned, &copied, &set, &constructed};
    for (const Equation* equation : equations) {
        EXPECT_TRUE(*equation == source);
        EXPECT_FALSE(*equation != source);
        EXPECT_EQ("A0 B0", VariablesOf(*equation));
        EXPECT_NE(source.GetImp(), equation->GetImp()) << "no two share one engine object";
    }
}

TEST(Facade, AssignedObjectIsIndependent)
{
    Equation a;
    Equation b("A & B");
    a = b;
    a.SetVariable("A", 1);
    EXPECT_EQ(0u, b.GetVariable("A"));
    a.SetEquation("C");
    EXPECT_EQ("A&B", Std(b.GetEquation(false)));
}

TEST(Facade, VariablesAreTheObjectsOwn)
{
    Equation equation("A");
    const auto& variables = equation.GetVariables();
    equation.DefineVariable("B", 1);
    EXPECT_EQ(2u, variables.size());
    EXPECT_EQ(&equation.GetImp()->GetVariables(), &variables);
    EXPECT_EQ(2u, equation.GetNumVariables());
}

TEST(Facade, EveryOperationIsTheEngines)
{
    Equation equation;
    ASSERT_TRUE(equation.SetEquationWithExplicitTerms({"A", "B"}, "0x4", false, false));
    EXPECT_TRUE(equation.IsHexInitValue());
    EXPECT_FALSE(equation.IsBinaryInitValue());
    EXPECT_FALSE(equation.IsExpression());
    EXPECT_EQ("0x4", Std(equation.GetEquation(true)));
    EXPECT_EQ("( A & ~ B )", Std(equation.GetEquationAlt1(true)));
    EXPECT_EQ("(A*~B)", Std(equation.GetEquationAlt2(false)));
    EXPECT_EQ("(A.AND.~B)", Std(equation.GetEquationAlt3(false)));
    EXPECT_EQ("(A&~B)", Std(equation.GetEquationAsExpression(false)));
    EXPECT_EQ("0x4", Std(equation.GetEquationAsHexInitValue(true)));
    EXPECT_EQ("0b0100", Std(equation.GetEquationAsBinaryInitValue()));
    EXPECT_EQ("B+A", Std(equation.GetInitValueTermEquation()));
    const Equation::Handle a = equation.GetVariableHandle("A");
    EXPECT_TRUE(equation.IsVariableDefined(a));
    EXPECT_TRUE(equation.IsVariableDefined("B"));
    EXPECT_TRUE(equation.SetVariable(a, 1));
    EXPECT_EQ(1u, equation.GetVariable(a));
    EXPECT_EQ(1u, equation.Eval());
    EXPECT_TRUE(equation.SetVariable("B", 1));
    EXPECT_EQ(1u, equation.GetVariable("B"));
    EXPECT_EQ(0u, equation.Eval());
    equation.Clear();
    EXPECT_TRUE(!equation);
    EXPECT_EQ(0u, equation.GetNumVariables());
}

TEST(Handle, IsAValue)
{
    Equation equation("a & a");
    const Equation::Handle handle = equation.GetVariableHandle("a");
    EXPECT_EQ(3u, handle.size());
    EXPECT_FALSE(handle.empty());
    Equation::Handle copy(handle);
    EXPECT_TRUE(copy == handle);
    *copy.begin() = 9;
    EXPECT_TRUE(copy != handle);
    copy = handle;
    EXPECT_TRUE(copy == handle);
    EXPECT_EQ(3, copy.end() - copy.begin());
    EXPECT_EQ(3, handle.end() - handle.begin());
}

TEST(Handle, LongerHandleIsUnequal)
{
    const Equation once("a & b");
    const Equation twice("a & b & a");
    EXPECT_TRUE(Equation::Handle() == Equation::Handle());
    EXPECT_TRUE(Equation::Handle() != once.GetVariableHandle("a"));
    EXPECT_TRUE(once.GetVariableHandle("a") != twice.GetVariableHandle("a"));
    EXPECT_TRUE(Equation::Handle().empty());
    EXPECT_EQ(0u, Equation::Handle().size());
}

TEST(PublicTable, DefaultIsEmpty)
{
    const Table table;
    EXPECT_TRUE(!table);
    EXPECT_EQ(nullptr, static_cast<Kq_PtrTester*>(table));
    EXPECT_TRUE(table.GetRows().empty());
    EXPECT_TRUE(table.GetVariableNames().empty());
}

TEST(PublicTable, RowsAndNamesAreCopies)
{
    const Table table(Equation("A & B"));
    EXPECT_EQ(reinterpret_cast<Kq_PtrTester*>(1), static_cast<Kq_PtrTester*>(table));
    std::vector<Table::Row> rows = table.GetRows();
    ASSERT_EQ(4u, rows.size());
    EXPECT_EQ(1u, rows[3].GetResultValue());
    std::vector<unsigned int> values = rows[2].GetVariableValues();
    EXPECT_EQ((std::vector<unsigned int>{1, 0}), values);
    values[0] = 7;
    rows.clear();
    std::vector<String> names = table.GetVariableNames();
    names[0] = "changed";
    EXPECT_EQ("A", Std(table.GetVariableNames()[0]));
    EXPECT_EQ(1u, table.GetRows()[2].GetVariableValues()[0]);
}

TEST(PublicTable, IsBuiltCopiedAssignedAndCompared)
{
    const Equation equation("A | B");
    Table table = equation.GetTruthTable();
    const Table copy(table);
    EXPECT_TRUE(table == copy);
    EXPECT_TRUE(table == Table(Equation("~(~A & ~B)")));
    table = Equation("A");
    EXPECT_TRUE(table != copy);
    EXPECT_EQ(2u, table.GetRows().size());
    table = copy;
    EXPECT_TRUE(table == copy);
    table = Equation("1");
    EXPECT_TRUE(!table);
}

TEST(PublicTable, RowsAreValues)
{
    const Table::Row row(1, {0, 1});
    Table::Row other(0, {});
    EXPECT_TRUE(row != other);
    other = row;
    EXPECT_TRUE(row == other);
    const Table::Row copy(row);
    EXPECT_TRUE(copy == row);
    EXPECT_EQ(1u, copy.GetResultValue());
    EXPECT_EQ((std::vector<unsigned int>{0, 1}), copy.GetVariableValues());
}

const char kEngineOrigin[] = "Kq ../s/Kq_BoolEquationImp.cpp $Revision: 1.35 $";
const char kFacadeOrigin[] = "Kq ../s/Kq_BoolEquation.cpp $Revision: 1.10 $";

TEST(Dumps, Equation)
{
    Messages messages;
    Equation equation("A & ~B");
    equation.SetVariable("B", 1);
    equation.Dbg();
    EXPECT_EQ("Bool Equation = A&~B\n"
              "Bool Equation Alt1 = A&~B\n"
              "Bool Equation Alt2 = A*~B\n"
              "Bool Equation Alt3 = A.AND.~B\n"
              "NumVariables = 2\n"
              "\n"
              "  Id Name             Value\n"
              "  == ================ =====\n"
              "   1 A                    0\n"
              "   2 B                    1\n"
              "\n"
              "ExprTree\n"
              "NODE: TOP. parent= type=AND token=& val=0\n"
              "LEFT:\n"
              "  NODE: TOP.L parent=TOP. type=ID token=A val=0\n"
              "RIGHT:\n"
              "  NODE: TOP.R parent=TOP. type=NOT token=~ val=0\n"
              "  LEFT:\n"
              "    NODE: TOP.RL parent=TOP.R type=ID token=B val=1\n"
              "\n"
              "NumNodes = 4\n"
              "Root =  [000]\n"
              "\n"
              "     Id     Par  Left Right\n"
              "   =====   ===== ===== =====\n"
              "   [000] = ----- [001] [002] AND          &\n"
              "   [001] = [000] ----- ----- ID           A\n"
              "   [002] = [000] [003] ----- NOT          ~\n"
              "   [003] = [002] ----- ----- ID           B\n"
              "\n"
              "TruthTable\n"
              "  Eqn: \"A&~B\"\n"
              "  NumCols: 2\n"
              "  Col[1] = \"A\"\n"
              "  Col[2] = \"B\"\n"
              "  NumRows: 4\n"
              "        v  1  2\n"
              "       == == ==\n"
              "     1  0  0  0\n"
              "     2  0  0  1\n"
              "     3  1  1  0\n"
              "     4  0  1  1\n"
              "\n",
              messages.Text());
    EXPECT_EQ(kEngineOrigin, messages.Origins().front());
    EXPECT_EQ(kEngineOrigin, messages.Origins().back());
    for (const int line : messages.Lines())
        EXPECT_GT(line, 0);
}

TEST(Dumps, EmptyEquation)
{
    Messages messages;
    Equation().Dbg();
    EXPECT_EQ("Bool Equation = \n"
              "Bool Equation Alt1 = \n"
              "Bool Equation Alt2 = \n"
              "Bool Equation Alt3 = \n"
              "NumVariables = 0\n"
              "\n"
              "  Id Name             Value\n"
              "  == ================ =====\n"
              "\n"
              "ExprTree\n"
              "\n"
              "NumNodes = 0\n"
              "Root =  -----\n"
              "\n"
              "TruthTable\n"
              "  Eqn: \"\"\n"
              "  NumCols: 0\n"
              "  NumRows: 0\n"
              "\n",
              messages.Text());
}

TEST(Dumps, ReferencesThatLeadBackShowThePositions)
{
    Messages messages;
    Equation("P & X ~ | Y").Dbg();
    EXPECT_NE(std::string::npos,
              messages.Text().find("   [000] = ----- [001] [002] AND          &\n"
                                   "   [001] = [000] ----- ----- ID           P\n"
                                   "   [002] = [004] [003] ----- NOT          ~\n"
                                   "   [003] = [002] [004] [005] OR           |\n"
                                   "   [004] = [003] ----- ----- ID           X\n"
                                   "   [005] = [003] ----- ----- ID           Y\n"));
}

TEST(Dumps, TableAndRowAreTheEngines)
{
    Messages messages;
    const Table table = Equation("A").GetTruthTable();
    table.Dbg();
    Table().Dbg();
    Table::Row(1, {0, 1, 1, 0}).Dbg();
    EXPECT_EQ("TruthTable\n  Eqn: \"A\"\n  NumCols: 1\n  Col[1] = \"A\"\n  NumRows: 2\n"
              "        v  1\n       == ==\n     1  0  0\n     2  1  1\n"
              "TruthTable\n  Eqn: \"\"\n  NumCols: 0\n  NumRows: 0\n"
              "    Row: 1=0110\n",
              messages.Text());
    for (const std::string& origin : messages.Origins())
        EXPECT_EQ(kEngineOrigin, origin);
}

TEST(Dumps, Handle)
{
    Messages messages;
    Equation::Handle().Dbg();
    Equation("b & a & a").GetVariableHandle("a").Dbg();
    EXPECT_EQ("Kq_BoolEquation::Handle::DbgSize = 0\n"
              "Kq_BoolEquation::Handle::DbgSize = 3\nEntry[0] = 1\nEntry[1] = 3\nEntry[2] = 4\n",
              messages.Text());
    for (const std::string& origin : messages.Origins())
        EXPECT_EQ(kFacadeOrigin, origin);
}

} // namespace
