# Copyright (C) 2026 the Tervane developers
# SPDX-License-Identifier: GPL-3.0-or-later
"""Data files: time series, lines, grids and layers of grids over time."""

from __future__ import annotations

import operator
import os
from datetime import datetime, timedelta
from typing import TYPE_CHECKING, Any, NamedTuple, SupportsIndex

from . import _tervane
from ._errors import KeyNotFound

if TYPE_CHECKING:
    import numpy
    import pandas
    import xarray

_VALUE_TYPES = ("instantaneous", "accumulated", "step-accumulated", "mean-step")


class Item(NamedTuple):
    """An item of a data file."""

    name: str
    item_type: int
    """The code of its quantity; 999 for none."""
    unit: str
    """In which the file holds it."""
    value_type: str
    """"instantaneous", "mean over the step"."""
    dimensions: int
    """0 a time series, 1 a line, 2 a grid, 3 layers of grids."""
    has_codes: bool
    """Its values are whole numbers that stand for something."""
    has_time: bool
    """False for an item that holds at all times, and has one step."""
    nx: int
    ny: int
    nz: int
    x0: float
    """The lower left corner of the lower left cell, in m, or degrees where it is geographical."""
    y0: float
    cell_size: float
    """0 where the place is not known."""
    cell_height: float
    rotation: float
    """In degrees, counter-clockwise around that corner."""
    projection: str
    """WKT; empty for a local plane."""
    is_geographical: bool


class DataFile:
    """An open data file. Values are read when they are asked for.

        heads = tervane.open_data_file("heads.nds3")
        last = heads.values("head elevation", steps=-1)
    """

    def __init__(self, handle: _tervane.DataFile) -> None:
        self._handle = handle
        self.items: list[Item] = [Item(**item) for item in handle.items()]
        """Its items, the first at 0."""

    @property
    def path(self) -> str:
        return self._handle.path

    @property
    def notes(self) -> list[str]:
        """What is to be known of a file of another program."""
        return self._handle.notes

    def __len__(self) -> int:
        """The number of time steps; 1 for a file without times."""
        return self._handle.steps

    def _number(self, item: int | str) -> int:
        """From 1."""
        if isinstance(item, str):
            for number, each in enumerate(self.items, 1):
                if each.name == item:
                    return number
            raise KeyNotFound(f"{self.path}: there is no item {item}: it has {', '.join(i.name for i in self.items)}")
        if not -len(self.items) <= item < len(self.items):
            raise KeyNotFound(f"{self.path}: there is no item {item}: it has {len(self.items)}")
        return item % len(self.items) + 1

    @property
    def times(self) -> numpy.ndarray[Any, Any]:
        """The stamps as datetime64[s]: the ends of intervals; empty for a file without times."""
        stamps: numpy.ndarray[Any, Any] = self._handle.stamps().view("datetime64[s]")
        return stamps

    @property
    def begin(self) -> datetime | None:
        """When the interval begins that ends with the first stamp, where the file tells."""
        seconds = self._handle.begin
        return None if seconds is None else datetime(1970, 1, 1) + timedelta(seconds=seconds)

    def values(
        self,
        item: int | str = 0,
        steps: SupportsIndex | slice | None = None,
        layer: int | None = None,
        unit: str | None = None,
    ) -> Any:
        """Values of an item, by its place from 0 or its name, as a float32 array (time, z, y, x), less the axes that the
        item does not have. Row 0 is the south, layer 0 the bottom; missing values are NaN. Codes are an int32 masked
        array. `steps` is one step, which then has no axis, or a slice; None is all. `layer` takes one layer.

        Values are in the base unit of their quantity, or in `unit`; those of no known quantity as the file holds them.
        The memory is numpy's, and other threads go on meanwhile.
        """
        number = self._number(item)
        count = len(self) if self.items[number - 1].has_time else 1
        is_one = steps is not None and not isinstance(steps, slice)
        if steps is None or isinstance(steps, slice):
            first, stop, stride = (slice(None) if steps is None else steps).indices(count)
            if stride < 1:
                raise ValueError("steps are read forward")
            length = max(stop - first, 0)
        else:
            step = operator.index(steps)
            if not -count <= step < count:
                raise IndexError(f"{self.path}: there is no step {step}: it has {count}")
            first, length, stride = step % count, 1, 1
        values = self._handle.read(number, first if length else 0, length, layer, unit)
        if stride > 1:
            values = values[::stride]
        if is_one:
            values = values[0]
        if not self.items[number - 1].has_codes or unit is not None:
            return values
        import numpy

        is_missing = numpy.isnan(values)
        masked: Any = numpy.ma  # which has no hints of its own
        return masked.masked_array(numpy.where(is_missing, 0, values).astype(numpy.int32), is_missing)

    def statistics(self, item: int | str = 0) -> dict[str, float]:
        """Smallest and largest value of an item, in the unit of the file; as it stores them, else of all values."""
        return self._handle.statistics(self._number(item))

    def _names(self) -> list[str]:
        """Of the items; of like ones the second is "name (2)"."""
        names: list[str] = []
        for item in self.items:
            name, number = item.name, 1
            while name in names:
                number += 1
                name = f"{item.name} ({number})"
            names.append(name)
        return names

    def to_pandas(self) -> pandas.DataFrame:
        """The time series of the file, a column for each, over their times; of like names the second is "name (2)".
        Needs pandas."""
        import pandas

        names = self._names()
        series = {names[i]: self.values(i) for i, item in enumerate(self.items) if item.dimensions == 0}
        if not series:
            raise ValueError(f"{self.path}: it holds no time series")
        return pandas.DataFrame(series, index=pandas.DatetimeIndex(self.times, name="time"))

    def to_xarray(self) -> xarray.Dataset:
        """All items with their times and the centres of their cells; of rotated grids in the grid's own directions.
        Of like names the second is "name (2)". Needs xarray."""
        import numpy
        import xarray

        times = self.times
        variables = {}
        names = self._names()
        for i, item in enumerate(self.items):
            axes = ["time", "z", "y", "x"] if item.dimensions == 3 else ["time", "y", "x"]
            axes = axes if item.dimensions >= 2 else ["time", "x"][: item.dimensions + 1]
            values = self.values(i)
            if item.has_codes:
                values = numpy.where(values.mask, numpy.nan, values.data.astype(numpy.float32))
            coordinates: dict[str, Any] = {"time": times} if item.has_time and len(times) else {}
            if item.dimensions >= 1 and item.cell_size > 0:
                coordinates["x"] = item.x0 + (numpy.arange(item.nx) + 0.5) * item.cell_size
            if item.dimensions >= 2 and item.cell_size > 0:
                coordinates["y"] = item.y0 + (numpy.arange(item.ny) + 0.5) * item.cell_height
            if not item.has_time:
                values, axes = values[0], axes[1:]
            attributes = {"item_type": item.item_type, "rotation": item.rotation}
            variables[names[i]] = xarray.DataArray(values, coordinates, axes, names[i], attributes)
        return xarray.Dataset(variables)

    def __repr__(self) -> str:
        return f"<tervane.DataFile {self.path}: {', '.join(item.name for item in self.items)}>"


def open_data_file(path: str | os.PathLike[str]) -> DataFile:
    """Opens a data file (.nds0 to .nds3), or a netCDF file or raster of another program. Raises `SetupError`."""
    return DataFile(_tervane.open_data_file(os.fspath(path)))


def write_data_file(
    path: str | os.PathLike[str],
    values: Any,
    quantity: str | int,
    name: str | None = None,
    unit: str = "",
    times: Any = None,
    begin: datetime | None = None,
    value_type: str = "instantaneous",
    x0: float = 0.0,
    y0: float = 0.0,
    cell_size: float = 1.0,
    rotation: float = 0.0,
    projection: str = "",
) -> None:
    """Writes a data file of one item, in one step. The values are an array (time, z, y, x), without a time axis where
    `times` is None, and with the axes that the extension tells: (time) for .nds0, (time, x) for .nds1, (time, y, x) for
    .nds2. Row 0 is the south; what is NaN or masked is missing. Raises `SetupError`, and the old file stands, where an
    editor has it open.

    Args:
        quantity: its name or code: "Elevation".
        unit: of the values; empty for the base unit of the quantity.
        times: datetimes or datetime64, the ends of the intervals, ascending.
        begin: of the first interval.
        value_type: "instantaneous", "accumulated", "step-accumulated" or "mean-step".
        x0, y0: the lower left corner of the lower left cell, in m.
        cell_size: in m.
        rotation: in degrees, counter-clockwise around that corner.
        projection: WKT; empty for a local plane.
    """
    import numpy

    if value_type not in _VALUE_TYPES:
        raise ValueError(f"{value_type!r} is none of {', '.join(_VALUE_TYPES)}")
    file = os.fspath(path)
    masked: Any = numpy.ma  # which has no hints of its own
    array = masked.filled(masked.asarray(values, dtype=numpy.float32), numpy.nan)
    stamps = numpy.asarray([] if times is None else times, dtype="datetime64[s]").astype(numpy.int64)
    if times is None:
        array = array[numpy.newaxis]
    dimensions = array.ndim - 1
    expected = file[-1] if file[-5:-1].lower() == ".nds" and file[-1] in "0123" else str(dimensions)
    if str(dimensions) != expected or dimensions > 3:
        raise ValueError(f"{file}: an array of {expected} axes beside the time was expected, not of {dimensions}")
    nz, ny, nx = (1, 1, 1, *array.shape[1:])[-3:]
    item = {
        "name": str(quantity) if name is None else name,
        "item_type": str(quantity),
        "unit": unit,
        "value_type": _VALUE_TYPES.index(value_type),
        "dimensions": dimensions,
        "nx": nx,
        "ny": ny,
        "nz": nz,
        "x0": x0,
        "y0": y0,
        "cell_size": cell_size,
        "rotation": rotation,
        "projection": projection,
    }
    seconds = None if begin is None else int((begin - datetime(1970, 1, 1)).total_seconds())
    _tervane.write_data_file(file, array, item, stamps, seconds)
