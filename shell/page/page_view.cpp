// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/page/page_view.h"

#include <QApplication>
#include <QContextMenuEvent>
#include <QGridLayout>
#include <QGroupBox>
#include <QLabel>
#include <QMenu>
#include <QScrollArea>
#include <QSplitter>
#include <QStyle>
#include <QVBoxLayout>
#include <algorithm>
#include <functional>

#include "pages/tree_entries.h"
#include "shell/page/control_widget.h"
#include "shell/page/control_widgets.h"
#include "shell/page/group_row.h"
#include "shell/page/table_view.h"
#include "shell/widgets/flash_mark.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kWidestForm = 860;      ///< In pixels at zoom 1: lines stay short enough to be read.
constexpr int kSideBySide = 700;      ///< From this width of a page on its map stands beside the form.
constexpr int kFormBesidePlot = 370;  ///< At least: some 28 letters m.
constexpr int kLeastPlot = 300;       ///< Width of a map beside a form, height of one below it.
constexpr int kMostFindings = 4;      ///< Lines below a form; the tab of findings has them all.

enum Column { kLabelColumn, kFieldColumn };

/// Of a control that has neither key nor label, as tables.
std::string NumberedName(std::size_t number) { return "#" + std::to_string(number); }

QString SeverityText(Severity severity) {
  return severity == Severity::Error     ? PageView::tr("Error")
         : severity == Severity::Warning ? PageView::tr("Warning")
                                         : PageView::tr("Note");
}

}  // namespace

struct PageView::Form {
  QGridLayout* grid;
  int depth;
  int row = 0;
  bool isBeside = false;  ///< Stands in one row with others: its labels align with nobody's.
};

struct PageView::SubForms {
  const Control* control;
  std::vector<QWidget*> forms;
  QWidget* place;
};

PageView::PageView(std::unique_ptr<CYbSEDlgBase> page, const QString& place, const QString& path)
    : ownPage_(std::move(page)), page_(*ownPage_) {
  Build(place, path);
}

PageView::PageView(CYbSEDlgBase& form) : page_(form) { Build({}, {}); }

void PageView::Build(const QString& placeText, const QString& path) {
  const Theme& theme = Theme::Get();
  const int margin = theme.Scaled(16);
  auto* all = new QVBoxLayout(this);
  all->setContentsMargins(0, 0, 0, 0);
  all->setSpacing(0);

  auto* top = new QWidget;
  auto* head = new QVBoxLayout(top);
  head->setContentsMargins(margin, theme.Scaled(12), margin, theme.Scaled(8));
  head->setSpacing(theme.Scaled(2));
  auto* title = new QLabel(Translated(page_.Node().GetTitle()));
  QFont bold = title->font();
  bold.setPointSizeF(bold.pointSizeF() * 1.35);
  bold.setWeight(QFont::DemiBold);
  title->setFont(bold);
  title->setWordWrap(true);
  title->setAlignment(AtBegin());
  head->addWidget(title);
  auto* place = new QLabel(placeText);
  place->setTextFormat(Qt::PlainText);
  place->setAlignment(AtBegin());
  QPalette quiet = place->palette();
  quiet.setColor(QPalette::WindowText, theme.QuietColor());
  place->setPalette(quiet);
  place->setTextInteractionFlags(Qt::TextSelectableByMouse);
  if (!path.isEmpty()) place->setToolTip(tr("On the command line: %1").arg(path));
  head->addWidget(place);
  all->addWidget(top);
  top->setVisible(ownPage_ != nullptr);

  QWidget* form = BuildForm(page_.Form(), 0);
  auto* content = new QWidget;
  auto* column = new QVBoxLayout(content);
  column->setContentsMargins(margin, theme.Scaled(4), margin, margin);
  auto* row = new QHBoxLayout;
  row->setContentsMargins(0, 0, 0, 0);
  formPlace_ = form;
  content_ = column;
  row->addWidget(form, 1);
  row->addStretch(0);
  column->addLayout(row);
  column->addStretch(1);

  scroll_ = new QScrollArea;
  scroll_->setFrameShape(QFrame::NoFrame);
  // The keyboard goes from field to field; the area around them would be a stop that nobody sees.
  scroll_->setFocusPolicy(Qt::NoFocus);
  scroll_->setWidgetResizable(true);
  scroll_->setWidget(content);
  if (plots_.empty()) {
    all->addWidget(scroll_, 1);
  } else {
    split_ = new QSplitter;
    split_->setChildrenCollapsible(false);
    split_->addWidget(scroll_);
    plotScroll_ = new QScrollArea;
    plotScroll_->setFrameShape(QFrame::NoFrame);
    plotScroll_->setFocusPolicy(Qt::NoFocus);
    plotScroll_->setWidgetResizable(true);
    plotScroll_->setWidget(plotPlace_);
    split_->addWidget(plotScroll_);
    split_->setStretchFactor(1, 1);
    all->addWidget(split_, 1);
  }
  // Below all: a finding that comes or goes must not move the field in which somebody types.
  findings_ = new QLabel;
  findings_->setWordWrap(true);
  findings_->setTextFormat(Qt::RichText);
  findings_->setContentsMargins(margin, theme.Scaled(6), margin, theme.Scaled(6));
  findings_->setTextInteractionFlags(Qt::LinksAccessibleByMouse | Qt::LinksAccessibleByKeyboard);
  findings_->hide();
  connect(findings_, &QLabel::linkActivated, this, &PageView::FollowFixLink);
  all->addWidget(findings_);
  noted_ = new QLabel;
  noted_->setWordWrap(true);
  noted_->setTextFormat(Qt::RichText);
  noted_->setContentsMargins(margin, theme.Scaled(2), margin, theme.Scaled(6));
  noted_->hide();
  all->addWidget(noted_);
  AlignLabels();
  Sync();
  // What is hidden before it was ever shown leaves the sizes that the layouts above it know.
  for (QLayout* layout : findChildren<QLayout*>()) layout->invalidate();
}

PageView::~PageView() = default;

QSize PageView::WantedSize() const {
  const int bar = style()->pixelMetric(QStyle::PM_ScrollBarExtent);
  const QSize content = scroll_->widget()->sizeHint();
  int width = std::max(content.width(), Theme::Get().Scaled(520));
  // A table takes what it is given, so that its hint is narrower than its columns.
  for (const TableView* table : findChildren<TableView*>())
    width = std::max(width, std::min(table->WantedWidth() + 4 * bar, Theme::Get().Scaled(900)));
  return {width + bar, content.height() + bar};
}

QWidget* PageView::BuildForm(PageForm& form, int depth) {
  auto* widget = new QWidget;
  auto* grid = new QGridLayout(widget);
  const Theme& theme = Theme::Get();
  grid->setContentsMargins(0, 0, 0, 0);
  grid->setHorizontalSpacing(theme.Scaled(12));
  grid->setVerticalSpacing(theme.Scaled(8));
  grid->setColumnStretch(kFieldColumn, 1);
  Form& built = *forms_.emplace_back(std::make_unique<Form>(Form{grid, depth}));

  std::vector<Control*> row;
  const auto finish = [&] {
    if (!row.empty()) AddRow(built, row);
    row.clear();
  };
  for (const auto& control : form.Controls()) {
    if (IsPlot(control->kind) && &form == &page_.Form()) {
      AddPlot(*control);
      continue;
    }
    if (!control->beside) finish();
    row.push_back(control.get());
  }
  finish();
  return widget;
}

/// The widget of a group or of a place of sub-forms, and of any other control that stands without a label in front.
QWidget* PageView::BuildCell(Control& control, int depth) {
  if (control.kind == ControlKind::Group) {
    auto* box = new QGroupBox(Translated(control.label));
    auto* column = new QVBoxLayout(box);
    const int margin = Theme::Get().Scaled(10);
    column->setContentsMargins(margin, margin, margin, margin);
    column->addWidget(BuildForm(*control.group, depth + 1));
    groups_.emplace_back(&control, box);
    return box;
  }
  if (control.kind == ControlKind::SubForms) {
    auto* place = new QWidget;
    auto* column = new QVBoxLayout(place);
    column->setContentsMargins(0, 0, 0, 0);
    auto& subForms = *subForms_.emplace_back(std::make_unique<SubForms>(SubForms{&control, {}, place}));
    for (const auto& form : control.subForms) {
      subForms.forms.push_back(BuildForm(*form, depth));
      column->addWidget(subForms.forms.back());
    }
    return place;
  }
  ControlWidget& made = *widgets_.emplace_back(ControlWidget::Make(page_, control));
  connect(&made, &ControlWidget::UnitChosen, this, &PageView::UnitChosen);
  return made.Field();
}

void PageView::AddRow(Form& built, const std::vector<Control*>& row) {
  QGridLayout& grid = *built.grid;
  const int line = built.row++;
  const bool allGroups =
      std::ranges::all_of(row, [](const Control* control) { return control->kind == ControlKind::Group; });
  if (row.size() > 1 && allGroups) {
    auto* groups = new GroupRow;
    for (Control* control : row) {
      const std::size_t before = forms_.size();
      groups->Add(BuildCell(*control, built.depth));
      for (std::size_t i = before; i < forms_.size(); ++i) forms_[i]->isBeside = true;
    }
    widest_ = std::max(widest_, groups->FullWidth());
    grid.addWidget(groups, line, kLabelColumn, 1, 2);
    return;
  }
  Control& first = *row.front();
  QWidget* cell = BuildCell(first, built.depth);
  QWidget* label = nullptr;
  bool growsDown = false;
  if (!widgets_.empty() && &widgets_.back()->Described() == &first) {
    label = widgets_.back()->Label();
    growsDown = widgets_.back()->GrowsDown();
  }
  if (row.size() == 1 && !label) {
    grid.addWidget(cell, line, kLabelColumn, 1, 2, growsDown ? Qt::Alignment() : Qt::AlignTop);
  } else if (row.size() == 1) {
    // The label stands at the height of the field's first line.
    label->setContentsMargins(0, Theme::Get().Scaled(4), 0, 0);
    grid.addWidget(label, line, kLabelColumn, Qt::AlignLeft | Qt::AlignTop);
    grid.addWidget(cell, line, kFieldColumn, growsDown ? Qt::Alignment() : Qt::AlignTop);
  } else {
    // The first stands in the place of a label, or with its own in front; the others follow it.
    auto* others = new QHBoxLayout;
    others->setSpacing(Theme::Get().Scaled(12));
    if (label) {
      label->setContentsMargins(0, Theme::Get().Scaled(4), 0, 0);
      grid.addWidget(label, line, kLabelColumn, Qt::AlignLeft | Qt::AlignTop);
      others->addWidget(cell);
    } else {
      grid.addWidget(cell, line, kLabelColumn);
    }
    for (std::size_t i = 1; i < row.size(); ++i) {
      QWidget* next = BuildCell(*row[i], built.depth);
      if (QWidget* nextLabel = widgets_.back()->Label()) others->addWidget(nextLabel);
      others->addWidget(next, 1);
    }
    grid.addLayout(others, line, kFieldColumn);
  }
  if (growsDown) growing_.push_back({&grid, line, cell});
}

void PageView::AddPlot(Control& control) {
  if (!plotPlace_) {
    plotPlace_ = new QWidget;
    auto* column = new QVBoxLayout(plotPlace_);
    const int margin = Theme::Get().Scaled(8);
    column->setContentsMargins(margin, 0, margin, margin);
  }
  ControlWidget& made = *widgets_.emplace_back(ControlWidget::Make(page_, control));
  auto& column = static_cast<QVBoxLayout&>(*plotPlace_->layout());
  if (QWidget* caption = made.Label()) column.addWidget(caption);
  // A chart and a map below each other share the height.
  column.addWidget(made.Field(), 1);
  plots_.push_back(&control);
}

void PageView::MeasureForm() {
  // What was hidden or shown just now is known to the layout around it, not to those above: from the inside out.
  const QList<QLayout*> layouts = formPlace_->findChildren<QLayout*>();
  for (QLayout* layout : layouts) layout->invalidate();
  std::for_each(layouts.rbegin(), layouts.rend(), [](QLayout* layout) { layout->activate(); });
  neededByForm_ = formPlace_->minimumSizeHint().width();
}

void PageView::SyncStretch() {
  // What is hidden leaves its room to the others.
  for (const GrowingRow& row : growing_) row.grid->setRowStretch(row.line, row.cell->isVisibleTo(this) ? 1 : 0);
  const auto hasShown = [this](bool (ControlWidget::*grows)() const) {
    return std::ranges::any_of(widgets_, [&](const auto& widget) {
      return ((*widget).*grows)() && std::ranges::find(plots_, &widget->Described()) == plots_.end() &&
             widget->Field()->isVisibleTo(this);
    });
  };
  const bool growsDown = hasShown(&ControlWidget::GrowsDown);
  const int widest = std::max(Theme::Get().Scaled(kWidestForm), widest_);
  formPlace_->setMaximumWidth(hasShown(&ControlWidget::GrowsRight) ? QWIDGETSIZE_MAX : widest);
  content_->setStretch(0, growsDown ? 1 : 0);
  const bool hasPlots = plotPlace_ && !arePlotsBeside_ && plotPlace_->isVisibleTo(this);
  content_->setStretch(content_->count() - 1, growsDown || hasPlots ? 0 : 1);
}

void PageView::MovePlots(bool beside) {
  if (beside == arePlotsBeside_) return;
  arePlotsBeside_ = beside;
  const bool isShown = !plotPlace_->isHidden();
  if (beside) {
    content_->removeWidget(plotPlace_);
    plotPlace_->setMinimumHeight(0);
    plotScroll_->setWidget(plotPlace_);
  } else {
    plotScroll_->takeWidget();
    content_->insertWidget(1, plotPlace_, 1);
  }
  plotPlace_->setVisible(isShown);
}

void PageView::PlacePlots() {
  const Theme& theme = Theme::Get();
  const auto count = std::ranges::count_if(plots_, [](const Control* control) { return control->IsShown(); });
  // The width alone decides: a bar below that opens moves nothing from side to side.
  const int bar = style()->pixelMetric(QStyle::PM_ScrollBarExtent);
  const QMargins margins = content_->contentsMargins();
  const int edges = margins.left() + margins.right() + bar;
  const int needed = neededByForm_ + edges;
  MovePlots(width() >= std::max(theme.Scaled(kSideBySide), needed + theme.Scaled(kLeastPlot)));
  plotScroll_->setVisible(arePlotsBeside_ && count > 0);
  if (!arePlotsBeside_) {
    plotPlace_->setMinimumHeight(static_cast<int>(count) * theme.Scaled(kLeastPlot));
    return;
  }
  int wanted = std::max(needed, theme.Scaled(kFormBesidePlot));
  for (const auto& widget : widgets_)
    if (widget->Field()->isVisibleTo(this)) wanted = std::max(wanted, widget->WantedWidth() + edges);
  const int form = std::min(wanted, std::max(needed, width() * 3 / 5));
  // What the user has moved stays until the page is another one.
  if (formSize_ == form) return;
  formSize_ = form;
  split_->setSizes({form, std::max(width() - form, 1)});
}

void PageView::resizeEvent(QResizeEvent* event) {
  QWidget::resizeEvent(event);
  if (split_) PlacePlots();
  SyncStretch();
}

void PageView::AlignLabels() {
  // A group's frame moves its content to the right by its margin: labels inside are that much narrower.
  const int step = Theme::Get().Scaled(10) + 3;
  const auto labelWidth = [](const Form& form) {
    int width = 0;
    for (int row = 0; row < form.grid->rowCount(); ++row) {
      const QLayoutItem* item = form.grid->itemAtPosition(row, kLabelColumn);
      if (item && item != form.grid->itemAtPosition(row, kFieldColumn))
        width = std::max(width, item->sizeHint().width());
    }
    return width;
  };
  int widest = 0;
  for (const auto& form : forms_)
    if (!form->isBeside) widest = std::max(widest, labelWidth(*form) + form->depth * step);
  for (const auto& form : forms_)
    if (!form->isBeside && labelWidth(*form) > 0)
      form->grid->setColumnMinimumWidth(kLabelColumn, widest - form->depth * step);
}

void PageView::Sync() {
  for (const auto& place : subForms_) {
    const int current = place->control->currentSubForm();
    for (std::size_t i = 0; i < place->forms.size(); ++i) place->forms[i]->setVisible(static_cast<int>(i) == current);
    place->place->setVisible(current >= 0 && current < static_cast<int>(place->forms.size()));
  }
  for (const auto& [control, box] : groups_) {
    box->setVisible(control->IsShown());
    // A group of which nothing can be changed stands back as a whole.
    const auto& inside = control->group->Controls();
    box->setEnabled(std::ranges::any_of(inside, [](const auto& each) { return each->IsEnabled(); }));
  }
  defaults_.Look();
  for (const auto& widget : widgets_) {
    widget->Sync();
    const Control& control = widget->Described();
    widget->ShowDeclared(Translated(defaults_.ToolTip(control)), defaults_.Reset(control));
  }
  if (plotPlace_)
    plotPlace_->setVisible(std::ranges::any_of(plots_, [](const Control* control) { return control->IsShown(); }));
  MeasureForm();
  if (split_ && isVisible()) PlacePlots();
  SyncStretch();
  SyncFindings();
  SyncNotes();
}

void PageView::SyncFindings() {
  const Theme& theme = Theme::Get();
  QString lines;
  int count = 0;
  linked_.clear();
  const auto add = [&](CYbSEKvfBase& node, const Finding& finding) {
    if (++count > kMostFindings) return;
    const QColor color = finding.severity == Severity::Error     ? theme.ErrorColor()
                         : finding.severity == Severity::Warning ? theme.WarningColor()
                                                                 : theme.QuietColor();
    QString text = Translated(finding.text).toHtmlEscaped().replace("\n", "<br>");
    if (!finding.detail.empty()) text += " — " + Translated(finding.detail).toHtmlEscaped();
    if (const QString fix = fixOf_ ? fixOf_(node, finding) : QString(); !fix.isEmpty()) {
      text += QString("&nbsp; <a href='%1'>%2</a>").arg(linked_.size()).arg(fix.toHtmlEscaped());
      linked_.emplace_back(node.Serial(), finding);
    }
    lines += QString("<div><b style='color:%1'>%2</b>&nbsp; %3</div>")
                 .arg(color.name(), SeverityText(finding.severity), text);
  };
  const std::function<void(CYbSEKvfBase&)> addAll = [&](CYbSEKvfBase& node) {
    for (const Finding& finding : node.Findings()) add(node, finding);
    // What has no page of its own, such as a file, speaks here.
    for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child))
      if (!PageClassOf(*child)) addAll(*child);
  };
  // A dialog asks for something of its own.
  if (ownPage_) addAll(page_.Node());
  if (count > kMostFindings) lines += "<div>" + tr("and %n more", nullptr, count - kMostFindings) + "</div>";
  findings_->setText(lines);
  findings_->setVisible(count > 0);
}

void PageView::ShowNotes(NotesAt notesAt) {
  notesAt_ = std::move(notesAt);
  SyncNotes();
}

void PageView::SyncNotes() {
  if (!notesAt_ || !ownPage_) return;
  for (const auto& widget : widgets_) {
    const Control& control = widget->Described();
    if (control.node && !control.key.empty()) widget->ShowNotes(notesAt_(*control.node, control.key));
  }
  const QString ofPage = notesAt_(page_.Node(), {}).toHtmlEscaped().replace("\n", "<br>");
  noted_->setText(QString("<b>%1</b>&nbsp; %2").arg(tr("Note"), ofPage));
  noted_->setVisible(!ofPage.isEmpty());
}

std::pair<std::uint64_t, std::string> PageView::KeyWithFocus() const {
  const QWidget* focus = QApplication::focusWidget();
  for (const auto& widget : widgets_)
    if (const Control& control = widget->Described();
        control.node && focus && widget->Field() && (widget->Field() == focus || widget->Field()->isAncestorOf(focus)))
      return {control.node->Serial(), control.key};
  return {};
}

void PageView::OfferFixes(FixOf fixOf) {
  fixOf_ = std::move(fixOf);
  SyncFindings();
}

void PageView::FollowFixLink(const QString& link) {
  const std::size_t number = link.toULong();
  if (number >= linked_.size()) return;
  // A copy: what is fixed is found no more.
  const auto [serial, finding] = linked_[number];
  emit FixAsked(serial, finding);
}

void PageView::Commit() {
  for (const auto& widget : widgets_) widget->Commit();
}

ControlWidget* PageView::Find(const std::string& name) const {
  if (name.empty()) return nullptr;
  ControlWidget* hidden = nullptr;
  for (std::size_t i = 0; i < widgets_.size(); ++i) {
    const Control& control = widgets_[i]->Described();
    if (control.key != name && control.label != name && name != NumberedName(i)) continue;
    // Sub-forms may bear the same key, of which one is shown.
    if (widgets_[i]->Field()->isVisibleTo(this)) return widgets_[i].get();
    if (!hidden) hidden = widgets_[i].get();
  }
  return hidden;
}

void PageView::FocusOn(const std::string& key) {
  ControlWidget* found = Find(key);
  if (!found) {
    const auto first = std::ranges::find_if(widgets_, [](const auto& widget) {
      return widget->FocusTarget() && widget->Described().IsShown() && widget->Described().IsEnabled();
    });
    if (first == widgets_.end()) return;
    found = first->get();
  }
  scroll_->ensureWidgetVisible(found->Field());
  // What cannot be changed now is shown, and no neighbour in its place.
  if (!found->FocusTarget() || !found->FocusTarget()->isEnabled()) return PointOut(found);
  found->FocusTarget()->setFocus(Qt::ShortcutFocusReason);
}

bool PageView::FocusOnPlot() {
  const QWidget* focus = QApplication::focusWidget();
  if (!plotPlace_ || (focus && plotPlace_->isAncestorOf(focus))) return false;
  for (const auto& widget : widgets_) {
    QWidget* target = widget->FocusTarget();
    if (!target || !target->isVisible() || !plotPlace_->isAncestorOf(target)) continue;
    if (!arePlotsBeside_) scroll_->ensureWidgetVisible(target);
    target->setFocus(Qt::ShortcutFocusReason);
    return true;
  }
  return false;
}

std::string PageView::NameOf(const void* control) const {
  for (std::size_t i = 0; control && i < widgets_.size(); ++i) {
    const Control& described = widgets_[i]->Described();
    if (&described == control)
      return !described.key.empty() ? described.key : !described.label.empty() ? described.label : NumberedName(i);
  }
  return {};
}

void PageView::PointOut(const std::string& name) {
  ControlWidget* found = Find(name);
  if (!found) return;
  FocusOn(name);
  PointOut(found);
}

void PageView::PointOut(ControlWidget* widget) {
  if (widget->Field()) new FlashMark(widget->Field());
}

void PageView::DropRefused() {
  for (const auto& widget : widgets_) widget->DropRefused();
}

void PageView::contextMenuEvent(QContextMenuEvent* event) {
  // What is disabled hands its events on to the page, and so do labels and check boxes.
  for (const auto& widget : widgets_) {
    const Control& control = widget->Described();
    const auto isHit = [&](const QWidget* part) {
      return part && part->isVisible() && part->rect().contains(part->mapFromGlobal(event->globalPos()));
    };
    if (!isHit(widget->Label()) && !isHit(widget->Field())) continue;
    QMenu menu;
    if (!control.IsEnabled() && !control.enabledWhen.IsAlways())
      menu.addAction(tr("&Why Is This Grey?"), this, [this, &control] { emit WhyAsked(&control); });
    widget->AddTo(menu);
    if (control.node && !control.key.empty())
      menu.addAction(tr("Add &Note…"), this, [this, &control] {
        emit NoteWanted(control.node->Serial(), QString::fromStdString(control.key));
      });
    if (menu.isEmpty()) continue;
    menu.exec(event->globalPos());
    return;
  }
  QWidget::contextMenuEvent(event);
}

}  // namespace tervane
