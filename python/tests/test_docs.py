"""Docstrings: every member has one, their examples are true, signatures can be read."""
import doctest
import inspect
from typing import Any, List

import booleq
from booleq import Equation

HIDDEN = {"__class__", "__dict__", "__weakref__", "__doc__", "__module__", "__new__",
          "_pybind11_conduit_v1_"}


def own_members() -> List[str]:
    return [name for name in vars(Equation) if name not in HIDDEN]


def test_version() -> None:
    assert booleq.__version__.count(".") == 2


def test_everything_is_documented() -> None:
    missing = [name for name in booleq.__all__
               if name != "__version__" and not getattr(booleq, name).__doc__]
    missing += [name for name in own_members() if not inspect.getdoc(getattr(Equation, name))]
    assert missing == [] and len(own_members()) > 40


def test_signatures_can_be_read() -> None:
    def parameters(member: Any) -> List[str]:
        return list(inspect.signature(member).parameters)

    assert parameters(Equation) == ["text", "inputs", "lsb_first"]
    assert parameters(Equation.from_init) == ["value", "inputs", "lsb_first"]
    assert parameters(Equation.render) == ["self", "syntax", "spaces"]
    assert parameters(Equation("A").render) == ["syntax", "spaces"]
    for name in own_members():
        member = getattr(Equation, name)
        if callable(member) and name != "__init__":
            assert parameters(member)[0] in ("self", "value")


def test_examples() -> None:
    assert doctest.testmod(booleq) .failed == 0
    found = [test for test in doctest.DocTestFinder().find(booleq) if test.examples]
    assert len(found) >= 15  # the finder sees into the compiled class
