"""Reading the planner's JSON: each exact number stands there twice, as a double and exactly."""

from __future__ import annotations

from fractions import Fraction
from typing import Any, Dict, Optional

Data = Dict[str, Any]


def exact(data: Data, name: str) -> Fraction:
    """The number under a name, exactly."""
    return Fraction(data[name + "_exact"])


def exact_or_none(data: Data, name: str) -> Optional[Fraction]:
    """The same where there may be none."""
    text = data.get(name + "_exact")
    return None if text is None else Fraction(text)
