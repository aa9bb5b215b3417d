"""Equations as SymPy expressions, and back. SymPy is needed only when this is called."""
from __future__ import annotations

from typing import TYPE_CHECKING, Any, Dict, List

if TYPE_CHECKING:
    import sympy

    from ._equation import Equation


def from_equation(equation: Equation) -> sympy.Basic:
    """Makes nodes from the last to the first: operands follow their operator in the list."""
    import sympy
    from sympy.logic import boolalg
    nodes = equation.tree()
    made: List[Any] = [None] * len(nodes)
    binary: Dict[str, Any] = {
        "AND": boolalg.And, "OR": boolalg.Or, "XOR": boolalg.Xor, "NAND": boolalg.Nand,
        "NOR": boolalg.Nor, "NXOR": boolalg.Xnor}
    for node in reversed(nodes):
        if node.type == "ID":
            made[node.id] = sympy.Symbol(node.token)
        elif node.type in ("1", "0"):
            made[node.id] = sympy.true if node.type == "1" else sympy.false
        else:
            left = made[node.left] if node.left is not None else sympy.false
            if node.type in binary:
                assert node.right is not None
                made[node.id] = binary[node.type](left, made[node.right])
            else:  # an inversion; a group or an init value stands for its content
                made[node.id] = boolalg.Not(left) if node.type == "NOT" else left
    result: sympy.Basic = made[0]
    return result


def _name(symbol: Any) -> str:
    name = str(symbol.name)
    if name.isidentifier() and name.isascii() or name.startswith("'"):
        return name
    if "'" in name:
        raise ValueError(f"the symbol {name} has no spelling as an input")
    return f"'{name}'"


def _join(operator: str, operands: List[str], empty: str) -> str:
    if not operands:
        return empty
    return operands[0] if len(operands) == 1 else "(" + f" {operator} ".join(operands) + ")"


def to_text(expression: sympy.Basic) -> str:
    """A text for Equation. TypeError for anything but a Boolean expression."""
    import sympy
    from sympy.logic import boolalg
    texts: Dict[Any, str] = {}
    for part in sympy.postorder_traversal(expression):
        if part in texts:
            continue
        operands = [texts[operand] for operand in part.args]
        if isinstance(part, sympy.Symbol):
            texts[part] = _name(part)
        elif isinstance(part, (boolalg.BooleanTrue, boolalg.BooleanFalse)):
            texts[part] = "1" if part else "0"
        elif isinstance(part, boolalg.Not):
            texts[part] = "~" + operands[0]
        elif isinstance(part, (boolalg.And, boolalg.Or, boolalg.Xor)):
            operator = {boolalg.And: "&", boolalg.Or: "|", boolalg.Xor: "^"}[type(part)]
            texts[part] = _join(operator, operands, "1" if operator == "&" else "0")
        elif isinstance(part, boolalg.Implies):
            texts[part] = f"(~{operands[0]} | {operands[1]})"
        elif isinstance(part, boolalg.Equivalent):
            pairs = [f"(~({left} ^ {right}))" for left, right in zip(operands, operands[1:])]
            texts[part] = _join("&", pairs, "1")
        elif isinstance(part, boolalg.ITE):
            condition, then, otherwise = operands
            texts[part] = f"(({condition} & {then}) | (~{condition} & {otherwise}))"
        else:
            raise TypeError(f"{type(part).__name__} is not a Boolean operator: {part}")
    text = texts[expression]
    return text[1:-1] if text.startswith("(") else text  # the matching ')' is the last character
