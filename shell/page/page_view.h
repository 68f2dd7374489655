// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QFrame>
#include <QWidget>
#include <functional>
#include <memory>
#include <vector>

#include "forms/page.h"
#include "pages/key_defaults.h"

class QBoxLayout;
class QGridLayout;
class QLabel;
class QScrollArea;
class QSplitter;

namespace tervane {

class ControlWidget;

/// Any page as widgets: the node's title, the form below, labels aligned over all of its groups, and the findings at
/// the foot.
class PageView : public QWidget {
  Q_OBJECT

 public:
  /// `place` is shown below the title, with the path as its tool tip.
  PageView(std::unique_ptr<CYbSEDlgBase> page, const QString& place, const QString& path = {});
  /// The form alone, of a dialog that owns it.
  explicit PageView(CYbSEDlgBase& form);
  ~PageView() override;

  CYbSEDlgBase& Page() const { return page_; }
  /// The size at which nothing needs to be scrolled.
  QSize WantedSize() const;
  /// Shows what the node holds now.
  void Sync();
  /// Hands over what was typed and not yet entered.
  void Commit();
  /// Puts the keyboard on the control of a key, or with that label; the first control when there is none.
  void FocusOn(const std::string& key);
  /// Puts the keyboard on the map or chart of the page; false where there is none, or it is there already.
  bool FocusOnPlot();
  /// The name by which a control of this page is found again on a page that is made anew; empty for no control of it.
  std::string NameOf(const void* control) const;
  /// Puts the keyboard on the control of that name and lets it stand out for a moment.
  void PointOut(const std::string& name);
  /// What fixes a finding, as a link behind it; empty where nothing does.
  using FixOf = std::function<QString(CYbSEKvfBase& node, const Finding& finding)>;
  void OfferFixes(FixOf fixOf);
  /// The review notes at a key, or with an empty key at a node itself; empty where there is none.
  using NotesAt = std::function<QString(const CYbSEKvfBase& node, const std::string& key)>;
  void ShowNotes(NotesAt notesAt);
  /// The node and key of the control that has the keyboard; 0 where none has.
  std::pair<std::uint64_t, std::string> KeyWithFocus() const;
  /// Texts that were not taken give way to what the node holds.
  void DropRefused();

 signals:
  void UnitChosen(int itemType, int unit);
  /// The user asks why a control cannot be changed.
  void WhyAsked(const Control* control);
  /// The user wants to note something at a key.
  void NoteWanted(quint64 serial, const QString& key);
  /// The user has followed the link behind a finding.
  void FixAsked(quint64 serial, const Finding& finding);

 protected:
  void resizeEvent(QResizeEvent* event) override;
  void contextMenuEvent(QContextMenuEvent* event) override;

 private:
  struct Form;  ///< A grid of one form, group or sub-form.
  struct SubForms;

  QWidget* BuildForm(PageForm& form, int depth);
  /// Places one control, or several that stand beside each other, in the next row.
  void AddRow(Form& grid, const std::vector<Control*>& row);
  QWidget* BuildCell(Control& control, int depth);
  /// A map or chart of the page itself stands beside the form, or below it where the page is narrow.
  void AddPlot(Control& control);
  void PlacePlots();
  void MeasureForm();
  void MovePlots(bool beside);
  /// What is shown and can use height or width gets what is left.
  void SyncStretch();
  void AlignLabels();
  void SyncFindings();
  void SyncNotes();
  void FollowFixLink(const QString& link);
  /// The control of a key, a label or a name of `NameOf`; one that is shown if there is one. Null when there is none.
  ControlWidget* Find(const std::string& name) const;
  void PointOut(ControlWidget* widget);

  void Build(const QString& place, const QString& path);

  std::unique_ptr<CYbSEDlgBase> ownPage_;
  CYbSEDlgBase& page_;
  std::vector<std::unique_ptr<ControlWidget>> widgets_;
  KeyDefaults defaults_;
  std::vector<std::unique_ptr<Form>> forms_;
  std::vector<std::unique_ptr<SubForms>> subForms_;
  /// Groups, whose frames follow the rules of their controls.
  std::vector<std::pair<const Control*, QWidget*>> groups_;
  std::vector<const Control*> plots_;
  QSplitter* split_ = nullptr;
  QWidget* plotPlace_ = nullptr;
  QScrollArea* plotScroll_ = nullptr;  ///< Holds the plots beside the form; below it they scroll with it.
  bool arePlotsBeside_ = true;
  int formSize_ = 0;  ///< Width of the form beside a plot, when it was given its place.
  /// A row of a form with a field that can use height.
  struct GrowingRow {
    QGridLayout* grid;
    int line;
    QWidget* cell;
  };
  std::vector<GrowingRow> growing_;
  QWidget* formPlace_ = nullptr;
  int neededByForm_ = 0;  ///< The least width in which nothing of it is cut.
  QBoxLayout* content_ = nullptr;
  QLabel* findings_;
  QLabel* noted_;
  NotesAt notesAt_;
  FixOf fixOf_;
  /// What the links behind findings stand for, by their numbers; nodes by serial, since they may go.
  std::vector<std::pair<std::uint64_t, Finding>> linked_;
  QScrollArea* scroll_;
  int widest_ = 0;  ///< What a row of groups would like to have.
};

}  // namespace tervane
