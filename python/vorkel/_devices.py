"""Devices, their files, and the certificate of a plan."""

from __future__ import annotations

import json
import os
from dataclasses import dataclass
from fractions import Fraction
from pathlib import Path
from typing import Any, Mapping, Optional, Tuple, Union

from . import _planner
from ._answers import Range
from ._data import Data, exact
from ._errors import mistake
from ._evaluation import AnyPlan, plan_json

_LARGEST_DEVICE_FILE = 1_000_000  # bytes


@dataclass(frozen=True)
class DevicePrimitive:
    """The ranges of a primitive, MHz; None for what it does not have."""

    primitive: str
    vco: Optional[Range]
    pfd: Optional[Range]
    pfd_low: Optional[Range]
    """With bandwidth LOW."""
    output: Optional[Range]
    output_1: Optional[Range]
    """Of output 1 of a PLL, which can drive an I/O clock."""
    has_jitter: bool


@dataclass(frozen=True)
class DeviceLimit:
    """A limit as the device file has it."""

    keyword: str
    unit: str
    value: Fraction


@dataclass(frozen=True)
class DeviceGrade:
    """A speed grade."""

    name: str
    primitives: Tuple[DevicePrimitive, ...]
    limits: Tuple[DeviceLimit, ...]
    warnings: Tuple[str, ...]


@dataclass(frozen=True)
class Device:
    """A device; of one whose file cannot be used only `name`, `file` and `reason`."""

    name: str
    usable: bool
    about: str
    file: str
    reason: str
    """Why it cannot be used."""
    packages: Tuple[str, ...]
    default_package: Optional[str]
    default_grade: Optional[str]
    fastest_grade: Optional[str]
    grades: Tuple[DeviceGrade, ...]


def _primitive(data: Data) -> DevicePrimitive:
    ranges = {
        name: Range.or_none(data.get(name))
        for name in ("vco", "pfd", "pfd_low", "output", "output_1")
    }
    return DevicePrimitive(
        primitive=data["primitive"], has_jitter=data.get("has_jitter", False), **ranges
    )


def _grade(data: Data) -> DeviceGrade:
    return DeviceGrade(
        name=data["name"],
        primitives=tuple(_primitive(one) for one in data["primitives"]),
        limits=tuple(
            DeviceLimit(one["keyword"], one["unit"], exact(one, "value")) for one in data["limits"]
        ),
        warnings=tuple(data["warnings"]),
    )


def _device(data: Data) -> Device:
    return Device(
        name=data["name"],
        usable=data["usable"],
        about=data.get("about") or "",
        file=data["file"],
        reason=data.get("reason") or "",
        packages=tuple(data.get("packages", ())),
        default_package=data.get("default_package"),
        default_grade=data.get("default_grade"),
        fastest_grade=data.get("fastest_grade"),
        grades=tuple(_grade(one) for one in data.get("grades", ())),
    )


def devices(name: Optional[str] = None) -> Tuple[Device, ...]:
    """The devices that there are, or the one of a name, of a part or of their beginning.

    Of a part with a grade it has that grade alone. Raises RequestError when there is none.
    """
    if name is not None and not isinstance(name, str):
        raise mistake("wrong_type", repr(name), f"name: {name!r} is no text", "name")
    return tuple(_device(one) for one in json.loads(_planner.devices(name))["devices"])


@dataclass(frozen=True)
class DeviceMistake:
    """Why a device file is refused."""

    places: Tuple[Tuple[int, int], ...]
    """Lines and columns, from 1; none: the file as a whole."""
    message: str
    unknown: str
    """A name that there is not, when it is that."""
    known: Tuple[str, ...]


@dataclass(frozen=True)
class DeviceWarning:
    """A limit that cannot be meant."""

    keyword: str
    other: str
    value: Fraction
    grades: Tuple[str, ...]
    lines: Tuple[int, ...]
    touched: Tuple[str, ...]
    """The primitives that it concerns."""
    lost: Tuple[str, ...]
    """Those that can do nothing with such limits."""
    message: str


@dataclass(frozen=True)
class GradeCheck:
    """What a grade has, and the keywords that it lacks."""

    name: str
    primitives: Tuple[str, ...]
    missing: Tuple[str, ...]


@dataclass(frozen=True)
class DeviceCheck:
    """What is wrong with a device file, and what is doubtful."""

    file: str
    usable: bool
    mistakes: Tuple[DeviceMistake, ...]
    untold: int
    """How many mistakes there are beside these."""
    warnings: Tuple[DeviceWarning, ...]
    grades: Tuple[GradeCheck, ...]


def check(file: Union[str, "os.PathLike[str]"]) -> DeviceCheck:
    """What is wrong with a device file, DEVICE.toml.

    Raises OSError when it cannot be read, and RequestError when it is no such file.
    """
    path = Path(file)
    name = str(path)
    if path.suffix != ".toml" or path.name == ".toml":
        raise mistake("no_file", name, f"{name}: a device file is named DEVICE.toml")
    with path.open("rb") as stream:
        text = stream.read(_LARGEST_DEVICE_FILE + 1)
    if len(text) > _LARGEST_DEVICE_FILE:
        raise mistake("no_file", name, f"{name}: it is too large for a device file")
    data = json.loads(_planner.check(text, name, path.stem))
    return DeviceCheck(
        file=name,
        usable=data["usable"],
        mistakes=tuple(
            DeviceMistake(
                tuple((place["line"], place["column"]) for place in one["places"]),
                one["message"],
                one["unknown"],
                tuple(one["known"]),
            )
            for one in data["mistakes"]
        ),
        untold=data["untold"],
        warnings=tuple(
            DeviceWarning(
                keyword=one["keyword"],
                other=one["other"],
                value=exact(one, "value"),
                grades=tuple(one["grades"]),
                lines=tuple(one["lines"]),
                touched=tuple(one["touched"]),
                lost=tuple(one["lost"]),
                message=one["message"],
            )
            for one in data["warnings"]
        ),
        grades=tuple(
            GradeCheck(one["name"], tuple(one["primitives"]), tuple(one["missing"]))
            for one in data["grades"]
        ),
    )


@dataclass(frozen=True)
class Discrepancy:
    """A number of a plan that is not right."""

    path: str
    """Such as "answers[0].outputs[2].error_ppm"; empty: the document as a whole."""
    found: str
    expected: str
    line: int
    """From 1; 0: nowhere."""
    column: int
    message: str


def verify(plan: AnyPlan) -> Tuple[Discrepancy, ...]:
    """Works every number of a plan out again, apart from the search; nothing when all are right.

    plan: a plan or an evaluation, its JSON, or that as a dictionary. Raises RequestError when the
    device that it names is not there.
    """
    return tuple(
        Discrepancy(
            path=one["path"],
            found=one["found"],
            expected=one["expected"],
            line=one["line"],
            column=one["column"],
            message=one["message"],
        )
        for one in json.loads(_planner.verify(plan_json(plan), "plan"))
    )
