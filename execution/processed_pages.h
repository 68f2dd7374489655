// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The pages of a preprocessor's report as nodes: one row for each kind of page. They are made anew whenever the report
// changes, are never saved, and undo knows nothing of them. docs/preprocessor-report.md tells the report's form.
#pragma once

#include <map>
#include <memory>
#include <string>
#include <string_view>

#include "core/kvf.h"
#include "core/node.h"
#include "execution/pages.h"
#include "simspec/pages.h"

namespace tervane {

/// What a page of the report says beside its kind.
struct PreprocessedPage {
  std::string title, abbreviatedTitle;
  /// The keywords of its content: the parameters of each as text, joined by commas.
  std::map<std::string, std::string> values;
  /// Folder of the report, from which the names of files in it start; shared by all its pages.
  std::shared_ptr<const std::string> folder;
};

/// A kind of page: the section that holds its content, the name of its nodes, and what shows them.
struct PreprocessedKind {
  std::string_view section;
  std::string_view className;
  const PageClass* page;  ///< Null for what has no page of its own.
};

/// A page with values.
class CPreprocessedDataEntity : public CYbSEKvfBase {
 public:
  CPreprocessedDataEntity(const PreprocessedKind& kind, PreprocessedPage page, CYbSEKvfBase* parent);

  /// The text of a key, empty where the report has none.
  const std::string& GetValue(const std::string& key) const;
  /// The text as a whole number: what stands in front of it, 0 where nothing does.
  int GetNumber(const std::string& key) const;
  /// The file that the key `Filename` names, absolute; empty where there is none.
  std::string GetFile() const;

  const PageClass* GetDlgRuntimeClass(int treeId) const override {
    return treeId == kProcessedDataTree ? pageClass_ : nullptr;
  }
  int AddToOverview(std::vector<OverviewLine>& /*lines*/, int /*level*/) override { return 1; }

 private:
  const PageClass* pageClass_;
  std::map<std::string, std::string> values_;
  std::shared_ptr<const std::string> folder_;
};

/// A page of the help, or an HTML file beside the report.
class CPreprocessedHTML : public CYbSEKvfGroupBase {
 public:
  CPreprocessedHTML(PreprocessedPage page, CYbSEKvfBase* parent);

  const PageClass* GetDlgRuntimeClass(int treeId) const override {
    return treeId == kProcessedDataTree ? &kHelpPage : nullptr;
  }
  int AddToOverview(std::vector<OverviewLine>& /*lines*/, int /*level*/) override { return 1; }

  /// Where the HTML file would lie, were it one beside the report; empty where the report names none.
  std::string GetFile() const;

 private:
  std::shared_ptr<const std::string> folder_;
};

/// Makes the node of a section "PAGE" and of all pages below it, as a child of `parent`. Gives how many were made.
int BuildPreprocessedPages(KvfNode* section, const std::shared_ptr<const std::string>& folder, CYbSEKvfBase& parent);

}  // namespace tervane
