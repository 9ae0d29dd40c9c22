"""What is wrong with a call is told as data."""

import pickle

import pytest

import vorkel


def mistakes(**entries):
    with pytest.raises(vorkel.RequestError) as caught:
        vorkel.plan(**entries)
    return caught.value.mistakes


def test_all_mistakes_of_a_request_are_told():
    found = mistakes(
        inputs=["27 parsecs"],
        outputs=["148,5", {"frequency": 74.25, "angle": 90}],
        bandwidth="NARROW",
        primitive="DLL",
    )
    assert [(one.kind, one.entry, one.index) for one in found] == [
        ("unknown_unit", "inputs", 0),
        ("not_a_value", "outputs", 0),
        ("unknown_entry", "outputs", 1),
        ("not_a_name", "primitive", None),
        ("not_a_name", "bandwidth", None),
    ] or sorted((one.kind, one.entry) for one in found) == [
        ("not_a_name", "bandwidth"),
        ("not_a_name", "primitive"),
        ("not_a_value", "outputs"),
        ("unknown_entry", "outputs"),
        ("unknown_unit", "inputs"),
    ]
    by_entry = {one.entry: one for one in found}
    assert by_entry["bandwidth"].text == "NARROW"
    assert set(by_entry["bandwidth"].known) >= {"LOW", "HIGH", "OPTIMIZED"}
    assert all(one.message for one in found)


@pytest.mark.parametrize(
    "entries, kind, entry",
    [
        (dict(outputs=[1]), "missing", "inputs"),
        (dict(inputs=[1]), "missing", "outputs"),
        (dict(inputs=[], outputs=[1]), "missing", "inputs"),
        (dict(inputs=27, outputs=[None]), "nothing_used", "outputs"),
        (dict(inputs=27, outputs=[float("nan")]), "not_a_value", "outputs"),
        (dict(inputs=float("inf"), outputs=[1]), "not_a_value", "inputs"),
        (dict(inputs=27, outputs=[-1]), "must_be", "outputs"),
        (dict(inputs=27, outputs=[0]), "must_be", "outputs"),
        (dict(inputs=27, outputs=[True]), "wrong_type", "outputs"),
        (dict(inputs=27, outputs=[[1]]), "wrong_type", "outputs"),
        (dict(inputs=27, outputs=[object()]), "wrong_type", "outputs"),
        (dict(inputs=object(), outputs=[1]), "wrong_type", "inputs"),
        (dict(inputs=27, outputs=[{"phase": 3}]), "no_frequency", "outputs"),
        (dict(inputs=27, outputs=["10 mHz"]), "other_unit", "outputs"),
        (dict(inputs=27, outputs=list(range(1, 9))), "too_many", "outputs"),
        (dict(inputs=27, outputs=[1], exact=True, tolerance=5), "contradiction", "exact"),
        (dict(inputs=27, outputs=[1], device="nothing"), "unknown_device", "device"),
        (dict(inputs=27, outputs=[1], device="vk"), "ambiguous_device", "device"),
        (dict(inputs=27, outputs=[1], device="vk40-9"), "unknown_grade", "device"),
        (dict(inputs=27, outputs=[1], device="vk20", primitive="PLL"), "no_primitive", "device"),
        (dict(inputs=27, outputs=[27], pick=0), "must_be", "pick"),
        (dict(inputs=27, outputs=[27], pick=10**5), "no_candidate", ""),
        (dict(request={"frob": 1, "inputs": 27, "outputs": 27}), "unknown_entry", ""),
    ],
)
def test_a_mistake(entries, kind, entry):
    found = mistakes(**entries)
    assert kind in [one.kind for one in found]
    assert entry in [one.entry for one in found]
    assert all(one.message and not one.message.startswith("--") for one in found)


def test_an_unknown_argument_is_a_type_error():
    for call in (vorkel.plan, vorkel.compare, vorkel.best):
        with pytest.raises(TypeError):
            call(27, [148.5], colour="red")


def test_a_sentence_without_a_place_begins_with_what_is_wrong():
    with pytest.raises(vorkel.RequestError, match='^unknown entry "colour"; the entries are '):
        vorkel.plan(request={"inputs": [27], "outputs": [27], "colour": 1})


def test_what_python_itself_knows():
    assert issubclass(vorkel.RequestError, ValueError)
    assert issubclass(vorkel.RequestError, vorkel.VorkelError)
    assert issubclass(vorkel.UnsolvedError, vorkel.VorkelError)


# 1 GHz is above the range of each output of a vk10, and 0.001 MHz below that of each input.
def test_a_request_that_nothing_serves():
    with pytest.raises(vorkel.UnsolvedError) as caught:
        vorkel.plan("1 kHz", ["5 GHz"], device="vk10")
    reasons = caught.value.reasons
    assert {one.primitive for one in reasons} == {"PLL", "KRU_SP", "KRU_CLKGEN"}
    assert all(one.reason and one.findings for one in reasons)
    for one in reasons:
        assert f"{one.primitive}: {one.reason}" in str(caught.value)


def test_errors_can_be_sent_to_another_process():
    with pytest.raises(vorkel.RequestError) as caught:
        vorkel.plan(27, ["x"])
    again = pickle.loads(pickle.dumps(caught.value))
    assert again.mistakes == caught.value.mistakes
    assert str(again) == str(caught.value)
    with pytest.raises(vorkel.UnsolvedError) as unsolved:
        vorkel.plan("1 kHz", ["5 GHz"], device="vk10")
    assert pickle.loads(pickle.dumps(unsolved.value)).reasons == unsolved.value.reasons


def test_a_failed_call_leaves_nothing_behind(video):
    for _ in range(50):
        with pytest.raises(vorkel.RequestError):
            vorkel.plan(27, ["x"])
    assert vorkel.plan(27, [148.5, 74.25, 27]).answer == video.answer


@pytest.mark.parametrize("call", ["pick", "to_sdc"])
@pytest.mark.parametrize("number", [0, -1, 10**9, "1", 1.0, True])
def test_candidates_that_there_are_not(video, call, number):
    with pytest.raises(vorkel.RequestError):
        getattr(video, call)(number)


def test_widths_and_counts(video):
    with pytest.raises(vorkel.RequestError):
        video.to_text(width=1)
    with pytest.raises(vorkel.RequestError):
        vorkel.best(27, [27], front=-1)


def test_names_that_no_module_can_have(video):
    for name in ("module", "", "a b", "3clocks", "a\n"):
        for write in (video.to_verilog, video.to_vhdl, video.to_testbench):
            with pytest.raises(vorkel.RequestError) as caught:
                write(name)
            assert caught.value.mistakes[0].kind == "not_writable"
    with pytest.raises(vorkel.RequestError):
        video.to_testbench(language="c")


@pytest.mark.parametrize("gap", ["-1ns", "x", "0%", "200%"])
def test_gaps_that_there_are_not(video, gap):
    for call in (video.relations, video.to_sdc):
        with pytest.raises(vorkel.RequestError) as caught:
            call(gap=gap)
        assert caught.value.mistakes[0].entry == "gap"


def test_plain_constraints_know_no_fifos(video):
    made = vorkel.evaluate(27, m=44, d=1, divide=[8])
    for call in (video.to_sdc, made.to_sdc):
        assert "create_clock" in call(plain=True)
        with pytest.raises(vorkel.RequestError, match="plain form") as caught:
            call(plain=True, fifos=True)
        (found,) = caught.value.mistakes
        assert (found.kind, found.entry) == ("contradiction", "fifos")
