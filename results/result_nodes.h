// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a setup keeps about the results of its runs: how they are looked at, and what was made of them.
#pragma once

#include "core/list.h"
#include "results/pages.h"

namespace tervane {

/// A node that the tree of the results shows.
class ResultPageKvf : public CTvnKvfBase {
 public:
  ResultPageKvf(std::string title, std::string section, const PageClass& page, CYbSEKvfBase* parent)
      : CTvnKvfBase(std::move(title), std::move(section), parent), page_(page) {}

  const PageClass* GetDlgRuntimeClass(int treeId) const override { return treeId == kResultsTree ? &page_ : nullptr; }

 private:
  const PageClass& page_;
};

/// What a run tells of its series at points, on a page in HTML that engines write.
class DetailedResultKvf : public ResultPageKvf {
 public:
  /// The class, the title and the section of a page; a constant.
  struct Kind {
    std::string_view className;
    const char* title;
    const char* section;
    const PageClass& page;
  };
  DetailedResultKvf(const Kind& kind, CYbSEKvfBase* parent);
};

/// Which of its layers a result is shown with, when it is handed to the result viewer.
class CResultViewerKvf : public ResultPageKvf {
 public:
  explicit CResultViewerKvf(CYbSEKvfBase* parent);

  int LayerNo = 1;  ///< From the top.

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// The results of a run.
class CResultKvf : public CYbSEKvfGroupBase {
 public:
  explicit CResultKvf(CYbSEKvfBase* parent);
};
inline constexpr ImportantName<CResultKvf> kResult{"RESULT"};

/// The files that hold the latest statistics.
class CRunStatisticsKvf : public ResultPageKvf {
 public:
  explicit CRunStatisticsKvf(CYbSEKvfBase* parent);

  FileName HtmlFilename, ShapeFilename;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// What is done with the results of a run.
class CResultsPostProcessingKvf : public CYbSEKvfGroupBase {
 public:
  explicit CResultsPostProcessingKvf(CYbSEKvfBase* parent);
};
inline constexpr ImportantName<CResultsPostProcessingKvf> kPostProcessing{"RESULTS_POST_PROCESSING"};

}  // namespace tervane
