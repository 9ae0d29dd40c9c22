"""Plans: the calls, and what they answer."""

from __future__ import annotations

import json
from typing import Any, Iterable, Iterator, Mapping, Optional, Tuple, Union

from . import _planner
from ._answers import Answer, Refusal
from ._document import Document, form, is_vhdl, whole
from ._errors import VorkelError, mistake
from ._explanation import Explanation
from ._relations import Relation, relations_of
from ._request import AnyInputs, AnyOutput, Value, listed, request_json, written

_USUAL_FRONT = 6


class Plan(Document):
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
        self._read()
        self._refused = tuple(
            Refusal.of(one["primitive"], one["reason"], one["refusals"])
            for one in self._data["answers"]
            if not one["solved"]
        )

    @property
    def answers(self) -> Tuple[Answer, ...]:
        """All answers of this plan, at least one."""
        return self._answers

    @property
    def refused(self) -> Tuple[Refusal, ...]:
        """Of `compare`: the primitives that have no settings."""
        return self._refused

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
        return Plan(self._made, _planner.Part.BEST, self._number, whole("front", front, 0))

    def to_json(self) -> str:
        """The document that `vorkel --format json` writes; `verify` and `evaluate` take it."""
        return self._made.json(self._part, self._number, self._most)

    def to_tcl(self) -> str:
        """The document as a Tcl dict."""
        return self._made.tcl(self._part, self._number, self._most)

    def to_text(self, width: int = 80) -> str:
        """The report that `vorkel` shows, for so many columns."""
        return self._made.report(self._part, self._number, self._most, whole("width", width, 40))

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
        fifos: data between clocks whose crossing needs a FIFO all goes through one; not with plain.
        gap: from which gap between edges on a crossing is timed as it stands, such as "0.5ns" or
            "20%" of the shorter period.
        """
        return self._made.sdc(self._chosen(number), *form(plain, fifos), gap or "")

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
        return self._made.hdl(self._chosen(number), is_vhdl(language), True, name)

    def _chosen(self, number: Optional[int]) -> int:
        return self._number if number is None else self._candidate(number)

    def _candidate(self, number: int) -> int:
        if whole("number", number, 1) > self._made.count:
            raise mistake(
                "no_candidate",
                str(number),
                f"there are {self._made.count} candidates, and no number {number}",
            )
        return number


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
    whole("pick", pick, 1)
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
    whole("front", front, 0)
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
    entries.update(inputs=inputs, outputs=outputs)
    tried = None
    if oscillators is not None:
        tried = json.dumps([str(written(one, "oscillators")) for one in listed(oscillators)])
    return Explanation(_planner.Explanation(request_json(request, entries), tried))


def relations(
    inputs: Optional[AnyInputs] = None,
    outputs: Optional[Iterable[AnyOutput]] = None,
    *,
    request: Optional[Mapping[str, Any]] = None,
    gap: Optional[str] = None,
    **entries: Any,
) -> Tuple[Relation, ...]:
    """How data crosses from each clock of a plan to each other. Takes what `plan` takes, and the
    gap of `Plan.relations`."""
    return plan(inputs, outputs, request=request, **entries).relations(gap=gap)


def batch(
    requests: Iterable[Mapping[str, Any]], **entries: Any
) -> Iterator[Union[Plan, VorkelError]]:
    """The plan of each request, in their order, one after the other as they are taken.

        >>> asked = [{"inputs": [27], "outputs": [148.5]}, {"inputs": [27]}]
        >>> for answer in vorkel.batch(asked, device="vk40"):
        ...     print(answer)
        <vorkel.Plan vk40b484-2 TSYN: 148.5 MHz>
        outputs: the outputs are missing

    requests: dictionaries as request files have them; each can have an "id", as the lines that
        `vorkel batch` reads.
    entries: what stands in place of theirs, as the arguments of `plan`.

    A request that cannot be read, or that nothing serves, has the exception in place of the plan.
    """
    for request in requests:
        try:
            if isinstance(request, Mapping):
                request = {name: one for name, one in request.items() if name != "id"}
            yield plan(request=request, **entries)
        except VorkelError as error:
            yield error
