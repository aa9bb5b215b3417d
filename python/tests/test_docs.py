"""Docstrings: every member has one, their examples are true, and signatures can be read."""
import doctest
import inspect
from typing import Any, List

import booleq
import pytest
from booleq import Equation, LutArray

HIDDEN = {"__class__", "__dict__", "__weakref__", "__doc__", "__module__", "__new__", "__slots__",
          "__annotations__", "__final__", "__hash__", "__iter__", "__parameters__"}
TYPES = [Equation, LutArray]


def own_members(kind: type) -> List[str]:
    return [name for name in vars(kind) if name not in HIDDEN]


def test_version() -> None:
    assert booleq.__version__.count(".") == 2


@pytest.mark.parametrize("kind", TYPES)
def test_everything_is_documented(kind: type) -> None:
    public = [name for name in own_members(kind) if not name.startswith("_")]
    assert len(public) > 10
    assert [name for name in public if not inspect.getdoc(getattr(kind, name))] == []


def test_names_of_the_package() -> None:
    for name in booleq.__all__:
        member = getattr(booleq, name)
        if inspect.isclass(member) or inspect.isfunction(member):
            assert member.__module__ == "booleq" and member.__doc__, name


def test_signatures_can_be_read() -> None:
    def parameters(member: Any) -> List[str]:
        return list(inspect.signature(member).parameters)

    assert parameters(Equation) == ["text", "inputs", "lsb_first"]
    assert parameters(Equation.from_init) == ["value", "inputs", "lsb_first"]
    assert parameters(Equation.render) == ["self", "syntax", "spaces"]
    assert parameters(LutArray) == ["values", "num_inputs", "lsb_first"]


def test_pythons_words() -> None:
    with pytest.raises(TypeError, match="missing required argument 'text'"):
        Equation()  # type: ignore[call-arg]
    with pytest.raises(TypeError, match="missing 1 required positional argument: 'other'"):
        Equation("A").equivalent()  # type: ignore[call-arg]
    with pytest.raises(TypeError, match="unexpected keyword argument 'space'"):
        Equation("A").render(space=True)  # type: ignore[call-arg]


def test_examples() -> None:
    runner = doctest.DocTestRunner()
    finder: Any = doctest.DocTestFinder()
    tests = [test for name in booleq.__all__
             for test in finder.find(getattr(booleq, name), name, module=False, globs={})
             if test.examples]
    assert len(tests) > 35
    for test in tests:
        runner.run(test)
    assert runner.summarize().failed == 0
