# Copyright (C) 2026 the Tervane developers
# SPDX-License-Identifier: GPL-3.0-or-later
import os
import pathlib
import shutil

import pytest

import tervane

ROOT = pathlib.Path(__file__).resolve().parents[2]


@pytest.fixture
def setup() -> tervane.Setup:
    return tervane.new()


@pytest.fixture
def rhone(tmp_path: pathlib.Path) -> pathlib.Path:
    """A real catchment with its data."""
    shutil.copytree(ROOT / "examples" / "rhone", tmp_path / "rhone")
    return tmp_path / "rhone" / "rhone.tvd"


@pytest.fixture
def engines() -> str:
    return os.path.join(os.environ["TERVANE_BIN"], "engines")
