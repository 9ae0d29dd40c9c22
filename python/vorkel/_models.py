"""The models of the primitives for simulators."""

from __future__ import annotations

import re
from pathlib import Path
from typing import Dict, List, Tuple

from . import _planner
from ._errors import VorkelError, mistake

_ENDINGS = {"verilog": ".v", "vhdl": ".vhd"}


def models(language: str = "verilog") -> Tuple[Path, ...]:
    """The files of the models, in verilog or vhdl, in an order in which they can be compiled.

    Raises VorkelError when they are not installed.
    """
    if language not in _ENDINGS:
        sentence = f"language: {language!r} must be verilog or vhdl"
        raise mistake("not_a_name", str(language), sentence, "language")
    folder = _planner.shipped(str(Path(__file__).resolve().parent), "hdl")
    files = sorted(Path(folder or "/nonexistent", language).glob("*" + _ENDINGS[language]))
    if not files:
        raise VorkelError("the models are not installed")
    return tuple(_ordered(files) if language == "vhdl" else files)


def _ordered(files: List[Path]) -> List[Path]:
    """VHDL wants each file behind those whose units it names."""
    by_name: Dict[str, Path] = {path.stem.lower(): path for path in files}
    ordered: List[Path] = []

    def add(path: Path) -> None:
        if path in ordered:
            return
        for name in re.findall(r"\bwork\.(\w+)", path.read_text(encoding="utf-8"), re.IGNORECASE):
            needed = by_name.get(name.lower())
            if needed is not None and needed != path:
                add(needed)
        ordered.append(path)

    for path in files:
        add(path)
    return ordered
