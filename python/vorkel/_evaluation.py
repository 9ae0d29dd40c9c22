"""Settings of the caller's own: what they make, and which limits they keep."""

from __future__ import annotations

import json
from typing import Any, Iterable, Mapping, Optional, Tuple, Union

from . import _planner
from ._document import Document, form, is_vhdl, whole
from ._errors import mistake
from ._relations import Relation, relations_of
from ._request import AnyInputs, AnyOutput, Value, request_json, text_of

Values = Union[Value, Iterable[Optional[Value]]]
"""One for each output, None for one that is not used; or a text, such as "8,16,-"."""


class Evaluation(Document):
    """What settings make that are there already, and what is to be said of them.

    `within` tells whether they keep all limits of the device and meet what they were compared with;
    `answer.findings` has what they break or miss, and the margins stand in `answer.limits` and with
    each output.
    """

    def __init__(self, made: _planner.Evaluation) -> None:
        self._made = made
        self._read()

    def to_json(self) -> str:
        """The document that `vorkel evaluate --format json` writes."""
        return self._made.json()

    def to_tcl(self) -> str:
        """The document as a Tcl dict."""
        return self._made.tcl()

    def to_text(self, width: int = 80) -> str:
        """The report that `vorkel evaluate` shows, for so many columns."""
        return self._made.report(whole("width", width, 40))

    def to_sdc(
        self, *, plain: bool = False, fifos: bool = False, gap: Optional[str] = None
    ) -> str:
        """Timing constraints; the arguments are those of `Plan.to_sdc`."""
        return self._made.sdc(*form(plain, fifos), gap or "")

    def relations(self, *, gap: Optional[str] = None) -> Tuple[Relation, ...]:
        """How data crosses from each clock to each other."""
        return relations_of(json.loads(self._made.relations(gap or "")))

    def to_verilog(self, name: str = "clocks") -> str:
        """A Verilog module with the primitive and these settings."""
        return self._made.hdl(False, False, name)

    def to_vhdl(self, name: str = "clocks") -> str:
        """The same as a VHDL entity."""
        return self._made.hdl(True, False, name)

    def to_testbench(self, name: str = "clocks", *, language: str = "verilog") -> str:
        """A testbench, in verilog or vhdl, that checks every edge of that module."""
        return self._made.hdl(is_vhdl(language), True, name)


AnyPlan = Union[Document, str, Mapping[str, Any]]
"""A plan, its JSON, or that as a dictionary."""


def plan_json(plan: AnyPlan) -> str:
    """The JSON of a plan."""
    if isinstance(plan, Document):
        return plan.to_json()
    return plan if isinstance(plan, str) else json.dumps(plan, indent=2)


_SETTINGS = (
    "m", "d", "divide", "phase_steps", "set_phase", "high_times", "set_duty", "pins",
    "divide_by_2", "phase_shift",
)  # fmt: skip


def evaluate(
    inputs: Optional[AnyInputs] = None,
    outputs: Optional[Iterable[AnyOutput]] = None,
    *,
    m: Optional[Value] = None,
    d: Optional[int] = None,
    divide: Optional[Values] = None,
    phase_steps: Optional[Values] = None,
    set_phase: Optional[Values] = None,
    high_times: Optional[Values] = None,
    set_duty: Optional[Values] = None,
    pins: Optional[Union[str, Iterable[Optional[str]]]] = None,
    divide_by_2: Optional[bool] = None,
    phase_shift: Optional[int] = None,
    plan: Optional[AnyPlan] = None,
    pick: Optional[int] = None,
    request: Optional[Mapping[str, Any]] = None,
    device: Optional[str] = None,
    primitive: Optional[str] = None,
    bandwidth: Optional[str] = None,
    feedback: Optional[bool] = None,
    input_jitter: Optional[Value] = None,
    input_tolerance: Optional[Value] = None,
    tolerance: Optional[Value] = None,
    phase_tolerance: Optional[Value] = None,
    duty_tolerance: Optional[Value] = None,
    max_jitter: Optional[Value] = None,
    exact: Optional[bool] = None,
) -> Evaluation:
    """What settings make of the inputs: frequencies, phases, duty cycles, jitter, and the margin to
    each limit of the device. Nothing is searched.

        >>> made = vorkel.evaluate(27, m=44, d=1, divide=[8, 16, 44], device="vk40")
        >>> [str(output.actual) for output in made.outputs]
        ['297/2', '297/4', '27']
        >>> made.answer.limits.vco_margin
        Fraction(7, 40)

    m, d: of the loop; M of a TSYN with up to five outputs can go in steps of 1/8.
    divide: the divider of each output; of a KRU one value, that of CLKDV or CLKFXDV.
    phase_steps, set_phase: the phase of each output, in eighths of a VCO period or in degrees.
    high_times, set_duty: how long each output is high, in halves of a VCO period or in percent.
    pins: the pin of each output of a KRU.
    divide_by_2, phase_shift: of a KRU_SP: CLKIN_DIVIDE_BY_2 and PHASE_SHIFT.
    plan: a plan, its JSON, or that as a dictionary, which may have been edited: its settings and
        its request count where the arguments say nothing else.
    pick: of such a plan the answer with that number; the first by default.
    outputs: what the outputs are to be compared with; nothing by default.
    primitive: a TSYN by default, or a PLL on a device without one; with pins a KRU_SP, or a
        KRU_CLKGEN where CLKFXDV is among them.
    bandwidth: of the loop; OPTIMIZED by default.
    feedback: of a KRU_SP: whether it is connected.

    The others are those of `plan`. Raises RequestError when that cannot be read, or the primitive
    cannot be set to it. A limit that is broken raises nothing: look at `within`.
    """
    said = dict(locals())
    settings = [
        (name, text_of(said[name], name)) for name in _SETTINGS if said[name] is not None
    ]
    for name in (*_SETTINGS, "plan", "pick", "request"):
        del said[name]
    if divide_by_2 is not None and not isinstance(divide_by_2, bool):
        sentence = f"divide_by_2: {divide_by_2!r} must be True or False"
        raise mistake("not_a_switch", repr(divide_by_2), sentence, "divide_by_2")
    if pick is not None:
        whole("pick", pick, 1)
        if plan is None:
            raise mistake("contradiction", str(pick), "pick goes with a plan", "pick")
    text = None if plan is None else plan_json(plan)
    return Evaluation(_planner.Evaluation(request_json(request, said, ()), settings, text, pick))
