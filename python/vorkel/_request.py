"""Requests: what a caller says, as the JSON that the planner reads. Numbers stay exact."""

from __future__ import annotations

import json
from dataclasses import dataclass, fields
from decimal import Decimal
from fractions import Fraction
from typing import Any, Iterable, List, Mapping, Optional, Union

from ._errors import mistake

Value = Union[int, float, str, Fraction, Decimal]
"""A number, in MHz, degrees, percent, ps or ppm; or a text with a unit, such as "148.5 MHz",
"8 ns", "90deg", "50%" or "100/3". A float is the decimal that it is shown as."""


@dataclass(frozen=True)
class Output:
    """An output that is asked for, with its demands; None where there is none."""

    frequency: Value
    phase: Optional[Value] = None
    duty: Optional[Value] = None
    tolerance: Optional[Value] = None
    phase_tolerance: Optional[Value] = None
    duty_tolerance: Optional[Value] = None
    max_jitter: Optional[Value] = None


AnyOutput = Union[Value, Output, Mapping[str, Any], None]
AnyInputs = Union[Value, Iterable[Value]]


def written(value: Any, entry: str) -> Any:
    """A value as JSON has it."""
    if value is None or isinstance(value, (str, bool, int)):
        return value
    if isinstance(value, float):
        # The decimal is what is meant: 33.3 is 333/10.
        return value if value - value == 0 else repr(value)
    if isinstance(value, Fraction):
        return f"{value.numerator}/{value.denominator}"
    if isinstance(value, Decimal):
        return str(value) if not value.is_finite() else f"{value:f}"
    if isinstance(value, Output):
        return output_data(value)
    if isinstance(value, Mapping):
        return {str(key): written(one, entry) for key, one in value.items() if one is not None}
    if isinstance(value, Iterable):
        return [written(one, entry) for one in value]
    kind = type(value).__name__
    raise mistake("wrong_type", kind, f"{entry}: no {kind} can be read", entry)


def text_of(value: Any, entry: str) -> str:
    """A value, or several with commas between, as the program's options have it."""
    if isinstance(value, bool):
        return "1" if value else "0"
    if isinstance(value, float) and value - value == 0:
        value = Decimal(repr(value))
    data = "-" if value is None else written(value, entry)
    if isinstance(data, Mapping):
        raise mistake("wrong_type", "dict", f"{entry}: no dict can be read", entry)
    if isinstance(data, list):
        return ",".join(text_of(one, entry) for one in value)
    return str(data)


def output_data(output: Output) -> Any:
    return written({one.name: getattr(output, one.name) for one in fields(output)}, "outputs")


def listed(value: Any) -> List[Any]:
    """A single value as a list of one."""
    if isinstance(value, (str, int, float, Fraction, Decimal, Mapping, Output)):
        return [value]
    return list(value)


_NEEDED = {"inputs": "frequencies of the inputs", "outputs": "outputs"}


def request_json(
    request: Optional[Mapping[str, Any]],
    entries: Mapping[str, Any],
    needed: Iterable[str] = tuple(_NEEDED),
) -> str:
    """The entries of a request and, in place of them, those that are not None."""
    if request is not None and not isinstance(request, Mapping):
        kind = type(request).__name__
        raise mistake("wrong_type", kind, f"the request must be a dictionary, and is a {kind}")
    whole = dict(request or {})
    whole.update({name: value for name, value in entries.items() if value is not None})
    # What stands for all tolerances and what stands for one do not go together.
    if entries.get("tolerance") is not None and entries.get("exact") is None:
        whole.pop("exact", None)
    if entries.get("exact") is not None and entries.get("tolerance") is None:
        whole.pop("tolerance", None)
    for name in ("inputs", "outputs"):
        try:
            whole[name] = listed(whole[name])
        except (KeyError, TypeError):
            pass  # told below, or by `written`
    for name in needed:
        if name not in whole or whole[name] is None or whole[name] == []:
            raise mistake("missing", "", f"{name}: the {_NEEDED[name]} are missing", name)
    if isinstance(whole.get("outputs"), list):
        whole["outputs"] = ["-" if one is None else one for one in whole["outputs"]]
    data = {name: written(one, name) for name, one in whole.items() if one is not None}
    return json.dumps(data, ensure_ascii=False)
