"""What values of signals are made of, besides int."""

import enum
import functools
from typing import Any, Callable, Iterable, Tuple, Type


class Enumeration(enum.IntEnum):
    """The base of the enumerations of signals. Numbers without a name are members, too, named by their digits.

    A member is compared with a name as well: `frame.state == "RUN"`; with one that it cannot have, that is a ValueError.
    """

    @classmethod
    def _missing_(cls, value: object) -> Any:
        if not isinstance(value, int):
            return None
        member = int.__new__(cls, value)
        member._name_ = f"0x{value:X}"
        member._value_ = value
        return member

    def __eq__(self, other: object) -> bool:
        if not isinstance(other, str):
            return int(self) == other
        if other not in type(self).__members__:
            names = ", ".join(type(self).__members__)
            raise ValueError(f"no value of {type(self).__name__}, whose values are {names}: {other}")
        return self.name == other

    def __ne__(self, other: object) -> bool:
        return not self == other

    def __hash__(self) -> int:
        return hash(int(self))


class Quantity(float):
    """A scaled value: a float with the `unit` of its signal, "" where it has none."""

    unit = ""

    def __reduce__(self) -> Tuple[Callable[[float], "Quantity"], Tuple[float]]:
        return _quantity_of(self.unit), (float(self),)


class _quantity_of:
    """Makes quantities of a unit; can be pickled, which their classes cannot."""

    def __init__(self, unit: str) -> None:
        self.unit = unit

    def __call__(self, number: float) -> Quantity:
        return quantity(self.unit)(number)


@functools.lru_cache(maxsize=None)
def quantity(unit: str) -> Type[Quantity]:
    """The class of quantities of that unit."""
    return type("Quantity", (Quantity,), {"unit": unit, "__module__": __name__})


def enumeration(name: str, values: Iterable[Tuple[str, int]]) -> Type[Enumeration]:
    """An enumeration of those names and numbers."""
    members = [(f"{each}_" if _is_reserved(each) else each, number) for each, number in values]
    make: Any = Enumeration  # by the functional form, with names that need not be Python's
    made: Type[Enumeration] = make(name, members)
    return made


def _is_reserved(name: str) -> bool:
    return name == "mro" or (name.startswith("_") and name.endswith("_"))
