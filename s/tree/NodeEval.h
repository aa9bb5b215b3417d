// Node-by-node evaluation that the library itself decides on: never traced, debug mode or not.
#ifndef KQ_NODEEVAL_H
#define KQ_NODEEVAL_H

#include <Kq_BoolEquationImpNode.h>

// As root.Eval, without a trace.
unsigned int
KqEvalSilently(const Kq_BoolEquationImp::Node& root,
               const std::vector<std::pair<Port::StringBase<char>, unsigned int>>& variables);

#endif
