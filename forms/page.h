// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "core/document.h"
#include "core/host.h"
#include "forms/page_form.h"
#include "forms/table_form.h"

namespace tervane {

class CYbSEDlgBase;

/// What a page needs of the program around it.
struct PageContext {
  CYbSEDocument& document;
  Host& host;
  /// Marks the document modified and makes the views follow; `action` names what the user did ("Change End Date"),
  /// `source` is the control in which it was done, so that its changes in quick succession are undone as one.
  std::function<void(int hint, const std::string& action, const void* source)> updateDoc;
  /// Shows another node's page.
  std::function<void(const CYbSEKvfBase& node)> selectNode = {};
  /// Shows a form with OK and Cancel. `accept` is asked at OK: it gives why the form must stay, or nothing. False when
  /// the user gave up.
  std::function<bool(const std::string& title, CYbSEDlgBase& form, const std::function<std::string()>& accept)>
      runDialog = {};
  /// The page replaces one that was shown: messages that it has shown are not shown again.
  bool isReplacement = false;
  /// The user's units; null for base units. They outlive the page.
  const DisplayUnits* displayUnits = nullptr;
  /// Shows the page anew once the present call has returned; empty where the page is not shown.
  std::function<void()> syncSoon = {};
};

/// A page: edits one node and holds no values of its own.
class CYbSEDlgBase {
 public:
  CYbSEDlgBase(CYbSEKvfBase& node, const PageContext& context) : node_(node), context_(context) {}
  virtual ~CYbSEDlgBase() = default;

  CYbSEKvfBase& Node() const { return node_; }
  const PageContext& Context() const { return context_; }
  Host& Outside() const { return context_.host; }
  /// For a form without a document: what follows each change.
  /// `soon` is what follows once the present call has returned.
  void FollowItself(std::function<void()> follow, std::function<void()> soon) {
    context_.updateDoc = [follow = std::move(follow)](int, const std::string&, const void*) { follow(); };
    context_.syncSoon = std::move(soon);
  }
  /// Called once, before the page is shown the first time: makes the form.
  virtual void Initialize();
  /// Called when the page is shown and after every change: what the form's rules do not say themselves.
  virtual void SetData() {}
  /// Makes the form and nothing else, for callers that only read the contents of a page.
  void MakeForm();
  PageForm& Form() const { return *form_; }

  /// The help command. False when the page has no help of its own.
  virtual bool OnHelp() { return false; }
  /// The refresh command.
  virtual void OnRefresh() {}

  /// Types a value into a control. Gives what was expected when the control refuses it; the node is then unchanged.
  std::string Enter(Control& control, const std::string& typed);
  /// Lets the user choose a file.
  void Browse(Control& control);
  /// Asks for a file, beginning at the one that is named now.
  std::optional<std::string> AskFile(Host::FileQuestion question, const std::string& now) const;
  void Press(const Control& control) const;
  /// Makes a row of a table the current one, which fields below it show.
  void ChooseRow(const Control& table, int row);
  /// Types into a cell of a table.
  std::string EnterCell(const Control& table, int row, int column, const std::string& typed);

  // Operations on a table, each told to the document as one change of a readable name. `table` is a control of this
  // page.

  /// Whole rows, as the buttons beside a table do it; 0 for no whole row. False when nothing was changed.
  bool ChangeRows(const Control& table, RowAction action, int first, int last);
  /// The row of the current cell, as the keys with Ctrl do it. False when nothing was changed: the cell then stays.
  bool ChangeRow(const Control& table, RowAction action, int row);
  CellsResult Paste(const Control& table, const CellRange& selected, std::string_view text);
  CellsResult FillDown(const Control& table, const CellRange& cells);
  CellsResult FillAll(const Control& table, const CellRange& cells);
  CellsResult ClearCells(const Control& table, const CellRange& cells);

  void UpdateDoc(int hint, const std::string& action, const void* source = nullptr) const;

 protected:
  virtual void Describe(PageForm& form) = 0;

 private:
  /// Updates the document after a control has stored a new value.
  void CommitValue(const Control& control);
  /// Updates the document after a change in a table; false when there was none.
  bool CommitTableChange(int hint, const std::string& action);

  CYbSEKvfBase& node_;
  PageContext context_;
  std::unique_ptr<PageForm> form_;
};

/// A page of one node class.
template <class NodeClass>
class PageOf : public CYbSEDlgBase {
 public:
  PageOf(CYbSEKvfBase& node, const PageContext& context) : CYbSEDlgBase(node, context) {}
  NodeClass& Node() const { return static_cast<NodeClass&>(CYbSEDlgBase::Node()); }
};

/// The page of a node by its class; null when the class is unknown or the node is of another class than the page edits.
std::unique_ptr<CYbSEDlgBase> MakePage(const PageClass& page, CYbSEKvfBase& node, const PageContext& context);
/// The same with its form alone: nothing is read, validated or changed for it.
std::unique_ptr<CYbSEDlgBase> MakePageToRead(const PageClass& page, CYbSEKvfBase& node, const PageContext& context);

}  // namespace tervane
