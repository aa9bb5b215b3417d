#include "read_design.h"

#include <cassert>

#include "hierarchy.h"
#include "read_fault.h"
#include "readers.h"
#include "watch.h"
#include "yosys_process.h"

namespace booleq {

namespace {

enum class Format { YosysJson, Blif, Edif, Verilog };

struct FormatRow {
    const char* name;
    void (*read)(const ReadJob&);
};

constexpr char kUnknown[] =
    "it is not a netlist of a known format: Yosys JSON begins with '{', BLIF with "
    "'.model', EDIF with '(edif', Verilog with a module";

bool BeginsWith(std::string_view text, std::string_view start)
{
    return text.substr(0, start.size()) == start;
}

// The format of a text, decided by its first word after any BLIF comments.
Format Recognise(std::string_view text)
{
    const std::string_view head = text.substr(0, 4096);
    if (head.find('\0') != std::string_view::npos)
        throw ReadFault{"it has bytes that are not text"};
    for (;;) {
        const size_t first = text.find_first_not_of(" \t\r\n");
        if (first == std::string_view::npos)
            throw ReadFault{"it is empty"};
        text.remove_prefix(first);
        if (text[0] != '#')
            break;
        text.remove_prefix(std::min(text.find('\n'), text.size() - 1) + 1);
    }
    if (text[0] == '{')
        return Format::YosysJson;
    if (text[0] == '.')
        return Format::Blif;
    if (text[0] == '(' && !BeginsWith(text, "(*"))
        return Format::Edif;
    for (const char* start : {"module", "/*", "//", "`", "(*"})
        if (BeginsWith(text, start))
            return Format::Verilog;
    throw ReadFault{kUnknown};
}

void ReadSource(SourceText& source, const ReadOptions& options, Design& design)
{
    static constexpr FormatRow kFormats[] = {{"Yosys JSON", ReadYosysJson},
                                             {"BLIF", ReadBlifNetlist},
                                             {"EDIF", ReadEdif},
                                             {"Verilog", ReadYosysJson}};
    const Format format = Recognise(source.Text());
    const FormatRow& row = kFormats[static_cast<size_t>(format)];
    design.format = row.name;
    design.numBytes = source.Text().size();
    design.names.Reserve(design.numBytes);
    SourceText json;
    if (format == Format::Verilog)
        ConvertVerilog(source, options.yosysSeconds, json);
    std::vector<ModuleContent> modules;
    const CellTypes& cellTypes =
        options.cellTypes != nullptr ? *options.cellTypes : CellTypes::Known();
    row.read({format == Format::Verilog ? json : source, options, cellTypes, design, modules});
    LayoutOptions layout;
    layout.top = options.top;
    layout.isFirstTop = format == Format::Blif;
    layout.hasKeys = !options.keyAttribute.empty();
    layout.maxItems = options.maxItems;
    LayOut(modules, layout, design);
}

template <class Fill>
bool ReadInto(Fill fill, const std::string& name, const ReadOptions& options, Design& design,
              std::string& fault)
{
    design = Design();
    Design made;
    try {
        SourceText source;
        fill(source);
        ReadSource(source, options, made);
    } catch (const ReadFault& found) {
        fault = (name == "-" ? "standard input" : name) + ": " + found.text;
        assert(design.tables.empty());
        return false;
    }
    made.file = name;
    design = std::move(made);
    return true;
}

} // namespace

void Pace::Report(uint64_t numBytesDone) const
{
    Watch();
    if (m_job.options.progress != nullptr)
        m_job.options.progress(m_job.options.progressContext, numBytesDone,
                               m_job.source.Text().size());
}

bool ReadDesign(const std::string& file, const ReadOptions& options, Design& design,
                std::string& fault)
{
    return ReadInto([&](SourceText& source) { source.ReadFile(file); }, file, options, design,
                    fault);
}

bool ReadDesignText(std::string_view text, const std::string& name, const ReadOptions& options,
                    Design& design, std::string& fault)
{
    return ReadInto([&](SourceText& source) { source.Copy(text); }, name, options, design, fault);
}

} // namespace booleq
