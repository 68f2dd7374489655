# Copyright (C) 2026 the Tervane developers
# SPDX-License-Identifier: GPL-3.0-or-later
"""What is told of setups, as plain objects."""

from __future__ import annotations

from typing import NamedTuple


def _place(path: str, key: str) -> str:
    return f"{path}:{key}" if key else path


class Finding(NamedTuple):
    """Something that is wrong in a setup, or to be known of it."""

    severity: str
    """"error", "warning", "note", or "unread" for what stands in the file and is read by nothing."""
    path: str
    key: str
    """May be empty."""
    text: str
    detail: str
    """The reason behind the text; may be empty."""
    line: int
    """Of the file that was read; 0 where it speaks of none."""

    def __str__(self) -> str:
        reason = f" ({self.detail})" if self.detail else ""
        return f"{self.severity}: {_place(self.path, self.key)}: {self.text}{reason}"


class Reason(NamedTuple):
    """Why a node takes part or not."""

    text: str
    """"Overland Flow (OL) is on"."""
    holds: bool
    path: str
    """Of the node whose key decides; may be empty."""
    key: str
    page: str
    """The title of the page on which it is decided; may be empty."""
    is_alternative: bool
    """This would do instead of the reasons in front of it."""


class Explanation(NamedTuple):
    """Whether a node takes part, and why."""

    path: str
    title: str
    holds: bool
    reasons: list[Reason]

    def __str__(self) -> str:
        head = f"{self.path} ({self.title}) takes {'part' if self.holds else 'no part'}"
        return head + (": " + "; ".join(reason.text for reason in self.reasons) if self.reasons else "")


def explanation_of(told: dict[str, object]) -> Explanation:
    reasons = [Reason(**reason) for reason in told["reasons"]]  # type: ignore[attr-defined]
    return Explanation(str(told["path"]), str(told["title"]), bool(told["holds"]), reasons)


class Difference(NamedTuple):
    """A difference of two setups."""

    kind: str
    """"changed", "added", "removed" or "moved"."""
    path: str
    key: str
    """Empty where a whole section is meant."""
    before: str
    """As the file holds it."""
    after: str
    before_meaning: str
    """The text of the choice, or the unit; empty where neither is known."""
    after_meaning: str

    def __str__(self) -> str:
        return f"{_place(self.path, self.key)}: {self.kind}: {self.before} -> {self.after}"


class Conflict(NamedTuple):
    """What both sides of a merge have changed in different ways."""

    kind: str
    """"value", "deleted by me", "deleted by them" or "order"."""
    path: str
    key: str
    base: str
    mine: str
    theirs: str
    text: str
    """In plain words."""

    def __str__(self) -> str:
        return self.text


class Merge(NamedTuple):
    """What came of a merge."""

    taken: int
    """How many changes of theirs were taken."""
    conflicts: list[Conflict]
