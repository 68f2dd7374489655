// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "forms/page.h"
#include "simspec/air_flow.h"
#include "simspec/control_parameters.h"
#include "simspec/time_step_control.h"

namespace tervane {

/// A plain value page: all that it does is in its description, of which each node class has one.
template <class Node>
class ValuePage : public PageOf<Node> {
 public:
  using PageOf<Node>::PageOf;

 protected:
  void Describe(PageForm& form) override;
};

using CCompControlParaTimeStepDlg = ValuePage<CCompControlParaTimeStepKvf>;
using CCompControlParaTimeStepWQDlg = ValuePage<CCompControlParaTimeStepWQKvf>;
using CCompControlParaPTDlg = ValuePage<CCompControlParaPTKvf>;
using CCompControlParaOLDlg = ValuePage<CCompControlParaOLKvf>;
using CCompControlParaUZDlg = ValuePage<CCompControlParaUZKvf>;
using CCompControlParaSZDlg = ValuePage<CCompControlParaSZKvf>;
using CCompControlParaColloidWQDlg = ValuePage<CCompControlParaColloidWQKvf>;
using CAirFlowModDlg = ValuePage<CAirFlowModKvf>;

template <>
void CCompControlParaTimeStepDlg::Describe(PageForm& form);
template <>
void CCompControlParaTimeStepWQDlg::Describe(PageForm& form);
template <>
void CCompControlParaPTDlg::Describe(PageForm& form);
template <>
void CCompControlParaOLDlg::Describe(PageForm& form);
template <>
void CCompControlParaUZDlg::Describe(PageForm& form);
template <>
void CCompControlParaSZDlg::Describe(PageForm& form);
template <>
void CCompControlParaColloidWQDlg::Describe(PageForm& form);
template <>
void CAirFlowModDlg::Describe(PageForm& form);

}  // namespace tervane
