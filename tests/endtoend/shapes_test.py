#!/usr/bin/env python3
"""Builds the example of reflected classes against the runtime, and runs its program."""

import shutil
import sys
from pathlib import Path

sys.path.insert(0, str(Path(__file__).parent))
from workspace_fixture import Workspace, equal, holds, need, run_tests  # noqa: E402

ROOT = Path(__file__).parents[2]


def shapes(binary):
    need("g++")
    with Workspace(binary, {}) as workspace:
        shutil.copytree(ROOT / "examples/shapes", workspace.folder, dirs_exist_ok=True)
        workspace.replace("shapes.qrex", "../../runtime", str(ROOT / "runtime"))
        holds(workspace.run("shapes.qrex"), "Completed.")
        equal(workspace.shell("out/lib/x64/Debug/app"), """class geo::Box
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


run_tests([shapes])
