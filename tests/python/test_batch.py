"""Many requests one after the other."""

from fractions import Fraction

import vorkel


def test_each_has_its_answer_and_a_bad_one_loses_nothing():
    asked = [
        {"id": 1, "inputs": [27], "outputs": [148.5]},
        {"inputs": [27], "outputs": ["148,5"]},
        {"inputs": ["1kHz"], "outputs": ["5GHz"]},
        "no request",
        {"id": "b", "inputs": [100], "outputs": [125], "device": "vk20"},
    ]
    answers = list(vorkel.batch(asked, device="vk40", primitive="PLL"))
    kinds = ["Plan", "RequestError", "UnsolvedError", "RequestError", "Plan"]
    assert [type(one).__name__ for one in answers] == kinds
    assert answers[0].outputs[0].actual == Fraction(297, 2)
    # What stands beside the requests replaces what they say.
    assert [answers[0].device[:4], answers[4].device[:4]] == ["vk40", "vk40"]
    assert answers[1].mistakes[0].text == "148,5"


def test_they_are_planned_as_they_are_taken():
    def requests():
        yield {"inputs": [27], "outputs": [27]}
        raise AssertionError("nobody has asked for a second one")

    assert next(vorkel.batch(requests())).within


def test_relations_of_a_plan():
    found = vorkel.relations(100, [150, 80], gap="20%", device="vk40")
    plan = vorkel.plan(100, [150, 80], device="vk40")
    assert found == plan.relations(gap="20%")
    assert len(found) > 1
