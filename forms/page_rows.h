// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// How a family of pages offers itself: a table of rows in the file of its pages. A page is a function that describes a
// form over a node; one with a state of its own is a class.
#pragma once

#include <memory>
#include <type_traits>

#include "forms/page.h"

namespace tervane {

/// A page class that nodes name, and how its page is made; `make` gives null for a node of another class.
struct PageRow {
  const PageClass& page;
  std::unique_ptr<CYbSEDlgBase> (*make)(CYbSEKvfBase& node, const PageContext& context);
};

namespace page_rows {

template <class Function>
struct NodeOf;
template <class Node>
struct NodeOf<void (*)(PageForm&, Node&)> {
  using Type = Node;
};
template <class Node>
struct NodeOf<void (*)(PageForm&, Node&, CYbSEDlgBase&)> {
  using Type = Node;
};

/// A page without a state of its own.
template <auto describe>
class FunctionPage : public PageOf<typename NodeOf<decltype(describe)>::Type> {
 public:
  using PageOf<typename NodeOf<decltype(describe)>::Type>::PageOf;

 protected:
  void Describe(PageForm& form) override {
    if constexpr (std::is_invocable_v<decltype(describe), PageForm&, decltype(this->Node()), CYbSEDlgBase&>)
      describe(form, this->Node(), *this);
    else
      describe(form, this->Node());
  }
};

template <class Page, class Node>
std::unique_ptr<CYbSEDlgBase> Make(CYbSEKvfBase& node, const PageContext& context) {
  if constexpr (!std::is_same_v<Node, CYbSEKvfBase>)
    if (!dynamic_cast<Node*>(&node)) return nullptr;
  return std::make_unique<Page>(node, context);
}

}  // namespace page_rows

/// `DescribedBy<DescribeSnowMelt>(kSnowMeltPage)`, of `void DescribeSnowMelt(PageForm&, CSnowmeltConstKvf&)`; the page
/// itself may be its third argument, for what it asks of the program around it.
template <auto describe>
constexpr PageRow DescribedBy(const PageClass& page) {
  using Node = typename page_rows::NodeOf<decltype(describe)>::Type;
  return {page, page_rows::Make<page_rows::FunctionPage<describe>, Node>};
}

/// `PageIs<CSimPeriodDlg, CSimPeriodKvf>(kSimPeriodPage)`, of a class.
template <class Page, class Node>
constexpr PageRow PageIs(const PageClass& page) {
  return {page, page_rows::Make<Page, Node>};
}

}  // namespace tervane
