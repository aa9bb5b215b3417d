// What each reader makes of small texts, and what it refuses.
#include <cstdlib>
#include <fstream>

#include <gtest/gtest.h>

#include "design_check.h"

namespace {

using booleq::Design;
using booleq::ReadOptions;

typedef std::vector<std::string> Lines;

Design MustRead(const std::string& text, const ReadOptions& options = ReadOptions())
{
    Design design;
    std::string fault;
    EXPECT_TRUE(ReadDesignText(text, "test", options, design, fault)) << fault << "\n"
                                                                      << text.substr(0, 5000);
    EXPECT_EQ(tests::BrokenInvariant(design), "") << text.substr(0, 5000);
    return design;
}

std::string FaultOf(const std::string& text, const ReadOptions& options = ReadOptions())
{
    Design design;
    std::string fault;
    EXPECT_FALSE(ReadDesignText(text, "test", options, design, fault)) << text.substr(0, 5000);
    EXPECT_TRUE(design.tables.empty());
    EXPECT_EQ(design.names.Size(), 1u); // the reader gave no result
    return fault;
}

std::string Replaced(std::string text, const std::string& what, const std::string& with)
{
    const size_t place = text.find(what);
    EXPECT_NE(place, std::string::npos) << what;
    return text.replace(place, what.size(), with);
}

// --- Yosys JSON

const char kJson[] = R"({
"creator": "a test",
"modules": {
 "sub": {"attributes": {}, "ports": {"p": {"direction": "input", "bits": [2, 3]},
                                     "q": {"direction": "output", "bits": [4]}},
  "cells": {"u": {"hide_name": 0, "type": "LUT2", "parameters": {"INIT": "0110"},
                  "connections": {"I0": [2], "I1": [3], "O": [4]}}},
  "netnames": {"p": {"hide_name": 0, "bits": [2, 3]}, "q": {"hide_name": 0, "bits": [4]}}},
 "top": {"attributes": {"top": 1}, "ports": {"a": {"direction": "input", "bits": [2, 3]},
                                             "y": {"direction": "output", "bits": [6, 7]}},
  "cells": {
   "lut": {"type": "$lut", "parameters": {"LUT": "11001010", "WIDTH": "11"},
           "attributes": {"BEL": "X1/Y2"}, "connections": {"A": [2, 3, "1"], "Y": [5]}},
   "s0": {"type": "sub", "connections": {"p": [5, 3], "q": [6]}},
   "s1": {"type": "sub", "connections": {"p": [6, "0"], "q": [7]}},
   "ff": {"type": "FDRE", "connections": {"D": [7], "Q": [8]}},
   "sr": {"type": "SRL16E", "parameters": {"INIT": "0000000000000000"}, "connections": {"Q": [9]}}},
  "netnames": {"$x": {"hide_name": 1, "bits": [5]}, "n": {"hide_name": 0, "bits": [5]},
               "a": {"bits": [2, 3]}, "y": {"bits": [6, 7], "offset": 4}}}}})";

TEST(JsonReader, HierarchyBecomesPaths)
{
    const Design design = MustRead(kJson);
    EXPECT_EQ(design.format, "Yosys JSON");
    EXPECT_EQ(tests::TableLines(design),
              (Lines{"lut $lut: n = ca(1'b1, a[1], a[0])", "s0.u LUT2: y[4] = 6(a[1], n)",
                     "s1.u LUT2: y[5] = 6(1'b0, y[4])"}));
    EXPECT_EQ(design.numCells, 5u);
    ASSERT_EQ(design.unread.size(), 1u);
    EXPECT_EQ(Path(design, design.unread[0].name), "sr");
    EXPECT_EQ(design.types[design.unread[0].type].note, "a shift register");
    EXPECT_EQ(design.ports.size(), 4u);
}

TEST(JsonReader, EveryNameOfANetIsKept)
{
    const Design design = MustRead(kJson);
    for (const char* name : {"n", "$x", "s0.p[0]"})
        EXPECT_EQ(tests::NetOf(design, name), tests::NetOf(design, "n")) << name;
    EXPECT_NE(tests::NetOf(design, "n"), booleq::kNetOpen);
    EXPECT_EQ(tests::NetOf(design, "s1.p[0]"), tests::NetOf(design, "y[4]"));
    EXPECT_EQ(tests::NetOf(design, "nothing"), booleq::kNetOpen);
}

TEST(JsonReader, AnAttributeIsKeptOnDemand)
{
    EXPECT_TRUE(MustRead(kJson).keys.empty());
    ReadOptions options;
    options.keyAttribute = "BEL";
    const Design design = MustRead(kJson, options);
    EXPECT_EQ(design.names.Text(design.keys.at(0)), "X1/Y2");
    EXPECT_EQ(design.keys.at(1), 0u);
}

TEST(JsonReader, WhatIsWrongIsSaidWithItsPlace)
{
    EXPECT_EQ(FaultOf(Replaced(kJson, "[5, 3]", "[5, 3.5]")).substr(0, 13), "test: line 14");
    EXPECT_NE(FaultOf(Replaced(kJson, "[5, 3]", "[5, \"2\"]")).find("module 'top', cell 's0', 'p'"),
              std::string::npos);
    EXPECT_NE(
        FaultOf(Replaced(kJson, "\"s1\"", "\"s0\"")).find("cell 's0': the name is given twice"),
        std::string::npos);
    EXPECT_NE(FaultOf(Replaced(kJson, "\"sub\": {\"attr", "\"top\": {\"attr")).find("twice"),
              std::string::npos);
    EXPECT_NE(FaultOf(Replaced(kJson, "\"type\": \"FDRE\"", "\"type\": 7")).find("'ff'"),
              std::string::npos);
    EXPECT_NE(FaultOf("{}").find("no \"modules\""), std::string::npos);
    EXPECT_NE(FaultOf("{\"modules\": {}}").find("no module"), std::string::npos);
    EXPECT_NE(FaultOf("{\"modules\": []}"), "");
    EXPECT_NE(FaultOf(std::string(kJson) + "x"), "");
    ReadOptions options;
    options.top = "nothing";
    EXPECT_EQ(FaultOf(kJson, options), "test: there is no module 'nothing'");
}

TEST(JsonReader, TextsThatEndEarlyAreRefused)
{
    const std::string text = kJson;
    for (size_t size = 0; size < text.size(); ++size)
        FaultOf(text.substr(0, size));
}

TEST(JsonReader, AModuleInItselfIsRefused)
{
    const std::string inner = Replaced(kJson, "\"type\": \"LUT2\"", "\"type\": \"sub\"");
    EXPECT_EQ(FaultOf(inner), "test: module 'sub' contains itself");
}

// Each level contains the one below it twice: 2^40 tables.
TEST(JsonReader, HierarchyThatExplodesIsRefused)
{
    std::string text =
        "{\"modules\": {\"m0\": {\"cells\": {\"u\": {\"type\": \"$lut\", \"parameters\": "
        "{\"LUT\": \"10\"}, \"connections\": {\"A\": [2], \"Y\": [3]}}}}";
    for (int level = 1; level <= 40; ++level) {
        const std::string below = "{\"type\": \"m" + std::to_string(level - 1) + "\"}";
        text += ", \"m" + std::to_string(level) + "\": {\"cells\": {\"a\": " + below +
                ", \"b\": " + below + "}}";
    }
    ReadOptions options;
    options.maxItems = 100000;
    EXPECT_NE(FaultOf(text + "}}", options).find("more than 100000 nets and cells"),
              std::string::npos);
}

// --- findings

std::string JsonCell(const std::string& type, const std::string& parameters,
                     const std::string& connections)
{
    return "{\"modules\": {\"t\": {\"cells\": {\"u\": {\"type\": \"" + type +
           "\", \"parameters\": {" + parameters + "}, \"connections\": {" + connections +
           "}}}, \"netnames\": {\"a\": {\"bits\": [2]}, \"b\": {\"bits\": [3]}, \"y\": {\"bits\": "
           "[4]}}}}}";
}

TEST(CellFindings, OddCellsAreNamed)
{
    const std::string pins = "\"I0\": [2], \"I1\": [3], \"O\": [4]";
    struct Row {
        std::string text;
        const char* finding;
        const char* table;
    };
    const Row rows[] = {
        {JsonCell("LUT2", "\"INIT\": \"0x12\"", pins), "init-long u INIT='0x12'", "2"},
        {JsonCell("LUT2", "\"INIT\": \"10\"", pins), "init-short u INIT='10'", "2"},
        {JsonCell("LUT2", "\"INIT\": \"1x00\"", pins), "init-unknown u INIT='1x00'", "8"},
        {JsonCell("LUT2", "\"INIT\": \"what\"", pins), "init-illegible u INIT='what'", ""},
        {JsonCell("LUT2", "\"INIT\": -3", pins), "init-illegible u INIT='-3'", ""},
        {JsonCell("LUT2", "", pins), "init-missing u INIT", "0"},
        {JsonCell("LUT2", "\"INIT\": 14", "\"I0\": [2], \"O\": [4]"), "pin-open u I1", "e"},
        {JsonCell("LUT2", "\"INIT\": 14", "\"I0\": [2], \"I1\": [\"x\"], \"O\": [4]"),
         "pin-unknown u I1", "e"},
        {JsonCell("LUT2", "\"INIT\": 14", pins + ", \"I2\": [4]"), "pin-strange u I2", ""},
        {JsonCell("LUT2", "\"INIT\": 14", pins + ", \"I0\": [4]"), "pin-twice u I0", "e"},
        {JsonCell("$lut", "\"LUT\": \"10\", \"WIDTH\": 2", "\"A\": [2], \"Y\": [4]"),
         "width u WIDTH", "2"},
        {JsonCell("cyclone10lp_lcell_comb", "\"lut_mask\": \"0x1234\", \"sum_lutc_input\": \"cin\"",
                  "\"combout\": [4]"),
         "mode-unread u a carry", ""},
    };
    for (const Row& row : rows) {
        const Design design = MustRead(row.text);
        ASSERT_EQ(tests::FindingLines(design), Lines{row.finding}) << row.text;
        ASSERT_EQ(design.tables.size() + design.unread.size(), 1u) << row.text;
        if (*row.table != 0) {
            EXPECT_NE(tests::TableLines(design).at(0).find(std::string(" = ") + row.table + "("),
                      std::string::npos)
                << tests::TableLines(design).at(0);
        }
    }
}

TEST(CellTypes, HalvesAndTreesOfTablesAreRead)
{
    const std::string six = "\"I0\": [2], \"I1\": [3], \"I2\": [\"0\"], \"I3\": [\"0\"], \"I4\": "
                            "[\"0\"], \"I5\": [\"1\"], \"O6\": [4], \"O5\": [5]";
    const Design halves = MustRead(JsonCell("LUT6_2", "\"INIT\": \"64'h8\"", six));
    ASSERT_EQ(halves.tables.size(), 2u);
    EXPECT_EQ(halves.NumInputs(halves.tables[0]), 6u);
    EXPECT_EQ(halves.NumInputs(halves.tables[1]), 5u);
    const Design tree =
        MustRead(JsonCell("CC_L2T4", "\"INIT_L00\": 8, \"INIT_L01\": 6, \"INIT_L10\": 14",
                          "\"I0\": [2], \"I1\": [3], \"I2\": [2], \"I3\": [3], \"O\": [4]"));
    // (I0 & I1) | (I2 ^ I3)
    EXPECT_EQ(tests::TableLines(tree), Lines{"u CC_L2T4: y = 8ff8(b, a, b, a)"});
}

// Even in a mode without a table output the table is read; its output goes to the flip-flop of the
// cell.
TEST(CellTypes, ATableBesideAFlipFlopIsRead)
{
    const std::string pins = "\"I0\": [2], \"I1\": [3], \"O\": [4]";
    const Design plain = MustRead(
        JsonCell("ICESTORM_LC", "\"LUT_INIT\": \"0000000000001000\", \"DFF_ENABLE\": \"0\"", pins));
    EXPECT_EQ(tests::TableLines(plain), Lines{"u ICESTORM_LC.O: y = 8(1'b0, 1'b0, b, a)"});
    const Design registered = MustRead(
        JsonCell("ICESTORM_LC", "\"LUT_INIT\": \"0000000000001000\", \"DFF_ENABLE\": \"1\"", pins));
    EXPECT_EQ(tests::TableLines(registered),
              Lines{"u ICESTORM_LC.LO: (open) = 8(1'b0, 1'b0, b, a)"});
}

TEST(CellTypes, AUsersTypesAreAdded)
{
    booleq::CellTypes types = booleq::CellTypes::Known();
    std::string fault;
    ASSERT_TRUE(types.Add("cell MINE\n input p q # two\n init T 4 hex\n table r = T q p\n",
                          "mine.txt", fault))
        << fault;
    ReadOptions options;
    options.cellTypes = &types;
    const Design design = MustRead(
        JsonCell("MINE", "\"T\": \"4'h2\"", "\"p\": [2], \"q\": [3], \"r\": [4]"), options);
    EXPECT_EQ(tests::TableLines(design), Lines{"u MINE: y = 2(a, b)"});
}

TEST(CellTypes, BadLinesAreRefusedWithTheirNumber)
{
    const char* rows[][2] = {
        {"table y = INIT a", "line 1: 'table' comes before the first 'cell'"},
        {"cell a\nwhat", "line 2: expected cell, input, other, vector, init, table, inner, open, "
                         "constant, unread or note instead of 'what'"},
        {"cell a\ninput p p", "line 2: pin 'p' is listed twice"},
        {"cell a\ninput p\ninit I 4\ntable y = I p",
         "line 4: the table has 2 rows, and there are 4 bits"},
        {"cell a\ninput p\ninit I 2\ntable y = I q",
         "line 4: 'q' is neither an input nor a table before this"},
        {"cell a\ninput p\ninit I 4\ntable y = I[9:2] p",
         "line 4: expected a number up to 3 instead of '9'"},
        {"cell a\ninit I 99999999", "line 2: expected a number up to 65536 instead of '99999999'"},
        {"cell a\ninput p", "line 2: cell 'a' above has no table"},
        {"cell a\nunread x\nconstant y 2", "line 3: expected a number up to 1 instead of '2'"},
    };
    for (const auto& row : rows) {
        booleq::CellTypes types;
        std::string fault;
        EXPECT_FALSE(types.Add(row[0], "f", fault)) << row[0];
        EXPECT_EQ(fault, std::string("f: ") + row[1]);
        EXPECT_TRUE(types.All().empty());
    }
}

// --- BLIF

const char kBlif[] = R"(# a comment
.model top
.inputs a b \
 c
.outputs y z w k
.names $undef
.names one
1
.names a b c n
11- 1
--1 1
.cname first
.attr BEL "X3/Y4"
.names n one y
0- 0
.names a z
1 1
.gate LUT2 I0=a I1=n O=w
.cname g
.param INIT 0x6
.subckt sub p=b q=k
.latch a q re c 2
.end
.model sub
.inputs p
.outputs q
.names p q
0 1
.end
)";

TEST(BlifReader, NamesGatesAndModels)
{
    ReadOptions options;
    options.keyAttribute = "BEL";
    const Design design = MustRead(kBlif, options);
    EXPECT_EQ(design.format, "BLIF");
    EXPECT_EQ(tests::TableLines(design),
              (Lines{"first .names: n = f8(c, b, a)", "y .names: y = a(1'b1, n)",
                     "g LUT2: w = 6(n, a)", "k .names: k = 1(b)"}));
    EXPECT_EQ(design.names.Text(design.keys.at(0)), "X3/Y4");
    EXPECT_TRUE(design.tables.at(1).isNamedByOutput);
    EXPECT_EQ(tests::NetOf(design, "z"),
              tests::NetOf(design, "a")); // a buffer without a name is a wire
    EXPECT_EQ(tests::NetOf(design, "one"), booleq::kNetOne);
    EXPECT_EQ(design.tables.at(0).line, 9u);
}

TEST(BlifReader, WhatIsWrongIsSaidWithItsLine)
{
    EXPECT_EQ(FaultOf(Replaced(kBlif, "--1 1", "--1 2")),
              "test: line 11: the value of a row is 0 or 1, not '2'");
    EXPECT_EQ(FaultOf(Replaced(kBlif, "--1 1", "-1 1")),
              "test: line 11: a row of this table has 3 inputs and a value");
    EXPECT_EQ(FaultOf(Replaced(kBlif, "--1 1", "-a1 1")),
              "test: line 11: expected 0, 1 or -, not '-a1'");
    EXPECT_EQ(FaultOf(Replaced(kBlif, ".latch", ".what")), "test: line 22: '.what' is not known");
    EXPECT_EQ(FaultOf(Replaced(kBlif, "I0=a", "a")),
              "test: line 18: expected PIN=NET instead of 'a'");
    EXPECT_EQ(FaultOf(Replaced(kBlif, ".model sub", ".model top")),
              "test: line 24: there are two models 'top'");
    EXPECT_EQ(FaultOf(Replaced(kBlif, "q re c 2\n.end", "q re c 2")),
              "test: line 23: the previous model has no .end");
    EXPECT_EQ(FaultOf(".model m\n.inputs a\n"),
              "test: line 2: the text ends inside model 'm', without .end");
    EXPECT_EQ(FaultOf(".names a b\n1 1\n.end\n"),
              "test: line 1: .names comes before the first .model");
}

TEST(BlifReader, MixedAndWideTablesAreNotRead)
{
    std::string wide = ".model m\n.names";
    for (int input = 0; input < 17; ++input)
        wide += " i" + std::to_string(input);
    const Design design =
        MustRead(wide + " y\n" + std::string(17, '1') + " 1\n.names a b z\n11 1\n00 0\n.end\n");
    EXPECT_TRUE(design.tables.empty());
    EXPECT_EQ(tests::FindingLines(design), (Lines{"too-wide y 17 inputs", "cover-mixed z"}));
}

TEST(BlifReader, ANetWithTwoDriversIsNamed)
{
    const Design design = MustRead(".model m\n.names a b y\n11 1\n.names a b y\n10 1\n.end\n");
    EXPECT_EQ(tests::FindingLines(design), Lines{"driver-twice y y"});
}

// --- EDIF

const char kEdif[] = R"((edif top
 (edifVersion 2 0 0)
 (external LIB (edifLevel 0)
  (cell VCC (cellType GENERIC) (view V (viewType NETLIST) (interface (port P (direction OUTPUT)))))
  (cell LUT2 (view V (viewType NETLIST)
   (interface (port I0 (direction INPUT)) (port I1 (direction INPUT)) (port O (direction OUTPUT))))))
 (Library DESIGN
  (cell (rename sub "the sub") (view V (viewType NETLIST)
   (interface (port (array (rename p "p[1:0]") 2) (direction INPUT)) (port q (direction OUTPUT)))
   (contents
    (instance u (viewRef V (cellRef LUT2 (libraryRef LIB))) (property INIT (string "4'h6")))
    (net p0 (joined (portRef (member p 1)) (portRef I0 (instanceRef u))))
    (net p1 (joined (portRef (member p 0)) (portRef I1 (instanceRef u))))
    (net q (joined (portRef q) (portRef O (instanceRef u)))))))
  (cell top (view V (viewType NETLIST)
   (interface (port a (direction INPUT)) (port y (direction OUTPUT)))
   (contents
    (instance vcc (viewRef V (cellRef VCC (libraryRef LIB))))
    (instance (rename &1s "1s") (viewRef V (cellRef sub)))
    (instance g (viewRef V (cellRef LUT2 (libraryRef LIB)))
     (property INIT (integer 8)) (property BEL (string "X%32%Y")) (property (rename x "y") (boolean (true))))
    (net a (joined (portRef a) (portRef (member p 1) (instanceRef &1s)) (portRef I0 (instanceRef g))))
    (net (rename n "n[0]") (joined (portRef q (instanceRef 1s)) (portRef I1 (instanceRef g))))
    (net one (joined (portRef P (instanceRef vcc)) (portRef (member p 0) (instanceRef &1s))))
    (net out (joined (portRef y) (portRef O (instanceRef g))))))))
 (design top (cellRef top (libraryRef DESIGN)))
))";

TEST(EdifReader, RenamesArraysAndHierarchy)
{
    ReadOptions options;
    options.keyAttribute = "BEL";
    const Design design = MustRead(kEdif, options);
    EXPECT_EQ(design.format, "EDIF");
    EXPECT_EQ(tests::TableLines(design),
              (Lines{"g LUT2: out = 8(n[0], a)", "1s.u LUT2: n[0] = 6(1'b1, a)"}));
    EXPECT_EQ(design.names.Text(design.keys.at(0)), "X Y");
    EXPECT_EQ(design.types.size(), 3u);
    EXPECT_TRUE(design.findings.empty());
}

TEST(EdifReader, WhatIsWrongIsSaidWithItsLine)
{
    EXPECT_EQ(FaultOf(Replaced(kEdif, "(cellRef sub)", "(cellRef what)")),
              "test: line 19: no cell 'what' stands before this");
    EXPECT_EQ(FaultOf(Replaced(kEdif, "(instanceRef vcc)", "(instanceRef what)")),
              "test: line 24: no instance 'what' stands before this");
    EXPECT_EQ(FaultOf(Replaced(kEdif, "(edifVersion 2 0 0)", "(edifVersion 3 0 0)")),
              "test: line 2: it is EDIF '3 0 0', and 2 0 0 is what is read");
    EXPECT_EQ(FaultOf(Replaced(kEdif, "(portRef P ", "(portRef Z ")),
              "test: line 24: cell 'VCC' has no port 'Z'");
    EXPECT_EQ(FaultOf(Replaced(kEdif, "(member p 1) (instanceRef", "(member p 2) (instanceRef")),
              "test: line 22: port 'p' has 2 bits, and no member 2");
    EXPECT_EQ(FaultOf(Replaced(kEdif, "(instance vcc", "(instance g")),
              "test: line 20: there are two instances 'g'");
    EXPECT_EQ(FaultOf(Replaced(kEdif, "\"p[1:0]\") 2)", "\"p[1:0]\") 10000000000)")),
              "test: line 9: expected a number up to 1048576 instead of '10000000000'");
    EXPECT_EQ(FaultOf(std::string(kEdif) + ")"),
              "test: line 27: unexpected text after the last ')'");
    EXPECT_EQ(FaultOf("(what)"), "test: line 1: expected (edif ...");
}

TEST(EdifReader, TextsThatEndEarlyAreRefused)
{
    const std::string text = kEdif;
    for (size_t size = 0; size < text.size(); ++size)
        FaultOf(text.substr(0, size));
}

TEST(EdifReader, AMillionParenthesesTakeNoStack)
{
    const std::string deep(1000000, '(');
    EXPECT_EQ(FaultOf("(edif a " + deep), "test: line 1: the text ends inside ( ...");
    EXPECT_NE(FaultOf("(edif a (library b (cell c " + deep + std::string(1000000, ')') + ")))"),
              "");
    EXPECT_NE(FaultOf("{\"modules\": " + std::string(1000000, '[')), "");
    // Unused content is skipped, however deeply nested.
    MustRead("{\"modules\": {\"m\": {\"x\": " + std::string(1000000, '[') +
             std::string(1000000, ']') + "}}}");
}

// --- files

TEST(NetlistFiles, WhatIsNotANetlistIsRefused)
{
    EXPECT_EQ(FaultOf(""), "test: it is empty");
    EXPECT_EQ(FaultOf(" \n# only a comment\n"), "test: it is empty");
    EXPECT_EQ(FaultOf(std::string("\x7f"
                                  "ELF\0\0",
                                  6)),
              "test: it has bytes that are not text");
    EXPECT_NE(FaultOf("hello").find("is not a netlist"), std::string::npos);
    Design design;
    std::string fault;
    EXPECT_FALSE(ReadDesign("/nonexistent/file", ReadOptions(), design, fault));
    EXPECT_EQ(fault, "/nonexistent/file: cannot open it: No such file or directory");
    EXPECT_FALSE(ReadDesign("/", ReadOptions(), design, fault));
    EXPECT_EQ(fault, "/: it is a directory");
}

TEST(NetlistFiles, AByteOrderMarkIsSkipped)
{
    EXPECT_EQ(tests::TableLines(MustRead("\xef\xbb\xbf" + std::string(kBlif))),
              tests::TableLines(MustRead(kBlif)));
}

// Refusing a file whose size is 10 GB costs nothing.
TEST(NetlistFiles, HugeFilesAreRefusedBeforeTheyAreRead)
{
    const std::string file = testing::TempDir() + "huge_netlist.json";
    {
        std::ofstream stream(file, std::ios::binary);
        stream.seekp(10000000000);
        stream.put('x');
    }
    Design design;
    std::string fault;
    EXPECT_FALSE(ReadDesign(file, ReadOptions(), design, fault));
    EXPECT_NE(fault.find("larger than 4,294,967,000 bytes"), std::string::npos) << fault;
    std::remove(file.c_str());
}

// A short file could ask for any amount of memory: each of these tables takes 8 KB.
TEST(NetlistFiles, ManyWideTablesAreRefusedAtALimit)
{
    const auto text = [](unsigned int count) {
        std::string file = ".model m\n.inputs";
        std::string pins;
        for (unsigned int pin = 0; pin < 16; ++pin)
            pins += " i" + std::to_string(pin);
        file += pins + "\n";
        for (unsigned int table = 0; table < count; ++table) {
            std::string row;
            for (unsigned int pin = 0; pin < 16; ++pin)
                row += (table >> pin & 1u) != 0 ? '1' : '0';
            file += ".names" + pins + " y" + std::to_string(table) + "\n" + row + " 1\n";
        }
        return file + ".end\n";
    };
    EXPECT_EQ(MustRead(text(32768)).tables.size(), 32768u);
    EXPECT_EQ(
        FaultOf(text(32769)),
        "test: line 65539: with this table the different init values take more than 256 MB, a "
        "table of 16 inputs taking 8192 bytes; map the design to narrower tables, or give it "
        "in parts");
}

} // namespace
