#include "notation.h"

#include <algorithm>
#include <cstring>

namespace booleq {

namespace {

bool IsLetter(char character)
{
    return (character >= 'a' && character <= 'z') || (character >= 'A' && character <= 'Z');
}

char ToLower(char character)
{
    return character >= 'A' && character <= 'Z' ? static_cast<char>(character | 0x20) : character;
}

bool IsDigit(char character)
{
    return character >= '0' && character <= '9';
}

bool IsIdentifier(const std::string& name, const char* more)
{
    if (name.empty() || !(IsLetter(name[0]) || name[0] == '_'))
        return false;
    return std::all_of(name.begin(), name.end(), [more](char character) {
        return IsLetter(character) || IsDigit(character) || character == '_' ||
               (character != '\0' && std::strchr(more, character) != nullptr);
    });
}

bool IsSimpleIdentifier(const std::string& name)
{
    return IsIdentifier(name, "");
}

bool IsVerilogIdentifier(const std::string& name)
{
    return IsIdentifier(name, "$");
}

// C reserves some names, so an input cannot have them: "__x", "_X".
bool IsCIdentifier(const std::string& name)
{
    const bool isReserved =
        name.size() > 1 && name[0] == '_' && (name[1] == '_' || (name[1] >= 'A' && name[1] <= 'Z'));
    return IsIdentifier(name, "") && !isReserved;
}

bool IsVhdlIdentifier(const std::string& name)
{
    return IsIdentifier(name, "") && name[0] != '_' && name.back() != '_' &&
           name.find("__") == std::string::npos;
}

bool IsAllBetween(const std::string& text, char first, char last)
{
    return !text.empty() && std::all_of(text.begin(), text.end(), [first, last](char character) {
        return character >= first && character <= last;
    });
}

// The blank ends the name. Readers replace what follows a "`" and read a "#" as the start of a
// directive before they look for escaped names, so these two cannot be escaped.
std::string EscapeForVerilog(const std::string& name)
{
    return IsAllBetween(name, '!', '~') && name.find_first_of("`#") == std::string::npos
               ? "\\" + name + " "
               : std::string();
}

std::string EscapeForVhdl(const std::string& name)
{
    if (!IsAllBetween(name, ' ', '~'))
        return std::string();
    std::string escaped = "\\";
    for (const char character : name)
        escaped += character == '\\' ? std::string("\\\\") : std::string(1, character);
    return escaped + "\\";
}

constexpr const char* kNoKeywords[] = {nullptr};

// Verilog and SystemVerilog: a file may be read as either. Some readers also reserve "bool", "wone"
// and "wreal".
constexpr const char* kVerilogKeywords[] = {"accept_on",
                                            "alias",
                                            "always",
                                            "always_comb",
                                            "always_ff",
                                            "always_latch",
                                            "and",
                                            "assert",
                                            "assign",
                                            "assume",
                                            "automatic",
                                            "before",
                                            "begin",
                                            "bind",
                                            "bins",
                                            "binsof",
                                            "bit",
                                            "bool",
                                            "break",
                                            "buf",
                                            "bufif0",
                                            "bufif1",
                                            "byte",
                                            "case",
                                            "casex",
                                            "casez",
                                            "cell",
                                            "chandle",
                                            "checker",
                                            "class",
                                            "clocking",
                                            "cmos",
                                            "config",
                                            "const",
                                            "constraint",
                                            "context",
                                            "continue",
                                            "cover",
                                            "covergroup",
                                            "coverpoint",
                                            "cross",
                                            "deassign",
                                            "default",
                                            "defparam",
                                            "design",
                                            "disable",
                                            "dist",
                                            "do",
                                            "edge",
                                            "else",
                                            "end",
                                            "endcase",
                                            "endchecker",
                                            "endclass",
                                            "endclocking",
                                            "endconfig",
                                            "endfunction",
                                            "endgenerate",
                                            "endgroup",
                                            "endinterface",
                                            "endmodule",
                                            "endpackage",
                                            "endprimitive",
                                            "endprogram",
                                            "endproperty",
                                            "endspecify",
                                            "endsequence",
                                            "endtable",
                                            "endtask",
                                            "enum",
                                            "event",
                                            "eventually",
                                            "expect",
                                            "export",
                                            "extends",
                                            "extern",
                                            "final",
                                            "first_match",
                                            "for",
                                            "force",
                                            "foreach",
                                            "forever",
                                            "fork",
                                            "forkjoin",
                                            "function",
                                            "generate",
                                            "genvar",
                                            "global",
                                            "highz0",
                                            "highz1",
                                            "if",
                                            "iff",
                                            "ifnone",
                                            "ignore_bins",
                                            "illegal_bins",
                                            "implements",
                                            "implies",
                                            "import",
                                            "incdir",
                                            "include",
                                            "initial",
                                            "inout",
                                            "input",
                                            "inside",
                                            "instance",
                                            "int",
                                            "integer",
                                            "interconnect",
                                            "interface",
                                            "intersect",
                                            "join",
                                            "join_any",
                                            "join_none",
                                            "large",
                                            "let",
                                            "liblist",
                                            "library",
                                            "local",
                                            "localparam",
                                            "logic",
                                            "longint",
                                            "macromodule",
                                            "matches",
                                            "medium",
                                            "modport",
                                            "module",
                                            "nand",
                                            "negedge",
                                            "nettype",
                                            "new",
                                            "nexttime",
                                            "nmos",
                                            "nor",
                                            "noshowcancelled",
                                            "not",
                                            "notif0",
                                            "notif1",
                                            "null",
                                            "or",
                                            "output",
                                            "package",
                                            "packed",
                                            "parameter",
                                            "pmos",
                                            "posedge",
                                            "primitive",
                                            "priority",
                                            "program",
                                            "property",
                                            "protected",
                                            "pull0",
                                            "pull1",
                                            "pulldown",
                                            "pullup",
                                            "pulsestyle_ondetect",
                                            "pulsestyle_onevent",
                                            "pure",
                                            "rand",
                                            "randc",
                                            "randcase",
                                            "randsequence",
                                            "rcmos",
                                            "real",
                                            "realtime",
                                            "ref",
                                            "reg",
                                            "reject_on",
                                            "release",
                                            "repeat",
                                            "restrict",
                                            "return",
                                            "rnmos",
                                            "rpmos",
                                            "rtran",
                                            "rtranif0",
                                            "rtranif1",
                                            "s_always",
                                            "s_eventually",
                                            "s_nexttime",
                                            "s_until",
                                            "s_until_with",
                                            "scalared",
                                            "sequence",
                                            "shortint",
                                            "shortreal",
                                            "showcancelled",
                                            "signed",
                                            "small",
                                            "soft",
                                            "solve",
                                            "specify",
                                            "specparam",
                                            "static",
                                            "string",
                                            "strong",
                                            "strong0",
                                            "strong1",
                                            "struct",
                                            "super",
                                            "supply0",
                                            "supply1",
                                            "sync_accept_on",
                                            "sync_reject_on",
                                            "table",
                                            "tagged",
                                            "task",
                                            "this",
                                            "throughout",
                                            "time",
                                            "timeprecision",
                                            "timeunit",
                                            "tran",
                                            "tranif0",
                                            "tranif1",
                                            "tri",
                                            "tri0",
                                            "tri1",
                                            "triand",
                                            "trior",
                                            "trireg",
                                            "type",
                                            "typedef",
                                            "union",
                                            "unique",
                                            "unique0",
                                            "unsigned",
                                            "until",
                                            "until_with",
                                            "untyped",
                                            "use",
                                            "uwire",
                                            "var",
                                            "vectored",
                                            "virtual",
                                            "void",
                                            "wait",
                                            "wait_order",
                                            "wand",
                                            "weak",
                                            "weak0",
                                            "weak1",
                                            "while",
                                            "wildcard",
                                            "wire",
                                            "with",
                                            "within",
                                            "wone",
                                            "wor",
                                            "wreal",
                                            "xnor",
                                            "xor",
                                            nullptr};

// VHDL up to 2008, in lower case because case does not count.
constexpr const char* kVhdlKeywords[] = {
    "abs", "access", "after", "alias", "all", "and", "architecture", "array", "assert", "assume",
    "assume_guarantee", "attribute", "begin", "block", "body", "buffer", "bus", "case", "component",
    "configuration", "constant", "context", "cover", "default", "disconnect", "downto", "else",
    "elsif", "end", "entity", "exit", "fairness", "file", "for", "force", "function", "generate",
    "generic", "group", "guarded", "if", "impure", "in", "inertial", "inout", "is", "label",
    "library", "linkage", "literal", "loop", "map", "mod", "nand", "new", "next", "nor", "not",
    "null", "of", "on", "open", "or", "others", "out", "package", "parameter", "port", "postponed",
    "procedure", "process", "property", "protected", "pure", "range", "record", "register",
    "reject", "release", "rem", "report", "restrict", "restrict_guarantee", "return", "rol", "ror",
    "select", "sequence", "severity", "shared", "signal", "sla", "sll", "sra", "srl", "strong",
    "subtype", "then", "to", "transport", "type", "unaffected", "units", "until", "use", "variable",
    "vmode", "vprop", "vunit", "wait", "when", "while", "with", "xnor", "xor",
    // The library and the type that an entity needs.
    "ieee", "std", "work", "std_logic", nullptr};

// C up to 2023, what stdbool.h defines, and the names that compilers define as macros unless a
// strict standard is asked for.
constexpr const char* kCKeywords[] = {
    "alignas",       "alignof",      "asm",      "auto",          "bool",
    "break",         "case",         "char",     "const",         "constexpr",
    "continue",      "default",      "do",       "double",        "else",
    "enum",          "extern",       "false",    "float",         "for",
    "goto",          "if",           "inline",   "int",           "long",
    "nullptr",       "register",     "restrict", "return",        "short",
    "signed",        "sizeof",       "static",   "static_assert", "struct",
    "switch",        "thread_local", "true",     "typedef",       "typeof",
    "typeof_unqual", "union",        "unsigned", "void",          "volatile",
    "while",         "i386",         "linux",    "mips",          "sparc",
    "sun",           "unix",         nullptr};

constexpr const char* kPythonKeywords[] = {
    "False",   "None",     "True",     "and",       "as",   "assert", "async",  "await",
    "break",   "class",    "continue", "def",       "del",  "elif",   "else",   "except",
    "finally", "for",      "from",     "global",    "if",   "import", "in",     "is",
    "lambda",  "nonlocal", "not",      "or",        "pass", "raise",  "return", "try",
    "while",   "with",     "yield",    "__debug__", nullptr};

// Two inversions side by side are not an expression of the language, though some tools accept them.
const Notation kVerilog = {"Verilog",
                           Values::Vector,
                           "1'b0",
                           "1'b1",
                           false,
                           {{"~", Meaning::BitNot, 90, Chain::Any, true},
                            {"!", Meaning::LogicalNot, 90, Chain::Any, false},
                            {"~&", Meaning::Foreign, 90, Chain::Any, false},
                            {"~|", Meaning::Foreign, 90, Chain::Any, false},
                            {"~^", Meaning::Foreign, 90, Chain::Any, false},
                            {"^~", Meaning::Foreign, 90, Chain::Any, false}},
                           false,
                           {},
                           {{"&", Meaning::And, 60, Chain::Any, true},
                            {"^", Meaning::Xor, 50, Chain::Any, true},
                            {"~^", Meaning::Nxor, 50, Chain::Any, true},
                            {"^~", Meaning::Nxor, 50, Chain::Any, false},
                            {"|", Meaning::Or, 40, Chain::Any, true},
                            {"*", Meaning::Multiply, 80, Chain::Any, false},
                            {"+", Meaning::Add, 70, Chain::Any, false}},
                           false,
                           false,
                           false,
                           IsVerilogIdentifier,
                           kVerilogKeywords,
                           EscapeForVerilog};

const Notation kVhdl = {"VHDL",
                        Values::Bits,
                        "'0'",
                        "'1'",
                        false,
                        {{"not", Meaning::BitNot, 90, Chain::Any, true}},
                        false,
                        {},
                        {{"and", Meaning::And, 10, Chain::Same, true},
                         {"or", Meaning::Or, 10, Chain::Same, true},
                         {"xor", Meaning::Xor, 10, Chain::Same, true},
                         {"nand", Meaning::Nand, 10, Chain::None, true},
                         {"nor", Meaning::Nor, 10, Chain::None, true},
                         {"xnor", Meaning::Nxor, 10, Chain::Same, true}},
                        false,
                        false,
                        true,
                        IsVhdlIdentifier,
                        kVhdlKeywords,
                        EscapeForVhdl};

const Notation kC = {"C",
                     Values::Int,
                     "0",
                     "1",
                     false,
                     {{"!", Meaning::LogicalNot, 90, Chain::Any, true},
                      {"~", Meaning::BitNot, 90, Chain::Any, false}},
                     true,
                     {},
                     {{"&", Meaning::And, 60, Chain::Any, true},
                      {"^", Meaning::Xor, 50, Chain::Any, true},
                      {"|", Meaning::Or, 40, Chain::Any, true},
                      {"*", Meaning::Multiply, 80, Chain::Any, false},
                      {"+", Meaning::Add, 70, Chain::Any, false}},
                     true,
                     false,
                     false,
                     IsCIdentifier,
                     kCKeywords,
                     nullptr};

// "and", "or", "!=" and "==" are meant for values 0 and 1, which is how the writer uses them; no
// text in this library's syntax contains them. Python changes names with two leading underscores in
// classes only, so they are plain.
const Notation kPython = {"Python",
                          Values::Int,
                          "0",
                          "1",
                          false,
                          {{"not", Meaning::LogicalNot, 30, Chain::Any, true},
                           {"~", Meaning::BitNot, 90, Chain::Any, false}},
                          true,
                          {},
                          {{"and", Meaning::And, 20, Chain::Any, true},
                           {"or", Meaning::Or, 10, Chain::Any, true},
                           {"!=", Meaning::Xor, 35, Chain::None, true},
                           {"==", Meaning::Nxor, 35, Chain::None, true},
                           {"&", Meaning::And, 60, Chain::Any, false},
                           {"^", Meaning::Xor, 50, Chain::Any, false},
                           {"|", Meaning::Or, 40, Chain::Any, false},
                           {"*", Meaning::Multiply, 80, Chain::Any, false},
                           {"+", Meaning::Add, 70, Chain::Any, false},
                           {"@", Meaning::Foreign, 80, Chain::Any, false}},
                          false,
                          false,
                          false,
                          IsSimpleIdentifier,
                          kPythonKeywords,
                          nullptr};

const Notation kLiberty = {"Liberty",
                           Values::Bits,
                           "0",
                           "1",
                           true,
                           {{"!", Meaning::BitNot, 90, Chain::Any, true}},
                           true,
                           {{"'", Meaning::BitNot, 90, Chain::Any, false}},
                           {{"^", Meaning::Xor, 60, Chain::Any, true},
                            {"&", Meaning::And, 50, Chain::Any, true},
                            {"*", Meaning::And, 50, Chain::Any, false},
                            {"|", Meaning::Or, 40, Chain::Any, true},
                            {"+", Meaning::Or, 40, Chain::Any, false}},
                           false,
                           true,
                           false,
                           IsSimpleIdentifier,
                           kNoKeywords,
                           nullptr};

// Readers of this format disagree about two inversions side by side.
const Notation kEqn = {
    "eqn",
    Values::Bits,
    "0",
    "1",
    true,
    {{"!", Meaning::BitNot, 90, Chain::Any, true}},
    false,
    {},
    {{"*", Meaning::And, 50, Chain::Any, true}, {"+", Meaning::Or, 40, Chain::Any, true}},
    false,
    false,
    false,
    IsSimpleIdentifier,
    kNoKeywords,
    nullptr};

} // namespace

Meaning MeaningOf(Operator op)
{
    switch (op) {
    case Operator::Zero:
        return Meaning::Zero;
    case Operator::One:
        return Meaning::One;
    case Operator::Input:
        return Meaning::Input;
    case Operator::Not:
        return Meaning::BitNot;
    case Operator::And:
        return Meaning::And;
    case Operator::Or:
        return Meaning::Or;
    case Operator::Xor:
        return Meaning::Xor;
    case Operator::Nand:
        return Meaning::Nand;
    case Operator::Nor:
        return Meaning::Nor;
    case Operator::Nxor:
        return Meaning::Nxor;
    }
    return Meaning::Foreign;
}

const Notation& VerilogNotation()
{
    return kVerilog;
}

const Notation& VhdlNotation()
{
    return kVhdl;
}

const Notation& CNotation()
{
    return kC;
}

const Notation& PythonNotation()
{
    return kPython;
}

const Notation& LibertyNotation()
{
    return kLiberty;
}

const Notation& EqnNotation()
{
    return kEqn;
}

const std::vector<const Notation*>& ForeignNotations()
{
    static const std::vector<const Notation*> kAll = {&kVerilog, &kC, &kLiberty, &kVhdl, &kPython};
    return kAll;
}

bool IsPlain(const Notation& notation, const std::string& name)
{
    if (!notation.isPlainName(name))
        return false;
    std::string key = name;
    if (notation.ignoresCase)
        std::transform(key.begin(), key.end(), key.begin(), ToLower);
    for (const char* const* keyword = notation.keywords; *keyword; ++keyword)
        if (key == *keyword)
            return false;
    return true;
}

bool IsNetName(const std::string& name)
{
    return !name.empty() && std::all_of(name.begin(), name.end(), [](char character) {
        return IsLetter(character) || IsDigit(character) ||
               (character != '\0' && std::strchr("_[]<>.:$", character) != nullptr);
    });
}

} // namespace booleq
