# Copyright (C) 2026 the Tervane developers
# SPDX-License-Identifier: GPL-3.0-or-later
"""A setup with its tree."""

from __future__ import annotations

import json
import os
from collections.abc import Iterator, Sequence
from datetime import date, datetime, timezone
from typing import TYPE_CHECKING, Any

from . import _tervane
from ._errors import SetupError
from ._findings import Difference, Explanation, Finding, explanation_of
from ._node import Node
from ._run import Run

if TYPE_CHECKING:
    import pandas

_PARTS = {"": "", "pp": "/PP", "wm": "/WM", "wq": "/WQ"}


def _seconds(when: date | None) -> int | None:
    """Since 1970, of a date without a zone."""
    if when is None:
        return None
    if isinstance(when, datetime) and when.tzinfo is not None:
        raise ValueError(f"{when} has a time zone: a date without one was expected")
    moment = when if isinstance(when, datetime) else datetime(when.year, when.month, when.day)
    return int(moment.replace(tzinfo=timezone.utc).timestamp())


def _twelve(value: float | Sequence[float]) -> list[float]:
    values = [float(value)] * 12 if isinstance(value, (int, float)) else [float(each) for each in value]
    if len(values) != 12:
        raise ValueError(f"{len(values)} numbers were given: one or twelve were expected, January first")
    return values


def _plain(value: Any) -> Any:
    """As JSON can hold it."""
    if isinstance(value, date):
        return value.isoformat()
    if isinstance(value, float) and value - value != 0:
        return repr(value)  # JSON knows no number that is none
    if isinstance(value, list):
        return [_plain(each) for each in value]
    return value


class Setup:
    """A setup, made by `tervane.open` or `tervane.new`. Nothing is written before `save`."""

    def __init__(self, handle: _tervane.Setup) -> None:
        self._handle = handle

    # ---- The file

    @property
    def path(self) -> str | None:
        """Of its file; None for a setup that was never saved."""
        return self._handle.path or None

    @property
    def folder(self) -> str:
        """The folder from which names of files in the setup start; empty for a new setup."""
        return self._handle.folder

    def save(self, path: str | os.PathLike[str] | None = None) -> list[str]:
        """Writes the setup in one step; without a path to its own file. Gives what is to be known of it, as where the
        original of an older version was kept.

        Raises `SetupError`, and the old file stands, where an editor has the setup open, or another program has
        changed the file since it was read.
        """
        return self._handle.save("" if path is None else os.fspath(path))

    def copy(self) -> Setup:
        """Another setup that is alike, for a scenario; it was never saved."""
        return Setup(self._handle.copy())

    def text(self) -> str:
        """The file as it would be saved."""
        return self._handle.text()

    # ---- Keys and nodes

    def __getitem__(self, path: str) -> Any:
        return self._handle.get(path)

    def __setitem__(self, path: str, value: Any) -> None:
        self._handle.set(path, value)

    def get(self, path: str, unit: str | None = None) -> Any:
        """The value of a key: get("SimSpec/SimTitle:Title"). See `Node.get`."""
        return self._handle.get(path, unit)

    def set(self, path: str, value: Any, unit: str | None = None) -> None:
        """Gives a key another value. See `Node.set`."""
        self._handle.set(path, value, unit)

    @property
    def root(self) -> Node:
        """The node above all."""
        return Node(self._handle.root)

    def node(self, path: str) -> Node:
        """The node at a path. Raises `KeyNotFound` with what comes near."""
        return Node(self._handle.find(path))

    def walk(self, used: bool = False) -> Iterator[Node]:
        """All nodes, parents first; with `used` only those that take part."""
        for node in self.root.walk():
            if node.parent is not None and (not used or node.takes_part):
                yield node

    # ---- What is to be known of it

    def validate(self) -> list[Finding]:
        """Checks all, also the files that the setup names, and gives what is found."""
        return [Finding(**finding) for finding in self._handle.validate()]

    def missing(self) -> list[Explanation]:
        """The nodes that take no part though those above them do, with what would bring them."""
        return [explanation_of(told) for told in self._handle.missing()]

    def diff(self, other: Setup) -> list[Difference]:
        """What is different in another setup."""
        return [Difference(**difference) for difference in self._handle.diff(other._handle)]

    def rows(self, used: bool = False) -> list[dict[str, Any]]:
        """All keys as rows of a table: path, key, value, unit, meaning, default."""
        rows = []
        for node in self.walk(used):
            path = node.path
            for key in node.keys():
                info = node.info(key)
                rows.append(
                    {
                        "path": path,
                        "key": key,
                        "value": node[key],
                        "unit": info.unit,
                        "meaning": info.meaning,
                        "default": info.default,
                    }
                )
        return rows

    def to_pandas(self, used: bool = False) -> pandas.DataFrame:
        """The same as a data frame, which needs pandas."""
        import pandas

        return pandas.DataFrame(self.rows(used))

    def to_json(self, used: bool = False, indent: int | None = 2) -> str:
        """The tree as JSON: path, title, class, whether it takes part, and the keys of each node."""
        nodes = [
            {
                "path": node.path,
                "title": node.title,
                "class": node.class_name,
                "used": node.takes_part,
                "keys": {key: _plain(value) for key, value in node.to_dict().items()},
            }
            for node in self.walk(used)
        ]
        return json.dumps({"nodes": nodes}, ensure_ascii=False, indent=indent)

    # ---- Runs and their results

    def run(self, part: str = "", engines: str | os.PathLike[str] | None = None, save: bool = True) -> Run:
        """Starts the engine, and gives the run to follow. `part` is "pp" for the preprocessor alone, "wm" for water
        movement, "wq" for water quality, or empty for what the setup says. The setup is saved first, unless `save` is
        False; then the file is run as it stands. `engines` is the folder of the engines; without it TERVANE_ENGINES,
        or engines/ beside the programs.
        """
        if part not in _PARTS:
            raise ValueError(f"{part!r} is none of 'pp', 'wm', 'wq' and ''")
        if self.path is None:
            raise SetupError("the setup was never saved: save it before it runs")
        if save:
            self.save()
        return Run(_tervane.start_run(self._handle, _PARTS[part], "" if engines is None else os.fspath(engines)))

    @property
    def result_folder(self) -> str:
        """Where runs leave their results."""
        return self._handle.result_folder

    def results(self) -> list[dict[str, Any]]:
        """The results in the catalogues of the latest run: name, path, item, data_type. Raises `SetupError` for a
        catalogue that cannot be read; where there is none, there are no results."""
        items, problems = _tervane.stored_results(self._handle)
        if problems:
            raise SetupError("\n".join(problems))
        return items

    def statistics(self, start: date | None = None, end: date | None = None) -> list[dict[str, Any]]:
        """How well simulated series agree with observed ones, point by point: name, data_type, unit, x, y in m, layer,
        pairs, mean_error and mean_absolute_error and root_mean_square_error and residual_deviation in that unit,
        correlation, nash_sutcliffe, kling_gupta, percent_bias; None for what cannot be told. Without dates over the
        whole simulation."""
        return _tervane.statistics(self._handle, _seconds(start), _seconds(end))

    # ---- Climate

    def climate(self) -> list[dict[str, Any]]:
        """What drives the setup: quantity, kind ("value", "series", "grids"), and a value in mm/day or degrees Celsius,
        or file and item."""
        return _tervane.climate(self._handle)

    def change_climate(
        self,
        folder: str | os.PathLike[str],
        factor: dict[str, float | Sequence[float]] | None = None,
        shift: dict[str, float | Sequence[float]] | None = None,
    ) -> list[str]:
        """Puts the setup under another climate, and gives a sentence for each change. Factors come before shifts; both
        are by the name of the quantity ("precipitation", "evapotranspiration", "temperature"), one number or one for
        each month, January first; shifts are in mm/day or degrees Celsius. Changed series and grids become new files
        in `folder`, which the setup then names.

            scenario.change_climate("wet", factor={"precipitation": 1.2}, shift={"temperature": 1.5})

        Raises `SetupError` where a file cannot be changed; then no new file is left, and the setup is not to be used.
        """
        rules = {}
        for name in {**(factor or {}), **(shift or {})}:
            rules[name] = (_twelve((factor or {}).get(name, 1.0)), _twelve((shift or {}).get(name, 0.0)))
        return _tervane.change_climate(self._handle, rules, os.path.abspath(os.fspath(folder)))

    def write_climate_definition(self, path: str | os.PathLike[str]) -> None:
        """Writes a file that tells where in the setup each value of its climate stands."""
        _tervane.write_climate_definition(self._handle, os.fspath(path))

    def __repr__(self) -> str:
        return f"<tervane.Setup {self.path or 'that was never saved'}>"
