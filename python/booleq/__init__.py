"""Boolean equations and look-up-table init values.

>>> from booleq import Equation
>>> eq = Equation("A & ~B")
>>> eq(A=1, B=0), eq.hex_init()
(1, '0x4')
"""
import sys as _sys

if _sys.version_info < (3, 11):
    raise ImportError("booleq needs Python 3.11 or newer; this is Python " +
                      ".".join(str(number) for number in _sys.version_info[:3]))

from ._batch import batch
from ._booleq import __version__
from ._equation import Equation, Operand, Syntax, Target, equations, minimize_pla
from ._luts import Canonical, Described, Distinct, LutArray
from ._netlists import (CellCount, FunctionCount, LoneTable, Netlist, NetlistDiff, NetlistError,
                        NetlistFinding, NetlistStats, NetlistTable, NetlistTables, RenamedNet,
                        TableDifference, read_netlist)
from ._results import (Assignment, Conversion, Difference, Equivalence, Explanation, Finding,
                       KarnaughMap, LintReport, Match, Minimum, Node, ParseError, Reading,
                       Satisfiability)

__all__ = ["Assignment", "Canonical", "CellCount", "Conversion", "Described", "Difference",
           "Distinct", "Equation", "Equivalence", "Explanation", "Finding", "FunctionCount",
           "KarnaughMap", "LintReport", "LoneTable", "LutArray", "Match", "Minimum", "Netlist",
           "NetlistDiff", "NetlistError", "NetlistFinding", "NetlistStats", "NetlistTable",
           "NetlistTables", "Node", "Operand", "ParseError", "Reading", "RenamedNet",
           "Satisfiability", "Syntax", "TableDifference", "Target", "__version__", "batch",
           "equations", "minimize_pla", "read_netlist"]

for _name in __all__:  # the place users import it from, for help() and pickles
    if isinstance(globals()[_name], type):
        globals()[_name].__module__ = __name__
for _function in (batch, equations, minimize_pla, read_netlist):
    _function.__module__ = __name__
del _name, _function
