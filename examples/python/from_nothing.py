#!/usr/bin/env python3
# Copyright (C) 2026 the Tervane developers
# SPDX-License-Identifier: GPL-3.0-or-later
"""A setup of a small valley that is built from nothing: domain, ground, rain and evapotranspiration.

    python3 from_nothing.py valley
"""

import datetime
import pathlib
import sys

import numpy

import tervane

CELL = 50.0  # m
ROWS, COLUMNS = 40, 60


def write_data(folder: pathlib.Path) -> None:
    """A valley that falls to the east, and the weather of a year."""
    y, x = numpy.mgrid[0:ROWS, 0:COLUMNS]
    # 1 is inside, 2 on the boundary; what is masked is outside.
    is_inside = ((y - ROWS / 2) / (ROWS / 2 - 1)) ** 2 + ((x - COLUMNS / 2) / (COLUMNS / 2 - 1)) ** 2 < 1
    around = numpy.pad(is_inside, 1)
    is_inner = around[:-2, 1:-1] & around[2:, 1:-1] & around[1:-1, :-2] & around[1:-1, 2:]
    domain = numpy.ma.masked_array(numpy.where(is_inner, 1, 2), ~is_inside)
    tervane.write_data_file(folder / "domain.nds2", domain, "Code", name="Domain", cell_size=CELL)
    ground = 120 - 0.5 * x + 0.05 * (y - ROWS / 2) ** 2
    tervane.write_data_file(folder / "ground.nds2", ground, "Elevation", unit="m", cell_size=CELL)

    begin = datetime.datetime(2001, 1, 1)
    days = [begin + datetime.timedelta(days=day) for day in range(1, 366)]
    rain = numpy.random.default_rng(2001).gamma(0.4, 6, 365)
    summer = numpy.sin(numpy.linspace(0, numpy.pi, 365)) ** 2
    for name, quantity, values in (
        ("rain", "Precipitation Rate", rain),
        ("evapotranspiration", "Evapotranspiration", 4 * summer),
    ):
        tervane.write_data_file(
            folder / f"{name}.nds0", values, quantity, unit="mm/day", times=days, begin=begin, value_type="mean-step"
        )


def build() -> tervane.Setup:
    setup = tervane.new()
    setup["SimSpec/SimTitle:Title"] = "A small valley"
    setup.node("SimSpec/SimulationPeriod").update(
        {"SIMSTART": datetime.datetime(2001, 1, 1), "SIMEND": datetime.datetime(2001, 12, 31)}
    )
    setup.set("SimSpec/CompControlParaTimeStep:InitialTimeStep", 15, unit="minutes")
    # Rain, evapotranspiration and overland flow; no ground below.
    setup.node("SimSpec/ModelComp").update({"SZ": 0, "UZ": 0, "ET": 0})
    setup.node("Catchment/NDS_2D_DATA_FILE").choose("domain.nds2")
    setup["Topography:Type"] = "Grid file (.nds2)"
    setup.node("Topography/NDS_2D_DATA_FILE").choose("ground.nds2")
    for quantity, file in (("PrecipitationRate", "rain"), ("POTEVAPTRANS", "evapotranspiration")):
        forcing = setup.node(f"Climate/{quantity}/GLOBAL")
        forcing["TYPE"] = 1  # a series
        forcing.node("TIME_SERIES_FILE").choose(f"{file}.nds0")
    setup.set("Overland/Manning:FixedValue", 15)
    return setup


def main(folder: str) -> None:
    place = pathlib.Path(folder)
    place.mkdir(parents=True, exist_ok=True)
    write_data(place)
    setup = build()
    setup.save(place / "valley.tvd")
    for finding in setup.validate():
        print(finding)
    run = setup.run("pp")
    for line in run:
        print(line)
    print(run.text)


if __name__ == "__main__":
    if len(sys.argv) != 2:
        sys.exit(__doc__)
    main(sys.argv[1])
