"""Boolean equations and look-up-table init values.

>>> from booleq import Equation
>>> eq = Equation("A & ~B")
>>> eq(A=1, B=0), eq.hex_init
(1, '0x4')
"""
from ._booleq import Equation, __version__, minimize_pla
from ._results import (Difference, Equivalence, Explanation, Finding, LintReport,
                       Minimum, Node, ParseError, Reading)

__all__ = ["Difference", "Equation", "Equivalence", "Explanation", "Finding", "LintReport",
           "Minimum", "Node", "ParseError", "Reading", "__version__", "minimize_pla"]

for _type in (Difference, Equivalence, Explanation, Finding, LintReport, Minimum, Node, ParseError,
              Reading):
    _type.__module__ = __name__
del _type
