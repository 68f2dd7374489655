// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/series_editor.h"

#include <QComboBox>
#include <QFileInfo>
#include <QHBoxLayout>
#include <QLabel>
#include <QLineEdit>
#include <QListWidget>
#include <QSplitter>
#include <QVBoxLayout>
#include <algorithm>
#include <cmath>
#include <limits>
#include <numeric>

#include "data/csv_reader.h"
#include "forms/entry.h"
#include "pages/parts/plot_content.h"
#include "platform/text.h"
#include "shell/charts/series_plot.h"
#include "shell/editors/edit_panel.h"
#include "shell/editors/edit_table.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/row_delegate.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kChartDelay = 60;  ///< Milliseconds after which a change that rests is drawn.

QString TimeText(const CYbDateTime& time) {
  return ToQt(time.Format(time.Second() == 0 ? "%Y-%m-%d %H:%M" : "%Y-%m-%d %H:%M:%S"));
}

/// A series whose values hold over the step that ends with their time is drawn in steps.
bool IsOverSteps(ValueType type) { return type == ValueType::MeanStep || type == ValueType::StepAccumulated; }

QString FigureText(double value, const QString& unit) {
  return std::isfinite(value) ? QString::number(value, 'g', 7) + unit : QString("-");
}

}  // namespace

SeriesEditor::SeriesEditor(const std::string& path, Host& host) : EditTab(host), edit_(path) {
  list_ = new QListWidget;
  list_->setAccessibleName(tr("Series"));
  list_->setSelectionMode(QAbstractItemView::ExtendedSelection);
  list_->setFrameShape(QFrame::NoFrame);
  list_->setWordWrap(true);
  list_->setItemDelegate(new RowDelegate(list_));
  chart_ = new SeriesPlot(host);
  table_ = BuildTable();
  panel_ = BuildPanel();
  auto* split = new QSplitter(Qt::Vertical);
  split->setChildrenCollapsible(false);
  split->addWidget(chart_);
  split->addWidget(table_);
  split->setStretchFactor(0, 1);
  split->setSizes({Theme::Get().Scaled(330), Theme::Get().Scaled(300)});
  auto* right = new QWidget;
  auto* row = new QHBoxLayout(right);
  const int margin = Theme::Get().Scaled(8);
  row->setContentsMargins(margin, margin, margin, margin);
  row->addWidget(split, 1);
  row->addWidget(panel_);
  auto* body = new QSplitter;
  body->setChildrenCollapsible(false);
  body->addWidget(list_);
  body->addWidget(right);
  body->setStretchFactor(1, 1);
  body->setSizes({Theme::Get().Scaled(170), Theme::Get().Scaled(900)});
  SetBody(body);
  HoldFile();
  rest_.setSingleShot(true);
  rest_.setInterval(kChartDelay);
  connect(&rest_, &QTimer::timeout, this, [this] {
    chart_->Show(Chart());
    ShowStatistics();
  });
  if (!edit_.Problem().empty()) return;
  FillList();
  connect(list_, &QListWidget::itemSelectionChanged, &rest_, qOverload<>(&QTimer::start));
  connect(table_->selectionModel(), &QItemSelectionModel::selectionChanged, this, [this] { ShowStatistics(); });
  chart_->Show(Chart());
  ShowStatistics();
  for (const std::string& note : edit_.Notes()) panel_->Tell(panel_->Told() + Translated(note) + "\n");
}

SeriesEditor::~SeriesEditor() = default;

Host::FileQuestion SeriesEditor::NameQuestion() const {
  const std::string suffix = FromQt(QFileInfo(ToQt(Path())).suffix());
  return {"Save As", "Data file (*." + suffix + ")|*." + suffix + "|All Files (*.*)|*||", suffix, Path()};
}

// ---- The parts

EditTable* SeriesEditor::BuildTable() {
  const auto at = [](int number) { return static_cast<std::size_t>(number); };
  EditTableContent content;
  content.rows = [this] { return static_cast<int>(edit_.Rows()); };
  content.columns = [this] { return static_cast<int>(edit_.SeriesCount()) + 1; };
  content.rowHead = [](int row) { return QString::number(row + 1); };
  content.columnHead = [this, at](int column) {
    if (column == 0) return tr("Time");
    const DataItem& item = edit_.ItemOf(at(column - 1));
    return QString("%1 [%2]").arg(ToQt(item.name), ToQt(ShortUnitOf(item)));
  };
  content.text = [this, at](int row, int column) {
    if (column == 0) return TimeText(edit_.TimeOf(at(row)));
    const float value = edit_.ValueOf(at(column - 1), at(row));
    return value == kDeleteValue ? QString() : ToQt(ShortestNumber(value));
  };
  content.mayEdit = [this, at](int column) {
    return column == 0 ? edit_.WhyNoOtherTimes().empty() : edit_.WhyNotChanged(at(column - 1)).empty();
  };
  content.enter = [this, at](int row, int column, const QString& text) {
    if (column == 0) {
      CYbDateTime time = CYbDateTime::Parse(FromQt(text), "%Y-%m-%d %H:%M:%S");
      const std::string why = time.IsValid() ? std::string() : EnterValue(time, FromQt(text));
      return Translated(why.empty() ? edit_.SetTime(at(row), time) : why);
    }
    const auto number = ParseCsvNumber(FromQt(text), true);
    if (!number && !text.isEmpty()) return tr("A number was expected, or nothing for no value.");
    return ToQt(edit_.SetValue(at(column - 1), at(row), number ? static_cast<float>(*number) : kDeleteValue));
  };
  content.paste = [this, at](int row, int column, const QString& text) {
    std::string note;
    const std::string why = edit_.Paste(at(row), at(std::max(column - 1, 0)), FromQt(text), note);
    return Translated(why.empty() ? note : why);
  };
  content.clear = [this, at](int top, int left, int bottom, int right) {
    std::vector<std::size_t> series;
    for (int column = std::max(left, 1); column <= right; ++column) series.push_back(at(column - 1));
    return ToQt(edit_.DeleteValues({at(top), at(bottom - top + 1)}, series));
  };
  auto* table = new EditTable(std::move(content));
  connect(table, &EditTable::Told, this, [this](const QString& text) { panel_->Tell(text); });
  connect(table, &EditTable::Changed, this, &SeriesEditor::Follow);
  return table;
}

EditPanel* SeriesEditor::BuildPanel() {
  auto* panel = new EditPanel;
  const QStringList units{tr("Seconds"), tr("Minutes"), tr("Hours"), tr("Days"), tr("Months"), tr("Years")};
  panel->Group(tr("Values of the Selected Cells"));
  auto* fill = panel->Choice(tr("Gaps:"), tr("What missing values become"),
                             {tr("Straight Line"), tr("Constant"), tr("Previous Value")});
  auto* constant = panel->Field(tr("Constant:"), tr("For gaps that get a constant"), "0");
  constant->setEnabled(false);
  connect(fill, &QComboBox::currentIndexChanged, constant, [constant](int index) { constant->setEnabled(index == 1); });
  panel->Button(tr("Fill Gaps"), tr("Of the selected cells, or of the series that are shown"),
                [this, panel, fill, constant] {
                  const auto fills = static_cast<GapFill>(fill->currentIndex());
                  const auto number = fills == GapFill::Constant ? panel->NumberIn(*constant) : std::optional(0.0);
                  return number ? Translated(edit_.FillGaps(Rows(), Chosen(), fills, static_cast<float>(*number)))
                                : panel->Told();
                });
  auto* factor = panel->Field(tr("Times:"), tr("Each value becomes value times this, plus that"), "1");
  auto* offset = panel->Field(tr("Plus:"), tr("Each value becomes value times that, plus this"), "0");
  panel->Button(tr("Scale"), tr("The selected cells, or the series that are shown"), [this, panel, factor, offset] {
    const auto times = panel->NumberIn(*factor);
    const auto plus = times ? panel->NumberIn(*offset) : std::nullopt;
    return plus ? Translated(edit_.Scale(Rows(), Chosen(), *times, *plus)) : panel->Told();
  });

  panel->Group(tr("Rows"));
  const auto currentRow = [this] { return static_cast<std::size_t>(std::max(table_->currentIndex().row(), 0)); };
  panel->Button(tr("Insert"), tr("Puts a row in front of the current one, in the middle between the times"),
                [this, currentRow] { return ToQt(edit_.InsertRow(currentRow())); });
  panel->Button(
      tr("Append"), tr("Puts a row behind the last one, a step later"),
      [this] { return ToQt(edit_.InsertRow(edit_.Rows())); }, false);
  panel->Button(
      tr("Delete"), tr("Deletes the selected rows"),
      [this] {
        int top = 0, left = 0, bottom = 0, right = 0;
        if (!table_->Selected(top, left, bottom, right)) return tr("Select rows of the table first.");
        return ToQt(edit_.DeleteRows({static_cast<std::size_t>(top), static_cast<std::size_t>(bottom - top + 1)}));
      },
      false);

  panel->Group(tr("Times of All Rows"));
  auto* from = panel->Field(tr("From:"), tr("A date as 2000-01-31 12:00"));
  auto* to = panel->Field(tr("To:"), tr("A date as 2000-01-31 12:00"));
  panel->Button(tr("Cut to Period"), tr("Keeps the rows from one date to the other"), [this, from, to] {
    const CYbDateTime begin = DateIn(*from);
    const CYbDateTime end = begin.IsValid() ? DateIn(*to) : begin;
    return end.IsValid() ? Translated(edit_.Cut(begin, end)) : panel_->Told();
  });
  auto* count = panel->Field(tr("Number:"), tr("Of the unit below; a negative one shifts back"), "1");
  auto* unit = panel->Choice(tr("Of:"), tr("The unit of the number"), units);
  unit->setCurrentIndex(3);
  const auto span = [panel, count, unit]() -> std::optional<Span> {
    const auto number = panel->NumberIn(*count);
    constexpr double kMost = 1e6;
    if (number && *number == std::trunc(*number) && std::abs(*number) <= kMost)
      return SpanOf(unit->currentIndex(), static_cast<int>(*number));
    if (number) panel->Tell(tr("Number: a whole number up to %L1 was expected.").arg(kMost, 0, 'f', 0));
    return std::nullopt;
  };
  panel->Button(tr("Shift"), tr("Moves all times"), [this, span] {
    const auto by = span();
    return by ? Translated(edit_.ShiftTimes(by->seconds, by->months)) : panel_->Told();
  });
  panel->Button(
      tr("Resample"),
      tr("Gives all series this step: means and sums by the parts of steps that overlap, values of a moment by "
         "straight "
         "lines"),
      [this, span] {
        const auto step = span();
        return step ? Translated(edit_.ResampleTo({step->seconds, step->months})) : panel_->Told();
      },
      false);

  panel->Group(tr("Statistics"));
  statistics_ = panel->Text();
  statistics_->setTextFormat(Qt::RichText);
  panel->End();
  connect(panel, &EditPanel::Done, this, &SeriesEditor::Follow);
  return panel;
}

SeriesEditor::Span SeriesEditor::SpanOf(int unit, int count) {
  constexpr std::int64_t kSeconds[] = {1, 60, 3600, 86400};
  if (unit < 4) return {kSeconds[unit] * count, 0};
  return {0, unit == 4 ? count : 12 * count};
}

CYbDateTime SeriesEditor::DateIn(const QLineEdit& field) {
  CYbDateTime date;
  if (const std::string why = EnterValue(date, FromQt(field.text().trimmed())); !why.empty())
    panel_->Tell(field.accessibleName() + " " + Translated(why));
  return date;
}

// ---- What is shown

void SeriesEditor::Commit() { table_->CommitOpenEditor(); }

void SeriesEditor::FillList() {
  QStringList texts, shown;
  for (std::size_t series = 0; series < edit_.SeriesCount(); ++series) {
    const DataItem& item = edit_.ItemOf(series);
    texts << ToQt(item.name) + "\n" + ToQt(ShortUnitOf(item)) + ", " +
                 Translated(std::string(ValueTypeText(item.valueType)));
  }
  for (int row = 0; row < list_->count(); ++row) shown << list_->item(row)->text();
  if (texts == shown) return;
  const QSignalBlocker blocked(list_);
  const int current = std::max(0, list_->currentRow());
  list_->clear();
  list_->addItems(texts);
  list_->setCurrentRow(std::min(current, list_->count() - 1));
  table_->Reset();
}

void SeriesEditor::Sync() {
  if (!edit_.Problem().empty()) return;
  // Another program may have written other series.
  FillList();
  Follow();
}

RowSpan SeriesEditor::Rows() const {
  int top = 0, left = 0, bottom = 0, right = 0;
  // A single cell is where the user stands, and no choice.
  if (!table_->Selected(top, left, bottom, right) || (top == bottom && left == right)) return {0, edit_.Rows()};
  return {static_cast<std::size_t>(top), static_cast<std::size_t>(bottom - top + 1)};
}

std::vector<std::size_t> SeriesEditor::Chosen() const {
  std::vector<std::size_t> series;
  int top = 0, left = 0, bottom = 0, right = 0;
  const bool isSelected = table_->Selected(top, left, bottom, right) && (top != bottom || left != right) && right > 0;
  for (std::size_t each = 0; each < edit_.SeriesCount(); ++each) {
    const int column = static_cast<int>(each) + 1;
    const bool isChosen = isSelected ? column >= left && column <= right : list_->item(column - 1)->isSelected();
    if (isChosen) series.push_back(each);
  }
  return series;
}

SeriesContent SeriesEditor::Chart() const {
  SeriesContent content;
  content.message = FromQt(tr("Choose a series in the list."));
  std::vector<CYbDateTime> times(edit_.Rows());
  for (std::size_t row = 0; row < times.size(); ++row) times[row] = edit_.TimeOf(row);
  const SharedValues<CYbDateTime> shared(std::move(times));
  for (std::size_t each = 0; each < edit_.SeriesCount(); ++each) {
    if (!list_->item(static_cast<int>(each))->isSelected()) continue;
    const DataItem& item = edit_.ItemOf(each);
    std::vector<double> values;
    values.reserve(edit_.Rows());
    for (const float value : edit_.ValuesOf(each))
      values.push_back(value == kDeleteValue ? std::numeric_limits<double>::quiet_NaN() : static_cast<double>(value));
    Series series{item.name, ShortUnitOf(item), shared, std::move(values)};
    series.isStepped = IsOverSteps(item.valueType);
    series.color = each;
    content.series.push_back(std::move(series));
  }
  return content;
}

void SeriesEditor::Follow() {
  table_->Refill();
  rest_.start();
  emit StateChanged();
}

void SeriesEditor::ShowStatistics() {
  const RowSpan rows = Rows();
  const std::vector<std::size_t> chosen = Chosen();
  QString text = tr("%L1 of %L2 rows").arg(rows.count).arg(edit_.Rows());
  if (const std::int64_t step = edit_.StepSeconds(); step > 0) {
    const bool areDays = step % 86400 == 0, areHours = step % 3600 == 0;
    text += areDays    ? tr(", every %L1 d").arg(step / 86400)
            : areHours ? tr(", every %L1 h").arg(step / 3600)
                       : tr(", every %L1 s").arg(step);
  } else if (edit_.Rows() > 1) {
    text += tr(", steps of several lengths");
  }
  for (const std::size_t series : chosen) {
    const SeriesStatistics found = edit_.Statistics(series, rows);
    const auto add = [&](const QString& name, const QString& value) {
      text += QString("<tr><td>%1&nbsp;&nbsp;</td><td align=right>%2</td></tr>").arg(name, value);
    };
    text += "<br><b>" + ToQt(edit_.ItemOf(series).name).toHtmlEscaped() + "</b><table>";
    const QString unit = " " + ToQt(ShortUnitOf(edit_.ItemOf(series))).toHtmlEscaped();
    add(tr("Values"), QString("%L1").arg(found.count));
    add(tr("Missing"), QString("%L1").arg(found.missing));
    add(tr("Smallest"), FigureText(found.smallest, unit));
    add(tr("Largest"), FigureText(found.largest, unit));
    add(tr("Mean"), FigureText(found.mean, unit));
    add(tr("Sum"), FigureText(found.sum, unit));
    text += "</table>";
  }
  statistics_->setText(text);
}

}  // namespace tervane
