// A script: steps over a few equation objects, handles and truth tables that may share data.
#ifndef RANDOM_SCRIPT_H
#define RANDOM_SCRIPT_H

#include <string>
#include <vector>

namespace script {

const size_t kNumObjects = 4;
const size_t kNumHandles = 3;
const size_t kNumTables = 2;

enum class Op {
    Create,
    CreateFromText,
    CreateCopy,
    Assign,
    Clear,
    Set,
    SetTerms,
    Define,
    SetVariable,
    GetVariable,
    GetHandle,
    UseHandle,
    CompareHandles,
    DumpHandle,
    CompareObjects,
    Eval,
    Render,
    RenderInitValues,
    Dump,
    DumpRoot,
    SetDebugMode,
    BuildTable,
    CompareTables,
    ReadTable,
    Tokenize, // engine only; clears first
    Build,    // engine only
    Ask,      // one question; 'value' says which
    kCount
};

// The source of a step's text: as given, or a reference into the object to which it is passed.
enum class Source { Given, OwnName, OwnRootToken };

struct Step {
    Op op = Op::Create;
    size_t object = 0;
    size_t other = 0; // another object, handle or table
    Source source = Source::Given;
    std::string text;
    std::vector<std::string> terms;
    bool firstFlag = false;
    bool secondFlag = false;
    unsigned int value = 0;
};

std::vector<Step> RandomScript(unsigned int seed, size_t numSteps, bool isEngine);

std::string Describe(const Step& step);
// A line for each step.
std::string Describe(const std::vector<Step>& steps);

// Names that scripts use: ordinary ones, and odd ones that are refused or nevertheless legal.
const std::vector<std::string>& UsualNames();
const std::vector<std::string>& OddNames();

} // namespace script

#endif
