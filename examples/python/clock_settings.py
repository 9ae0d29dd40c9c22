#!/usr/bin/env python3
"""A plan for a hardware description in Python: settings of the primitive, and clock constraints.

    clock_settings.py INPUT OUTPUT...

Such flows instantiate a primitive by its name with keyword arguments, `p_` for parameters, `i_` and
`o_` for inputs and outputs, and want the period of each clock net. `instance` and `periods` give
both for a plan; at the end they are printed.
"""

import sys
from fractions import Fraction

import vorkel


def instance(plan):
    """The name of the primitive, and its settings as keyword arguments."""
    settings = plan.settings
    arguments = {}
    for index, frequency in enumerate(plan.request["inputs"], start=1):
        exact = Fraction(str(frequency))
        arguments[f"p_CLKIN{index}_MHZ_NUM"] = exact.numerator
        arguments[f"p_CLKIN{index}_MHZ_DEN"] = exact.denominator
        arguments[f"i_CLKIN{index}"] = f"clk_in{index}"
    if not plan.answer.is_loop:
        raise ValueError("this example is of a PLL or a TSYN; ask for primitive='PLL'")
    arguments["p_BANDWIDTH"] = settings.bandwidth
    arguments["p_M_EIGHTHS"] = settings.m_eighths
    arguments["p_D"] = settings.d
    for output in plan.outputs:
        if output.used:
            clock = f"CLKOUT{output.index}"
            arguments[f"p_{clock}_DIVIDE_EIGHTHS"] = output.divider_eighths
            arguments[f"p_{clock}_PHASE_EIGHTHS"] = output.phase_step
            arguments[f"p_{clock}_HIGH_HALVES"] = output.high_time
            arguments[f"o_{clock}"] = f"clk_out{output.index}"
    return f"VORKEL_{plan.primitive}", arguments


def periods(plan):
    """The period of each clock net in ns, exactly, and its uncertainty in ns."""
    first = Fraction(str(plan.request["inputs"][0]))
    nets = {"clk_in1": (1000 / first, plan.answer.input_jitter / 2000)}
    for output in plan.outputs:
        if output.used:
            nets[f"clk_out{output.index}"] = (output.period, (output.jitter or 0) / 2000)
    return nets


def main(words):
    if len(words) < 2:
        print("usage: clock_settings.py INPUT OUTPUT...", file=sys.stderr)
        return 2
    try:
        plan = vorkel.plan(words[0], words[1:])
        name, arguments = instance(plan)
    except (vorkel.RequestError, ValueError) as error:
        print(error, file=sys.stderr)
        return 2
    except vorkel.UnsolvedError as error:
        print(error, file=sys.stderr)
        return 1
    print(f"Instance({name!r},")
    for argument, value in arguments.items():
        print(f"    {argument}={value!r},")
    print(")")
    for net, (period, uncertainty) in periods(plan).items():
        print(f"{net}: {float(period):.6f} ns, {uncertainty:.6f} ns uncertain")
    return 0 if plan.within else 3


if __name__ == "__main__":
    sys.exit(main(sys.argv[1:]))
