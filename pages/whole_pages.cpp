// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/whole_pages.h"

#include "pages/overview_lines.h"
#include "simspec/introduction.h"
#include "simspec/pages.h"

namespace tervane {

CIntroductionDlg::CIntroductionDlg(CYbSEKvfBase& node, const PageContext& context)
    : CTvnHelpView(node, context), summary_(*this) {}

void CIntroductionDlg::Describe(PageForm& form) {
  summary_.Describe(form);
  CTvnHelpView::Describe(form);
}

void COverviewDlg::Initialize() {
  words_ = OverviewText(OverviewInWords(Context().document));
  Node().Lines.clear();
  Node().Text.clear();
  if (Node().GetRoot() && GenerateOverview(*Node().GetRoot(), Node().Lines)) Node().Text = OverviewText(Node().Lines);
  PageOf::Initialize();
}

void COverviewDlg::Describe(PageForm& form) {
  form.TextView("As the pages show it:", [this] { return words_; });
  form.TextView("", [this] { return Node().Text; });
}

namespace {

std::unique_ptr<CYbSEDlgBase> MakeHelpPage(CYbSEKvfBase& node, const PageContext& context) {
  if (dynamic_cast<const CIntroductionKvf*>(&node)) return std::make_unique<CIntroductionDlg>(node, context);
  return std::make_unique<CTvnHelpView>(node, context);
}

}  // namespace

std::span<const PageRow> WholePages() {
  static constexpr PageRow kRows[] = {
      {kHelpPage, MakeHelpPage},
      PageIs<COverviewDlg, COverviewKvf>(kOverviewPage),
  };
  return kRows;
}

}  // namespace tervane
