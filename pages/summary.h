// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "core/document.h"
#include "forms/page.h"
#include "forms/plots.h"

namespace tervane {

/// What a setup is about, how it stands, and what is to be done next, for its first page.
class SetupSummary {
 public:
  explicit SetupSummary(const CYbSEDlgBase& page);
  ~SetupSummary();

  /// Puts it at the top of the page, with the model domain beside it.
  void Describe(PageForm& form);

 private:
  /// What is to be done next, and where.
  struct Step {
    std::string text;
    std::uint64_t serial = 0;  ///< Of the node whose page it is done on; 0 where it is done on none.
  };

  CYbSEKvfBase& Root() const;
  std::string TitleText() const;
  std::string PeriodText() const;
  std::string DomainText() const;
  std::string ComponentsText();
  std::string FindingsText() const;
  std::string RunText() const;
  Step Next() const;
  MapContent Map() const;

  const CYbSEDlgBase& page_;
  std::unique_ptr<CYbSEDlgBase> components_;  ///< The page on which they are chosen, whose words are used here.
};

}  // namespace tervane
