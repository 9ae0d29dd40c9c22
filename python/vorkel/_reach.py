"""Which frequencies an output can have."""

from __future__ import annotations

import json
from dataclasses import dataclass
from fractions import Fraction
from typing import Dict, Mapping, Optional, Tuple

from . import _planner
from ._data import Data, exact, exact_or_none
from ._document import whole
from ._request import AnyInputs, Value, request_json, text_of

_ALL = 1_000_000_000


@dataclass(frozen=True)
class Reachable:
    """A frequency that an output can have, and the settings that `plan` ranks first for it."""

    primitive: str
    frequency: Fraction
    """MHz, with the first input."""
    multiply: int
    """The frequency is input * multiply / divide, in lowest terms."""
    divide: int
    error: Optional[Fraction]
    """Of `near`: less the frequency that was asked for, MHz."""
    error_ppm: Optional[Fraction]
    vco: Optional[Fraction]
    """MHz; this and the next are of a PLL or a TSYN."""
    bandwidth: Optional[str]
    m: Optional[Fraction]
    d: Optional[int]
    divider: Optional[Fraction]
    pin: Optional[str]
    """Of a KRU, as the next."""
    feedback: Optional[bool]
    clkin_divide_by_2: Optional[bool]
    kru_divide: Optional[Fraction]
    """Of CLKDV or CLKFXDV."""
    jitter: Optional[float]
    """ps, peak to peak; None: not known."""

    @classmethod
    def of(cls, primitive: str, data: Data) -> Reachable:
        return cls(
            primitive=primitive,
            frequency=exact(data, "frequency"),
            multiply=data["multiply"],
            divide=data["divide"],
            error=exact_or_none(data, "error"),
            error_ppm=exact_or_none(data, "error_ppm"),
            vco=exact_or_none(data, "vco"),
            bandwidth=data.get("bandwidth"),
            m=_part(data.get("m_eighths", data.get("m")), 8 if "m_eighths" in data else 1),
            d=data.get("d"),
            divider=_part(data.get("divider_eighths"), 8),
            pin=data.get("pin"),
            feedback=data.get("feedback"),
            clkin_divide_by_2=data.get("clkin_divide_by_2"),
            kru_divide=_part(data.get("divide_halves"), 2),
            jitter=data["jitter"],
        )


def _part(count: Optional[int], parts: int) -> Optional[Fraction]:
    return None if count is None else Fraction(count, parts)


@dataclass(frozen=True)
class ReachableGap:
    """Two frequencies with none between them."""

    width: Fraction
    """MHz."""
    width_ppm: Fraction
    """Of the lower frequency."""
    below: Reachable
    above: Reachable


@dataclass(frozen=True)
class ReachableCount:
    """How many frequencies there are, the lowest and the highest, where there is any."""

    count: int
    lowest: Optional[Fraction]
    highest: Optional[Fraction]


class Reach:
    """Which frequencies an output can have from an input, when no other output is used.

    Each call answers for each primitive that can be asked, by its name.
    """

    def __init__(self, made: _planner.Reach) -> None:
        self._made = made

    def all(self, most: int = 10_000) -> Mapping[str, Tuple[Reachable, ...]]:
        """The frequencies by rising frequency, at most `most`; 0: all, which can be ten million."""
        return _points(self._made.all(whole("most", most, 0, _ALL)))

    def near(self, frequency: Value, most: int = 5) -> Mapping[str, Tuple[Reachable, ...]]:
        """The nearest ones to a frequency; of two that are equally near the lower first."""
        return _points(self._made.near(text_of(frequency, "near"), whole("most", most, 1)))

    def gaps(self, most: int = 5) -> Mapping[str, Tuple[ReachableGap, ...]]:
        """The widest gaps in MHz between two frequencies, the widest first."""
        return {
            name: tuple(
                ReachableGap(
                    width=exact(one, "width"),
                    width_ppm=exact(one, "width_ppm"),
                    below=Reachable.of(name, one["below"]),
                    above=Reachable.of(name, one["above"]),
                )
                for one in data["gaps"]
            )
            for name, data in _primitives(self._made.gaps(whole("most", most, 1))).items()
        }

    def count(self) -> Mapping[str, ReachableCount]:
        """How many there are, the lowest and the highest."""
        return {
            name: ReachableCount(
                data["count"], exact_or_none(data, "lowest"), exact_or_none(data, "highest")
            )
            for name, data in _primitives(self._made.count()).items()
        }


def _primitives(document: str) -> Dict[str, Data]:
    return {one["primitive"]: one for one in json.loads(document)["primitives"]}


def _points(document: str) -> Mapping[str, Tuple[Reachable, ...]]:
    return {
        name: tuple(Reachable.of(name, one) for one in data["frequencies"])
        for name, data in _primitives(document).items()
    }


def reach(
    inputs: AnyInputs,
    *,
    output: int = 0,
    lowest: Optional[Value] = None,
    highest: Optional[Value] = None,
    device: Optional[str] = None,
    primitive: Optional[str] = None,
    bandwidth: Optional[str] = None,
    int_div0: Optional[bool] = None,
    feedback: Optional[bool] = None,
    input_jitter: Optional[Value] = None,
    input_tolerance: Optional[Value] = None,
) -> Reach:
    """Which frequencies an output can have.

        >>> near = vorkel.reach(27, primitive="PLL", device="vk40").near("148.5 MHz", most=2)
        >>> [(str(one.frequency), str(one.m), one.d, str(one.divider)) for one in near["PLL"]]
        [('297/2', '33', 1, '6'), ('1026/7', '38', 1, '7')]

    output: the place of the output, which counts: output 0 of a TSYN has dividers in eighths.
    lowest, highest: bounds of what is looked at, both included.

    The others are those of `plan`. Raises RequestError when that cannot be read, and UnsolvedError
    when no primitive has so many inputs or outputs. Without any frequency in the bounds the answers
    are empty.
    """
    said = dict(locals())
    for name in ("output", "lowest", "highest"):
        del said[name]
    bounds = [
        None if bound is None else text_of(bound, name)
        for name, bound in (("lowest", lowest), ("highest", highest))
    ]
    request = request_json(None, said, ("inputs",))
    return Reach(_planner.Reach(request, whole("output", output, 0, 100), *bounds))
