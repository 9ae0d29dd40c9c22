"""Plans in Python: what can be asked, and what is answered."""

import json
import subprocess
import threading
from decimal import Decimal
from fractions import Fraction

import pytest

import vorkel


def test_answers_are_exact(video):
    assert video.device == "vk40b484-2"
    assert video.primitive == "TSYN"
    assert video.within
    settings = video.settings
    assert isinstance(settings, vorkel.LoopSettings)
    assert (settings.m, settings.d, settings.m_eighths) == (44, 1, 352)
    assert settings.vco == 27 * settings.m / settings.d == 1188
    assert settings.pfd == 27
    assert settings.vco in video.answer.limits.vco
    assert [one.divider for one in video.outputs] == [8, 16, 44]
    assert [one.actual for one in video.outputs] == [Fraction(297, 2), Fraction(297, 4), 27]
    for output in video.outputs:
        assert isinstance(output.actual, Fraction)
        assert output.actual == settings.vco / output.divider
        assert output.actual == Fraction(27) * output.multiply / output.divide
        assert output.error_ppm == 0
        assert output.period * output.actual == 1000
        assert output.jitter > output.jitter_rms > 0
        assert output.actual in output.range


@pytest.mark.parametrize(
    "frequency",
    [
        "148.5 MHz",
        "148500kHz",
        "297/2",
        148.5,
        Fraction(297, 2),
        Decimal("148.5"),
        Decimal("1.485e2"),
        {"frequency": "148.5"},
        {"frequency": Fraction(297, 2), "phase": None},
        vorkel.Output(148.5),
    ],
)
def test_a_frequency_in_many_forms(frequency):
    plan = vorkel.plan(27, [frequency], primitive="PLL")
    assert plan.outputs[0].requested == Fraction(297, 2)


def test_floats_are_the_decimals_that_they_show():
    plan = vorkel.plan(inputs=[33.3], outputs=[33.3], primitive="PLL")
    assert plan.outputs[0].requested == Fraction(333, 10)
    plan = vorkel.plan(inputs=Fraction(100, 3), outputs=[Fraction(100, 3)], primitive="PLL")
    assert plan.outputs[0].actual == Fraction(100, 3)


# 100 MHz x 6 is 600 MHz: of a divider of 6, a step of phase is an eighth of a sixth of a turn.
def test_phases_and_duty_cycles():
    plan = vorkel.plan(
        inputs=[100],
        outputs=[
            vorkel.Output(100, phase="90deg", duty="25%"),
            {"frequency": 50, "phase": 0},
            None,
        ],
        primitive="PLL",
    )
    first, second, third = plan.outputs
    assert (first.phase, first.requested_phase, first.phase_error) == (90, 90, 0)
    assert first.duty == 25
    assert first.phase == Fraction(first.phase_step, 8) / first.divider * 360
    assert first.duty == Fraction(first.high_time, 2) / first.divider * 100
    assert (second.phase, second.requested_duty) == (0, None)
    assert not third.used
    assert third.index == 2


def test_tolerances_of_one_output_and_of_all():
    entries = dict(inputs=[100], outputs=[{"frequency": 148.5, "tolerance": 2000}], primitive="PLL")
    assert vorkel.plan(**entries).within
    entries["outputs"] = [148.5]
    plan = vorkel.plan(**entries, exact=True)
    assert not plan.within
    assert plan.outputs[0].error_ppm != 0
    (missed,) = [one for one in plan.answer.findings if one.kind == "off_target"]
    assert (missed.value, missed.range.highest) == (plan.outputs[0].error_ppm, 0)
    assert plan.answer.misses


def test_a_request_as_a_dictionary_and_arguments_over_it():
    request = {"inputs": [27], "outputs": [148.5], "device": "vk10", "exact": True}
    assert vorkel.plan(request=request).device.startswith("vk10")
    plan = vorkel.plan(request=request, device="vk40", outputs=[54], tolerance=50)
    assert plan.device.startswith("vk40")
    assert plan.outputs[0].requested == 54
    assert plan.request["tolerance"] == 50
    again = vorkel.plan(request=plan.request)
    assert again.to_json() == plan.to_json()


# A VCO of 1188 MHz, with a 27 MHz that is up to 1 % off, stays below 1440 MHz by 1440 - 1199.88.
def test_tolerance_of_the_input(video):
    plan = vorkel.plan(27, [148.5, 74.25, 27], input_tolerance="1%", int_div0=True)
    assert plan.answer.input_tolerance == 10000
    limits, settings = plan.answer.limits, plan.settings
    most, least = Fraction(101, 100), Fraction(99, 100)
    for value, of, margin in (
        (settings.vco, limits.vco, limits.vco_margin),
        (settings.pfd, limits.pfd, limits.pfd_margin),
        *((one.actual, one.range, one.margin) for one in plan.outputs),
    ):
        low = (value * least - of.lowest) / of.lowest
        high = (of.highest - value * most) / of.highest
        assert margin == min(low, high)
    assert plan.answer.ranking.margin == min(
        limits.vco_margin, limits.pfd_margin, *(one.margin for one in plan.outputs)
    )
    assert video.answer.input_tolerance == 0


# 100 MHz times 3 on CLKFX, doubled, and as it is with half a turn.
def test_a_kru():
    plan = vorkel.plan(
        100, [300, 200, {"frequency": 100, "phase": 180}], primitive="KRU_SP", feedback=True
    )
    settings = plan.settings
    assert isinstance(settings, vorkel.KruSettings)
    assert settings.feedback is True
    assert [one.pin for one in plan.outputs] == ["CLKFX", "CLK2X", "CLK180"]
    assert Fraction(100) * settings.m / settings.d == 300
    assert plan.answer.limits is None
    assert not plan.answer.is_loop


def test_two_inputs():
    plan = vorkel.plan([100, "50 MHz"], [100], primitive="PLL")
    assert plan.outputs[0].actual_second == plan.outputs[0].actual / 2
    assert plan.settings.vco_second == plan.settings.vco / 2


def test_candidates(video):
    everything = video.compare()
    assert len(everything.answers) == video.candidates
    assert [one.number for one in everything.answers] == list(range(1, video.candidates + 1))
    assert everything.answers[0] == video.answer
    second = video.pick(2)
    assert second.answer == everything.answers[1]
    assert vorkel.plan(27, [148.5, 74.25, 27], pick=2).answer == second.answer
    assert second.to_sdc() == video.to_sdc(2) != video.to_sdc()
    named = vorkel.compare(27, [148.5, 74.25, 27], primitive="PLL")
    assert {one.primitive for one in named.answers} == {"PLL"}


def test_tradeoffs():
    request = dict(inputs=100, outputs=[148.5, 74.25, 27], tolerance="2%")
    plan = vorkel.best(**request, front=3)
    tradeoffs = [one for one in plan.answers if one.tradeoff]
    assert 1 < len(tradeoffs) <= 4
    # None is worse than another in both.
    figures = [(one.ranking.worst_error, one.max_jitter) for one in tradeoffs]
    assert all(one[0] < other[0] or one[1] < other[1]
               for one in figures for other in figures if one is not other)
    assert len(vorkel.best(**request, front=1).answers) < len(plan.answers)
    assert vorkel.plan(**request).best(3).to_json() == plan.to_json()


def test_refused_primitives_of_a_comparison():
    plan = vorkel.compare([100, 50], [100])
    refused = {one.primitive: one for one in plan.refused}
    assert refused["KRU_SP"].findings[0].kind == "too_many_inputs"
    assert refused["KRU_SP"].reason == refused["KRU_SP"].findings[0].text


@pytest.mark.parametrize(
    "words, written",
    [
        ("--format json", lambda plan: plan.to_json()),
        ("--format tcl", lambda plan: plan.to_tcl()),
        ("--format sdc", lambda plan: plan.to_sdc()),
        ("--format sdc-plain", lambda plan: plan.to_sdc(plain=True)),
        ("--format sdc --pick 2", lambda plan: plan.to_sdc(2)),
        ("--format verilog", lambda plan: plan.to_verilog()),
        ("--format verilog --name video", lambda plan: plan.to_verilog("video")),
        ("--format vhdl --pick 2", lambda plan: plan.to_vhdl(number=2)),
        ("--format testbench", lambda plan: plan.to_testbench()),
        ("--format testbench --language vhdl", lambda plan: plan.to_testbench(language="vhdl")),
    ],
)
def test_formats_are_those_of_the_program(video, build_dir, words, written):
    command = [f"{build_dir}/vorkel", "plan", "--in", "27MHz", "--out", "148.5,74.25,27"]
    shown = subprocess.run([*command, *words.split()], check=True, capture_output=True, text=True)
    assert written(video) == shown.stdout


# Of 148.5 and 74.25 MHz every second edge is the same one: a gap of 1000 / 148.5 ns.
def test_relations(video):
    relations = {(one.launching.name, one.capturing.name): one for one in video.relations()}
    one = relations["clk_out0", "clk_out1"]
    assert one.synchronous and not one.fifo
    assert one.ratio == Fraction(1, 2)
    assert one.gap == one.launching.period == 1000 / Fraction(297, 2)
    assert (one.launches, one.captures) == (2, 1)
    assert one.capturing.outputs == (1,)
    # 148.5 / 27 is 11 / 2.
    far = relations["clk_in1", "clk_out0"]
    assert (far.ratio, far.launches, far.captures) == (Fraction(11, 2), 2, 11)
    assert far.hyperperiod == Fraction(2000, 27)
    stricter = {(one.launching.name, one.capturing.name): one for one in video.relations(gap="6ns")}
    assert stricter["clk_in1", "clk_out0"].limit == 6


def test_the_report(video):
    text = video.to_text()
    assert text.startswith("device        vk40b484-2 TSYN\n")
    assert all(len(line) <= 80 for line in text.splitlines())
    assert len(video.to_text(width=60).splitlines()) > len(text.splitlines())
    assert "KRU_CLKGEN" in video.compare().to_text()
    assert "148.5 MHz" in repr(video)
    assert video.to_dict() == json.loads(video.to_json())


# Runs of the engine take turns: plans that are made at the same time get their own.
def test_threads_plan_beside_each_other():
    requests = [(27, 148.5), (25, 125), (100, 66), (50, 33)]
    expected = [vorkel.plan(*one, primitive="PLL").to_json() for one in requests]
    found = {}

    def work(index):
        one = requests[index % len(requests)]
        found[index] = vorkel.plan(*one, primitive="PLL").to_json()

    threads = [threading.Thread(target=work, args=(index,)) for index in range(8)]
    for thread in threads:
        thread.start()
    for thread in threads:
        thread.join()
    assert [found[index] for index in range(8)] == expected * 2
