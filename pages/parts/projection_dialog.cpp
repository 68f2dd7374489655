// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/projection_dialog.h"

#include <fmt/format.h>

#include "forms/table_of.h"
#include "geometry/cart.h"
#include "pages/parts/create_dialogs.h"
#include "platform/text.h"

namespace tervane {

namespace {

constexpr std::size_t kMostFound = 200;

}  // namespace

ProjectionDialog::ProjectionDialog(const PageContext& context, CYbSEKvfBase& node, const std::string& now)
    : CYbSEDlgBase(node, WithoutDocument(context)), typed_(CYbMapProjection(now).Name()) {
  Find();
}

void ProjectionDialog::Find() {
  found_ = FindProjections(typed_, kMostFound, problem_);
  chosen_ = found_.size() == 1 ? 0 : -1;
}

void ProjectionDialog::Describe(PageForm& form) {
  form.Text("Name, EPSG code or place:", typed_).ToolTip("As \"UTM zone 32N\", \"2056\" or \"Denmark\"").Then([this] {
    Find();
    return 0;
  });
  form.Notice([this] {
    if (!problem_.empty()) return problem_;
    if (Trimmed(typed_).empty()) return std::string("Type a part of a name, a code or a place to see what fits.");
    if (found_.empty()) return std::string("No coordinate system of the register holds all of these words.");
    return found_.size() == kMostFound ? fmt::format("The first {}; type more words to find fewer.", kMostFound)
                                       : std::string();
  });
  auto table = std::make_shared<TableOf<KnownProjection>>(found_);
  table->ItemName("Coordinate system");
  table->Value("Name", &KnownProjection::name).Width(260);
  table->Value("Code", &KnownProjection::code).Width(100);
  table->Value("Place", &KnownProjection::place).Width(360);
  table->ShowOnly();
  table->OnChoose([this](int row) { chosen_ = row - 1; });
  form.Table(table);
}

std::optional<std::string> ProjectionDialog::Run() {
  if (!Context().runDialog) return std::nullopt;
  Initialize();
  std::string text;
  const auto accept = [&]() -> std::string {
    if (chosen_ < 0 || chosen_ >= static_cast<int>(found_.size()))
      return found_.empty() ? "No coordinate system is found." : "Choose a coordinate system of the list.";
    text = ProjectionTextOf(found_[static_cast<std::size_t>(chosen_)].code);
    return text.empty() ? "The register does not tell this coordinate system." : std::string();
  };
  if (!Context().runDialog("Choose a coordinate system", *this, accept)) return std::nullopt;
  return text;
}

}  // namespace tervane
