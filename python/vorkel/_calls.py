"""Plans: the calls, and what they answer."""

from __future__ import annotations

import json
from typing import Any, Iterable, Mapping, Optional, Tuple, Union

from . import _planner
from ._answers import Answer, KruSettings, LoopSettings, OutputAnswer, Refusal
from ._data import Data
from ._errors import mistake
from ._explanation import Explanation
from ._relations import Relation, relations_of
from ._request import AnyInputs, AnyOutput, Value, listed, request_json, written

_USUAL_FRONT = 6
_LARGEST = 1_000_000


class Plan:
    """Answers to a request, the best first.

    `plan` makes one with a single answer, `compare` one with all candidates, and `best` one with
    trade-offs. `pick`, `compare` and `best` of a plan make others of it without planning again.
    """

    def __init__(
        self, made: _planner.Plan, part: _planner.Part, number: int = 1, most: int = 0
    ) -> None:
        self._made = made
        self._part = part
        self._number = number
        self._most = most
        self._data: Data = json.loads(self.to_json())
        self._answers = tuple(Answer.of(one) for one in self._data["answers"] if one["solved"])
        self._refused = tuple(
            Refusal.of(one["primitive"], one["reason"], one["refusals"])
            for one in self._data["answers"]
            if not one["solved"]
        )

    def __repr__(self) -> str:
        outputs = ", ".join(
            f"{float(one.actual):.6g} MHz" if one.used else "-" for one in self.outputs
        )
        return f"<vorkel.Plan {self.device} {self.primitive}: {outputs}>"

    @property
    def device(self) -> str:
        """The part name, with package and grade."""
        return str(self._data["request"]["device"])

    @property
    def request(self) -> Mapping[str, Any]:
        """What was asked for, as a request file has it; it can be given to `plan` again."""
        return dict(self._data["request"])

    @property
    def answers(self) -> Tuple[Answer, ...]:
        """All answers of this plan, at least one."""
        return self._answers

    @property
    def refused(self) -> Tuple[Refusal, ...]:
        """Of `compare`: the primitives that have no settings."""
        return self._refused

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

    @property
    def candidates(self) -> int:
        """How many candidates there are to pick from."""
        return self._made.count

    def pick(self, number: int) -> Plan:
        """The plan with candidate `number` of `compare`, from 1."""
        return Plan(self._made, _planner.Part.PLAN, self._candidate(number))

    def compare(self) -> Plan:
        """All candidates."""
        return Plan(self._made, _planner.Part.COMPARE)

    def best(self, front: int = _USUAL_FRONT) -> Plan:
        """The best, that of each other primitive, at most `front` trade-offs, the engine's best."""
        return Plan(self._made, _planner.Part.BEST, self._number, _count("front", front, 0))

    def to_json(self) -> str:
        """The document that `vorkel --format json` writes; `verify` takes it."""
        return self._made.json(self._part, self._number, self._most)

    def to_dict(self) -> Data:
        """The same as a dictionary."""
        document: Data = json.loads(self.to_json())
        return document

    def to_tcl(self) -> str:
        """The same as a Tcl dict."""
        return self._made.tcl(self._part, self._number, self._most)

    def to_text(self, width: int = 80) -> str:
        """The report that `vorkel` shows, for so many columns."""
        return self._made.report(self._part, self._number, self._most, _count("width", width, 40))

    def to_sdc(
        self,
        number: Optional[int] = None,
        *,
        plain: bool = False,
        fifos: bool = False,
        gap: Optional[str] = None,
    ) -> str:
        """Timing constraints of the first answer, or of candidate `number`.

        plain: `create_clock` alone, for readers that know nothing else.
        fifos: data between clocks whose crossing needs a FIFO all goes through one.
        gap: from which gap between edges on a crossing is timed as it stands, such as "0.5ns" or
            "20%" of the shorter period.
        """
        return self._made.sdc(self._chosen(number), bool(plain), bool(fifos), gap or "")

    def relations(
        self, number: Optional[int] = None, *, gap: Optional[str] = None
    ) -> Tuple[Relation, ...]:
        """How data crosses from each clock to each other."""
        return relations_of(json.loads(self._made.relations(self._chosen(number), gap or "")))

    def to_verilog(self, name: str = "clocks", number: Optional[int] = None) -> str:
        """A Verilog module with the primitive and all its settings."""
        return self._made.hdl(self._chosen(number), False, False, name)

    def to_vhdl(self, name: str = "clocks", number: Optional[int] = None) -> str:
        """The same as a VHDL entity."""
        return self._made.hdl(self._chosen(number), True, False, name)

    def to_testbench(
        self, name: str = "clocks", number: Optional[int] = None, *, language: str = "verilog"
    ) -> str:
        """A testbench, in verilog or vhdl, that checks every edge of that module."""
        if language not in ("verilog", "vhdl"):
            sentence = f"language: {language!r} must be verilog or vhdl"
            raise mistake("not_a_name", str(language), sentence, "language")
        return self._made.hdl(self._chosen(number), language == "vhdl", True, name)

    def _chosen(self, number: Optional[int]) -> int:
        return self._number if number is None else self._candidate(number)

    def _candidate(self, number: int) -> int:
        if _count("number", number, 1) > self._made.count:
            raise mistake(
                "no_candidate",
                str(number),
                f"there are {self._made.count} candidates, and no number {number}",
            )
        return number


def _count(name: str, value: int, lowest: int) -> int:
    if isinstance(value, bool) or not isinstance(value, int) or not lowest <= value <= _LARGEST:
        text = repr(value)
        sentence = f"{name}: {text} must be a whole number from {lowest} to {_LARGEST}"
        raise mistake("must_be", text, sentence, name)
    return value


def plan(
    inputs: Optional[AnyInputs] = None,
    outputs: Optional[Iterable[AnyOutput]] = None,
    *,
    request: Optional[Mapping[str, Any]] = None,
    device: Optional[str] = None,
    primitive: Optional[str] = None,
    input_jitter: Optional[Value] = None,
    input_tolerance: Optional[Value] = None,
    tolerance: Optional[Value] = None,
    phase_tolerance: Optional[Value] = None,
    duty_tolerance: Optional[Value] = None,
    max_jitter: Optional[Value] = None,
    bandwidth: Optional[str] = None,
    rank: Optional[str] = None,
    exact: Optional[bool] = None,
    feedback: Optional[bool] = None,
    prefer_max_vco: Optional[bool] = None,
    int_div0: Optional[bool] = None,
    any_order: Optional[bool] = None,
    engine: Optional[bool] = None,
    pick: int = 1,
) -> Plan:
    """The settings that serve a request best.

    inputs: one or two input clocks.
    outputs: one to seven outputs, each a frequency, an `Output`, a dictionary with the entries of
        that, or None for one that is not used.
    request: a dictionary with all of these, as a request file in JSON has it; arguments go before.
    device: a part name or its beginning; vk40 by default.
    primitive: PLL, TSYN, KRU_SP or KRU_CLKGEN; all of the device by default.
    input_jitter: peak to peak, ps.
    input_tolerance: how far the inputs can be off over temperature and age, ppm; all limits of the
        device are kept with all of it.
    tolerance, phase_tolerance, duty_tolerance: how far frequencies, phases and duty cycles may be
        off where an output says nothing else: 100 ppm, 0.5 degrees and 0.5 percent points.
    max_jitter: the most jitter that an output may have, ps.
    bandwidth: LOW, HIGH or OPTIMIZED; all by default.
    rank: what counts first of settings that meet all: jitter (default), error, margin or vco.
    exact: short for a tolerance of 0.
    feedback: a KRU_SP only with its feedback connected.
    prefer_max_vco: the highest VCO counts instead of the lowest.
    int_div0: of a TSYN only whole M and whole dividers.
    any_order: outputs may change places.
    engine: only what the design flow's own search answers.
    pick: the candidate to take, by its number in `compare`.

    Raises RequestError when that cannot be read, and UnsolvedError when nothing keeps the device's
    limits. A plan that misses a demand is a plan: look at `within`.
    """
    names = dict(locals())
    del names["request"], names["pick"]
    _count("pick", pick, 1)
    made = _planner.Plan(request_json(request, names))
    first = Plan(made, _planner.Part.PLAN)
    return first if pick == 1 else first.pick(pick)


def compare(
    inputs: Optional[AnyInputs] = None,
    outputs: Optional[Iterable[AnyOutput]] = None,
    *,
    request: Optional[Mapping[str, Any]] = None,
    **entries: Any,
) -> Plan:
    """All candidates, the best first, and the primitives without any. Takes what `plan` takes."""
    return plan(inputs, outputs, request=request, **entries).compare()


def best(
    inputs: Optional[AnyInputs] = None,
    outputs: Optional[Iterable[AnyOutput]] = None,
    *,
    request: Optional[Mapping[str, Any]] = None,
    front: int = _USUAL_FRONT,
    **entries: Any,
) -> Plan:
    """The best, that of each other primitive, at most `front` trade-offs, and what the engine has
    to say. Takes what `plan` takes."""
    _count("front", front, 0)
    return plan(inputs, outputs, request=request, **entries).best(front)


def explain(
    inputs: Optional[AnyInputs] = None,
    outputs: Optional[Iterable[AnyOutput]] = None,
    *,
    request: Optional[Mapping[str, Any]] = None,
    oscillators: Optional[Iterable[Value]] = None,
    **entries: Any,
) -> Explanation:
    """What is in the way of a request, and what would work.

    oscillators: input frequencies to try instead of stock ones. The rest is what `plan` takes, but
    `pick`.
    """
    whole = {"inputs": inputs, "outputs": outputs, **entries}
    tried = None
    if oscillators is not None:
        tried = json.dumps([str(written(one, "oscillators")) for one in listed(oscillators)])
    return Explanation(_planner.Explanation(request_json(request, whole), tried))
