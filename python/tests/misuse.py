"""Users' mistakes, each an error that mypy must report: a test of the types, never run.

mypy runs with warn_unused_ignores, so an error that is not reported fails as well.
"""
import booleq
from booleq import Assignment, Equation, LutArray

eq = Equation("A & B")
luts = LutArray([1, 2], 2)

Equation()  # type: ignore[call-arg]
Equation(1)  # type: ignore[arg-type]
Equation("A", inputs=3)  # type: ignore[arg-type]
eq.text = "B"  # type: ignore[misc]
eq["A"]  # type: ignore[index]
eq["A"] = 1  # type: ignore[index]
len(eq)  # type: ignore[arg-type]
list(eq)  # type: ignore[call-overload]
eq(A="1")  # type: ignore[arg-type]
eq(A=0.5)  # type: ignore[arg-type]
eq & None  # type: ignore[operator]
eq & 1.5  # type: ignore[operator]
eq < 3  # type: ignore[operator]
eq.render("verilog")  # type: ignore[arg-type]
eq.convert("html")  # type: ignore[arg-type]
eq.convert()  # type: ignore[call-arg]
eq.hex_init  # a method without a call is not a type error
int(eq.hex_init)  # type: ignore[call-overload]
eq.cofactor(A="0")  # type: ignore[arg-type]
eq.compose(A=None)  # type: ignore[arg-type]
eq.rename({"A": 1})  # type: ignore[dict-item]
eq.satisfiable().assigment  # type: ignore[attr-defined]
eq.equivalent([])  # type: ignore[arg-type]
eq.minimize(True)  # type: ignore[misc]
eq.match("A", True)  # type: ignore[misc]
eq.equivalent("A").equal = True  # type: ignore[misc]
Assignment({"A": 1})["A"] = 0  # type: ignore[index]
luts.canonical("np")  # type: ignore[arg-type]
luts.words = luts.words  # type: ignore[misc]
LutArray([1])  # type: ignore[call-arg]
booleq.equations("A", 1)  # type: ignore[arg-type]
booleq.batch()  # type: ignore[call-overload]


class Derived(Equation):  # type: ignore[misc]
    """There are none."""
