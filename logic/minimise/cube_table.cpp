// Tables from expressions and init values; expressions from sums.
#include "cube_table.h"

#include <algorithm>
#include <unordered_map>

#include "cover.h"
#include "cube_columns.h"
#include "listed_inputs.h"
#include "text.h"
#include "unate.h"

namespace booleq {

namespace {

typedef std::unordered_map<std::string, size_t> Places; // of the inputs

void AppendCover(const CubeSpace& space, const Function& function, const Places& places,
                 size_t output, CubeList& target)
{
    const size_t numInputs = function.NumInputs();
    for (const Cube& product : FindCover(function.GetRows())) {
        target.Resize(target.Size() + 1);
        uint64_t* cube = target.At(target.Size() - 1);
        for (size_t word = 0; word < space.NumWords(); ++word)
            cube[word] = space.Inputs(word);
        for (size_t input = 0; input < numInputs; ++input)
            if ((product.used >> input & 1) != 0)
                ClearBit(cube, 2 * places.at(function.Inputs()[input]) +
                                   ((product.values >> input & 1) != 0 ? 0u : 1u));
        SetBit(cube, space.OutputBit(output));
    }
}

// An exclusive OR of n inputs has 2^(n-1) cubes. These limit the cubes of one operand, those of all
// operands that wait to be combined, and the work that they may take.
constexpr size_t kMaxCubes = size_t(1) << 17;
constexpr size_t kMaxWaitingCubes = 8 * kMaxCubes;
constexpr uint64_t kMaxUnits = uint64_t(1) << 32;

// The cubes of an expression's operands, from the leaves up. Throws OutOfWork if there are too
// many.
class CubesOfExpression {
  public:
    CubesOfExpression(const CubeSpace& space, const Expression& expression, const Places& places,
                      Work& work)
        : m_space(space), m_expression(expression), m_places(places), m_work(work),
          m_full(space.NumInputWords(), ~uint64_t(0)), m_input_space(space.NumInputs(), 0)
    {
    }

    CubeList Find()
    {
        for (const Expression::Node& node : m_expression.nodes)
            Take(node);
        assert(m_stack.size() == 1);
        return m_stack.back();
    }

  private:
    void Take(const Expression::Node& node)
    {
        if (IsBinary(node.op)) {
            const CubeList right = Pop();
            const CubeList left = Pop();
            Push(Combined(node.op, left, right));
            return;
        }
        CubeList cubes(m_full.size());
        switch (node.op) {
        case Operator::Zero:
            break;
        case Operator::One:
            cubes.Append(m_full.data());
            break;
        case Operator::Input:
            cubes.Append(m_full.data());
            ClearBit(cubes.At(0), 2 * m_places.at(m_expression.names[node.left]));
            break;
        case Operator::Not:
            cubes = Inverted(Pop());
            break;
        case Operator::And:
        case Operator::Or:
        case Operator::Xor:
        case Operator::Nand:
        case Operator::Nor:
        case Operator::Nxor:
            assert(false);
            break;
        }
        Push(cubes);
    }

    void Push(const CubeList& cubes)
    {
        m_num_waiting += cubes.Size();
        if (cubes.Size() > kMaxCubes || m_num_waiting > kMaxWaitingCubes)
            throw OutOfWork{false};
        m_stack.push_back(cubes);
    }

    CubeList Pop()
    {
        assert(!m_stack.empty());
        CubeList cubes = std::move(m_stack.back());
        m_stack.pop_back();
        m_num_waiting -= cubes.Size();
        return cubes;
    }

    CubeList Inverted(CubeList cubes)
    {
        CubeList inverted(m_full.size());
        if (!ComplementInputs(m_space, cubes, kMaxCubes, m_work, inverted))
            throw OutOfWork{false};
        return inverted;
    }

    CubeList Product(const CubeList& left, const CubeList& right)
    {
        CubeList product(m_full.size());
        std::vector<uint64_t> cube(m_full.size());
        for (size_t index = 0; index < left.Size(); ++index) {
            m_work.Spend(right.Size());
            for (size_t other = 0; other < right.Size(); ++other) {
                if (!HasCommonInputs(m_space, left.At(index), right.At(other)))
                    continue;
                for (size_t word = 0; word < cube.size(); ++word)
                    cube[word] = left.At(index)[word] & right.At(other)[word];
                product.Append(cube.data());
            }
            if (product.Size() > kMaxWaitingCubes)
                throw OutOfWork{false};
        }
        RemoveContained(m_input_space, product, m_work);
        return product;
    }

    CubeList Union(CubeList left, const CubeList& right)
    {
        left.Append(right);
        RemoveContained(m_input_space, left, m_work);
        return left;
    }

    CubeList Combined(Operator op, const CubeList& left, const CubeList& right)
    {
        const bool isInverted = op == Operator::Nand || op == Operator::Nor || op == Operator::Nxor;
        CubeList result(m_full.size());
        if (op == Operator::And || op == Operator::Nand)
            result = Product(left, right);
        else if (op == Operator::Or || op == Operator::Nor)
            result = Union(left, right);
        else
            result = Union(Product(left, Inverted(right)), Product(Inverted(left), right));
        return isInverted ? Inverted(result) : result;
    }

    const CubeSpace& m_space;
    const Expression& m_expression;
    const Places& m_places;
    Work& m_work;
    std::vector<uint64_t> m_full;
    const CubeSpace m_input_space; // of cubes without outputs
    std::vector<CubeList> m_stack;
    size_t m_num_waiting = 0; // cubes on the stack
};

void AppendExpression(const CubeSpace& space, const Expression& expression, const Places& places,
                      size_t output, CubeList& target, Work& work)
{
    if (expression.names.size() <= kMaxCoverInputs) {
        AppendCover(space, ToFunction(expression), places, output, target);
        return;
    }
    const CubeList cubes = CubesOfExpression(space, expression, places, work).Find();
    for (size_t index = 0; index < cubes.Size(); ++index) {
        target.Resize(target.Size() + 1);
        uint64_t* cube = target.At(target.Size() - 1);
        for (size_t word = 0; word < space.NumInputWords(); ++word)
            cube[word] = cubes.At(index)[word] & space.Inputs(word);
        SetBit(cube, space.OutputBit(output));
    }
}

Pla EmptyTable(const std::vector<std::string>& inputs, std::vector<std::string> outputs)
{
    Pla table;
    table.space = CubeSpace(inputs.size(), outputs.size());
    table.inputs = inputs;
    table.outputs = std::move(outputs);
    table.hasInputNames = table.hasOutputNames = true;
    table.on = table.free = table.off = CubeList(table.space.NumWords());
    return table;
}

} // namespace

bool TableOf(const std::vector<TableOutput>& outputs, const std::vector<std::string>& inputs,
             Pla& table, PlaFault& fault, Work& work)
{
    std::vector<std::string> names;
    names.reserve(outputs.size());
    for (const TableOutput& output : outputs)
        names.push_back(output.name);
    table = EmptyTable(inputs, names);
    Places places;
    for (const std::string& input : inputs)
        places.emplace(input, places.size());
    const uint64_t limit = work.Limit();
    for (size_t output = 0; output < outputs.size(); ++output) {
        work.SetLimit(std::min(limit, work.Spent() + kMaxUnits));
        try {
            AppendExpression(table.space, outputs[output].on, places, output, table.on, work);
            if (outputs[output].hasFree)
                AppendExpression(table.space, outputs[output].free, places, output, table.free,
                                 work);
        } catch (const OutOfWork&) {
            fault = {0,
                     "the equation of " + outputs[output].name + " needs more than " +
                         std::to_string(kMaxCubes) + " products when it is multiplied out",
                     "minimise its operands on their own; exclusive or doubles the products with "
                     "each input"};
            work.SetLimit(limit);
            return false;
        }
    }
    work.SetLimit(limit);
    table.onLines.assign(table.on.Size(), 0);
    return true;
}

std::vector<std::string> InputsOf(const std::vector<TableOutput>& outputs)
{
    std::vector<std::string> inputs;
    Places places;
    const auto add = [&](const Expression& expression) {
        for (const std::string& name : expression.names)
            if (places.emplace(name, inputs.size()).second)
                inputs.push_back(name);
    };
    for (const TableOutput& output : outputs) {
        add(output.on);
        if (output.hasFree)
            add(output.free);
    }
    return inputs;
}

bool IsInitWithFree(const std::string& text)
{
    return text.size() > 2 && text[0] == '0' && (text[1] == 'b' || text[1] == 'B') &&
           text.find_first_not_of("01xX", 2) == std::string::npos &&
           text.find_first_of("xX", 2) != std::string::npos;
}

bool TableFromInit(const std::string& text, const std::vector<std::string>& inputs, bool lsbFirst,
                   const std::string& output, Pla& table, std::string& reason)
{
    assert(IsInitWithFree(text));
    if (inputs.size() > kMaxCoverInputs) {
        reason = "an init value with x has at most " + std::to_string(kMaxCoverInputs) +
                 " inputs, not " + std::to_string(inputs.size());
        return false;
    }
    const size_t numRows = size_t(1) << inputs.size();
    if (text.size() - 2 != numRows) {
        reason = Count(text.size() - 2, "digit") + " for " + Count(inputs.size(), "input") +
                 ": an init value with x has one for each of the " + std::to_string(numRows) +
                 " rows";
        return false;
    }
    std::string onText = text;
    std::string freeText = text;
    for (size_t place = 2; place < text.size(); ++place) {
        const bool isFree = text[place] == 'x' || text[place] == 'X';
        onText[place] = isFree ? '0' : text[place];
        freeText[place] = isFree ? '1' : '0';
    }
    Function on;
    Function free;
    Reading reading;
    reading.hasInputs = true;
    reading.inputs = inputs;
    reading.lsbFirst = lsbFirst;
    const auto read = [&reading](const std::string& digits, Function& function) {
        Kq_BoolEquation equation;
        return SetFromText(equation, digits, reading) && FunctionOf(equation, function);
    };
    if (!read(onText, on) || !read(freeText, free)) {
        reason = "not an init value";
        return false;
    }
    table = EmptyTable(inputs, {output});
    Places places;
    for (const std::string& input : inputs)
        places.emplace(input, places.size());
    AppendCover(table.space, on, places, 0, table.on);
    AppendCover(table.space, free, places, 0, table.free);
    table.onLines.assign(table.on.Size(), 0);
    return true;
}

Expression ExpressionOf(const Pla& table, const CubeList& sum, size_t output, bool isInverted)
{
    const CubeSpace& space = table.space;
    const Operator inner = isInverted ? Operator::Or : Operator::And;
    const Operator outer = isInverted ? Operator::And : Operator::Or;
    Expression expression;
    expression.names = table.inputs;
    bool isFirstTerm = true;
    uint32_t whole = 0;
    for (size_t index = 0; index < sum.Size(); ++index) {
        const uint64_t* cube = sum.At(index);
        if (!GetBit(cube, space.OutputBit(output)))
            continue;
        bool isFirst = true;
        uint32_t term = 0;
        for (size_t input = 0; input < space.NumInputs(); ++input) {
            const bool hasZero = GetBit(cube, 2 * input);
            const bool hasOne = GetBit(cube, 2 * input + 1);
            if (hasZero && hasOne)
                continue;
            uint32_t literal = AddInput(expression, static_cast<uint32_t>(input));
            if (hasZero != isInverted)
                literal = AddNot(expression, literal);
            term = isFirst ? literal : AddBinary(expression, inner, term, literal);
            isFirst = false;
        }
        if (isFirst)
            term = AddConstant(expression, !isInverted);
        whole = isFirstTerm ? term : AddBinary(expression, outer, whole, term);
        isFirstTerm = false;
    }
    if (isFirstTerm)
        AddConstant(expression, isInverted);
    return expression;
}

} // namespace booleq
