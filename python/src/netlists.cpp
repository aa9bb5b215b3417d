// Netlists, for booleq/_netlists.py. Every answer comes from the second library's class and is
// turned into Python objects a column at a time. The lock is released while that class works.
#include <string>
#include <unordered_map>
#include <vector>

#include <kq_logic/netlist_compare.h>

#include "bind.h"
#include "lock.h"
#include "number_array.h"
#include "unicode.h"

namespace booleq_python {

namespace {

using kq_logic::Netlist;

constexpr size_t kPart = 4096; // objects made between two checks of signals

// A list with an element for each of 'count' places.
template <class Make>
py::list ListOf(size_t count, const Make& make)
{
    py::list list(count);
    for (size_t place = 0; place < count; ++place) {
        py::object made = make(place);
        PyList_SET_ITEM(list.ptr(), static_cast<py::ssize_t>(place), made.release().ptr());
        if (place % kPart == kPart - 1)
            CheckSignals();
    }
    return list;
}

template <class Element, class Make>
py::list ListOf(const std::vector<Element>& elements, const Make& make)
{
    return ListOf(elements.size(), [&](size_t place) { return make(elements[place]); });
}

py::object DecodeOrNone(const std::string& bytes)
{
    return bytes.empty() ? py::object(py::none()) : py::object(Decode(bytes));
}

// The bytes of a file's name, or of a text.
std::string BytesOf(const py::bytes& bytes)
{
    return std::string(bytes);
}

// None, or why the netlist is not read.
template <class Read>
py::object ReadWith(const Read& read, const py::str& key, const py::bytes& cells,
                    const py::str& top)
{
    kq_logic::NetlistOptions options;
    options.key = Encode(key);
    options.cellsFile = BytesOf(cells);
    options.top = Encode(top);
    std::string fault;
    const bool isRead = Freely([&] { return read(fault, options); });
    return isRead ? py::object(py::none()) : py::object(Decode(fault));
}

py::object ReadFile(Netlist& netlist, const py::bytes& file, const py::str& key,
                    const py::bytes& cells, const py::str& top)
{
    const std::string name = BytesOf(file);
    return ReadWith(
        [&](std::string& fault, const kq_logic::NetlistOptions& options) {
            return netlist.Read(name, fault, options);
        },
        key, cells, top);
}

py::object ReadText(Netlist& netlist, const py::bytes& text, const py::str& key,
                    const py::bytes& cells, const py::str& top)
{
    const std::string bytes = BytesOf(text);
    return ReadWith(
        [&](std::string& fault, const kq_logic::NetlistOptions& options) {
            return netlist.ReadText(bytes, fault, options);
        },
        key, cells, top);
}

py::tuple At(const Netlist& netlist, size_t table)
{
    if (table >= netlist.NumTables())
        throw py::index_error("there is no such table");
    const kq_logic::NetlistTable own = netlist.At(table);
    return py::make_tuple(Decode(own.path), Decode(own.type), Decode(own.output),
                          DecodeAll(own.inputs), Decode(own.init), DecodeOrNone(own.key),
                          own.line == 0 ? py::object(py::none()) : py::int_(own.line));
}

py::list Paths(const Netlist& netlist)
{
    return ListOf(netlist.NumTables(),
                  [&](size_t table) { return py::object(Decode(netlist.PathAt(table))); });
}

py::list Nets(const Netlist& netlist)
{
    return ListOf(netlist.NumNets(),
                  [&](size_t net) { return py::object(Decode(netlist.NetAt(net))); });
}

// The places, words, inputs, outputs, types and lines of the tables of one width.
py::tuple Arrays(const Netlist& netlist, unsigned int width)
{
    const kq_logic::NetlistArrays arrays = Freely([&] { return netlist.Arrays(width); });
    return py::make_tuple(ArrayOf(arrays.tables), ArrayOf(arrays.words), ArrayOf(arrays.inputs),
                          ArrayOf(arrays.outputs), ArrayOf(arrays.types), ArrayOf(arrays.lines));
}

// Init values as texts; equal ones share an object.
py::list HexTexts(const kq_logic::NetlistArrays& arrays, unsigned int width)
{
    std::vector<std::string> inputs;
    for (unsigned int input = 0; input < width; ++input)
        inputs.push_back("i" + std::to_string(input));
    const size_t numWords = arrays.tables.empty() ? 1 : arrays.words.size() / arrays.tables.size();
    std::unordered_map<std::string, py::object> known;
    return ListOf(arrays.tables.size(), [&](size_t place) {
        const uint64_t* const words = arrays.words.data() + place * numWords;
        const std::string bytes(reinterpret_cast<const char*>(words), numWords * sizeof *words);
        py::object& text = known[bytes];
        if (!text) {
            kq_logic::Function function;
            if (!function.Set(inputs, std::vector<uint64_t>(words, words + numWords)))
                throw std::logic_error("rows of another width");
            text = Decode(function.Hex());
        }
        return text;
    });
}

// The columns of a frame for the tables of one width: places, init values, and tuples of elements
// of 'nets'.
py::tuple Columns(const Netlist& netlist, unsigned int width, const py::tuple& nets)
{
    const kq_logic::NetlistArrays arrays = Freely([&] { return netlist.Arrays(width); });
    if (nets.size() != netlist.NumNets())
        throw py::value_error("nets of another netlist");
    py::list inputs = ListOf(arrays.tables.size(), [&](size_t place) {
        py::tuple names(width);
        for (unsigned int input = 0; input < width; ++input)
            names[input] = nets[arrays.inputs[place * width + input]];
        return py::object(std::move(names));
    });
    return py::make_tuple(ArrayOf(arrays.tables), HexTexts(arrays, width), inputs);
}

// The values of the key attribute; None for a cell without one.
py::list Keys(const Netlist& netlist)
{
    return ListOf(netlist.NumTables(),
                  [&](size_t table) { return DecodeOrNone(netlist.KeyAt(table)); });
}

// --- answers

py::tuple Counted(const std::vector<uint64_t>& counts)
{
    py::list pairs;
    for (size_t width = 0; width < counts.size(); ++width)
        if (counts[width] > 0)
            pairs.append(py::make_tuple(width, counts[width]));
    return py::tuple(pairs);
}

// A dict by the names of the fields of the report.
py::dict Stats(const Netlist& netlist)
{
    const kq_logic::NetlistStats stats = Freely([&] { return netlist.Stats(); });
    py::dict answer;
    answer["format"] = Decode(netlist.Format());
    answer["top"] = DecodeOrNone(netlist.Top());
    answer["cells"] = stats.numCells;
    answer["tables"] = stats.numTables;
    answer["by_pins"] = Counted(stats.byPins);
    answer["by_inputs"] = Counted(stats.byInputs);
    answer["functions"] = stats.numFunctions;
    answer["classes"] = stats.numClasses;
    answer["wide_functions"] = stats.numWide;
    answer["constants"] = stats.numConstant;
    answer["wires"] = stats.numWires;
    answer["inverters"] = stats.numInverters;
    answer["idle_inputs"] = stats.numIdle;
    answer["not_read"] = stats.numUnread;
    answer["findings"] = py::tuple(ListOf(stats.findings, [](const auto& finding) {
        return py::object(py::make_tuple(Decode(finding.first), finding.second));
    }));
    answer["types"] = ListOf(stats.types, [](const auto& type) {
        return py::object(py::make_tuple(Decode(type.type), Decode(type.role), type.numCells,
                                         DecodeOrNone(type.note)));
    });
    answer["commonest"] = ListOf(stats.commonest, [](const auto& count) {
        return py::object(py::make_tuple(
            count.numTables, DecodeAll(count.function.Inputs()), Decode(count.function.Hex()),
            DecodeOrNone(count.kind), DecodeOrNone(count.meaning), DecodeOrNone(count.expression)));
    });
    return answer;
}

py::list Check(const Netlist& netlist)
{
    std::vector<kq_logic::NetlistFinding> findings;
    Freely([&] {
        netlist.Check([&](const kq_logic::NetlistFinding& finding) {
            findings.push_back(finding);
            return true;
        });
    });
    return ListOf(findings, [](const kq_logic::NetlistFinding& finding) {
        return py::object(
            py::make_tuple(Decode(finding.code), Decode(finding.severity), Decode(finding.path),
                           finding.line == 0 ? py::object(py::none()) : py::int_(finding.line),
                           Decode(finding.text)));
    });
}

py::list LoneTables(const std::vector<kq_logic::LoneTable>& tables)
{
    return ListOf(tables, [](const kq_logic::LoneTable& table) {
        return py::object(
            py::make_tuple(Decode(table.path), Decode(table.output), DecodeOrNone(table.wire)));
    });
}

py::object DifferenceOf(const kq_logic::TableDifference& difference)
{
    py::dict assignment;
    for (const auto& net : difference.assignment)
        assignment[Decode(net.first)] = net.second ? 1 : 0;
    py::list causes;
    for (const auto& cause : difference.causes)
        causes.append(py::make_tuple(Decode(cause.first), Decode(cause.second)));
    const bool hasRow = !difference.isSameFunction;
    return py::make_tuple(
        Decode(difference.path), Decode(difference.rightPath), Decode(difference.matchedBy),
        Decode(difference.output), hasRow ? py::object(assignment) : py::object(py::none()),
        hasRow ? py::object(py::make_tuple(difference.left ? 1 : 0, difference.right ? 1 : 0))
               : py::object(py::none()),
        DecodeOrNone(difference.leftEquation), DecodeOrNone(difference.rightEquation),
        DecodeOrNone(difference.shouldBe), py::tuple(causes));
}

kq_logic::NetlistNames NamesOf(const std::string& word)
{
    if (word == "auto")
        return kq_logic::NetlistNames::Auto;
    return word == "kept" ? kq_logic::NetlistNames::Kept : kq_logic::NetlistNames::Gone;
}

// A dict by the names of the fields of the report.
py::dict Compare(const Netlist& left, const Netlist& right, const py::list& renames,
                 const std::string& names, bool allowsWires, int openInputs,
                 const py::object& maxDescribed)
{
    kq_logic::CompareOptions options;
    for (const py::handle pair : renames)
        options.renames.emplace_back(Encode(pair.cast<py::tuple>()[0]),
                                     Encode(pair.cast<py::tuple>()[1]));
    options.names = NamesOf(names);
    options.allowsWires = allowsWires;
    options.openInputs = openInputs;
    if (!maxDescribed.is_none())
        options.maxDescribed = maxDescribed.cast<size_t>();
    const kq_logic::NetlistComparison compared =
        Freely([&] { return kq_logic::Compare(left, right, options); });
    py::dict answer;
    answer["is_same"] = compared.isSame;
    answer["same"] = compared.numSame;
    answer["same_but_for_names"] = compared.numRenamed;
    answer["num_different"] = compared.numDifferent;
    answer["different"] = ListOf(compared.differences, DifferenceOf);
    answer["missing"] = LoneTables(compared.missing);
    answer["added"] = LoneTables(compared.added);
    answer["renamed"] = ListOf(compared.renamed, [](const kq_logic::RenamedNet& net) {
        return py::object(py::make_tuple(Decode(net.left), Decode(net.right), net.numTables));
    });
    answer["names"] = compared.areNamesGone ? "gone" : "kept";
    answer["matched_nets"] = compared.numMatchedNets;
    answer["compared_by_order"] = compared.numByOrder;
    answer["keys_twice"] = compared.numKeysTwice;
    answer["unused_renames"] = py::tuple(ListOf(compared.unusedRenames, [](const auto& rename) {
        return py::object(py::make_tuple(Decode(rename.first), Decode(rename.second)));
    }));
    return answer;
}

} // namespace

void BindNetlists(py::module_& module)
{
    py::class_<Netlist>(module, "NetlistCore", "What booleq.Netlist is made of.")
        .def(py::init<>())
        .def("read", &ReadFile)
        .def("read_text", &ReadText)
        .def("__len__", &Netlist::NumTables)
        .def("format", &Netlist::Format)
        .def("top", [](const Netlist& netlist) { return DecodeOrNone(netlist.Top()); })
        .def("at", &At)
        .def("widths",
             [](const Netlist& netlist) {
                 return py::tuple(ListOf(netlist.Widths(), [](unsigned int width) {
                     return py::object(py::int_(width));
                 }));
             })
        .def("types", [](const Netlist& netlist) { return DecodeAll(netlist.Types()); })
        .def("paths", &Paths)
        .def("nets", &Nets)
        .def("arrays", &Arrays)
        .def("columns", &Columns)
        .def("keys", &Keys)
        .def("stats", &Stats)
        .def("check", &Check)
        .def("compare", &Compare);
}

} // namespace booleq_python
