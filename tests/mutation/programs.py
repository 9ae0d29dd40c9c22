"""Which test programs matter for a source: the first folder of the table that it is in.

The own tests of a folder come first, since they are the quickest to notice.
"""

from dataclasses import dataclass, replace


@dataclass(frozen=True)
class Programs:
    # Targets that are GoogleTest programs.
    programs: tuple = ()
    # tcltest files, and targets that they need.
    scripts: tuple = ()
    targets: tuple = ()

    def without(self, name):
        return replace(self, programs=tuple(one for one in self.programs if one != name))


PACKAGE = ("Ip_Vorkel", "PtrHandleQrm")
ENGINE = ("engine_test", "no_allocation_test", "golden_test", "compare_test")
KRU = ("kru_test", "kru_golden_test", "compare_test")
BINDING = (
    "binding_test", "initialisers_test", "tcl_calls_test", "replaced_host_test",
    "stub_library_test", "loading_test", "allocation_test",
)
PACKAGE_SCRIPTS = tuple(
    f"tests/package/{name}.test"
    for name in (
        "package", "dispatch", "badinput", "device", "pll", "tsyn", "kru", "timing", "trace",
    )
)

TABLE = (
    ("engine/pll/", Programs(ENGINE)),
    ("engine/timing/", Programs(("engine_test", "no_allocation_test", "compare_test"))),
    ("engine/kru", Programs(KRU)),
    ("engine/", Programs(("engine_test", "kru_test", "golden_test", "compare_test"))),
    ("binding/", Programs(BINDING, PACKAGE_SCRIPTS, PACKAGE)),
    ("host/bundled/calculator/", Programs(("calculator_test",))),
    ("host/bundled/device/", Programs(("host_device_test", "calculator_test", "host_script_test"))),
    ("host/bundled/script/", Programs(
        ("host_script_test", "binding_test", "allocation_test"), PACKAGE_SCRIPTS, PACKAGE)),
    ("host/", Programs(
        ("host_base_test", "host_device_test", "host_script_test", "binding_test"))),
    ("hardware/", Programs(("hardware_test", "planner_answer_test", "planner_search_test"))),
    ("planner/answer/", Programs(("planner_answer_test", "planner_search_test"))),
    ("planner/batch/", Programs(("planner_batch_test",))),
    ("planner/device/", Programs(("planner_device_test",))),
    ("planner/engine/", Programs(("planner_engine_test", "planner_plan_test"))),
    ("planner/explain/", Programs(("planner_explain_test",))),
    ("planner/hdl/", Programs(
        ("planner_hdl_test",), ("tests/hdl/hdl.test", "tests/hdl/names.test"), ("vorkel",))),
    ("planner/plan/", Programs(("planner_plan_test", "planner_explain_test"))),
    ("planner/reach/", Programs(("planner_reach_test",))),
    ("planner/read/", Programs(("planner_read_test",))),
    ("planner/relations/", Programs(("planner_relations_test",))),
    ("planner/report/", Programs(("planner_report_test",))),
    ("planner/search/", Programs(("planner_search_test", "planner_plan_test"))),
    ("planner/verify/", Programs(("planner_verify_test",))),
    ("planner/", Programs(("planner_answer_test", "planner_plan_test", "planner_report_test"))),
)


def programs_for(file):
    for folder, programs in TABLE:
        if file.startswith(folder):
            return programs
    raise ValueError(f"no tests are known for {file}")
