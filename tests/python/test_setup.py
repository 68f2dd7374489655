# Copyright (C) 2026 the Tervane developers
# SPDX-License-Identifier: GPL-3.0-or-later
import datetime
import gc
import json
import pathlib
import subprocess
import sys
import threading

import pytest

import tervane
from conftest import ROOT

STEP = "SimSpec/CompControlParaTimeStep:InitialTimeStep"


@pytest.mark.parametrize(
    "path, value, expected",
    [
        ("SimSpec/SimTitle:Title", "Größe, \"x\"", "Größe, \"x\""),
        ("SimSpec:ModelType", 2, 2),
        ("SimSpec:ModelType", "2", 2),
        (STEP, 0.1, 0.1),
        (STEP, 3, 3.0),
        (STEP, "2 days", 48.0),
        ("SimSpec/SimulationPeriod:SIMSTART", datetime.datetime(2003, 2, 1, 6, 30), datetime.datetime(2003, 2, 1, 6, 30)),
        ("SimSpec/SimulationPeriod:SIMSTART", datetime.date(2003, 2, 1), datetime.datetime(2003, 2, 1)),
        ("SimSpec/SimulationPeriod:SIMSTART", "2003-02-01", datetime.datetime(2003, 2, 1)),
        ("SimSpec/SimulationPeriod:HotStartResultFile", pathlib.Path("a/b.tvdres"), "a/b.tvdres"),
    ],
)
def test_a_value_is_given_back_as_it_was_set(setup, tmp_path, path, value, expected):
    setup[path] = value
    assert setup[path] == expected and type(setup[path]) is type(expected)
    setup.save(tmp_path / "a.tvd")
    again = tervane.open(tmp_path / "a.tvd")
    assert again[path] == expected
    assert again.path == str(tmp_path / "a.tvd") and again.diff(setup) == []


PERIOD = "SimSpec/SimulationPeriod:SIMSTART"


@pytest.mark.parametrize(
    "path, value, text",
    [
        ("SimSpec:ModelType", datetime.datetime(2003, 2, 1), "holds no date"),
        (STEP, datetime.date(2003, 2, 1), "holds no date"),
        (PERIOD, datetime.datetime(2003, 2, 1, 0, 0, 30), "whole minutes"),
        (PERIOD, datetime.datetime(2003, 2, 1, tzinfo=datetime.timezone.utc), "time zone"),
    ],
)
def test_a_date_that_would_not_be_kept_is_refused(setup, path, value, text):
    before = setup.text()
    with pytest.raises(tervane.ValueRefused, match=text):
        setup[path] = value
    assert setup.text() == before


def test_a_day_takes_no_time(setup):
    crop = setup.node("LandUse/Vegetation/GLOBAL/VEG_PROP_FILES").items.add()
    crop["STARTDATE"] = datetime.datetime(2003, 2, 1)
    with pytest.raises(tervane.ValueRefused, match="without a time"):
        crop["STARTDATE"] = datetime.datetime(2003, 2, 2, 5)
    assert crop["STARTDATE"] == datetime.date(2003, 2, 1)


def test_a_date_of_a_zone_is_none_of_the_simulation(setup):
    with pytest.raises(ValueError, match="time zone"):
        setup.statistics(start=datetime.datetime(2003, 2, 1, tzinfo=datetime.timezone.utc))


def test_numbers_have_units(setup):
    setup.set(STEP, 0.5, unit="days")
    assert (setup[STEP], setup.get(STEP, unit="minutes")) == (12.0, 720.0)
    for unit in ("m", "no such unit"):
        with pytest.raises(tervane.UnitError, match=unit):
            setup.get(STEP, unit=unit)
    with pytest.raises(tervane.UnitError):
        setup.get("SimSpec/SimTitle:Title", unit="m")


@pytest.mark.parametrize(
    "path, value, error, text",
    [
        ("SimSpec:ModelTyp", 1, tervane.KeyNotFound, "did you mean ModelType"),
        ("SimSpex:ModelType", 1, tervane.KeyNotFound, "did you mean SimSpec"),
        ("SimSpec:ModelType", 1.5, tervane.ValueRefused, "whole number"),
        ("SimSpec:ModelType", [1, 2], tervane.ValueRefused, "one value"),
        ("SimSpec:ModelType", 2**70, OverflowError, ""),
        ("SimSpec:ModelType", object(), TypeError, ""),
        ("SimSpec/SimTitle:Title", 3, tervane.ValueRefused, "a text was expected"),
        ("SimSpec/SimTitle:Title", "a\0b\ud800", (UnicodeEncodeError, RuntimeError), ""),
        (STEP, "x", tervane.ValueRefused, "hours"),
    ],
)
def test_what_is_refused_changes_nothing(setup, path, value, error, text):
    before = setup.text()
    with pytest.raises(error, match=text):
        setup[path] = value
    assert setup.text() == before


def test_errors_know_file_line_and_key(setup, tmp_path):
    (tmp_path / "bad.tvd").write_text("target TERVANE_FLOWMODEL {\n  section A {\n    x = 12y\n")
    with pytest.raises(tervane.SetupError) as caught:
        tervane.open(tmp_path / "bad.tvd")
    assert caught.value.file == str(tmp_path / "bad.tvd") and caught.value.line == 3
    with pytest.raises(tervane.SetupError, match="missing.tvd"):
        tervane.open(tmp_path / "missing.tvd")
    with pytest.raises(tervane.ValueRefused) as caught:
        setup["SimSpec:ModelType"] = "x"
    assert caught.value.key == "SimSpec:ModelType"
    with pytest.raises(tervane.SetupError, match="never saved"):
        setup.save()


def test_a_list_is_a_sequence_of_nodes(setup):
    species = setup.node("Species").items
    species.append({"Name": "a"})
    species.extend([{"Name": "b"}, {"Name": "c"}])
    names = lambda: [item["Name"] for item in species]
    assert names() == ["a", "b", "c"] and len(species) == 3
    species.insert(1, {"Name": "x"})
    assert names() == ["a", "x", "b", "c"]
    species.move(-1, 0)
    assert names() == ["c", "a", "x", "b"]
    del species[1:3]
    assert names() == ["c", "b"] and species[-1]["Name"] == "b"
    species[0] = {"Name": "d"}
    assert names() == ["d", "b"]
    species.reverse()
    assert names() == ["b", "d"]
    species.reverse()
    with pytest.raises(IndexError):
        species[2]
    with pytest.raises(tervane.KeyNotFound):
        species.append({"Nam": "e"})
    assert names() == ["d", "b"]
    extra = setup.node("ExtraParams").items
    extra.add(Name="p")
    extra.append(extra[0])
    assert [item["Name"] for item in extra] == ["p", "p"]
    assert extra.add(extra[0], Name="q")["Name"] == "q"
    with pytest.raises(tervane.KeyNotFound):
        extra.add(extra[0], Nam="r")
    assert [item["Name"] for item in extra] == ["p", "p", "q"]
    with pytest.raises(tervane.ValueRefused, match="another kind"):
        species.append(extra[0])
    with pytest.raises(TypeError):
        setup.node("SimSpec/SimTitle").items


def test_a_node_stays_and_goes(setup):
    species = setup.node("Species").items
    first, second = species.add(Name="a"), species.add(Name="b")
    assert first == species[0] and first != second and len({first, species[0]}) == 1
    species.pop(0)
    with pytest.raises(tervane.StaleNode):
        first["Name"]
    assert second["Name"] == "b" and not first.is_alive
    kept = setup.node("SimSpec/SimTitle")
    setup["SimSpec/SimTitle:Title"] = "new"
    assert kept["Title"] == "new"
    del setup
    gc.collect()
    assert kept["Title"] == "new" and kept.parent.path == "SimSpec"


def test_a_walk_over_a_list_that_shrinks_ends(setup):
    species = setup.node("Species").items
    for name in "abcd":
        species.append({"Name": name})
    seen = 0
    for node in setup.node("Species").walk():
        seen += 1
        if len(species) > 1:
            del species[-1]
    assert seen >= 1 and len(species) == 1


def test_findings_reasons_and_what_is_missing(setup):
    text = [str(finding) for finding in setup.validate()]
    assert any("File is not valid" in each for each in text)
    why = setup.node("SimSpec/STRESSPERIODS").why()
    assert not why.holds and "Numeric Engine" in str(why)
    assert any(each.path == "SimSpec/STRESSPERIODS" for each in setup.missing())
    info = setup.node("SimSpec").info("ModelType")
    assert info.choices[info.choices and 0] == info.meaning and info.type == "int"


def test_every_key_of_every_example_can_be_read():
    for file in sorted((ROOT / "examples").rglob("*.tvd")):
        setup = tervane.open(file)
        rows = setup.rows()
        assert len(rows) > 500
        assert len(json.loads(setup.to_json(used=True))["nodes"]) == len(list(setup.walk(used=True)))
        for node in setup.walk():
            assert setup.node(node.path) == node


def test_copies_go_their_own_ways(setup):
    copy = setup.copy()
    copy[STEP] = 1.0
    [difference] = tervane.diff(setup, copy)
    assert (difference.key, difference.after, copy.path) == ("InitialTimeStep", "1f", None)


def test_two_setups_are_merged(setup, tmp_path):
    for name, changes in {
        "base": {},
        "mine": {STEP: 1.0, "SimSpec/SimTitle:Title": "mine"},
        "theirs": {STEP: 2.0, "SimSpec:ModelType": 2},
    }.items():
        made = setup.copy()
        for path, value in changes.items():
            made[path] = value
        made.save(tmp_path / f"{name}.tvd")
    merge = tervane.merge(*(tmp_path / f"{n}.tvd" for n in ("base", "mine", "theirs", "out")))
    [conflict] = merge.conflicts
    assert conflict.key == "InitialTimeStep" and merge.taken == 1
    merged = tervane.open(tmp_path / "out.tvd")
    assert (merged[STEP], merged["SimSpec:ModelType"], merged["SimSpec/SimTitle:Title"]) == (1.0, 2, "mine")
    theirs = (tmp_path / "theirs.tvd").read_bytes()
    with pytest.raises(tervane.SetupError, match="exists"):
        tervane.merge(*(tmp_path / f"{n}.tvd" for n in ("base", "mine", "theirs", "theirs")))
    assert (tmp_path / "theirs.tvd").read_bytes() == theirs
    assert tervane.merge(*(tmp_path / f"{n}.tvd" for n in ("base", "mine", "theirs", "mine"))).taken == 1


def test_what_others_have_written_is_not_overrun(setup, tmp_path):
    setup.save(tmp_path / "a.tvd")
    mine, theirs = tervane.open(tmp_path / "a.tvd"), tervane.open(tmp_path / "a.tvd")
    theirs["SimSpec/SimTitle:Title"] = "a longer title than before"
    theirs.save()
    with pytest.raises(tervane.SetupError, match="another program has changed it"):
        mine.save()


def test_threads_have_setups_of_their_own():
    done = []

    def work(number):
        setup = tervane.new()
        for step in range(100):
            setup[STEP] = float(step + number)
        done.append(setup[STEP] == 99.0 + number)

    threads = [threading.Thread(target=work, args=(number,)) for number in range(4)]
    for thread in threads:
        thread.start()
    for thread in threads:
        thread.join()
    assert done == [True] * 4


def test_the_import_is_quick_and_leaves_numpy_alone():
    code = "import sys, tervane; tervane.new(); print('numpy' in sys.modules, 'pandas' in sys.modules)"
    assert subprocess.run([sys.executable, "-c", code], capture_output=True, text=True, check=True).stdout == "False False\n"


def test_a_table_for_pandas(setup):
    pandas = pytest.importorskip("pandas")
    table = setup.to_pandas()
    assert isinstance(table, pandas.DataFrame)
    assert table[(table.path == "SimSpec") & (table.key == "ModelType")].value.item() == 0
