// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/page.h"

#include <algorithm>

#include <fmt/format.h>

#include "core/undo.h"
#include "platform/text.h"

namespace tervane {

void CYbSEDlgBase::MakeForm() {
  form_ = std::make_unique<PageForm>(node_);
  Describe(*form_);
  form_->SetDisplayUnits(context_.displayUnits);
  form_->Follow();
}

void CYbSEDlgBase::Initialize() {
  MakeForm();
  SetData();
  // A page that only reads changes nothing, nor does one that takes the place of a page that was shown: a step that was
  // undone would come again.
  if (!context_.updateDoc || context_.isReplacement) return;
  for (const PageForm::Mend& each : form_->Mends())
    if (each.mend()) UpdateDoc(kDataChanged | (each.action.empty() ? kFollowsFromStep : 0), each.action);
}

void CYbSEDlgBase::UpdateDoc(int hint, const std::string& action, const void* source) const {
  if (form_) form_->Follow();
  if (context_.updateDoc) context_.updateDoc(hint, action, source);
}

namespace {

/// A label as the name of an action: "Start Date:" gives "Start Date".
std::string ActionName(std::string_view label) {
  std::string name = Replaced(label, "\n", " ");
  while (!name.empty() && (name.back() == ':' || name.back() == ' ')) name.pop_back();
  return name;
}

}  // namespace

std::string CYbSEDlgBase::Enter(Control& control, const std::string& typed) {
  if (!control.enter || !control.IsEnabled()) return "this value cannot be changed here";
  if (control.Text() == typed) return {};
  for (const auto& [value, rule] : control.optionRules)
    if (std::to_string(value) == typed && !rule.Holds(*control.pageNode)) return "this option cannot be chosen here";
  if (std::string expected = control.enter(typed); !expected.empty()) return expected;
  CommitValue(control);
  return {};
}

void CYbSEDlgBase::Browse(Control& control) {
  if (control.IsEnabled() && control.browse && control.browse(Outside())) CommitValue(control);
}

std::optional<std::string> CYbSEDlgBase::AskFile(Host::FileQuestion question, const std::string& now) const {
  const std::string folder = node_.GetRoot() ? node_.GetRoot()->SetupFolder() : std::string();
  question.current = FileName(now, folder).Absolute();
  if (question.current.empty()) question.current = folder;
  return Outside().AskFileToOpen(question);
}

void CYbSEDlgBase::CommitValue(const Control& control) {
  const int hint = control.hint | (control.then ? control.then() : 0);
  if (control.revalidates && node_.GetRoot()) node_.GetRoot()->ReValidate();
  if (control.revalidatesLater) node_.SetRevalidateAll();
  SetData();
  UpdateDoc(hint, fmt::format("Change {}", ActionName(control.label.empty() ? control.key : control.label)), &control);
}

void CYbSEDlgBase::Press(const Control& control) const {
  if (control.press && control.IsEnabled()) control.press();
}

void CYbSEDlgBase::ChooseRow(const Control& table, int row) {
  if (!table.table->Choose(row)) return;
  SetData();
  if (context_.syncSoon) context_.syncSoon();
}

std::string CYbSEDlgBase::EnterCell(const Control& table, int row, int column, const std::string& typed) {
  if (table.table->Cell(row, column) == typed) return {};
  if (!table.IsEnabled()) return NoCell().why;
  if (std::string expected = table.table->Enter(row, column, typed); !expected.empty()) return expected;
  const TableColumn& changed = *table.table->Column(column);
  const std::string name = ActionName(changed.head);
  const int hint = changed.hint;
  SetData();
  UpdateDoc(hint, name.empty() ? "Change Cell" : "Change " + name, &table);
  return {};
}

bool CYbSEDlgBase::CommitTableChange(int hint, const std::string& action) {
  if (hint == 0) return false;
  SetData();
  // Without a source, so that no two operations are undone as one.
  UpdateDoc(hint, action);
  return true;
}

bool CYbSEDlgBase::ChangeRows(const Control& table, RowAction action, int first, int last) {
  if (!table.IsEnabled()) return false;
  const int rows = first < 1 ? 1 : std::min(last, table.table->RowCount()) - first + 1;
  const int hint = table.table->ChangeRows(action, first, last);
  return CommitTableChange(hint, table.table->ActionName(action, rows));
}

bool CYbSEDlgBase::ChangeRow(const Control& table, RowAction action, int row) {
  return table.IsEnabled() &&
         CommitTableChange(table.table->ChangeRow(action, row), table.table->ActionName(action, 1));
}

CellsResult CYbSEDlgBase::Paste(const Control& table, const CellRange& selected, std::string_view text) {
  if (!table.IsEnabled()) return {};
  CellsResult result = table.table->Paste(selected, text);
  CommitTableChange(result.hint, "Paste");
  return result;
}

CellsResult CYbSEDlgBase::FillDown(const Control& table, const CellRange& cells) {
  if (!table.IsEnabled()) return {};
  CellsResult result = table.table->FillDown(cells);
  CommitTableChange(result.hint, "Fill Down");
  return result;
}

CellsResult CYbSEDlgBase::FillAll(const Control& table, const CellRange& cells) {
  if (!table.IsEnabled()) return {};
  CellsResult result = table.table->FillAll(cells);
  CommitTableChange(result.hint, table.table->ToAllRowsCommand());
  return result;
}

CellsResult CYbSEDlgBase::ClearCells(const Control& table, const CellRange& cells) {
  if (!table.IsEnabled()) return {};
  CellsResult result = table.table->Clear(cells);
  CommitTableChange(result.hint, "Clear");
  return result;
}

}  // namespace tervane
