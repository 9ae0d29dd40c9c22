"""The small changes of a C++ source that tests should notice.

A change is one token, one statement left out, or two arguments swapped. What stands in comments,
texts and directives is left alone.
"""

import re
from dataclasses import dataclass

# Binary operators stand between blanks; brackets of templates do not.
OPERATORS = {
    "<": "<=",
    "<=": "<",
    ">": ">=",
    ">=": ">",
    "==": "!=",
    "!=": "==",
    "+": "-",
    "-": "+",
    "*": "/",
    "/": "*",
    "&&": "||",
    "||": "&&",
    "+=": "-=",
    "-=": "+=",
    "*=": "/=",
    "/=": "*=",
    "|=": "&=",
    "&=": "|=",
}
WORDS = {"true": "false", "false": "true"}

# What is not counted: comments, texts, characters, directives.
SILENT = re.compile(
    r"""//[^\n]*|/\*.*?\*/|R"\((?:.|\n)*?\)"|"(?:\\.|[^"\\\n])*"|'(?:\\.|[^'\\\n])'"""
    r"""|^[ ]*\#[^\n]*(?:\\\n[^\n]*)*|\bstatic_assert\([^;]*;""",
    re.MULTILINE | re.DOTALL | re.VERBOSE,
)
OPERATOR = re.compile(r"(?<= )(?:&&|\|\||[<>=!+\-*/|&]=|[<>+\-*/])(?= |\n)")
WORD = re.compile(r"\b(?:true|false)\b")
NUMBER = re.compile(r"(?<![\w.'])\d+(?:\.\d+)?(?:e[+-]?\d+)?(?=[uUlLfF]*\b)(?![\w.'])")
STEP = re.compile(r"\+\+|--")
# An early exit, a jump, a call, an assignment: what can go without what follows losing a name.
EXIT = r"(?:if|while|for) \([^;{}]*\) (?:return|continue|break|throw)\b[^;{}]*;"
JUMP = r"(?:return|continue|break);"
PLACE = r"\*?[\w:.]+(?:->[\w.]+|\[[^\]\n]*\])*"
CALL = PLACE + r"\([^;{}]*\);"
ASSIGNMENT = PLACE + r" [-+*/|&]?= [^;{}]*;"
COUNT = rf"(?:(?:\+\+|--){PLACE}|{PLACE}(?:\+\+|--));"
STATEMENT = re.compile(
    rf"(?<=[;{{}}:\n])(?P<blank>\s*?\n *)(?P<statement>{EXIT}|{JUMP}|{CALL}|{ASSIGNMENT}|{COUNT})"
    r"(?=[ ]*\n)"
)
CALLED = re.compile(r"(?<![\w.])((?:\w|::|\.|->)+)\(")
# No functions, or with arguments in any order.
NOT_CALLED = {"if", "for", "while", "switch", "return", "sizeof", "catch", "noexcept", "decltype"}
NOT_CALLED |= {"std::min", "std::max"}
DECLARED = re.compile(r"^(?:const )?[\w:<>,]+[ &*]+\w+$|^(?:const )?[\w:<>]+[&*]?$")


@dataclass(frozen=True)
class Change:
    """`before` at the given place of a file becomes `after`."""

    file: str
    start: int
    before: str
    after: str
    line: int
    # The lines that it stands in, as they were and as they are.
    old: str
    new: str

    def apply(self, text):
        return text[: self.start] + self.after + text[self.start + len(self.before) :]


def silenced(text):
    """The text with blanks for all that is not counted."""
    return SILENT.sub(lambda match: re.sub(r"[^\n]", "\0", match.group()), text)


def replaced_numbers(number):
    """By one more and one less; fractions and powers grow."""
    if re.fullmatch(r"\d+", number):
        return [str(int(number) + 1)] + ([str(int(number) - 1)] if int(number) > 0 else [])
    mantissa, _, power = number.partition("e")
    grown = float(mantissa) + 1.0
    return [] if grown == float(mantissa) else [repr(grown) + ("e" + power if power else "")]


def tokens(code):
    for match in OPERATOR.finditer(code):
        if match.group() in OPERATORS:
            yield match.start(), match.group(), OPERATORS[match.group()]
    for match in WORD.finditer(code):
        yield match.start(), match.group(), WORDS[match.group()]
    for match in STEP.finditer(code):
        yield match.start(), match.group(), "--" if match.group() == "++" else "++"
    for match in NUMBER.finditer(code):
        for after in replaced_numbers(match.group()):
            yield match.start(), match.group(), after


def statements(code):
    # Statements share the blank between them, so that the next search begins at the end of one.
    place = 0
    while match := STATEMENT.search(code, place):
        yield match.start("statement"), match.group("statement"), ";"
        place = match.end("statement") - 1


def arguments(code, start):
    """The places of the arguments of a call whose bracket opens before `start`."""
    depth, begin, found = 0, start, []
    for place in range(start, len(code)):
        letter = code[place]
        if letter in "([{":
            depth += 1
        elif letter in ")]}":
            if depth == 0:
                return [*found, (begin, place)]
            depth -= 1
        elif letter == "," and depth == 0:
            found.append((begin, place))
            begin = place + 1
        elif letter == ";":
            return []
    return []


def swaps(text, code):
    for match in CALLED.finditer(code):
        if match.group(1) in NOT_CALLED:
            continue
        places = arguments(code, match.end())
        for (first, first_end), (second, second_end) in zip(places, places[1:]):
            one, other = text[first:first_end].strip(), text[second:second_end].strip()
            if one == other or DECLARED.match(one) and " " in one:
                continue
            before = text[first:second_end]
            lead = before[: len(before) - len(before.lstrip())]
            yield first, before, f"{lead}{other}, {one}"


def changes_of(file, text):
    """All changes of a source, in the order of their places."""
    code = silenced(text)
    found = [*tokens(code), *statements(code), *swaps(text, code)]
    for start, before, after in sorted(found):
        real = text[start : start + len(before)]
        begin = text.rfind("\n", 0, start) + 1
        end = text.find("\n", start + len(real))
        old = text[begin:end]
        new = text[begin:start] + after + text[start + len(real) : end]
        yield Change(
            file, start, real, after, text.count("\n", 0, start) + 1,
            " ".join(old.split()), " ".join(new.split()),
        )
