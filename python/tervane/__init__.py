# Copyright (C) 2026 the Tervane developers
# SPDX-License-Identifier: GPL-3.0-or-later
"""Setups of the integrated catchment model Tervane.

    import tervane

    setup = tervane.open("karup.tvd")
    setup["SimSpec/SimTitle:Title"] = "With a wet winter"
    setup.set("SimSpec/CompControlParaTimeStep:InitialTimeStep", 0.5, unit="days")
    for finding in setup.validate():
        print(finding)
    setup.save("wet.tvd")

Numbers are in the unit in which the file holds them, unless `unit` names another one. Names of keys and sections are
those of the file. One thread at a time uses a setup.
"""

from __future__ import annotations

import os

from . import _tervane
from ._data import DataFile, Item, open_data_file, write_data_file
from ._errors import KeyNotFound, RunError, SetupError, StaleNode, UnitError, ValueRefused
from ._findings import Conflict, Difference, Explanation, Finding, Merge, Reason
from ._node import KeyInfo, Node, NodeList
from ._run import Run
from ._setup import Setup

__version__: str = _tervane.version

__all__ = [
    "Conflict",
    "DataFile",
    "Difference",
    "Explanation",
    "Finding",
    "Item",
    "KeyInfo",
    "KeyNotFound",
    "Merge",
    "Node",
    "NodeList",
    "Reason",
    "Run",
    "RunError",
    "Setup",
    "SetupError",
    "StaleNode",
    "UnitError",
    "ValueRefused",
    "diff",
    "merge",
    "new",
    "open",
    "open_data_file",
    "write_data_file",
]


def new() -> Setup:
    """A setup at its defaults, which is in no file yet."""
    return Setup(_tervane.Setup())


def open(path: str | os.PathLike[str]) -> Setup:  # noqa: A001: it is tervane.open
    """Reads a setup of any document version. Raises `SetupError` with file and line where it cannot be read."""
    handle = _tervane.Setup()
    handle.open(os.fspath(path))
    return Setup(handle)


def diff(before: Setup, after: Setup) -> list[Difference]:
    """What is different in a second setup, key by key and item by item."""
    return before.diff(after)


def merge(
    base: str | os.PathLike[str],
    mine: str | os.PathLike[str],
    theirs: str | os.PathLike[str],
    out: str | os.PathLike[str],
) -> Merge:
    """Puts two setup files together that were made from `base`, and writes `out`, in one step; it may be `mine`,
    else a new file: raises `SetupError` where there is another one.

    Where both have changed a thing in different ways, the merged setup has mine, and the result lists the conflict.
    """
    told = _tervane.merge(os.fspath(base), os.fspath(mine), os.fspath(theirs), os.fspath(out))
    return Merge(told["taken"], [Conflict(**conflict) for conflict in told["conflicts"]])
