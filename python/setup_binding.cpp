// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <fmt/format.h>
#include <pybind11/stl.h>

#include "core/kvf_writer.h"
#include "document/item_owner.h"
#include "document/key_reference.h"
#include "document/setup_diff.h"
#include "pages/why.h"
#include "platform/paths.h"
#include "platform/text.h"
#include "python/key_values.h"

namespace py = pybind11;
using namespace py::literals;

namespace tervane::python {

namespace {

using SetupHandle = std::shared_ptr<OpenSetup>;

Node NodeOf(const SetupHandle& setup, CYbSEKvfBase& node) { return {setup, setup->Hold(node)}; }

OpenSetup::Place PlaceAt(OpenSetup& setup, const std::string& path) {
  std::string problem;
  const OpenSetup::Place* place = setup.Find(path, problem);
  if (!place) Raise("KeyNotFound", problem);
  return *place;
}

PathStep StepOfKey(const std::string& key) {
  // Nearly all names are plain: a path is only read where a number stands behind.
  if (key.find_first_of("#\"") == std::string::npos) return {key, 1};
  return ParseSetupPath(":" + key).key;
}

py::dict DictOf(const SetupFinding& finding) {
  return py::dict("severity"_a = std::string(KindName(finding.kind)), "path"_a = finding.path, "key"_a = finding.key,
                  "text"_a = finding.text, "detail"_a = finding.detail, "line"_a = finding.line);
}

py::dict DictOf(const Explanation& why, const std::string& path) {
  py::list reasons;
  for (const Reason& reason : why.reasons)
    reasons.append(py::dict("text"_a = reason.text, "holds"_a = reason.holds, "path"_a = reason.path,
                            "key"_a = reason.key, "page"_a = reason.page, "is_alternative"_a = reason.isAlternative));
  return py::dict("path"_a = path, "title"_a = why.subject, "holds"_a = why.holds, "reasons"_a = reasons);
}

py::dict InfoOf(const Node& node, const std::string& key) {
  CYbSEKvfBase& own = node.Get();
  std::string problem;
  const PathStep step = StepOfKey(key);
  const KvfNode* keyword = node.setup->Keys().Find(own, step, problem);
  if (!keyword) Raise("KeyNotFound", problem);
  const std::optional<KeyInfo> info = node.setup->Keys().InfoOf(own, Trimmed(step.name));
  const KeyFacts facts = info ? info->facts : KeyFacts();
  py::dict choices;
  for (const KeyChoice& choice : facts.choices)
    choices[py::int_(choice.value + info->inFile)] = std::string(choice.text);
  std::string meaning;
  if (info && !facts.choices.empty() && keyword->count == 1 && keyword->params[0].type == KvfType::Int)
    meaning = TextOf(facts.choices, keyword->params[0].asInt - info->inFile);
  const std::string standard(KeyReference::Get().DefaultOf(PathOf(own), Trimmed(step.name)));
  return py::dict("key"_a = std::string(keyword->Name()), "type"_a = info ? info->type : std::string(),
                  "default"_a = standard, "choices"_a = choices, "unit"_a = std::string(facts.UnitText()),
                  "range"_a = facts.RangeText(), "text"_a = PlainValuesText(*keyword), "meaning"_a = meaning);
}

std::string FileOf(const Node& node, const std::string& key) {
  std::string problem;
  const KvfNode* keyword = node.setup->Keys().Find(node.Get(), StepOfKey(key), problem);
  if (!keyword) Raise("KeyNotFound", problem);
  if (keyword->count == 0 || keyword->params[0].type != KvfType::Filename)
    Raise("ValueRefused", PathOf(node.Get()) + ":" + key + ": it names no file");
  const std::string text(keyword->params[0].Text());
  return text.empty() ? text : ResolvedPath(text, node.setup->Root().SetupFolder());
}

std::vector<Node> NodesOf(const Node& node, bool itemsAlone) {
  std::vector<Node> nodes;
  CYbSEKvfBase& own = node.Get();
  const auto add = [&](CYbSEKvfBase& child) {
    nodes.push_back({node.setup, std::make_shared<HeldNode>(child, node.held)});
  };
  if (itemsAlone)
    for (CYbSEKvfBase* item : ItemOwner(&own).Items()) add(*item);
  else
    for (CYbSEKvfBase* child = own.GetFirstChild(); child; child = own.GetNextChild(child)) add(*child);
  return nodes;
}

std::vector<std::string> KeysOf(const Node& node) {
  std::vector<std::string> names;
  std::unordered_map<std::string, int> instances;
  for (const KvfNode* key : node.setup->Keys().KeysOf(node.Get())) {
    const std::string name(key->Name());
    const int instance = ++instances[name];
    names.push_back(instance == 1 ? name : PathName(name, instance));
  }
  return names;
}

Node InsertItem(const Node& owner, int place, const std::optional<Node>& like) {
  std::string problem;
  CYbSEKvfBase* item = owner.setup->InsertItem(owner.Get(), place, like ? &like->Get() : nullptr, problem);
  if (!item) Raise("ValueRefused", problem);
  return NodeOf(owner.setup, *item);
}

/// As `CompareDocuments`, with the words of the command line.
py::list Differences(const OpenSetup& from, const OpenSetup& to) {
  constexpr const char* kKinds[] = {"changed", "added", "removed", "moved"};
  py::list list;
  for (const SetupDifference& difference : CompareDocuments(from.Document(), to.Document()))
    list.append(py::dict("kind"_a = kKinds[static_cast<std::size_t>(difference.kind)], "path"_a = difference.path,
                         "key"_a = difference.key, "before"_a = difference.from, "after"_a = difference.to,
                         "before_meaning"_a = difference.fromMeaning, "after_meaning"_a = difference.toMeaning));
  return list;
}

void BindNode(py::module_& module) {
  py::class_<Node>(module, "Node")
      .def_property_readonly("path", [](const Node& node) { return PathOf(node.Get()); })
      .def_property_readonly("title", [](const Node& node) { return node.Get().GetTitle(); })
      .def_property_readonly("class_name", [](const Node& node) { return ClassNameOf(node.Get()); })
      .def_property_readonly("section", [](const Node& node) { return node.Get().FormattedSectionName(); })
      .def_property_readonly("serial", [](const Node& node) { return node.held->Serial(); })
      .def_property_readonly("is_alive", [](const Node& node) { return node.held->Get() != nullptr; })
      .def_property_readonly("takes_part", [](const Node& node) { return node.Get().IsDataUsedInSetup() != 0; })
      .def_property_readonly("parent",
                             [](const Node& node) -> std::optional<Node> {
                               CYbSEKvfBase* parent = node.Get().GetParent();
                               return parent ? std::optional(NodeOf(node.setup, *parent)) : std::nullopt;
                             })
      .def("children", [](const Node& node) { return NodesOf(node, false); })
      .def("keys", &KeysOf)
      .def(
          "get",
          [](const Node& node, const std::string& key, const std::optional<std::string>& unit) {
            return ValueOf(*node.setup, node.Get(), StepOfKey(key), unit);
          },
          "key"_a, "unit"_a = py::none())
      .def(
          "set",
          [](const Node& node, const std::string& key, const py::object& value,
             const std::optional<std::string>& unit) {
            SetValue(*node.setup, node.Get(), StepOfKey(key), value, unit);
          },
          "key"_a, "value"_a, "unit"_a = py::none())
      .def("info", &InfoOf, "key"_a)
      .def("file", &FileOf, "key"_a)
      .def(
          "repeated",
          [](const Node& node, const std::string& section, const std::string& key) {
            const auto values = node.setup->Keys().Repeated(node.Get(), section, key);
            if (!values) Raise("KeyNotFound", PathOf(node.Get()) + ": there is no section " + section + " here");
            py::list list;
            for (const PlainValue& value : *values) list.append(ToPython(value));
            return list;
          },
          "section"_a, "key"_a)
      .def(
          "set_repeated",
          [](const Node& node, const std::string& section, const std::string& key, const py::object& values) {
            const std::vector<PlainValue> plain = PlainValuesOf(values);
            const std::string problem = node.setup->Keys().SetRepeated(node.Get(), section, key, plain);
            if (!problem.empty()) Raise("ValueRefused", problem);
          },
          "section"_a, "key"_a, "values"_a)
      .def_property_readonly("has_items", [](const Node& node) { return ItemOwner(&node.Get()).Node() != nullptr; })
      .def("item_count", [](const Node& node) { return ItemOwner(&node.Get()).Count(); })
      .def("items", [](const Node& node) { return NodesOf(node, true); })
      .def(
          "item",
          [](const Node& node, int number) {
            CYbSEKvfBase* item = ItemOwner(&node.Get()).Item(number);
            if (!item) throw py::index_error("there is no such item");
            return Node{node.setup, std::make_shared<HeldNode>(*item, node.held)};
          },
          "number"_a)
      .def("insert_item", &InsertItem, "number"_a, "like"_a = py::none())
      .def(
          "remove_item", [](const Node& node, int number) { return node.setup->RemoveItem(node.Get(), number); },
          "number"_a)
      .def(
          "move_item",
          [](const Node& node, int number, int to) { return node.setup->MoveItem(node.Get(), number, to); }, "number"_a,
          "to"_a)
      .def("why",
           [](const Node& node) {
             CYbSEKvfBase& own = node.Get();
             return DictOf(WhyTakesPart(node.setup->Document(), own), PathOf(own));
           })
      .def(
          "find",
          [](const Node& node, const std::string& path) {
            const SetupPath parsed = ParseSetupPath(path);
            CYbSEKvfBase* found = parsed.error.empty() ? &node.Get() : nullptr;
            for (const PathStep& step : parsed.steps)
              if (found) found = FindChild(*found, step);
            if (!found || !parsed.key.name.empty())
              Raise("KeyNotFound", fmt::format("{}: there is no node {} here", PathOf(node.Get()), path));
            return NodeOf(node.setup, *found);
          },
          "path"_a);
}

}  // namespace

void BindSetups(py::module_& module) {
  BindNode(module);
  py::class_<OpenSetup, SetupHandle>(module, "Setup")
      .def(py::init<>())
      .def(
          "open",
          [](OpenSetup& setup, const std::string& path) {
            if (!setup.Open(path)) Raise("SetupError", setup.Error());
          },
          "path"_a)
      .def(
          "save",
          [](OpenSetup& setup, const std::string& path) {
            if (!setup.Save(path)) Raise("SetupError", setup.Error());
            return setup.Document().SaveNotes();
          },
          "path"_a)
      .def("copy",
           [](const OpenSetup& setup) {
             auto copy = std::make_shared<OpenSetup>();
             std::string problem;
             if (!setup.CopyTo(*copy, problem)) Raise("SetupError", problem);
             return copy;
           })
      .def_property_readonly("path", [](const OpenSetup& setup) { return setup.Document().PathName(); })
      .def_property_readonly("folder", [](const OpenSetup& setup) { return setup.Root().SetupFolder(); })
      .def_property_readonly("version", [](const OpenSetup& setup) { return setup.Root().ReadDocVersion(); })
      .def_property_readonly("result_folder", [](const OpenSetup& setup) { return setup.Document().getResultFolder(); })
      .def_property_readonly("root",
                             [](const SetupHandle& setup) {
                               return Node{setup, setup->HeldRoot()};
                             })
      .def(
          "find",
          [](const SetupHandle& setup, const std::string& path) {
            return Node{setup, PlaceAt(*setup, path).node};
          },
          "path"_a)
      .def(
          "get",
          [](OpenSetup& setup, const std::string& path, const std::optional<std::string>& unit) {
            const OpenSetup::Place place = PlaceAt(setup, path);
            return ValueOf(setup, *place.node->Get(), place.key, unit);
          },
          "path"_a, "unit"_a = py::none())
      .def(
          "set",
          [](OpenSetup& setup, const std::string& path, const py::object& value,
             const std::optional<std::string>& unit) {
            const OpenSetup::Place place = PlaceAt(setup, path);
            SetValue(setup, *place.node->Get(), place.key, value, unit);
          },
          "path"_a, "value"_a, "unit"_a = py::none())
      .def("validate",
           [](OpenSetup& setup) {
             py::list findings;
             for (const SetupFinding& finding : setup.Validate()) findings.append(DictOf(finding));
             return findings;
           })
      .def("missing",
           [](OpenSetup& setup) {
             py::list missing;
             for (const MissingNode& node : WhatIsMissing(setup.Document()))
               missing.append(DictOf(node.why, node.path));
             return missing;
           })
      .def("diff", &Differences, "other"_a)
      .def("text", [](const OpenSetup& setup) {
        std::string text, problem;
        if (!setup.Document().BuildText(setup.Root().SetupFolder(), text, problem)) Raise("SetupError", problem);
        return text;
      });
}

}  // namespace tervane::python
