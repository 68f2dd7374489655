# Copyright (C) 2026 the Tervane developers
# SPDX-License-Identifier: GPL-3.0-or-later
"""Nodes of a setup: sections with their keys, lists with their items."""

from __future__ import annotations

import os
from collections.abc import Iterable, Iterator, Mapping, MutableSequence
from typing import Any, NamedTuple, SupportsIndex, overload

from . import _tervane
from ._findings import Explanation, explanation_of


class KeyInfo(NamedTuple):
    """What is declared of a key, with its present value in words."""

    key: str
    type: str
    """"int", "float", "double", "bool", "string", "filename", "date", "day", "int list", "string list"."""
    default: str
    """As the file holds it; empty where there is none."""
    choices: dict[int, str]
    """The texts of the values that it may have; empty where it may have any."""
    unit: str
    """The unit in which the file holds it; may be empty."""
    range: str
    """"0 or more"; may be empty."""
    text: str
    """The value as the file holds it."""
    meaning: str
    """The text of the chosen value; empty where there are no choices."""


class Node:
    """A node of a setup. It stays the same through all changes, until it is removed; then all operations raise
    `StaleNode`. Two nodes are equal when they are the same node.

        node = setup.node("SimSpec/SimulationPeriod")
        node["SIMSTART"] = datetime(2001, 3, 1)
    """

    __slots__ = ("_handle",)

    def __init__(self, handle: _tervane.Node) -> None:
        self._handle = handle

    # ---- Keys

    def __getitem__(self, key: str) -> Any:
        return self._handle.get(key)

    def __setitem__(self, key: str, value: Any) -> None:
        self._handle.set(key, value)

    def get(self, key: str, unit: str | None = None) -> Any:
        """The value of a key as the file would hold it: int, float, bool, str, datetime, date, or a list.

        A number is in the unit of the file, or in `unit` ("m", "mm/day"). Raises `KeyNotFound`, and `UnitError`.
        """
        return self._handle.get(key, unit)

    def set(self, key: str, value: Any, unit: str | None = None) -> None:
        """Gives a key another value: a number, where `unit` may tell its unit, a truth value, a date, a path, a list;
        or a text, which is taken as people type it: "Richards equation", "2 days", "2001-03-01".

        Raises `ValueRefused` where the setup would not keep the value; then nothing is changed.
        """
        self._handle.set(key, value, unit)

    def update(self, values: Mapping[str, Any]) -> None:
        """Gives several keys other values, in this order."""
        for key, value in values.items():
            self._handle.set(key, value)

    def keys(self) -> list[str]:
        """The names of all keys in the order of the file; of like ones the second is "NAME#2"."""
        return self._handle.keys()

    def __contains__(self, key: object) -> bool:
        return key in self._handle.keys()

    def to_dict(self) -> dict[str, Any]:
        """All keys with their values."""
        return {key: self._handle.get(key) for key in self._handle.keys()}

    def info(self, key: str) -> KeyInfo:
        """What is declared of a key: type, default, choices, unit, range."""
        return KeyInfo(**self._handle.info(key))

    def file(self, key: str) -> str:
        """The absolute path that a key names; empty where it names no file."""
        return self._handle.file(key)

    def choose(self, path: str | os.PathLike[str], item: int = 1) -> None:
        """Of a node of a data file: names the file, and one of its items, from 1. A relative path starts
        from the folder of the setup.

            setup.node("Topography/NDS_2D_DATA_FILE").choose("dem.nds2")
        """
        self["FILE_NAME"] = os.fspath(path)
        if "ITEM_NUMBERS" in self:
            self["ITEM_NUMBERS"] = [item]

    def repeated(self, section: str, key: str) -> list[Any]:
        """The values that stand one behind the other in a section of the node that is no node itself."""
        return self._handle.repeated(section, key)

    def set_repeated(self, section: str, key: str, values: Iterable[Any]) -> None:
        """Puts others in their place."""
        self._handle.set_repeated(section, key, list(values))

    # ---- The tree

    @property
    def path(self) -> str:
        """As every program writes it: "SimSpec/SimTitle"."""
        return self._handle.path

    @property
    def title(self) -> str:
        """What people call it."""
        return self._handle.title

    @property
    def class_name(self) -> str:
        """The kind of node."""
        return self._handle.class_name

    @property
    def is_alive(self) -> bool:
        """False once it is gone."""
        return self._handle.is_alive

    @property
    def parent(self) -> Node | None:
        """None for the root."""
        parent = self._handle.parent
        return None if parent is None else Node(parent)

    def children(self) -> list[Node]:
        """All nodes right below, of a list also its items."""
        return [Node(child) for child in self._handle.children()]

    def node(self, path: str) -> Node:
        """A node below: node("Soils/Soil_1")."""
        return Node(self._handle.find(path))

    def walk(self) -> Iterator[Node]:
        """This node and all below it, parents first. What is added or removed meanwhile may be met or not."""
        yield self
        for child in self._handle.children() if self.is_alive else ():
            if child.is_alive:
                yield from Node(child).walk()

    @property
    def items(self) -> NodeList:
        """The items of a list, or zones, as a sequence that can be changed. Raises `TypeError` for other nodes."""
        return NodeList(self._handle)

    # ---- Taking part

    @property
    def takes_part(self) -> bool:
        """Whether the model uses it: by its own rule and those of all nodes above it."""
        return self._handle.takes_part

    def why(self) -> Explanation:
        """Why it takes part or not."""
        return explanation_of(self._handle.why())

    def __eq__(self, other: object) -> bool:
        return isinstance(other, Node) and self._handle.serial == other._handle.serial

    def __hash__(self) -> int:
        return hash(self._handle.serial)

    def __repr__(self) -> str:
        return f"<tervane.Node {self.path}>" if self.is_alive else "<tervane.Node that is gone>"


class NodeList(MutableSequence[Node]):
    """The items of a list, counted from 0 as all sequences. What is put in is a mapping of keys and values, another
    item of the same kind, whose values are copied, or None for an item at its defaults.

        species = setup.node("Species").items
        species.append({"Name": "Nitrate"})
        species.append(species[0])
        del species[-1]
    """

    __slots__ = ("_handle",)

    def __init__(self, handle: _tervane.Node) -> None:
        if not handle.has_items:
            raise TypeError(f"{handle.path} holds no items")
        self._handle = handle

    def __len__(self) -> int:
        return self._handle.item_count()

    def _place(self, index: SupportsIndex) -> int:
        """From 1."""
        place = index.__index__()
        count = len(self)
        if not -count <= place < count:
            raise IndexError(f"{self._handle.path}: there is no item {place}: it has {count}")
        return place % count + 1

    @overload
    def __getitem__(self, index: SupportsIndex) -> Node: ...

    @overload
    def __getitem__(self, index: slice) -> list[Node]: ...

    def __getitem__(self, index: SupportsIndex | slice) -> Node | list[Node]:
        if isinstance(index, slice):
            return [Node(item) for item in self._handle.items()[index]]
        return Node(self._handle.item(self._place(index)))

    def __setitem__(self, index: Any, value: Any) -> None:
        """Puts an item in the place of another one."""
        if isinstance(index, slice):
            raise TypeError("items are put in one by one")
        place = self._place(index)
        self.insert(place, value)
        self._handle.remove_item(place)

    def __delitem__(self, index: SupportsIndex | slice) -> None:
        places = [self._place(i) for i in range(len(self))[index]] if isinstance(index, slice) else [self._place(index)]
        for place in sorted(places, reverse=True):
            self._handle.remove_item(place)

    def insert(self, index: SupportsIndex, value: Node | Mapping[str, Any] | None = None) -> None:
        """Puts an item in front of another one; behind all where there is none."""
        count = len(self)
        place = index.__index__()
        place = max(place + count, 0) if place < 0 else min(place, count)
        like = value._handle if isinstance(value, Node) else None
        if value is not None and like is None and not isinstance(value, Mapping):
            raise TypeError("an item is put in as a mapping of keys, as another item, or as None")
        item = Node(self._handle.insert_item(place + 1, like))
        if isinstance(value, Mapping):
            try:
                item.update(value)
            except Exception:
                self._handle.remove_item(place + 1)
                raise

    def add(self, value: Node | Mapping[str, Any] | None = None, **keys: Any) -> Node:
        """Appends an item, and gives it: add(Name="Nitrate"). The keys hold over those of `value`."""
        if value is None or isinstance(value, Mapping):
            self.append({**(value or {}), **keys})
            return self[-1]
        self.append(value)
        item = self[-1]
        try:
            item.update(keys)
        except Exception:
            del self[-1]
            raise
        return item

    def append(self, value: Node | Mapping[str, Any] | None = None) -> None:
        """Appends an item."""
        self.insert(len(self), value)

    def move(self, index: SupportsIndex, to: SupportsIndex) -> None:
        """Gives an item another place, by which the others step aside."""
        if not self._handle.move_item(self._place(index), self._place(to)):
            raise TypeError(f"{self._handle.path}: these items have no order of their own")

    def reverse(self) -> None:
        """Turns the order of the items around."""
        for place in range(len(self)):
            self.move(-1, place)

    def __repr__(self) -> str:
        return f"<tervane.NodeList {self._handle.path}, {len(self)} items>"
