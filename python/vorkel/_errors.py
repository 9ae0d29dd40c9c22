"""What goes wrong, as exceptions with the findings as data."""

from __future__ import annotations

import json
from dataclasses import dataclass
from typing import NoReturn, Optional, Tuple

from ._answers import Refusal


class VorkelError(Exception):
    """What all exceptions of the planner are."""


@dataclass(frozen=True)
class Mistake:
    """One thing that is wrong with a request."""

    kind: str
    """What it is, such as "not_a_value", "unknown_entry" or "unknown_device"."""
    entry: str
    """The entry of the request, such as "outputs"; empty: the request as a whole."""
    index: Optional[int]
    """Which input or output, from 0; None: the entry as a whole."""
    key: str
    """What of an output, such as "phase"."""
    text: str
    """What was given."""
    known: Tuple[str, ...]
    """What there is, where a name is wrong."""
    message: str
    """All of it as a sentence."""


class RequestError(VorkelError, ValueError):
    """A request that cannot be read, or a device that there is not."""

    def __init__(self, mistakes: Tuple[Mistake, ...]) -> None:
        super().__init__("\n".join(mistake.message for mistake in mistakes))
        self.mistakes: Tuple[Mistake, ...] = mistakes

    def __reduce__(self) -> Tuple[type, Tuple[Tuple[Mistake, ...]]]:
        return type(self), (self.mistakes,)


class UnsolvedError(VorkelError):
    """No settings of any primitive keep the device's limits."""

    def __init__(self, reasons: Tuple[Refusal, ...]) -> None:
        super().__init__("\n".join(f"{one.primitive}: {one.reason}" for one in reasons))
        self.reasons: Tuple[Refusal, ...] = reasons

    def __reduce__(self) -> Tuple[type, Tuple[Tuple[Refusal, ...]]]:
        return type(self), (self.reasons,)


def mistake(kind: str, text: str, message: str, entry: str = "") -> RequestError:
    """A mistake that the package itself has found."""
    return RequestError((Mistake(kind, entry, None, "", text, (), message),))


def raise_request(data: str) -> NoReturn:
    """Called by the extension."""
    raise RequestError(
        tuple(
            Mistake(
                kind=one["kind"],
                entry=one["entry"],
                index=one.get("index"),
                key=one.get("key", ""),
                text=one["text"],
                known=tuple(one["known"]),
                message=one["message"],
            )
            for one in json.loads(data)
        )
    )


def raise_unsolved(data: str) -> NoReturn:
    """Called by the extension."""
    raise UnsolvedError(
        tuple(
            Refusal.of(one["primitive"], one["message"], one["refusals"])
            for one in json.loads(data)
        )
    )
