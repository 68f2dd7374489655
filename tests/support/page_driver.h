// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "document/flow_model_document.h"
#include "pages/page.h"

namespace tervane::test {

/// A host that answers nothing; a question fails the test.
class NoQuestions : public Host {
 public:
  Answer Ask(const std::string& text, Icon icon, Buttons buttons) override;
  std::optional<std::string> AskFileToOpen(const FileQuestion& question) override;
  std::optional<std::string> AskFileToSave(const FileQuestion& question) override;
  std::optional<int> AskItem(const ItemQuestion& question) override;
  void OpenBrowser(const std::string& address) override;
  std::string Setting(const std::string& name) const override;
  void SetSetting(const std::string& name, const std::string& value) override;
};

/// The page of a node of a setup, driven by its labels.
class PageDriver {
 public:
  PageDriver(CFlowModelDoc& document, std::string_view path);

  CYbSEDlgBase& Page() { return *page_; }
  /// The control with that label; of controls without one, the one of that key. One that is not there fails the test.
  Control& Find(std::string_view label);
  /// Types a value; gives what was expected when it is refused.
  std::string Enter(std::string_view label, const std::string& typed) { return page_->Enter(Find(label), typed); }
  bool IsEnabled(std::string_view label) { return Find(label).IsEnabled(); }
  std::string Text() { return FormText(page_->Form()); }
  /// The hints and names of the changes so far: "1 Change End Date".
  const std::vector<std::string>& Changes() const { return changes_; }

 private:
  NoQuestions host_;
  std::vector<std::string> changes_;
  std::unique_ptr<CYbSEDlgBase> page_;
};

}  // namespace tervane::test
