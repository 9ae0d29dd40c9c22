"""Explanations: what is in the way of a request, and what would work."""

from __future__ import annotations

import json
from dataclasses import dataclass
from fractions import Fraction
from typing import Iterable, Optional, Tuple

from . import _planner
from ._answers import Finding, findings
from ._data import Data, exact


@dataclass(frozen=True)
class Demand:
    """A demand of the request, or a limit of the device."""

    kind: str
    output: Optional[int]
    text: str

    @classmethod
    def of(cls, data: Data) -> Demand:
        return cls(data["kind"], data["output"], data.get("text", ""))


def _demands(data: Iterable[Data]) -> Tuple[Demand, ...]:
    return tuple(Demand.of(one) for one in data)


@dataclass(frozen=True)
class Change:
    """A change of one demand with which the rest goes. Each has been tried."""

    kind: str
    demand: Demand
    value: Fraction
    before: Fraction
    text: str

    @classmethod
    def of(cls, data: Data) -> Change:
        return cls(
            data["kind"],
            Demand.of(data["demand"]),
            exact(data, "value"),
            exact(data, "before"),
            data["text"],
        )


def _changes(data: Iterable[Data]) -> Tuple[Change, ...]:
    return tuple(Change.of(one) for one in data)


@dataclass(frozen=True)
class Conflict:
    """Demands that cannot be met together, though all but any one of them can."""

    demands: Tuple[Demand, ...]
    changes: Tuple[Change, ...]
    changes_lift_all: bool
    """Whether the whole request goes with one of the changes, and not only these demands."""


@dataclass(frozen=True)
class PrimitiveExplanation:
    """What one primitive has to say."""

    primitive: str
    possible: bool
    refusals: Tuple[Finding, ...]
    conflicts: Tuple[Conflict, ...]
    corrections: Tuple[Tuple[Demand, ...], ...]
    """The smallest sets of demands without which the rest goes."""
    together: Tuple[Change, ...]
    """The smallest tolerance for all, and the smallest jitter for all that have a limit."""
    swaps: Tuple[Tuple[int, int], ...]
    """Outputs that should change places."""
    complete: bool
    """False where there were too many questions to ask all of them."""

    @classmethod
    def of(cls, data: Data) -> PrimitiveExplanation:
        return cls(
            primitive=data["primitive"],
            possible=data["possible"],
            refusals=findings(data["refusals"]),
            conflicts=tuple(
                Conflict(
                    demands=_demands(one["demands"]),
                    changes=_changes(one["changes"]),
                    changes_lift_all=one["changes_lift_all"],
                )
                for one in data["conflicts"]
            ),
            corrections=tuple(_demands(one) for one in data["corrections"]),
            together=_changes(data["together"]),
            swaps=tuple((first, second) for first, second in data["swaps"]),
            complete=data["complete"],
        )


@dataclass(frozen=True)
class InputThatServes:
    """An input frequency, MHz, with which the request goes, and the primitives."""

    frequency: Fraction
    primitives: Tuple[str, ...]


class Explanation:
    """What is in the way of a request, and what would work."""

    def __init__(self, made: _planner.Explanation) -> None:
        self._made = made
        data: Data = json.loads(made.json())
        self.possible: bool = data["possible"]
        """Whether the request goes as it stands."""
        self.primitives: Tuple[PrimitiveExplanation, ...] = tuple(
            PrimitiveExplanation.of(one) for one in data["primitives"]
        )
        self.inputs: Tuple[InputThatServes, ...] = tuple(
            InputThatServes(exact(one, "frequency"), tuple(one["primitives"]))
            for one in data["inputs"]
        )

    def to_json(self) -> str:
        """The document that `vorkel explain --format json` writes."""
        return self._made.json()

    def to_text(self, width: int = 80) -> str:
        """The text that `vorkel explain` shows."""
        return self._made.report(max(40, width))
