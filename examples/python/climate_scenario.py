#!/usr/bin/env python3
# Copyright (C) 2026 the Tervane developers
# SPDX-License-Identifier: GPL-3.0-or-later
"""A setup under a warmer climate with wetter winters, beside the one of today.

Series are changed month by month in files of their own; the setup of today and its files stay as they are.

    python3 climate_scenario.py examples/rhone/rhone.tvd warmer.tvd
"""

import pathlib
import sys

import numpy

import tervane

# January first.
WETTER_WINTERS = [1.2, 1.2, 1.1, 1, 1, 0.9, 0.9, 0.9, 1, 1.1, 1.2, 1.2]


def mean_of(setup: tervane.Setup, quantity: str) -> float:
    """The mean of all series of a quantity, in mm/day or degrees Celsius."""
    means = [
        numpy.nanmean(tervane.open_data_file(each["file"]).values(each["item"] - 1))
        for each in setup.climate()
        if each["quantity"] == quantity and each["kind"] == "series"
    ]
    return float(numpy.mean(means))


def main(path: str, out: str) -> None:
    today = tervane.open(path)
    scenario = today.copy()
    folder = pathlib.Path(out).with_suffix("").with_name(pathlib.Path(out).stem + "_climate")
    scenario.change_climate(folder, factor={"precipitation": WETTER_WINTERS}, shift={"temperature": 2.5})
    scenario["SimSpec/SimTitle:Title"] = f"{today['SimSpec/SimTitle:Title']}, 2.5 degrees warmer"
    scenario.save(out)
    for quantity, unit in (("precipitation", "mm/day"), ("temperature", "°C")):
        before, after = mean_of(today, quantity), mean_of(scenario, quantity)
        print(f"{quantity}: {before:.2f} -> {after:.2f} {unit}")
    changed = [finding for finding in scenario.validate() if finding.severity == "error"]
    print(f"{len(changed)} errors in {out}, {len(today.diff(scenario))} differences")


if __name__ == "__main__":
    if len(sys.argv) != 3:
        sys.exit(__doc__)
    main(*sys.argv[1:])
