"""Which changes are drawn, and how they are made."""

import tomllib

from changes import changes_of
from programs import programs_for
from run import FOLDERS, LIST, ROOT


def lines(text):
    """What a line can become."""
    return [change.new for change in changes_of("one.cpp", text)]


def test_each_token_is_changed_alone():
    assert lines("x = a < b + c;\n") == ["x = a <= b + c;", "x = a < b - c;"]
    assert lines("return one && true;\n") == ["return one || true;", "return one && false;"]


def test_a_number_becomes_one_less_and_one_more():
    assert lines("int n = 7;\n") == ["int n = 6;", "int n = 8;"]
    assert lines("int n = 0;\n") == ["int n = 1;"]
    assert lines("double x = 1.5e-3;\n") == ["double x = 2.5e-3;"]


def test_a_number_that_does_not_change_is_left():
    assert lines("double x = 9007199254740992.0;\n") == []


def test_statements_are_left_out():
    text = "void F() {\n  table.Clear();\n  if (!(x > 0)) return;\n  int left = right;\n}\n"
    dropped = [change for change in changes_of("one.cpp", text) if change.after == ";"]
    assert [change.before for change in dropped] == ["table.Clear();", "if (!(x > 0)) return;"]
    assert [change.line for change in dropped] == [2, 3]
    assert dropped[0].apply(text) == text.replace("table.Clear();", ";")


def test_arguments_are_swapped():
    assert lines("x = F(one, two(a, b));\n") == ["x = F(two(a, b), one);", "x = F(one, two(b, a));"]


def test_those_of_a_declaration_are_not():
    assert lines("int F(int one, const Two& two);\n") == []


def test_comments_texts_and_directives_are_left():
    assert lines('#include "a < b"\n// 1 < 2\nF("1 < 2", \'0\', "0");  // 3\n'.replace("F(", "f = (")) == []


def test_a_template_is_no_comparison():
    assert lines("std::vector<int> x;\n") == []


def test_each_source_has_programs_that_test_it():
    for folder in FOLDERS:
        for path in (ROOT / folder).rglob("*.cpp"):
            programs = programs_for(str(path.relative_to(ROOT)))
            assert programs.programs or programs.scripts


def test_each_equivalent_change_has_a_reason():
    for entry in tomllib.loads(LIST.read_text())["change"]:
        assert set(entry) == {"file", "old", "new", "reason"}
        assert len(entry["reason"]) > 10
        assert (ROOT / entry["file"]).exists()
