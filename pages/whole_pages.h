// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <span>

#include "document/overview.h"
#include "forms/page_rows.h"
#include "pages/document/document_pages.h"
#include "pages/summary.h"

namespace tervane {

/// The first page of a setup: a summary of it above the help page that tells what the editor is for.
class CIntroductionDlg : public CTvnHelpView {
 public:
  CIntroductionDlg(CYbSEKvfBase& node, const PageContext& context);

 protected:
  void Describe(PageForm& form) override;

 private:
  SetupSummary summary_;
};

/// The whole setup as a text to read, in the words of the pages and below by its keys.
class COverviewDlg : public PageOf<COverviewKvf> {
 public:
  using PageOf::PageOf;
  void Initialize() override;

 protected:
  void Describe(PageForm& form) override;

 private:
  std::string words_;
};

/// Pages that speak of what all other pages show: the first page and the overview. Help pages of other nodes are here
/// too, since they are of one class.
std::span<const PageRow> WholePages();

}  // namespace tervane
