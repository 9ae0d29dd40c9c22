"""Clock relations: how data crosses from one clock to another."""

from __future__ import annotations

from dataclasses import dataclass
from fractions import Fraction
from typing import Optional, Tuple

from ._data import Data, exact, exact_or_none


@dataclass(frozen=True)
class Clock:
    """A clock at an input or an output. Times are in ns, from time 0 on."""

    name: str
    """As in the timing constraints."""
    input: int
    """The input that it follows, from 0."""
    outputs: Tuple[int, ...]
    """The outputs that have it; none: it is at an input."""
    frequency: Fraction
    period: Fraction
    rise: Fraction
    fall: Fraction
    jitter: Optional[float]
    """ps, peak to peak."""


@dataclass(frozen=True)
class Relation:
    """From a launching clock to a capturing one; None stands for what unrelated ones do not have."""

    launching: Clock
    capturing: Clock
    synchronous: bool
    crossing: str
    """single_cycle, multicycle, phase, short, relaxed, fifo or unrelated."""
    fifo: bool
    """Whether it takes a FIFO or a handshake."""
    ratio: Optional[Fraction]
    """The frequency of the capturing clock by that of the launching one."""
    hyperperiod: Optional[Fraction]
    """ns."""
    launches: Optional[int]
    """Rising edges of the launching clock in a hyperperiod."""
    captures: Optional[int]
    phase: Optional[Fraction]
    """Degrees of the capturing clock, by which it is behind at time 0."""
    gap: Optional[Fraction]
    """ns: the shortest from a rising edge to the next one that captures."""
    gap_rise_fall: Optional[Fraction]
    gap_fall_rise: Optional[Fraction]
    gap_fall_fall: Optional[Fraction]
    hold: Optional[Fraction]
    limit: Optional[Fraction]
    """ns: what the gap has to be for a crossing to be timed as it stands."""


def _clock(data: Data) -> Clock:
    return Clock(
        name=data["name"],
        input=data["input"],
        outputs=tuple(data["outputs"]),
        frequency=exact(data, "frequency"),
        period=exact(data, "period"),
        rise=exact(data, "rise"),
        fall=exact(data, "fall"),
        jitter=data["jitter"],
    )


def relations_of(document: Data) -> Tuple[Relation, ...]:
    """Those of a document that `vorkel relations` writes."""
    clocks = {one["name"]: _clock(one) for one in document["clocks"]}
    return tuple(
        Relation(
            launching=clocks[one["from"]],
            capturing=clocks[one["to"]],
            synchronous=one["synchronous"],
            crossing=one["crossing"],
            fifo=one["fifo"],
            ratio=exact_or_none(one, "ratio"),
            hyperperiod=exact_or_none(one, "hyperperiod"),
            launches=one.get("launches"),
            captures=one.get("captures"),
            phase=exact_or_none(one, "phase"),
            gap=exact_or_none(one, "gap"),
            gap_rise_fall=exact_or_none(one, "gap_rise_fall"),
            gap_fall_rise=exact_or_none(one, "gap_fall_rise"),
            gap_fall_fall=exact_or_none(one, "gap_fall_fall"),
            hold=exact_or_none(one, "hold"),
            limit=exact_or_none(one, "limit"),
        )
        for one in document["relations"]
    )
