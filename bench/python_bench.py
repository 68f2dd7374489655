#!/usr/bin/env python3
# Copyright (C) 2026 the Tervane developers
# SPDX-License-Identifier: GPL-3.0-or-later
"""What the Python module costs: to import, to get values, to read a grid of 100 MB beside a bare read of its file.

    PYTHONPATH=build/release/python python3 bench/python_bench.py
"""

import os
import statistics
import subprocess
import sys
import tempfile
import time
from collections.abc import Callable

import numpy

import tervane

ROOT = os.path.dirname(os.path.dirname(os.path.abspath(__file__)))
GETS = 10_000


def median_of(work: Callable[[], object], times: int = 7) -> float:
    """Milliseconds."""
    taken = []
    for _ in range(times):
        start = time.perf_counter()
        work()
        taken.append((time.perf_counter() - start) * 1000)
    return statistics.median(taken)


def tell(what: str, found: float, limit: float, unit: str = "ms") -> None:
    print(f"{what:45} {found:8.2f} {unit:2}  limit {limit:6.1f}  {'met' if found <= limit else 'NOT MET'}")


def bench_import() -> None:
    def start(code: str) -> float:
        return median_of(lambda: subprocess.run([sys.executable, "-c", code], check=True))

    tell("import tervane", start("import tervane") - start("pass"), 100)


def bench_gets() -> None:
    setup = tervane.open(os.path.join(ROOT, "examples/rhone/rhone.tvd"))
    path = "SimSpec/CompControlParaTimeStep:InitialTimeStep"
    node = setup.node("SimSpec/CompControlParaTimeStep")
    tell(f"{GETS} gets by path", median_of(lambda: [setup[path] for _ in range(GETS)]), 50)
    tell(f"{GETS} gets by a held node", median_of(lambda: [node["InitialTimeStep"] for _ in range(GETS)]), 20)
    values = [float(number) for number in range(1, 1001)]

    def change() -> None:
        for value in values:
            node["InitialTimeStep"] = value

    print(f"{'1000 sets by a held node':45} {median_of(change):8.2f} ms")


def bench_grid() -> None:
    with tempfile.TemporaryDirectory() as folder:
        path = os.path.join(folder, "grid.nds2")
        days = numpy.datetime64("2001-01-01") + numpy.arange(25)
        values = numpy.random.default_rng(1).random((25, 1000, 1000), dtype=numpy.float32)
        tervane.write_data_file(path, values, "Elevation", times=days, cell_size=10)

        def bare() -> None:
            # As the values stand in the file, the most significant byte first, turned around in place.
            numpy.fromfile(path, dtype=">f4", count=values.size).byteswap(inplace=True)

        file = tervane.open_data_file(path)
        module, peer = median_of(lambda: file.values()), median_of(bare)
        print(f"{'bare read of 100 MB, bytes turned around':45} {peer:8.2f} ms")
        print(f"{'the same as an array with missing values':45} {module:8.2f} ms")
        tell("against the bare read", module / peer, 1.2, "x")


if __name__ == "__main__":
    bench_import()
    bench_gets()
    bench_grid()
