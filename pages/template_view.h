// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A process template to look at, without any toolkit: what it declares, as a table.
#pragma once

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "core/document.h"
#include "forms/page.h"
#include "wqpt/kinetra_template.h"

namespace tervane {

/// True for a file that is named as a process template.
bool IsNamedAsTemplate(const std::string& path);

class TemplateView {
 public:
  explicit TemplateView(std::string path);
  ~TemplateView();
  TemplateView(const TemplateView&) = delete;
  TemplateView& operator=(const TemplateView&) = delete;

  const std::string& Path() const { return path_; }
  /// Why there is nothing to show; empty when there is.
  const std::string& Problem() const { return content_->problem; }
  /// Reads the file anew if it is another one on the disk than it was. True when its page must be made anew.
  bool Reopen();

  /// A table of what is declared; `soon` asks to show the page anew.
  std::unique_ptr<CYbSEDlgBase> MakePage(Host& host, std::function<void()> soon);

 private:
  class Node;
  class Page;

  void Take(std::shared_ptr<const KinetraTemplate> content);

  std::string path_;
  std::shared_ptr<const KinetraTemplate> content_;
  std::vector<CKinetraSolverItem> items_;  ///< Of all kinds, in the order of the file.
  int shown_ = 0;                          ///< 0 for all kinds, else the number of a kind from 1.
  CYbSEDocument document_;
  std::unique_ptr<Node> node_;
};

}  // namespace tervane
