// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/document/document_pages.h"

#include <fmt/format.h>

#include "pages/document/help_pages.h"

namespace tervane {

std::string CTvnHelpView::PageName() const {
  const std::string& name = Node().GetHtml();
  return FindHelpPage(name) ? name : "default.htm";
}

bool CTvnHelpView::OnHelp() {
  const std::string uri = Outside().Setting("HelpURI");
  if (uri.empty()) return false;
  const bool isIntroduction = Node().GetHtml() == "Tvn.htm";
  Outside().OpenBrowser(fmt::format(
      "{}2017/{}", uri,
      isIntroduction ? "tervane/VORA_TVD_online/TVN_Getting_started/Introduction.htm" : "tervane/index.htm"));
  return true;
}

void CTvnHelpView::Describe(PageForm& form) {
  form.Browser([this] { return std::string(*FindHelpPage(PageName())); });
}

void COverviewDlg::Initialize() {
  Node().Lines.clear();
  Node().Text.clear();
  if (Node().GetRoot() && GenerateOverview(*Node().GetRoot(), Node().Lines)) Node().Text = OverviewText(Node().Lines);
  PageOf::Initialize();
}

void COverviewDlg::Describe(PageForm& form) {
  form.TextView("", [this] { return Node().Text; });
}

void CDisplayDlg::Describe(PageForm& form) {
  form.Check("Default map display based on the Model Domain", Node().UseModelDomain);
}

}  // namespace tervane
