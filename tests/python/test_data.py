# Copyright (C) 2026 the Tervane developers
# SPDX-License-Identifier: GPL-3.0-or-later
import datetime
import threading

import pytest

import tervane

numpy = pytest.importorskip("numpy")

DAYS = [datetime.datetime(2001, 1, day) for day in range(1, 5)]


def test_a_grid_is_given_back_as_it_was_written(tmp_path):
    values = numpy.arange(4 * 3 * 5, dtype=numpy.float32).reshape(4, 3, 5)
    values[1, 2, 3] = numpy.nan
    path = tmp_path / "a.nds2"
    tervane.write_data_file(path, values, "Elevation", times=DAYS, x0=100, y0=200, cell_size=50, rotation=10)
    file = tervane.open_data_file(path)
    [item] = file.items
    assert (item.nx, item.ny, item.x0, item.cell_size, item.rotation) == (5, 3, 100, 50, 10) and len(file) == 4
    read = file.values()
    assert read.dtype == numpy.float32 and read.flags.owndata
    numpy.testing.assert_array_equal(read, values)
    numpy.testing.assert_array_equal(file.times, numpy.array(DAYS, dtype="datetime64[s]"))
    numpy.testing.assert_array_equal(file.values(steps=-1), values[3])
    numpy.testing.assert_array_equal(file.values(steps=numpy.int64(0)), values[0])
    numpy.testing.assert_array_equal(file.values(steps=0), values[0])
    numpy.testing.assert_array_equal(file.values("Elevation", steps=slice(1, 4, 2)), values[1:4:2])
    numpy.testing.assert_allclose(file.values(unit="km"), values / 1000, rtol=1e-6)
    assert file.values(steps=slice(2, 2)).shape == (0, 3, 5)
    del file
    assert read[0, 0, 1] == 1


def test_layers_lines_and_series(tmp_path):
    layers = numpy.random.default_rng(1).random((2, 3, 4, 5), dtype=numpy.float32)
    tervane.write_data_file(tmp_path / "a.nds3", layers, "Elevation", times=DAYS[:2], cell_size=10)
    file = tervane.open_data_file(tmp_path / "a.nds3")
    numpy.testing.assert_array_equal(file.values(), layers)
    numpy.testing.assert_array_equal(file.values(layer=2, steps=1), layers[1, 2])
    series = numpy.array([1, numpy.nan, 3, 4], dtype=numpy.float32)
    tervane.write_data_file(
        tmp_path / "a.nds0", series, "Precipitation Rate", unit="mm/h", times=DAYS, value_type="mean-step"
    )
    file = tervane.open_data_file(tmp_path / "a.nds0")
    numpy.testing.assert_array_equal(file.values(unit="mm/h"), series)
    numpy.testing.assert_allclose(file.values(unit="mm/day"), series * 24, rtol=1e-6)
    numpy.testing.assert_allclose(file.values(), file.values(unit="mm/day"))


def test_codes_are_whole_numbers_with_a_mask(tmp_path):
    codes = numpy.ma.masked_array([[1, 2], [3, 0]], [[False, False], [False, True]])
    tervane.write_data_file(tmp_path / "a.nds2", codes, 100370)
    read = tervane.open_data_file(tmp_path / "a.nds2").values(steps=0)
    assert read.dtype == numpy.int32 and read.mask.tolist() == [[False, False], [False, True]]
    assert read.compressed().tolist() == [1, 2, 3]


@pytest.mark.parametrize(
    "call, error",
    [
        (lambda file: file.values(9), tervane.KeyNotFound),
        (lambda file: file.values("no such"), tervane.KeyNotFound),
        (lambda file: file.values(steps=1), IndexError),
        (lambda file: file.values(layer=1), IndexError),
        (lambda file: file.values(unit="kg"), tervane.UnitError),
        (lambda file: tervane.open_data_file(file.path + "x"), tervane.SetupError),
        (lambda file: tervane.write_data_file(file.path, numpy.zeros(3), "Elevation"), ValueError),
        (lambda file: tervane.write_data_file(file.path, numpy.zeros((2, 2)), "no such"), tervane.ValueRefused),
        (lambda file: tervane.write_data_file(file.path, numpy.zeros((2, 2)), "Elevation", unit="kg"), tervane.UnitError),
    ],
)
def test_what_is_not_there_is_told(tmp_path, call, error):
    tervane.write_data_file(tmp_path / "a.nds2", numpy.ones((2, 2)), "Elevation")
    file = tervane.open_data_file(tmp_path / "a.nds2")
    with pytest.raises(error):
        call(file)
    assert file.values().shape == (1, 2, 2)


def test_what_an_editor_holds_is_not_written_over(tmp_path):
    path = tmp_path / "a.nds2"
    tervane.write_data_file(path, numpy.ones((2, 2)), "Elevation")
    (tmp_path / ".a.nds2.lock").write_text("somebody")
    with pytest.raises(tervane.SetupError, match="may have it open"):
        tervane.write_data_file(path, numpy.zeros((2, 2)), "Elevation")
    assert tervane.open_data_file(path).values().min() == 1


def test_items_of_one_name_have_names_of_their_own(tmp_path):
    tervane.write_data_file(tmp_path / "a.nds2", numpy.ones((2, 2)), "Elevation")
    file = tervane.open_data_file(tmp_path / "a.nds2")
    [item] = file.items
    file.items = [item._replace(name=name) for name in ("a", "a", "a (2)", "a", "b")]
    assert file._names() == ["a", "a (2)", "a (2) (2)", "a (3)", "b"]


def test_threads_read_one_file(tmp_path):
    values = numpy.random.default_rng(1).random((4, 300, 300), dtype=numpy.float32)
    tervane.write_data_file(tmp_path / "a.nds2", values, "Elevation", times=DAYS)
    file = tervane.open_data_file(tmp_path / "a.nds2")
    equal = []
    threads = [
        threading.Thread(target=lambda: equal.append(bool((file.values() == values).all()))) for _ in range(4)
    ]
    for thread in threads:
        thread.start()
    for thread in threads:
        thread.join()
    assert equal == [True] * 4


def test_for_pandas(tmp_path):
    pandas = pytest.importorskip("pandas")
    tervane.write_data_file(tmp_path / "a.nds0", numpy.arange(4.0), "Temperature", times=DAYS)
    table = tervane.open_data_file(tmp_path / "a.nds0").to_pandas()
    assert table.index[2] == pandas.Timestamp("2001-01-03") and table["Temperature"].tolist() == [0, 1, 2, 3]


def test_for_xarray(tmp_path):
    pytest.importorskip("xarray")
    tervane.write_data_file(tmp_path / "a.nds2", numpy.ones((4, 2, 3)), "Elevation", times=DAYS, x0=100, cell_size=50)
    grid = tervane.open_data_file(tmp_path / "a.nds2").to_xarray()["Elevation"]
    assert grid.dims == ("time", "y", "x") and grid.x.values.tolist() == [125, 175, 225]
    assert float(grid.sel(time="2001-01-02").sum()) == 6
