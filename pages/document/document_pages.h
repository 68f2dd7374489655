// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>

#include "forms/page_rows.h"
#include "overlays/overlays.h"

namespace tervane {

/// Shows the help page of a node whose information is a text. Of a page of processed data it may be a file beside the
/// preprocessor's report.
class CTvnHelpView : public PageOf<CYbSEKvfBase> {
 public:
  using PageOf::PageOf;

  /// The name of the help page that is shown: the node's own, or "default.htm" where the program holds none of that
  /// name.
  std::string PageName() const;
  /// Opens the online help, when the setting `HelpURI` says where it is.
  bool OnHelp() override;

 protected:
  void Describe(PageForm& form) override;

 private:
  /// The file that the node names beside the report; empty for none, and where the program holds a page of that name.
  std::string FileOfReport() const;
  /// The text of that file; without one, or where it cannot be read (`problem` says why), the help page.
  std::string PageText(std::string& problem) const;
};

/// What the maps show.
class CDisplayDlg : public PageOf<COverlaysKvf> {
 public:
  using PageOf::PageOf;
  void SetData() override;

 protected:
  void Describe(PageForm& form) override;

 private:
  /// Takes the corners from a grid, an image's place or a shape file.
  void Import();
  /// The frame of the area that maps show.
  LineLayer ShownArea();

  std::shared_ptr<const std::vector<MapLine>> frame_;
};

/// The pages of the document as a whole: coverage and display.
std::span<const PageRow> DocumentPages();

}  // namespace tervane
