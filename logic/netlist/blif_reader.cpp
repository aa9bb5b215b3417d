// Makes a network of a BLIF text, which is read like any netlist. It accepts what a network can
// hold: one model, one output, only tables, each signal defined before it is used.
// Fails: false, and 'network' is unchanged.  Cost: linear in the text and the rows of the tables.
#include <algorithm>

#include "fold.h"
#include "network_builder.h"
#include "read_design.h"

namespace booleq {

namespace {

constexpr uint32_t kNoSignal = UINT32_MAX;

class DesignNetwork {
  public:
    explicit DesignNetwork(const Design& design)
        : m_design(design), m_signals(design.nets.size(), kNoSignal)
    {
    }

    bool Make(Network& network)
    {
        const bool isSound = std::all_of(
            m_design.findings.begin(), m_design.findings.end(), [](const ReadFinding& finding) {
                return finding.code == FindingCode::Buffer ||
                       finding.code == FindingCode::ConstantNet; // a second name, or a constant
            });
        if (!isSound || !m_design.unread.empty() || m_design.numCells != m_design.tables.size() ||
            m_design.scopes.size() != 1)
            return false;
        std::string output;
        NetId outputNet = kNetOpen;
        for (const DesignPort& port : m_design.ports) {
            const std::string name(m_design.names.Text(port.name));
            if (port.direction != PortDirection::Input) {
                if (!output.empty())
                    return false;
                output = name;
                outputNet = port.net;
            } else if (!AddInput(name, port.net)) {
                return false;
            }
        }
        for (const DesignTable& table : m_design.tables)
            if (!AddTable(table,
                          table.output == outputNet ? output : NetName(m_design, table.output)))
                return false;
        return Connect(output, outputNet) && m_builder.Take(output, network);
    }

  private:
    bool AddInput(const std::string& name, NetId net)
    {
        m_signals[net] = static_cast<uint32_t>(m_num_signals++);
        return net >= kNumFixedNets && m_builder.AddInput(name);
    }

    bool AddSignal(const std::string& name, Expression expression)
    {
        if (!m_builder.AddSignal(name))
            return false;
        ++m_num_signals;
        m_builder.DefineLast(std::move(expression));
        return true;
    }

    bool AddTable(const DesignTable& table, const std::string& name)
    {
        const FoldedRows folded = FoldTable(m_design, table);
        std::vector<uint32_t> operands;
        for (const NetId net : folded.nets) {
            if (m_signals[net] == kNoSignal)
                return false;
            operands.push_back(m_signals[net]);
        }
        SumOfRows sum;
        for (uint64_t row = 0; row < folded.rows.NumRows(); ++row) {
            std::string text;
            for (size_t input = operands.size(); input-- > 0;)
                text += (row >> input & 1u) != 0 ? '1' : '0';
            if (folded.rows.At(row) && !sum.Add(text, operands))
                return false;
        }
        const auto signal = static_cast<uint32_t>(m_num_signals);
        if (!AddSignal(name, sum.Take()))
            return false;
        m_signals[table.output] = signal;
        return true;
    }

    // An output that no table drives is a constant or another name of a signal.
    bool Connect(const std::string& name, NetId net)
    {
        Expression expression;
        if (net <= kNetOne) {
            AddConstant(expression, net == kNetOne);
            return AddSignal(name, std::move(expression));
        }
        uint32_t signal = 0;
        if (m_builder.Find(name, signal))
            return true;
        if (m_signals[net] == kNoSignal)
            return false;
        expression.nodes.push_back({Operator::Input, 0, m_signals[net], 0});
        return AddSignal(name, std::move(expression));
    }

    const Design& m_design;
    NetworkBuilder m_builder;
    std::vector<uint32_t> m_signals; // by net
    size_t m_num_signals = 0;
};

} // namespace

bool ReadBlif(const std::string& text, Network& network)
{
    Design design;
    std::string fault;
    return ReadDesignText(text, "text", ReadOptions(), design, fault) && design.format == "BLIF" &&
           DesignNetwork(design).Make(network);
}

} // namespace booleq
