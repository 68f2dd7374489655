// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A control of a page on the screen. Who adds a kind of control to `pages/` adds its widget here, once.
#pragma once

#include <QLabel>
#include <QObject>
#include <QPointer>
#include <QString>
#include <QWidget>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "forms/page.h"

class QBoxLayout;
class QHBoxLayout;
class QMenu;

namespace tervane {

/// What a control shows in, kept in step with its page. The widgets belong to the form in which they are laid out.
class ControlWidget : public QObject {
  Q_OBJECT

 public:
  /// Null for the kinds that hold other controls: groups and places of sub-forms.
  static std::unique_ptr<ControlWidget> Make(CYbSEDlgBase& page, Control& control);

  Control& Described() const { return control_; }
  /// What stands in front of the field; null where the field bears its label itself.
  QWidget* Label() const { return label_; }
  /// The field with all that stands beside and below it.
  QWidget* Field() const { return field_; }
  /// Whether the field takes all the height that it can get.
  virtual bool GrowsDown() const { return false; }
  /// Whether the field grows with the window beyond the width of a form.
  virtual bool GrowsRight() const { return false; }
  /// The width at which nothing of it is hidden, where that may be more than it needs; 0 where it is not.
  virtual int WantedWidth() const { return 0; }

  /// Shows the value as the page has it and applies the page's rules; a text that was refused stays in its field.
  void Sync();
  /// Hands over what was typed and not yet entered.
  virtual void Commit() {}
  /// The widget that takes the keyboard; null where there is none.
  virtual QWidget* FocusTarget() const { return nullptr; }
  /// Takes what the declaration tells of the key; `reset` is what gives it its default, nothing where it has it.
  void ShowDeclared(const QString& toolTip, std::optional<std::string> reset);
  /// Shows review notes at the key, as a mark behind the field; none where the text is empty.
  void ShowNotes(const QString& notes);
  /// Adds the commands on the value to a menu.
  void AddTo(QMenu& menu);
  /// A value that the page has not taken gives way to the node's.
  void DropRefused();
  /// The value is none that the page takes, so that the node has another one.
  bool IsRefused() const { return !refusal_.isEmpty(); }

 signals:
  /// The user wants to see quantities of that item type in that unit.
  void UnitChosen(int itemType, int unit);

 protected:
  ControlWidget(CYbSEDlgBase& page, Control& control);

  virtual void SyncValue() = 0;
  virtual void SyncEnabled(bool enabled) { field_->setEnabled(enabled); }
  /// Enters a typed value; a refusal is shown below the field. False when it was refused.
  bool Enter(const QString& typed);
  /// What is wrong with a value that is not refused, such as one outside its list.
  void SetRemark(const QString& remark);
  /// The marks in which a refused value stands out.
  virtual void ShowRefused(bool /*refused*/) {}
  /// What was typed and not entered belongs to what was shown before.
  virtual void Forget() {}
  /// A field that tells its own value there keeps its tool tip.
  virtual bool HasOwnToolTip() const { return false; }

  CYbSEDlgBase& Page() const { return page_; }
  /// Puts the label in front of the field.
  void MakeLabel();
  /// Makes the field around an editor, with the unit and the marks behind it.
  QBoxLayout* MakeField(QWidget* editor, bool grows);

 private:
  QWidget* MakeUnit();
  void NameFor(QWidget& target) const;
  void SyncSubject();
  void ForgetRefusal();
  void SyncUnit();
  void SyncFindings();
  void SyncMessage();
  /// Tells screen readers what stands beside and below the field.
  void SyncDescription();

  CYbSEDlgBase& page_;
  Control& control_;
  QPointer<QWidget> label_, field_;
  QPointer<QWidget> unit_;  ///< A label, or a button where the user may choose.
  QPointer<QLabel> mark_, message_, noteMark_;
  QPointer<QHBoxLayout> row_;  ///< Of the field: the editor and what stands behind it.
  QPointer<QWidget> editor_;
  QPointer<QWidget> dot_;  ///< Marks a value that is not the default.
  std::optional<std::string> reset_;
  QString refusal_, remark_, findings_;
  std::uintptr_t subject_ = 0;  ///< What the value that is shown belongs to.
};

}  // namespace tervane
