"""Plan the clocks of a device: find the settings of its clock primitives.

    >>> import vorkel
    >>> plan = vorkel.plan(inputs=["27 MHz"], outputs=["148.5 MHz", "74.25 MHz"], device="vk40",
    ...                    int_div0=True)
    >>> plan.primitive
    'TSYN'
    >>> [str(output.actual) for output in plan.outputs]
    ['297/2', '297/4']
    >>> print(plan.to_sdc())    # doctest: +SKIP

Frequencies are in MHz, phases in degrees, duty cycles in percent, jitter in ps peak to peak and
errors of a frequency in ppm. What is worked out exactly is a `fractions.Fraction`; jitter is a
float. A request that cannot be read raises `RequestError`, and one that nothing serves
`UnsolvedError`; both have the findings as data.
"""

from ._answers import (
    Answer,
    Finding,
    KruSettings,
    Limits,
    LoopSettings,
    OutputAnswer,
    Range,
    Ranking,
    Refusal,
)
from ._calls import Plan, batch, best, compare, explain, plan, relations
from ._devices import (
    Device,
    DeviceCheck,
    DeviceGrade,
    DeviceLimit,
    DeviceMistake,
    DevicePrimitive,
    DeviceWarning,
    Discrepancy,
    GradeCheck,
    check,
    devices,
    verify,
)
from ._errors import Mistake, RequestError, UnsolvedError, VorkelError
from ._evaluation import Evaluation, evaluate
from ._explanation import (
    Change,
    Conflict,
    Demand,
    Explanation,
    InputThatServes,
    PrimitiveExplanation,
)
from ._models import models
from ._planner import version as __version__
from ._reach import Reach, Reachable, ReachableCount, ReachableGap, reach
from ._relations import Clock, Relation
from ._request import Output, Value

__all__ = [
    "Answer",
    "Change",
    "Clock",
    "Conflict",
    "Demand",
    "Device",
    "DeviceCheck",
    "DeviceGrade",
    "DeviceLimit",
    "DeviceMistake",
    "DevicePrimitive",
    "DeviceWarning",
    "Discrepancy",
    "Evaluation",
    "Explanation",
    "Finding",
    "GradeCheck",
    "InputThatServes",
    "KruSettings",
    "Limits",
    "LoopSettings",
    "Mistake",
    "Output",
    "OutputAnswer",
    "Plan",
    "PrimitiveExplanation",
    "Range",
    "Ranking",
    "Reach",
    "Reachable",
    "ReachableCount",
    "ReachableGap",
    "Refusal",
    "Relation",
    "RequestError",
    "UnsolvedError",
    "Value",
    "VorkelError",
    "__version__",
    "batch",
    "best",
    "check",
    "compare",
    "devices",
    "evaluate",
    "explain",
    "models",
    "plan",
    "reach",
    "relations",
    "verify",
]
