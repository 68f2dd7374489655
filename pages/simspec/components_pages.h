// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "forms/page.h"
#include "simspec/basic_parameters.h"
#include "simspec/model_components.h"

namespace tervane {

/// The engine, and the components that it knows.
class CBasicParaDlg : public PageOf<CBasicParaKvf> {
 public:
  using PageOf::PageOf;
  void SetData() override;

 protected:
  void Describe(PageForm& form) override;

 private:
  int shown_ = 0;  ///< An engine that the list does not have keeps the form that was shown.
};

class CModelCompWQDlg : public PageOf<CModelCompWQKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;
};

class CModelCompPTDlg : public PageOf<CModelCompPTKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;
};

}  // namespace tervane
