"""Settings of the caller's own."""

import json
import subprocess
from decimal import Decimal
from fractions import Fraction

import pytest

import vorkel


def program(build_dir, *words):
    """What the program writes."""
    result = subprocess.run([f"{build_dir}/vorkel", *words], capture_output=True, text=True)
    assert result.returncode in (0, 3), result.stderr
    return result.stdout


def test_what_settings_make():
    # 27 x 44 is 1188 MHz: 8 x 148.5, 16 x 74.25. A VCO of 600 to 1440 MHz leaves 252 of 1440.
    made = vorkel.evaluate(
        27, m=44, d=1, divide=[8, None, 16], set_phase=[90, None, 0], device="vk40"
    )
    assert (made.primitive, made.device[:4], made.within) == ("TSYN", "vk40", True)
    assert [one.used for one in made.outputs] == [True, False, True]
    assert made.outputs[0].actual == Fraction(297, 2)
    assert (made.outputs[0].phase, made.outputs[0].phase_step) == (90, 16)
    assert made.outputs[2].period == Fraction(4000, 297)
    assert (made.settings.vco, made.settings.pfd) == (1188, 27)
    assert made.settings.bandwidth == "OPTIMIZED"
    assert made.answer.limits.vco_margin == Fraction(252, 1440)
    assert repr(made) == "<vorkel.Evaluation vk40b484-2 TSYN: 148.5 MHz, -, 74.25 MHz>"


def test_a_limit_that_is_broken_is_told():
    made = vorkel.evaluate(27, ["148.5", 20], m=54, d=1, divide=[8, 16], device="vk40")
    assert not made.within
    # 27 x 54 is 1458 MHz, 18 above 1440; output 1 is at 91.125 MHz.
    assert made.answer.limits.vco_margin == Fraction(-18, 1440)
    broken = [one for one in made.answer.findings if one.kind == "outside_limit"]
    assert [(one.quantity, one.value, one.range.highest) for one in broken] == [("vco", 1458, 1440)]
    assert len(made.answer.misses) == 2
    assert made.outputs[1].error_ppm == (Fraction(1458, 16) / 20 - 1) * 1_000_000


@pytest.mark.parametrize("m", [41.625, "41.625", Fraction(333, 8), Decimal("41.625"), "333/8"])
def test_numbers_are_taken_exactly(m):
    made = vorkel.evaluate("24 MHz", m=m, d=1, divide="9.125,10")
    assert made.settings.m == Fraction(333, 8)
    assert [one.actual for one in made.outputs] == [Fraction(999 * 8, 73), Fraction(999, 10)]


def test_a_kru():
    made = vorkel.evaluate(
        100,
        pins=["CLKDV", None, "CLK90"],
        divide=2.5,
        feedback=True,
        divide_by_2=True,
        phase_shift=3,
    )
    assert made.primitive == "KRU_SP"
    assert [one.pin for one in made.outputs] == ["CLKDV", None, "CLK90"]
    # 50 MHz behind the half.
    assert [one.actual for one in made.outputs if one.used] == [20, 50]
    settings = made.settings
    assert (settings.divide, settings.phase_shift) == (Fraction(5, 2), 3)
    assert settings.clkin_divide_by_2


CALLS = [
    (
        dict(inputs=27, outputs=[148.5, 74.25], m=44, d=1, divide=[8, 16], bandwidth="LOW"),
        "--in 27 --out 148.5,74.25 --m 44 --d 1 --divide 8,16 --bandwidth LOW",
    ),
    (
        dict(inputs=100, m=9, d=1, divide=[9, 10], phase_steps=[-3, 4], high_times=[4, 0]),
        "--in 100 --m 9 --d 1 --divide 9,10 --phase-steps -3,4 --high-times 4,0",
    ),
    (
        dict(inputs=[25, 50], m="57.625", d=1, divide=[8], set_duty=["50%"], input_tolerance=50),
        "--in 25,50 --m 57.625 --d 1 --divide 8 --set-duty 50 --input-tolerance 50",
    ),
    (
        dict(inputs=50, pins="CLKFX,CLKFXDV", m=8, d=4, divide=4, primitive="KRU_CLKGEN"),
        "--in 50 --pins CLKFX,CLKFXDV --m 8 --d 4 --divide 4 --primitive KRU_CLKGEN",
    ),
]


@pytest.mark.parametrize("arguments, words", CALLS)
def test_it_is_what_the_program_writes(build_dir, arguments, words):
    def shown(*more):
        return program(build_dir, "evaluate", *words.split(), *more)

    made = vorkel.evaluate(**arguments)
    assert made.to_text() == shown()
    assert made.to_json() == shown("--format", "json")
    assert made.to_dict() == json.loads(made.to_json())
    assert made.to_tcl() == shown("--format", "tcl")
    assert made.to_sdc() == shown("--format", "sdc")
    assert made.to_sdc(plain=True) == shown("--format", "sdc-plain")
    assert made.to_verilog("a") == shown("--format", "verilog", "--name", "a")
    assert made.to_vhdl() == shown("--format", "vhdl")
    bench = ("--format", "testbench", "--language", "vhdl")
    assert made.to_testbench(language="vhdl") == shown(*bench)
    assert vorkel.verify(made) == ()


def test_a_plan_with_something_changed(video):
    assert [one.actual for one in vorkel.evaluate(plan=video).outputs] == [
        one.actual for one in video.outputs
    ]
    low = vorkel.evaluate(plan=video, bandwidth="LOW")
    assert (low.settings.bandwidth, low.settings.m) == ("LOW", 44)
    assert low.answer.max_jitter > video.answer.max_jitter
    edited = video.to_dict()
    edited["answers"][0]["settings"]["m"] = 45
    del edited["answers"][0]["settings"]["m_eighths"]
    for text in (edited, json.dumps(edited)):
        made = vorkel.evaluate(plan=text)
        assert made.outputs[0].actual == Fraction(27 * 45, 8)
        assert not made.within
    # What it is compared with can be replaced, too.
    assert vorkel.evaluate(outputs=["151.875", None, None], plan=edited).within
    second = video.compare().answers[1]
    assert vorkel.evaluate(plan=video.compare(), pick=2).settings == second.settings


def test_relations_of_settings():
    (there, back) = [
        one
        for one in vorkel.evaluate(100, m=9, d=1, divide=[6, 9]).relations()
        if one.launching.outputs and one.capturing.outputs
    ]
    # 150 and 100 MHz: 20 ns, and edges at 6.667 and 10 ns.
    assert (there.hyperperiod, there.gap, there.ratio) == (20, Fraction(10, 3), Fraction(2, 3))
    assert back.gap == Fraction(10, 3)


@pytest.mark.parametrize(
    "arguments, kind, entry, said",
    [
        (dict(m=4, d=1, divide=[8]), "no_setting", "m", "m: 4 is no M of a TSYN"),
        (dict(m=44, d=1), "missing", "divide", 'such as divide="8,16"'),
        (dict(m="x", d=1, divide=[8]), "not_a_value", "m", "m: "),
        (dict(m={}, d=1, divide=[8]), "wrong_type", "m", "dict"),
        (dict(m=44, d=1, divide=[8], set_phase=[3]), "no_setting", "set_phase", "5.625"),
        (dict(m=44, d=1, divide=[8], phase_steps=[1, 2]), "count_differs", "phase_steps", "2 in"),
        (dict(pins=["CLK0"]), "no_setting", "pins", "it needs the feedback, feedback=True"),
        (dict(pins="CLKFX", m=2, d=1, divide_by_2="no"), "not_a_switch", "divide_by_2", "'no'"),
        (dict(m=44, d=1, divide=[8], pick=1), "contradiction", "pick", "plan"),
        (dict(plan="{", m=44), "syntax", "", "plan:1:2"),
        (dict(plan={}), "not_a_plan", "", "no plan with settings"),
        (dict(m=44, d=1, divide=[8], device="nothing"), "unknown_device", "device", "nothing"),
        (dict(m=44, d=1, divide=[8], primitive="MMM"), "not_a_name", "primitive", "MMM"),
    ],
)
def test_what_cannot_be_read(arguments, kind, entry, said):
    with pytest.raises(vorkel.RequestError) as caught:
        vorkel.evaluate(27, **arguments)
    (mistake,) = caught.value.mistakes
    assert (mistake.kind, mistake.entry) == (kind, entry)
    assert said in mistake.message
    assert "--" not in mistake.message.replace("such as --format json writes", "")


def test_the_input_is_missing():
    with pytest.raises(vorkel.RequestError, match='^inputs is missing: .* such as inputs="100"$'):
        vorkel.evaluate(m=44, d=1, divide=[8])
