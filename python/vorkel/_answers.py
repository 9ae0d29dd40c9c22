"""Answers: what settings make of a request."""

from __future__ import annotations

from dataclasses import dataclass
from fractions import Fraction
from typing import Any, Iterable, Optional, Tuple, Union

from ._data import Data, exact, exact_or_none


@dataclass(frozen=True)
class Range:
    """A range with both ends in it."""

    lowest: Fraction
    highest: Fraction

    def __contains__(self, value: object) -> bool:
        return isinstance(value, (int, float, Fraction)) and self.lowest <= value <= self.highest

    @classmethod
    def of(cls, data: Data) -> Range:
        return cls(exact(data, "lowest"), exact(data, "highest"))

    @classmethod
    def or_none(cls, data: Optional[Data]) -> Optional[Range]:
        return None if data is None else cls.of(data)


@dataclass(frozen=True)
class Finding:
    """What there is to say beside numbers: a broken limit, a missed demand, a note."""

    kind: str
    quantity: Optional[str]
    primitive: Optional[str]
    output: Optional[int]
    input: Optional[int]
    pin: Optional[str]
    value: Optional[Fraction]
    """The number that it is about."""
    range: Optional[Range]
    """What that may be."""
    corner: Fraction
    """By how many ppm the input is off where a limit is broken."""
    text: str
    """All of it as a sentence."""

    @classmethod
    def of(cls, data: Data) -> Finding:
        return cls(
            kind=data["kind"],
            quantity=data.get("quantity"),
            primitive=data.get("primitive"),
            output=data.get("output"),
            input=data.get("input"),
            pin=data.get("pin"),
            value=exact_or_none(data, "value"),
            range=Range.or_none(data.get("range")),
            corner=exact_or_none(data, "corner") or Fraction(0),
            text=data["text"],
        )


def findings(data: Iterable[Data]) -> Tuple[Finding, ...]:
    return tuple(Finding.of(one) for one in data)


@dataclass(frozen=True)
class Refusal:
    """A primitive that has no settings, and why."""

    primitive: str
    reason: str
    findings: Tuple[Finding, ...]

    @classmethod
    def of(cls, primitive: str, reason: str, refusals: Iterable[Data]) -> Refusal:
        return cls(primitive, reason, findings(refusals))


@dataclass(frozen=True)
class LoopSettings:
    """The settings of a PLL or a TSYN; those of the outputs stand with them."""

    bandwidth: str
    """LOW, HIGH or OPTIMIZED."""
    m: Fraction
    d: int
    m_eighths: int
    """M as a whole number, in eighths."""
    vco: Fraction
    """MHz."""
    pfd: Fraction
    """MHz."""
    vco_second: Optional[Fraction]
    """With the second input; None without one."""
    pfd_second: Optional[Fraction]


@dataclass(frozen=True)
class KruSettings:
    """The settings of a KRU_SP or a KRU_CLKGEN; None for what it does not have or use."""

    m: Optional[int]
    d: Optional[int]
    divide: Optional[Fraction]
    """Of CLKDV or CLKFXDV."""
    divide_halves: Optional[int]
    """The same as a whole number, in halves."""
    feedback: Optional[bool]
    clkin_divide_by_2: Optional[bool]
    phase_shift: Optional[int]
    phase_offset: Optional[Fraction]
    """Degrees: what PHASE_SHIFT is to make."""


@dataclass(frozen=True)
class Limits:
    """The device's limits of a PLL or a TSYN."""

    vco: Range
    pfd: Range
    largest_count: int
    """The most VCO periods for which a divider can hold its output high or low."""
    vco_margin: Fraction
    """The smallest distance from an end of the range, as a fraction of that end, with each input
    and all of its tolerance; negative outside."""
    pfd_margin: Fraction


@dataclass(frozen=True)
class OutputAnswer:
    """What settings make of one output. Only `index` counts of one that is not used."""

    index: int
    """Its place, from 0."""
    used: bool
    request: int
    """The output of the request that stands here; any_order can have moved it."""
    requested: Fraction
    """MHz."""
    actual: Fraction
    """MHz, with the first input."""
    actual_second: Optional[Fraction]
    """MHz, with the second input."""
    error_ppm: Fraction
    multiply: int
    """The frequency is input * multiply / divide, exactly."""
    divide: int
    pin: Optional[str]
    """Of a KRU."""
    divider: Optional[Fraction]
    """Of a PLL or a TSYN."""
    divider_eighths: Optional[int]
    phase_step: Optional[int]
    """In eighths of a VCO period."""
    high_time: Optional[int]
    """In halves of a VCO period; 0: not set, 50 percent."""
    requested_phase: Optional[Fraction]
    phase: Fraction
    """Degrees."""
    phase_error: Optional[Fraction]
    requested_duty: Optional[Fraction]
    duty: Fraction
    """Percent."""
    duty_error: Optional[Fraction]
    jitter: Optional[float]
    """ps, peak to peak at a bit error rate of 1e-12; None: not known."""
    jitter_rms: Optional[float]
    searched: Optional[float]
    """MHz: what the engine counted with, where that differs."""
    range: Optional[Range]
    """The device's, MHz."""
    margin: Fraction
    """The smallest distance from an end of that, as a fraction of the end; negative outside."""
    within: bool
    """As asked for, and in the device's range."""

    @property
    def period(self) -> Fraction:
        """ns."""
        return 1000 / self.actual

    @classmethod
    def of(cls, data: Data) -> OutputAnswer:
        if not data["used"]:
            data = {"request": data["index"], "multiply": 0, "divide": 1, "within": True, **data}
        zero = Fraction(0)
        return cls(
            index=data["index"],
            used=data["used"],
            request=data["request"],
            requested=exact_or_none(data, "requested") or zero,
            actual=exact_or_none(data, "actual") or zero,
            actual_second=exact_or_none(data, "actual_second"),
            error_ppm=exact_or_none(data, "error_ppm") or zero,
            multiply=data["multiply"],
            divide=data["divide"],
            pin=data.get("pin"),
            divider=_eighths(data.get("divider_eighths")),
            divider_eighths=data.get("divider_eighths"),
            phase_step=data.get("phase_step"),
            high_time=data.get("high_time"),
            requested_phase=exact_or_none(data, "requested_phase"),
            phase=exact_or_none(data, "phase") or zero,
            phase_error=exact_or_none(data, "phase_error"),
            requested_duty=exact_or_none(data, "requested_duty"),
            duty=exact_or_none(data, "duty") or zero,
            duty_error=exact_or_none(data, "duty_error"),
            jitter=data.get("jitter"),
            jitter_rms=data.get("jitter_rms"),
            searched=data.get("search"),
            range=Range.or_none(data.get("range")),
            margin=exact_or_none(data, "margin") or zero,
            within=data["within"],
        )


def _eighths(count: Optional[int]) -> Optional[Fraction]:
    return None if count is None else Fraction(count, 8)


@dataclass(frozen=True)
class Ranking:
    """What the ranking goes by."""

    rank_class: str
    """met: all demands are met; missed: only the limits are kept; broken: not even these."""
    worst_error: Fraction
    """The largest error of all demands, each in units of its tolerance."""
    max_jitter: Optional[float]
    margin: Fraction
    """The smallest distance from a limit of the device, as a fraction of that limit."""
    vco: Fraction


@dataclass(frozen=True)
class Answer:
    """Settings of one primitive, and what they make of the request."""

    number: Optional[int]
    """In the ranking, from 1; None: not in that, as a trade-off."""
    tradeoff: bool
    """No settings of its class have both a smaller error and less jitter."""
    primitive: str
    """PLL, TSYN, KRU_SP or KRU_CLKGEN."""
    source: str
    """engine, search or both: who has found them."""
    variant: str
    """What was special about the engine's search, such as "largest VCO"."""
    within: bool
    """All is as asked for, and in the device's range."""
    settings: Union[LoopSettings, KruSettings]
    limits: Optional[Limits]
    """Of a PLL or a TSYN."""
    outputs: Tuple[OutputAnswer, ...]
    input_jitter: float
    """ps: what the figures are for."""
    input_tolerance: Fraction
    """ppm: with which limits and margins are judged."""
    phase_error: Optional[float]
    """ps, between input and outputs."""
    worst_ppm: Fraction
    max_jitter: Optional[float]
    ranking: Ranking
    misses: Tuple[str, ...]
    """Sentences on what is not as asked for."""
    violations: Tuple[str, ...]
    """Sentences on what is outside of the device's range."""
    notes: Tuple[str, ...]
    """Sentences on what else should be known."""
    findings: Tuple[Finding, ...]
    """What the last three say, as data."""

    @property
    def is_loop(self) -> bool:
        """Whether it is of a PLL or a TSYN."""
        return isinstance(self.settings, LoopSettings)

    @classmethod
    def of(cls, data: Data) -> Answer:
        return cls(
            number=data["number"],
            tradeoff=data["tradeoff"],
            primitive=data["primitive"],
            source=data["source"],
            variant=data["variant"],
            within=data["within"],
            settings=_settings(data),
            limits=_limits(data["limits"]),
            outputs=tuple(OutputAnswer.of(one) for one in data["outputs"]),
            input_jitter=data["input_jitter"],
            input_tolerance=exact(data, "input_tolerance"),
            phase_error=data["phase_error"],
            worst_ppm=exact(data, "worst_ppm"),
            max_jitter=data["max_jitter"],
            ranking=_ranking(data["ranking"]),
            misses=tuple(data["misses"]),
            violations=tuple(data["violations"]),
            notes=tuple(data["notes"]),
            findings=findings(data["findings"]),
        )


def _settings(data: Data) -> Union[LoopSettings, KruSettings]:
    settings: Any = data["settings"]
    if "m_eighths" in settings:
        return LoopSettings(
            bandwidth=data["bandwidth"],
            m=Fraction(settings["m_eighths"], 8),
            d=settings["d"],
            m_eighths=settings["m_eighths"],
            vco=exact(settings, "vco"),
            pfd=exact(settings, "pfd"),
            vco_second=exact_or_none(settings, "vco_second"),
            pfd_second=exact_or_none(settings, "pfd_second"),
        )
    halves = settings.get("divide_halves")
    return KruSettings(
        m=settings.get("m"),
        d=settings.get("d"),
        divide=None if halves is None else Fraction(halves, 2),
        divide_halves=halves,
        feedback=settings.get("feedback"),
        clkin_divide_by_2=settings.get("clkin_divide_by_2"),
        phase_shift=settings.get("phase_shift"),
        phase_offset=exact_or_none(settings, "phase_offset"),
    )


def _limits(data: Optional[Data]) -> Optional[Limits]:
    if data is None:
        return None
    return Limits(
        vco=Range.of(data["vco"]),
        pfd=Range.of(data["pfd"]),
        largest_count=data["largest_count"],
        vco_margin=exact(data, "vco_margin"),
        pfd_margin=exact(data, "pfd_margin"),
    )


def _ranking(data: Data) -> Ranking:
    return Ranking(
        rank_class=data["class"],
        worst_error=exact(data, "worst_error"),
        max_jitter=data["max_jitter"],
        margin=exact(data, "margin"),
        vco=exact(data, "vco"),
    )
