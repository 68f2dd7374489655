// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/surface/stress_period_grid_pages.h"

#include "forms/table_of.h"
#include "surface/pages.h"
#include "surface/stress_period_grids.h"

namespace tervane {

namespace {

void DescribeSpans(PageForm& form, CRechargeAndPondingModListKvf& n, CYbSEDlgBase& page) {
  using Span = CRechargeAndPondingModItemKvf;
  auto table = std::make_shared<TableOf<Span>>(n);
  table->ItemName("Span");
  if (const auto& select = page.Context().selectNode)
    table->Button("", "...", [select](Span& span) { select(span); }).Width(25).ToolTip("Shows its page");
  table->Value("From Stress Period", [](Span& span) { return span.StressPeriodFrom(); })
      .GreyWhen([](Span&) { return true; })
      .Width(125);
  // Titles in the tree follow.
  table
      ->Value(
          "To Stress Period", [](Span& span) { return span.StressPeriodTo; },
          [](Span& span, int to) -> std::string {
            if (to < 0) return "a whole number of at least 0 was expected";
            span.StressPeriodTo = to;
            return {};
          })
      .Key("StressPeriodTo")
      .Hint(kDataChanged | kTreeRebuilt)
      .Width(115);
  table->Value("Dates", [](Span& span) { return span.DatesText(); }).GreyWhen([](Span&) { return true; }).Width(260);
  form.Table(std::move(table));
}

}  // namespace

std::span<const PageRow> StressPeriodGridPages() {
  static constexpr PageRow kRows[] = {DescribedBy<DescribeSpans>(kStressPeriodGridsPage)};
  return kRows;
}

}  // namespace tervane
