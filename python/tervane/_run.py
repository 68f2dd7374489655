# Copyright (C) 2026 the Tervane developers
# SPDX-License-Identifier: GPL-3.0-or-later
"""Runs of engines."""

from __future__ import annotations

import time
from collections.abc import Callable, Iterator

from . import _tervane
from ._errors import RunError
from ._findings import Finding

_INTERVAL = 0.05


class Run:
    """A run of an engine. It outlives the script: a small program waits for the engine and notes how it ended.

        run = setup.run("pp")
        for line in run:
            print(line)
        if run.outcome != "done":
            print(run.text)
    """

    def __init__(self, handle: _tervane.Run) -> None:
        self._handle = handle
        self._is_over = False
        self.progress: float | None = None
        """How far the engine says that it is, from 0 to 100; None until it says something."""
        self.messages: list[Finding] = []
        """Errors and warnings that the engine has told."""

    @property
    def is_over(self) -> bool:
        """Whether it has ended; reads the state anew."""
        if not self._is_over and not self._handle.look():
            self._is_over = True
            self._handle.mark_reported()
        return self._is_over

    @property
    def outcome(self) -> str:
        """"going on", "done", "failed", "stopped", "not started" or "unknown"."""
        return str(self._handle.state()["outcome"])

    @property
    def text(self) -> str:
        """The same as a sentence: "The engine crashed after 12 s: segmentation fault (signal 11).\""""
        return str(self._handle.state()["text"])

    @property
    def log(self) -> str:
        """The path of all that the engine prints."""
        return str(self._handle.state()["log"])

    @property
    def seconds(self) -> float:
        """How long it took; 0 until the end."""
        return float(self._handle.state()["seconds"])

    def lines(self) -> list[str]:
        """The lines that the engine has printed since the last call."""
        is_over = self.is_over
        lines = self._handle.lines(is_over)
        for line in lines:
            meaning = _tervane.meaning_of(line)
            if meaning is None:
                continue
            kind, first, second = meaning
            if kind == "progress":
                self.progress = float(first)
            else:
                path, _, key = str(first).rpartition(":") if ":" in str(first) else (str(first), "", "")
                self.messages.append(Finding(kind, path, key, second, "", 0))
        return lines

    def __iter__(self) -> Iterator[str]:
        """The lines of the engine as they come, to its end."""
        while True:
            is_over = self.is_over
            yield from self.lines()
            if is_over:
                return
            time.sleep(_INTERVAL)

    def wait(
        self, timeout: float | None = None, on_progress: Callable[[float], None] | None = None, check: bool = False
    ) -> str:
        """Waits for the end, and gives the outcome. Raises `TimeoutError` after `timeout` seconds; the run goes on.
        With `check` an outcome that is not "done" raises `RunError`."""
        end = None if timeout is None else time.monotonic() + timeout
        told: float | None = None
        while True:
            is_over = self.is_over
            self.lines()
            if on_progress is not None and self.progress is not None and self.progress != told:
                told = self.progress
                on_progress(told)
            if is_over:
                break
            if end is not None and time.monotonic() >= end:
                raise TimeoutError(f"the engine still runs after {timeout} s")
            time.sleep(_INTERVAL)
        if check and self.outcome != "done":
            raise RunError(self.text)
        return self.outcome

    def stop(self) -> None:
        """Asks the engine and all that it has started to end; a second call kills it."""
        problem = self._handle.stop()
        if problem:
            raise RunError(problem)
