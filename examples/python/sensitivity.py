#!/usr/bin/env python3
# Copyright (C) 2026 the Tervane developers
# SPDX-License-Identifier: GPL-3.0-or-later
"""How much of a catchment is lost on a coarser grid.

Each of 20 scenarios has other cells, from 500 m to 5 km. The preprocessor puts the domain and the ground on them; the
script reads what came of it. Nothing of the setup itself is changed.

    python3 sensitivity.py examples/rhone/rhone.tvd runs
"""

import math
import pathlib
import sys

import numpy

import tervane


def grids_of(scenario: tervane.Setup) -> tervane.DataFile:
    """What the preprocessor has put on the cells."""
    [path] = pathlib.Path(scenario.result_folder).glob("*_PreProcessed.nds2")
    return tervane.open_data_file(path)


def main(path: str, folder: str, runs: int = 20) -> None:
    setup = tervane.open(path)
    pathlib.Path(folder).mkdir(parents=True, exist_ok=True)
    domain = setup.node("Catchment")
    size, width, height = domain["sizeShp"], domain["nxShp"], domain["nyShp"]
    print("cell size in m  cells   area in km2  mean elevation in m  highest")
    for number, cell in enumerate(numpy.linspace(500, 5000, runs), 1):
        scenario = setup.copy()
        scenario.node("Catchment").update(
            {"sizeShp": cell, "nxShp": math.ceil(width * size / cell), "nyShp": math.ceil(height * size / cell)}
        )
        scenario.save(pathlib.Path(folder) / f"cells_{number}.tvd")
        scenario.run("pp").wait(check=True)
        grids = grids_of(scenario)
        inside = grids.values("Model Domain and Grid", steps=0).count()
        ground = grids.values("Topography", steps=0)
        area = inside * (cell / 1000) ** 2
        print(f"{cell:14.0f}  {inside:5}  {area:12.0f}  {numpy.nanmean(ground):19.1f}  {numpy.nanmax(ground):7.0f}")


if __name__ == "__main__":
    if len(sys.argv) != 3:
        sys.exit(__doc__)
    main(*sys.argv[1:])
