"""Which frequencies an output can have."""

import json
import subprocess
from fractions import Fraction

import pytest

import vorkel


def program(build_dir, *words):
    command = [f"{build_dir}/vorkel", "reach", *words, "--format", "json"]
    result = subprocess.run(command, capture_output=True, text=True)
    assert result.returncode == 0, result.stderr
    return json.loads(result.stdout)


def plain_frequencies(lowest, highest):
    """Those of a PLL from 27 MHz between bounds, by trying everything that the device has."""
    (device,) = vorkel.devices("vk40")
    (grade,) = [one for one in device.grades if one.name == device.default_grade]
    (pll,) = [one for one in grade.primitives if one.primitive == "PLL"]
    found = set()
    for d in range(1, 53):
        for m in range(1, 65):
            vco = Fraction(27 * m, d)
            if Fraction(27, d) not in pll.pfd or vco not in pll.vco:
                continue
            found.update(vco / divider for divider in range(1, 129))
    return sorted(one for one in found if lowest <= one <= highest)


def test_all_between_two_bounds():
    highest = Fraction(61, 2)
    reach = vorkel.reach(27, primitive="PLL", lowest="20 MHz", highest=highest, device="vk40")
    plain = plain_frequencies(20, highest)
    assert [one.frequency for one in reach.all()["PLL"]] == plain
    assert len(plain) > 100
    counted = reach.count()["PLL"]
    assert (counted.count, counted.lowest, counted.highest) == (len(plain), plain[0], plain[-1])
    assert [one.frequency for one in reach.all(most=3)["PLL"]] == plain[:3]
    for one in reach.all()["PLL"]:
        assert one.frequency == 27 * Fraction(one.multiply, one.divide)
        assert one.frequency == 27 * one.m / one.d / one.divider == one.vco / one.divider
    widths = sorted((high - low for low, high in zip(plain, plain[1:])), reverse=True)
    gaps = reach.gaps(4)["PLL"]
    assert [one.width for one in gaps] == widths[:4]
    assert all(one.above.frequency - one.below.frequency == one.width for one in gaps)
    assert gaps[0].width_ppm == gaps[0].width / gaps[0].below.frequency * 1_000_000
    near = reach.near("25.1 MHz", most=3)["PLL"]
    wanted = Fraction(251, 10)
    assert [one.frequency for one in near] == sorted(plain, key=lambda one: abs(one - wanted))[:3]
    assert near[0].error == near[0].frequency - wanted
    assert near[0].error_ppm == near[0].error / wanted * 1_000_000


def test_each_primitive_answers(build_dir):
    near = vorkel.reach(27, output=1, feedback=True).near(20, most=2)
    wanted = program(build_dir, *"--in 27 --output 1 --feedback --near 20 --most 2".split())
    assert list(near) == [one["primitive"] for one in wanted["primitives"]]
    for one in wanted["primitives"]:
        found = near[one["primitive"]]
        assert [str(point.frequency) for point in found] == [
            str(Fraction(point["frequency_exact"])) for point in one["frequencies"]
        ]
        assert [point.pin for point in found] == [point.get("pin") for point in one["frequencies"]]


# A plan for it has these settings.
def test_settings_are_those_of_the_plan():
    (one,) = vorkel.reach(27, primitive="TSYN", device="vk40").near("148.5 MHz", most=1)["TSYN"]
    plan = vorkel.plan(27, [one.frequency], primitive="TSYN", exact=True, device="vk40")
    settings = plan.settings
    assert (settings.m, settings.d, settings.bandwidth) == (one.m, one.d, one.bandwidth)
    assert plan.outputs[0].divider == one.divider
    assert plan.outputs[0].jitter == pytest.approx(one.jitter)


def test_nothing_in_the_bounds():
    reach = vorkel.reach(27, primitive="PLL", lowest=3000, highest=4000)
    assert reach.all() == {"PLL": ()} == reach.near(3500)
    counted = reach.count()["PLL"]
    assert (counted.count, counted.lowest, counted.highest) == (0, None, None)


def test_two_inputs():
    assert list(vorkel.reach([27, 54]).count()) == ["PLL", "TSYN"]
    with pytest.raises(vorkel.UnsolvedError) as caught:
        vorkel.reach([27, 54], primitive="KRU_SP")
    (reason,) = caught.value.reasons
    assert reason.primitive == "KRU_SP" and reason.findings[0].kind == "too_many_inputs"


@pytest.mark.parametrize(
    "arguments, entry, said",
    [
        (dict(inputs="x"), "inputs", "x"),
        (dict(inputs=[]), "inputs", "missing"),
        (dict(inputs=27, output=7), "output", "0 to 6"),
        (dict(inputs=27, output=-1), "output", "-1"),
        (dict(inputs=27, lowest="x"), "lowest", "x"),
        (dict(inputs=27, highest="x"), "highest", "x"),
        (dict(inputs=27, lowest=30, highest=20), "highest", "below"),
        (dict(inputs=27, device="nothing"), "device", "nothing"),
        (dict(inputs=27, primitive="MMM"), "primitive", "MMM"),
    ],
)
def test_what_cannot_be_read(arguments, entry, said):
    with pytest.raises(vorkel.RequestError) as caught:
        vorkel.reach(**arguments)
    assert caught.value.mistakes[0].entry == entry
    assert said in str(caught.value)


def test_questions_that_cannot_be_read():
    reach = vorkel.reach(27, primitive="PLL")
    for ask, entry in (
        (lambda: reach.near("x"), "near"),
        (lambda: reach.near(27, most=0), "most"),
        (lambda: reach.gaps(0), "most"),
        (lambda: reach.all(-1), "most"),
        (lambda: reach.all(True), "most"),
    ):
        with pytest.raises(vorkel.RequestError) as caught:
            ask()
        assert caught.value.mistakes[0].entry == entry
