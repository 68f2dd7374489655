# Copyright (C) 2026 the Tervane developers
# SPDX-License-Identifier: GPL-3.0-or-later
"""What operations raise."""

import re


class SetupError(Exception):
    """Something of a setup or a file could not be done. The text tells what, where, and what to do.

    Attributes:
        file: the file that it speaks of, or None.
        line: the line in that file, from 1; None where it speaks of none.
        key: the path of the key that it speaks of, or None.
    """

    def __init__(self, text: str) -> None:
        super().__init__(text)
        place = re.match(r"(.+?\.\w+):(?:(\d+):)?(?:\d+:)? ", text)
        key = re.match(r"([^\s:]+:[^\s:]+): ", text)
        self.file: str | None = place.group(1) if place else None
        self.line: int | None = int(place.group(2)) if place and place.group(2) else None
        self.key: str | None = key.group(1) if key and not place else None

    def __str__(self) -> str:
        return str(self.args[0])


class KeyNotFound(SetupError, KeyError):
    """The setup has no such node or key. The text names what comes near."""


class ValueRefused(SetupError, ValueError):
    """The key does not take the value, or the list not the item."""


class UnitError(SetupError, ValueError):
    """The unit is not known, or measures something else than the number."""


class StaleNode(SetupError, ReferenceError):
    """The node is gone: it was removed, or its setup was read anew."""


class RunError(SetupError):
    """An engine could not be started, or it failed."""
