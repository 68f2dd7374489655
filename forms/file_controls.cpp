// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Controls over data files and shape files: a name that may be typed, and a selector that shows what a file holds and
// refuses with the reason what its node has no use for.
#include <algorithm>
#include <array>

#include <fmt/format.h>

#include "data/datafile_request.h"
#include "forms/file_browse.h"
#include "forms/page_form.h"
#include "spatial/file_nodes.h"

namespace tervane {

namespace {

std::string SizeText(const DataItem& item) {
  if (item.dimensions == 0) return "one value";
  if (item.dimensions == 1) return fmt::format("{}", item.geometry.nx);
  std::string size = fmt::format("{} x {}", item.geometry.nx, item.geometry.ny);
  if (item.dimensions == 3) size += fmt::format(" x {} layers", item.geometry.nz);
  return size;
}

std::string PeriodText(const TimeAxis& time) {
  if (!time.hasDates || time.stamps.empty()) return "at all times";
  constexpr std::string_view kDay = "%Y-%m-%d %H:%M";
  return fmt::format("{} to {}", time.Start().Format(kDay), time.End().Format(kDay));
}

/// Asks for a shape file and one of its attributes; without a demand for one the file alone is chosen.
bool BrowseShapeFile(CData2DShpFile& node, Host::FileQuestion question, Host& host) {
  const std::string folder = node.GetRoot() ? node.GetRoot()->SetupFolder() : std::string();
  question.current = node.File.IsEmpty() ? folder : node.File.Absolute();
  const auto path = host.AskFileToOpen(question);
  if (!path) return false;
  CYbShapeData shapes;
  if (const FileResult result = shapes.ReadShapeAndDbfFile(*path, ""); !result.Ok()) {
    host.ShowMessage(result.error, Host::Icon::Error);
    return false;
  }
  Host::ItemQuestion fields;
  fields.title = "Choose an attribute";
  fields.file = *path;
  fields.heads = {"Attribute", "Kind", "Shapes"};
  constexpr const char* kKinds[] = {"text", "whole numbers", "numbers"};
  for (const ShapeField& field : shapes.Fields()) {
    fields.rows.push_back(
        {{field.name, kKinds[static_cast<int>(field.kind)], fmt::format("{}", shapes.GetData().size())},
         CheckShapeFile(*path, node.Request(), field.name).error});
    if (fields.current < 0 && fields.rows.back().refusal.empty())
      fields.current = static_cast<int>(fields.rows.size()) - 1;
  }
  const auto chosen = host.AskItem(fields);
  if (!chosen) return false;
  node.Choose(FileName::Picked(*path, folder), shapes.Fields()[static_cast<std::size_t>(*chosen)].name);
  return true;
}

/// An attribute that a file of a typed name does not have gives way to the first that will do.
void ChooseAttribute(CData2DShpFile& node) {
  CYbShapeData shapes;
  const std::string path = node.File.Absolute();
  if (!shapes.ReadShapeAndDbfFile(path, "").Ok()) return;
  const std::string chosen = node.Attribute();
  if (std::ranges::any_of(shapes.Fields(), [&](const ShapeField& field) { return field.name == chosen; })) return;
  const auto usable = std::ranges::find_if(
      shapes.Fields(), [&](const ShapeField& field) { return CheckShapeFile(path, node.Request(), field.name).Ok(); });
  node.Choose(node.File, usable == shapes.Fields().end() ? std::string() : usable->name);
}

}  // namespace

bool BrowseDataFile(DataFileNode& node, Host::FileQuestion question, Host& host) {
  const std::string folder = node.GetRoot() ? node.GetRoot()->SetupFolder() : std::string();
  question.current = node.File.IsEmpty() ? folder : node.File.Absolute();
  const auto path = host.AskFileToOpen(question);
  if (!path) return false;
  const auto file = DataFileFactsOf(*path);
  if (!file->error.empty()) {
    host.ShowMessage(file->error, Host::Icon::Error);
    return false;
  }
  Host::ItemQuestion items;
  items.title = "Choose an item";
  items.file = *path;
  items.heads = {"Item", "Quantity", "Unit", "Period", "Steps", "Size"};
  const DataFileRequest request = node.SelectionRequest();
  for (std::size_t i = 0; i < file->items.size(); ++i) {
    const DataItem& item = file->items[i];
    const ItemType* type = FindItemType(item.itemType);
    const int number = static_cast<int>(i) + 1;
    items.rows.push_back({{item.name, std::string(type ? type->name : "unknown"), item.unitText,
                           item.hasTime ? PeriodText(file->time) : "at all times",
                           fmt::format("{}", item.hasTime ? file->time.steps : 1), SizeText(item)},
                          WhyNotMet(*file, std::array{number}, request)});
    if (items.current < 0 && items.rows.back().refusal.empty()) items.current = static_cast<int>(i);
  }
  const auto chosen = host.AskItem(items);
  if (!chosen) return false;
  node.File = FileName::Picked(*path, folder);
  node.Items = {*chosen + 1};
  return true;
}

Control& PageForm::DataFile(std::string label, DataFileNode& file) {
  Control& control = File(std::move(label), file.File);
  control.node = &file;
  control.key = "FILE_NAME";
  control.enter = [&file, enter = std::move(control.enter)](const std::string& typed) {
    const std::string before = file.File.Text();
    std::string expected = enter(typed);
    // What was chosen in another file says nothing of this one.
    if (expected.empty() && file.File.Text() != before) file.Items = {1};
    return expected;
  };
  control.browse = [&file, &control](Host& host) { return BrowseDataFile(file, control.fileQuestion, host); };
  return control;
}

Control& PageForm::ShapeFile(std::string label, CData2DShpFile& file) {
  Control& control = File(std::move(label), file.File);
  control.node = &file;
  control.key = "FILE_NAME";
  control.enter = [&file, enter = std::move(control.enter)](const std::string& typed) {
    const std::string before = file.File.Text();
    std::string expected = enter(typed);
    if (expected.empty() && file.File.Text() != before) ChooseAttribute(file);
    return expected;
  };
  control.browse = [&file, &control](Host& host) { return BrowseShapeFile(file, control.fileQuestion, host); };
  return control;
}

}  // namespace tervane
