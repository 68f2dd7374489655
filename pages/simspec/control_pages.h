// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "pages/page.h"
#include "simspec/air_flow.h"
#include "simspec/control_parameters.h"
#include "simspec/time_step_control.h"

namespace tervane {

// Plain value pages: all that they do is in their description.

class CCompControlParaTimeStepDlg : public PageOf<CCompControlParaTimeStepKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;
};

class CCompControlParaTimeStepWQDlg : public PageOf<CCompControlParaTimeStepWQKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;
};

class CCompControlParaPTDlg : public PageOf<CCompControlParaPTKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;
};

class CCompControlParaOLDlg : public PageOf<CCompControlParaOLKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;
};

class CCompControlParaUZDlg : public PageOf<CCompControlParaUZKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;
};

class CCompControlParaSZDlg : public PageOf<CCompControlParaSZKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;
};

class CCompControlParaColloidWQDlg : public PageOf<CCompControlParaColloidWQKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;
};

class CAirFlowModDlg : public PageOf<CAirFlowModKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;
};

}  // namespace tervane
