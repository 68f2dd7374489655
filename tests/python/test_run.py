# Copyright (C) 2026 the Tervane developers
# SPDX-License-Identifier: GPL-3.0-or-later
import os
import pathlib
import subprocess
import sys

import pytest

import tervane


def test_a_run_is_followed_to_its_end(rhone):
    setup = tervane.open(rhone)
    run = setup.run("pp")
    lines = list(run)
    assert run.outcome == "done" and run.is_over and run.seconds > 0, run.text
    assert lines and run.progress == 100
    assert os.path.exists(run.log) and os.path.isdir(setup.result_folder)
    assert any("_PreProcessed" in name for name in os.listdir(setup.result_folder))


def test_a_run_that_fails_tells_why(rhone, engines):
    setup = tervane.open(rhone)
    run = setup.run("wm", engines=engines)
    assert run.wait(timeout=120) == "failed" and run.text
    with pytest.raises(tervane.RunError):
        setup.run("wm").wait(timeout=120, check=True)
    with pytest.raises(tervane.RunError, match="was not found"):
        setup.run("pp", engines="/no/such/folder")
    with pytest.raises(ValueError):
        setup.run("all")
    with pytest.raises(tervane.SetupError, match="never saved"):
        setup.copy().run("pp")


def test_a_run_outlives_the_script(rhone):
    code = f"import tervane; tervane.open({str(rhone)!r}).run('pp')"
    subprocess.run([sys.executable, "-c", code], check=True)
    folder = tervane.open(rhone).result_folder
    for _ in range(600):
        if any("_PreProcessed.kvf" in name for name in os.listdir(folder)):
            break
        subprocess.run(["sleep", "0.1"], check=True)
    assert any("_PreProcessed.kvf" in name for name in os.listdir(folder))


def test_a_stopped_run_ends(rhone, tmp_path):
    (tmp_path / "Tvn_Simulation").write_text("#!/bin/sh\necho 'progress 10 waiting'\nexec sleep 600\n")
    (tmp_path / "Tvn_Simulation").chmod(0o755)
    run = tervane.open(rhone).run(engines=tmp_path)
    with pytest.raises(TimeoutError):
        run.wait(timeout=0.3)
    while run.progress is None:
        run.lines()
    run.stop()
    assert run.wait(timeout=60) == "stopped" and run.progress == 10


def test_results_and_statistics_are_empty_before_a_run(rhone):
    setup = tervane.open(rhone)
    assert setup.results() == []
    with pytest.raises(tervane.SetupError):
        setup.statistics()


def test_another_climate(rhone, tmp_path):
    setup = tervane.open(rhone)
    before = setup.climate()
    assert {each["quantity"] for each in before} >= {"precipitation", "temperature"}
    scenario = setup.copy()
    folder = tmp_path / "wet"
    changes = scenario.change_climate(folder, factor={"precipitation": [1.5] * 12}, shift={"temperature": 2})
    assert changes and setup.climate() == before
    for old, new in zip(before, scenario.climate()):
        if old["kind"] != "series" or old["quantity"] != "precipitation":
            continue
        assert pathlib.Path(new["file"]).parent == folder
        values = [tervane.open_data_file(each["file"]).values(each["item"] - 1) for each in (old, new)]
        assert (abs(values[1] - 1.5 * values[0]) < 1e-4).sum() > 100
        break
    else:
        raise AssertionError("there is no series of precipitation")
    with pytest.raises(tervane.ValueRefused, match="rain"):
        setup.change_climate(folder, factor={"rain": 2})
    with pytest.raises(ValueError, match="twelve"):
        setup.change_climate(folder, factor={"precipitation": [1, 2]})
    scenario.write_climate_definition(tmp_path / "d.def")
    assert "CCCompare" in (tmp_path / "d.def").read_text()
