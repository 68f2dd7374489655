# Copyright (C) 2026 the Tervane developers
# SPDX-License-Identifier: GPL-3.0-or-later
"""The programs that the manual and the examples show."""

import pathlib
import re
import subprocess
import sys

import pytest

import tervane
from conftest import ROOT


def run(program: pathlib.Path, *arguments: pathlib.Path) -> list[str]:
    done = subprocess.run([sys.executable, program, *arguments], capture_output=True, text=True)
    assert done.returncode == 0, done.stderr
    return done.stdout.splitlines()


def test_the_program_of_the_manual(tmp_path):
    manual = (ROOT / "docs/manual/programming.md").read_text()
    [program] = re.findall(r"^```python\n(.*?)^```$", manual, re.MULTILINE | re.DOTALL)
    (tmp_path / "program.py").write_text(program)
    lines = run(tmp_path / "program.py", ROOT / "examples/water_quality.tvd", tmp_path / "out.tvd")
    assert lines[0] == "initial time step: 6 hours, 0.25 days"
    assert lines[1] == "1 species, the last is Nitrate"
    assert any(line.startswith("error: ModelCompWQ:UZ: ") for line in lines)
    saved = tervane.open(tmp_path / "out.tvd")
    assert saved["SimSpec/CompControlParaTimeStep:InitialTimeStep"] == 3
    assert saved.node("Species").items[0]["Name"] == "Nitrate"


def test_a_setup_built_from_nothing(tmp_path):
    numpy = pytest.importorskip("numpy")
    lines = run(ROOT / "examples/python/from_nothing.py", tmp_path / "valley")
    assert not any(line.startswith(("error: ", "warning: ")) for line in lines), lines
    assert lines[-1].startswith("The run is done")
    grids = tervane.open_data_file(tmp_path / "valley/valley_results/valley_PreProcessed.nds2")
    assert grids.values("Model Domain and Grid").count() > 1000
    assert numpy.nanmax(grids.values("Topography")) > 110


def test_a_climate_scenario(rhone, tmp_path):
    pytest.importorskip("numpy")
    lines = run(ROOT / "examples/python/climate_scenario.py", rhone, tmp_path / "warmer.tvd")
    change = re.fullmatch(r"temperature: (\S+) -> (\S+) °C", lines[1])
    assert float(change[2]) - float(change[1]) == pytest.approx(2.5, abs=0.02)
    assert lines[2].startswith("0 errors")
    assert tervane.open(tmp_path / "warmer.tvd").climate() != tervane.open(rhone).climate()


def test_a_sensitivity_of_twenty_runs(rhone, tmp_path):
    pytest.importorskip("numpy")
    lines = run(ROOT / "examples/python/sensitivity.py", rhone, tmp_path / "runs")
    cells = [int(line.split()[1]) for line in lines[1:]]
    assert len(cells) == 20 and cells == sorted(cells, reverse=True) and cells[0] > 80 * cells[-1]
