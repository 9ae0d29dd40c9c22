"""What is the same of all that answers a request: plans, and settings that have been judged."""

from __future__ import annotations

import json
from typing import Any, Mapping, Tuple, Union

from ._answers import Answer, KruSettings, LoopSettings, OutputAnswer
from ._data import Data
from ._errors import mistake

_LARGEST = 1_000_000


class Document:
    """Answers to a request, at least one."""

    _answers: Tuple[Answer, ...]

    def _read(self) -> None:
        self._data: Data = json.loads(self.to_json())
        self._answers = tuple(Answer.of(one) for one in self._data["answers"] if one["solved"])

    def __repr__(self) -> str:
        outputs = ", ".join(
            f"{float(one.actual):.6g} MHz" if one.used else "-" for one in self.outputs
        )
        return f"<vorkel.{type(self).__name__} {self.device} {self.primitive}: {outputs}>"

    def to_json(self) -> str:
        """The document that the program writes."""
        raise NotImplementedError

    def to_dict(self) -> Data:
        """The same as a dictionary."""
        document: Data = json.loads(self.to_json())
        return document

    @property
    def device(self) -> str:
        """The part name, with package and grade."""
        return str(self._data["request"]["device"])

    @property
    def request(self) -> Mapping[str, Any]:
        """What was asked for, as a request file has it; it can be given to `plan` again."""
        return dict(self._data["request"])

    @property
    def answer(self) -> Answer:
        """The first answer."""
        return self._answers[0]

    @property
    def primitive(self) -> str:
        """That of the first answer."""
        return self.answer.primitive

    @property
    def settings(self) -> Union[LoopSettings, KruSettings]:
        """Those of the first answer."""
        return self.answer.settings

    @property
    def outputs(self) -> Tuple[OutputAnswer, ...]:
        """Those of the first answer."""
        return self.answer.outputs

    @property
    def within(self) -> bool:
        """Whether all of the first answer is as asked for, and in the device's range."""
        return self.answer.within


def form(plain: bool, fifos: bool) -> Tuple[bool, bool]:
    """Which timing constraints are written."""
    if plain and fifos:
        sentence = "fifos has no place in the plain form, which has create_clock alone"
        raise mistake("contradiction", "True", sentence, "fifos")
    return bool(plain), bool(fifos)


def whole(name: str, value: int, lowest: int, highest: int = _LARGEST) -> int:
    """An argument that is a whole number."""
    if isinstance(value, bool) or not isinstance(value, int) or not lowest <= value <= highest:
        text = repr(value)
        sentence = f"{name}: {text} must be a whole number from {lowest} to {highest}"
        raise mistake("must_be", text, sentence, name)
    return value


def is_vhdl(language: str) -> bool:
    """Whether an argument says vhdl, and not verilog."""
    if language not in ("verilog", "vhdl"):
        sentence = f"language: {language!r} must be verilog or vhdl"
        raise mistake("not_a_name", str(language), sentence, "language")
    return language == "vhdl"
