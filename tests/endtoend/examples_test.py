#!/usr/bin/env python3
"""Builds the examples with the tools of the gcc family, those with reflection against the runtime, and runs their
programs."""

import shutil
import sys
from pathlib import Path

sys.path.insert(0, str(Path(__file__).parent))
from workspace_fixture import equal, holds, in_workspace, run_tests  # noqa: E402

ROOT = Path(__file__).resolve().parents[2]


def build(workspace, name, program, *arguments):
    """Builds a copy of the example; what its program writes."""
    shutil.copytree(ROOT / "examples" / name, workspace.folder, dirs_exist_ok=True)
    settings = workspace.path(f"{name}.qrex")
    settings.write_text(settings.read_text().replace("../../runtime", str(ROOT / "runtime")))
    holds(workspace.run(settings.name, *arguments), "Completed.")
    return workspace.shell(f"out/lib/x64/Debug/{program}")


@in_workspace({}, "g++")
def first(workspace):
    output = build(workspace, "first", "app", "translateOnly=false", 'PATH("x64") = { "/usr/bin" "/bin" }',
                   'INCLUDE("x64") = { "/usr/include" }', 'LIB("x64") = { "/usr/lib" }')
    holds(output, "First: error codes\napp for x64, Debug, on Linux\n")


@in_workspace({}, "g++")
def evolution(workspace):
    equal(build(workspace, "evolution", "notes"),
          'release 1: "call the harbour", 90000 ms, 3 words, tags: urgent\n'
          'release 2: "call the harbour", 90000 ms, 3 words, tags: sea today\n'
          'release 3: "two words", 1500 ms, 2 words, tags: new\n')


@in_workspace({}, "g++")
def shapes(workspace):
    equal(build(workspace, "shapes", "app"), """class geo::Box
    geo::Point[2] corners
class geo::Canvas
    float64 width
    float64 height
class geo::Circle ["round"]
    geo::Point centre
    float64 radius
    Scale(float64 factor)
class geo::Drawing
    string8 title
    Draw(ptr<geo::IShape> shape, string8 const& layer)
    Area() const
struct geo::Point ["in the plane"]
    [unit("mm")] float64 x
    [unit("mm")] float64 y
    Move(float64 dx, float64 dy)
    DistanceTo(geo::Point const& other) const
a circle and a box, area 13, apart 5
after Scale(0.5):
    centre = (3,4)
    radius = 1
a pair, used 1 times
3000 mm, 750 mm, 1500 mm as they are
3 m, 0.75 m, 1.5 m as they are
measured 6, in metres 2.54
variable geo::conversions
canvas 6 6, a share 2, wider 12, a share 4, calculated 2 times
""")


run_tests([first, evolution, shapes])
