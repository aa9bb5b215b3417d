#include "netlist.h"

#include <cerrno>
#include <filesystem>
#include <future>
#include <thread>

#include <unistd.h>

#include "progress.h"
#include "read_design.h"
#include "text.h"

namespace booleq {

namespace {

// A missing file is not a refusal of its contents. It is not opened here: a pipe is read once.
void CheckFile(const std::string& file)
{
    if (file != "-" && access(file.c_str(), R_OK) != 0)
        throw IoError("cannot read " + Visible(file), errno);
}

// 0 when the size is unknown.
uint64_t SizeOf(const std::string& file)
{
    std::error_code error;
    const uint64_t size = std::filesystem::file_size(file, error);
    return error ? 0 : size;
}

void ShowBytes(void* context, uint64_t numDone, uint64_t /*numBytes*/)
{
    static_cast<Progress*>(context)->Show(numDone);
}

ReadOptions OptionsOf(const Request& request, const CellTypes& cellTypes,
                      const std::string& keyAttribute)
{
    ReadOptions options;
    options.cellTypes = &cellTypes;
    options.keyAttribute = keyAttribute;
    options.top = request.Get("--top");
    return options;
}

void RefuseFile(const std::string& file, const Request& request, Output& output,
                const std::string& fault)
{
    if (request.json)
        Refuse({file, 0}, request, output, fault);
    else
        Complain(output, Visible(fault));
}

} // namespace

std::vector<Option> NetlistOptions()
{
    return {{"--cells", "FILE", "Further types of look-up-table cells (see docs/netlists.md)"},
            {"--top", "MODULE", "The top module, if the file does not say"}};
}

CellTypes CellTypesOf(const Request& request)
{
    CellTypes types = CellTypes::Known();
    std::string fault;
    if (request.Has("--cells") && !types.AddFile(request.Get("--cells"), fault))
        throw UsageError("--cells: " + Visible(fault));
    return types;
}

void CheckFiles(const Request& request)
{
    for (const std::string& file : request.operands)
        CheckFile(file);
}

bool ReadNetlist(const std::string& file, const Request& request, const CellTypes& cellTypes,
                 const std::string& keyAttribute, Output& output, Design& design)
{
    CheckFile(file);
    Progress progress("reading", SizeOf(file));
    ReadOptions options = OptionsOf(request, cellTypes, keyAttribute);
    options.progress = ShowBytes;
    options.progressContext = &progress;
    std::string fault;
    if (ReadDesign(file, options, design, fault))
        return true;
    RefuseFile(file, request, output, fault);
    return false;
}

bool ReadNetlists(const Request& request, const CellTypes& cellTypes,
                  const std::string& keyAttribute, Output& output, Design& left, Design& right)
{
    const std::string& leftFile = request.operands[0];
    const std::string& rightFile = request.operands[1];
    if (leftFile == "-" && rightFile == "-")
        throw UsageError("standard input can be one of the files, not both");
    CheckFiles(request);
    ReadOptions options = OptionsOf(request, cellTypes, keyAttribute);
    std::string rightFault;
    auto other = std::async(std::thread::hardware_concurrency() > 1 ? std::launch::async
                                                                    : std::launch::deferred,
                            [&rightFile, &right, &rightFault, options] {
                                return ReadDesign(rightFile, options, right, rightFault);
                            });
    Progress progress("reading", SizeOf(leftFile));
    options.progress = ShowBytes;
    options.progressContext = &progress;
    std::string leftFault;
    const bool isLeft = ReadDesign(leftFile, options, left, leftFault);
    const bool isRight = other.get();
    if (!isLeft)
        RefuseFile(leftFile, request, output, leftFault);
    if (!isRight)
        RefuseFile(rightFile, request, output, rightFault);
    return isLeft && isRight;
}

} // namespace booleq
