# Random equations whose meaning is known from how they were made, not from reading them: a tree is
# drawn first, and its text is written from it.
import random

BINARY = {
    "and": (["&", "*", ".AND."], lambda a, b: a & b),
    "or": (["|", "+", ".OR."], lambda a, b: a | b),
    "xor": (["^", "@", ".XOR."], lambda a, b: a ^ b),
    "nand": (["~&", "~*", "!&", "!*", ".NAND."], lambda a, b: 1 - (a & b)),
    "nor": (["~|", "~+", "!|", "!+", ".NOR."], lambda a, b: 1 - (a | b)),
    "nxor": (["~^", "~@", "!^", "!@", ".NXOR."], lambda a, b: 1 - (a ^ b)),
}
PLAIN_NAMES = ["A", "a", "b", "C", "d_1", "_x", "__y", "_Bool", "and", "module", "signal", "lambda",
               "f", "y", "n1", "int", "E2"]
QUOTED_NAMES = ["'A[0]'", "'A'", "'a b'", "'1'", "''", "'x$y'", "'a\\b'", "'q\"#;'", "'a/*b*/'",
                "'A[0'", "'not'", "'$'"]


# Trees are tuples: ("name", text), ("const", 0 or 1), ("not", tree), (operator, left, right) and
# ("behind", operand, operators): "X ~ op Y op2 Z", the inversion of "(X op Y) op2 Z".
def draw(rng, names, depth, operators=tuple(BINARY)):
    kind = rng.random()
    if depth == 0 or kind < 0.12:
        if rng.random() < 0.06:
            return ("const", rng.randrange(2))
        return ("name", rng.choice(names))
    if kind < 0.27:
        return ("not", draw(rng, names, depth - 1, operators))
    # With a limited choice of operators, the text must be readable in other languages too.
    if kind < 0.37 and len(operators) == len(BINARY):
        rest = [(rng.choice(operators), draw(rng, names, depth - 1))
                for _ in range(rng.randrange(1, 3))]
        return ("behind", ("name", rng.choice(names)), rest)
    return (rng.choice(operators), draw(rng, names, depth - 1, operators),
            draw(rng, names, depth - 1, operators))


def value(tree, values):
    if tree[0] == "name":
        return values[tree[1]]
    if tree[0] == "const":
        return tree[1]
    if tree[0] == "not":
        return 1 - value(tree[1], values)
    if tree[0] == "behind":
        result = value(tree[1], values)
        for operator, operand in tree[2]:
            result = BINARY[operator][1](result, value(operand, values))
        return 1 - result
    return BINARY[tree[0]][1](value(tree[1], values), value(tree[2], values))


def names_of(tree):
    """The names in the order of the text."""
    if tree[0] == "name":
        return [tree[1]]
    if tree[0] == "const":
        return []
    if tree[0] == "behind":
        parts = [tree[1]] + [operand for _, operand in tree[2]]
    else:
        parts = tree[1:]
    found = []
    for part in parts:
        found += [name for name in names_of(part) if name not in found]
    return found


def column(tree):
    """The values of all rows, row 0 first; the first input is the most significant."""
    names = names_of(tree)
    rows = []
    for row in range(2 ** len(names)):
        bits = [(row >> (len(names) - 1 - place)) & 1 for place in range(len(names))]
        rows.append(value(tree, dict(zip(names, bits))))
    return rows


class Style:
    """How texts are written: 'spellings' chooses among an operator's spellings, None for any."""

    def __init__(self, rng, spelling=None, inversion=None, blanks=True):
        self.rng, self.spelling, self.inversion = rng, spelling, inversion
        self.blanks = blanks

    def operator(self, name):
        spellings = BINARY[name][0]
        return self.rng.choice(spellings) if self.spelling is None else spellings[self.spelling]

    def invert(self):
        return self.inversion or self.rng.choice(["~", "!", ".NOT."])


def text(tree, style):
    if tree[0] == "name":
        return tree[1]
    if tree[0] == "const":
        return str(tree[1])
    if tree[0] == "not":
        return style.invert() + " " * style.rng.randrange(2) + operand(tree[1], style)
    if tree[0] == "behind":
        found = text(tree[1], style)
        for place, (name, part) in enumerate(tree[2]):
            spelled = style.operator(name)
            if place == 0:
                # The inversion needs blanks, or it would be part of the operator.
                found += f" {style.invert()} {spelled}"
            else:
                found += f" {spelled}"
            found += " " + operand(part, style)
        return found
    blank = " " if style.blanks or style.rng.random() < 0.5 else ""
    left = tree[1]
    # Operators group from the left, so a binary operation on the left needs no parentheses.
    bare_left = left[0] in BINARY and style.rng.random() < 0.7
    found = text(left, style) if bare_left else operand(left, style)
    return f"{found}{blank}{style.operator(tree[0])}{blank}{operand(tree[2], style)}"


def operand(tree, style):
    if tree[0] in ("name", "const", "not"):
        return text(tree, style)
    return "(" + text(tree, style) + ")"


def equations(seed, count, names=tuple(PLAIN_NAMES + QUOTED_NAMES), operators=tuple(BINARY),
              **style):
    """(text, names, column) of 'count' random equations over at most five names each."""
    rng = random.Random(seed)
    made = []
    while len(made) < count:
        own = rng.sample(names, rng.randrange(1, 1 + min(5, len(names))))
        tree = draw(rng, own, rng.randrange(1, 5), operators)
        made.append((text(tree, Style(rng, **style)), names_of(tree), column(tree)))
    return made
