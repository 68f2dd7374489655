// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What stands around the map of the grid editor: tools, the table of cells, and what is done to a selection.
#include <QAction>
#include <QActionGroup>
#include <QComboBox>
#include <QHBoxLayout>
#include <QLabel>
#include <QLineEdit>
#include <QSpinBox>
#include <QToolButton>
#include <QVBoxLayout>
#include <initializer_list>
#include <limits>
#include <utility>

#include "data/csv_reader.h"
#include "platform/text.h"
#include "shell/editors/edit_panel.h"
#include "shell/editors/edit_table.h"
#include "shell/editors/grid_editor.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/scrolled_row.h"
#include "shell/widgets/theme.h"

namespace tervane {

QWidget* GridEditor::BuildTools() {
  auto* all = new QWidget;
  auto* column = new QVBoxLayout(all);
  column->setContentsMargins(0, 0, 0, 0);
  auto* choicesArea = new ScrolledRow;
  QHBoxLayout* choices = &choicesArea->Row();
  choices->setContentsMargins(0, 0, 0, 0);
  items_ = new QComboBox;
  items_->setAccessibleName(tr("Item"));
  layers_ = new QComboBox;
  layers_->setAccessibleName(tr("Layer"));
  step_ = new QSpinBox;
  step_->setAccessibleName(tr("Step"));
  step_->setKeyboardTracking(false);
  layerLabel_ = new QLabel(tr("Layer:"));
  stepLabel_ = new QLabel(tr("Step:"));
  date_ = new QLabel;
  choices->addWidget(new QLabel(tr("Item:")));
  choices->addWidget(items_);
  choices->addSpacing(Theme::Get().Scaled(12));
  for (QWidget* widget : std::initializer_list<QWidget*>{layerLabel_, layers_, stepLabel_, step_, date_})
    choices->addWidget(widget);
  choices->addStretch();
  column->addWidget(choicesArea);

  auto* toolsArea = new ScrolledRow;
  QHBoxLayout* row = &toolsArea->Row();
  row->setContentsMargins(0, 0, 0, 0);
  row->setSpacing(Theme::Get().Scaled(3));
  tools_ = new QActionGroup(this);
  struct Named {
    Tool tool;
    QString text, key, toolTip;
  };
  const Named named[] = {
      {Tool::Move, tr("Move"), "M", tr("Drag moves the map; a click shows the cell in the table")},
      {Tool::Brush, tr("Brush"), "B", tr("Drag paints the value; the middle button moves the map")},
      {Tool::Line, tr("Line", "drawn"), "L",
       tr("Clicks give the corners of a line that is painted, a double click its end")},
      {Tool::Polygon, tr("Polygon"), "P",
       tr("Clicks give the corners of an area that is painted, a double click its end")},
      {Tool::Fill, tr("Fill"), "F", tr("A click paints the cells that hang together with one and have its value")},
      {Tool::SelectRectangle, tr("Select Rectangle"), "R", tr("Drag selects cells for counting and changing")},
      {Tool::SelectPolygon, tr("Select Polygon"), "A", tr("Clicks give the corners of the area that is selected")},
  };
  for (const Named& each : named) {
    auto* action = new QAction(each.text, this);
    action->setCheckable(true);
    action->setChecked(each.tool == Tool::Move);
    action->setShortcut(QKeySequence(each.key));
    action->setShortcutContext(Qt::WidgetWithChildrenShortcut);
    action->setToolTip(QString("%1 (%2)").arg(each.toolTip, each.key));
    action->setData(static_cast<int>(each.tool));
    tools_->addAction(action);
    addAction(action);
    connect(action, &QAction::triggered, this, [this, tool = each.tool] { SetTool(tool); });
    auto* button = new QToolButton;
    button->setDefaultAction(action);
    button->setToolButtonStyle(Qt::ToolButtonTextOnly);
    button->setFocusPolicy(Qt::TabFocus);
    row->addWidget(button);
  }
  row->addSpacing(Theme::Get().Scaled(12));
  value_ = new QLineEdit("0");
  value_->setAccessibleName(tr("Value"));
  value_->setPlaceholderText(tr("no value"));
  value_->setToolTip(tr("What tools paint; with an empty field they delete values"));
  value_->setFixedWidth(Theme::Get().Scaled(90));
  unit_ = new QLabel;
  width_ = new QSpinBox;
  width_->setAccessibleName(tr("Width"));
  width_->setRange(1, 999);
  width_->setToolTip(tr("Of brush and line, in cells ([ and ] on the map)"));
  widthLabel_ = new QLabel(tr("Width:"));
  auto* valueLabel = new QLabel(tr("Value:"));
  for (QWidget* widget : std::initializer_list<QWidget*>{valueLabel, value_, unit_}) row->addWidget(widget);
  row->addSpacing(Theme::Get().Scaled(8));
  row->addWidget(widthLabel_);
  row->addWidget(width_);
  row->addStretch();
  column->addWidget(toolsArea);
  for (const auto& [key, by] : {std::pair(Qt::Key_BracketLeft, -1), std::pair(Qt::Key_BracketRight, 1)}) {
    auto* action = new QAction(this);
    action->setShortcut(QKeySequence(key));
    action->setShortcutContext(Qt::WidgetWithChildrenShortcut);
    connect(action, &QAction::triggered, this, [this, step = by] { width_->setValue(width_->value() + step); });
    addAction(action);
  }
  connect(width_, &QSpinBox::valueChanged, this, [this] { SetTool(tool_); });

  connect(items_, &QComboBox::activated, this, [this](int index) {
    WaitForPicture();
    Tell(edit_.Show(index + 1, edit_.Slice()));
    ShowItem();
  });
  connect(layers_, &QComboBox::activated, this, [this](int index) {
    WaitForPicture();
    // The list goes from the top, as layers lie; the file counts from the bottom.
    Tell(edit_.Show(edit_.Item(), {edit_.Slice().step, layers_->count() - 1 - index}));
    ShowSlice();
  });
  connect(step_, &QSpinBox::valueChanged, this, [this](int step) {
    WaitForPicture();
    Tell(edit_.Show(edit_.Item(), {static_cast<std::size_t>(step - 1), edit_.Slice().layer}));
    ShowSlice();
  });
  return all;
}

EditTable* GridEditor::BuildTable() {
  const auto rowOf = [this](int row) { return edit_.Grid()->Geometry().ny - 1 - row; };
  EditTableContent content;
  content.rows = [this] { return edit_.Grid() ? edit_.Grid()->Geometry().ny : 0; };
  content.columns = [this] { return edit_.Grid() ? edit_.Grid()->Geometry().nx : 0; };
  content.text = [this, rowOf](int row, int column) { return CellText(edit_.ValueOf(column, rowOf(row))); };
  content.rowHead = [rowOf](int row) { return QString::number(rowOf(row)); };
  content.columnHead = [](int column) { return QString::number(column); };
  content.mayEdit = [this](int) { return edit_.WhyNotChanged().empty(); };
  const auto put = [this](const char* name, std::vector<std::tuple<int, int, float>> cells) {
    WaitForPicture();
    return Translated(edit_.PutCells(name, cells));
  };
  content.enter = [this, rowOf, put](int row, int column, const QString& text) {
    const auto number = ParseCsvNumber(FromQt(text), true);
    if (!number && !text.isEmpty()) return tr("A number was expected, or nothing for no value.");
    if (const std::string why = number ? edit_.WhyNotValue(*number) : std::string(); !why.empty())
      return Translated(why);
    return put("Change Cell", {{column, rowOf(row), number ? static_cast<float>(*number) : kDeleteValue}});
  };
  content.paste = [this, rowOf, put](int row, int column, const QString& text) {
    std::vector<std::tuple<int, int, float>> cells;
    const std::string bytes = FromQt(text);
    CsvReader reader(bytes, false);
    std::vector<std::string> line;
    int beyond = 0;
    for (; reader.Next(line); ++row) {
      for (std::size_t k = 0; k < line.size(); ++k) {
        const std::string_view cell = Trimmed(line[k]);
        const auto number = ParseCsvNumber(cell, !reader.SeparatesByComma());
        if (!number && !cell.empty()) return tr("Line %1: %2 is no number.").arg(reader.Line()).arg(ToQt(cell));
        if (const std::string why = number ? edit_.WhyNotValue(*number) : std::string(); !why.empty())
          return tr("Line %1: %2").arg(reader.Line()).arg(Translated(why));
        const int i = column + static_cast<int>(k), j = rowOf(row);
        if (i >= edit_.Grid()->Geometry().nx || j < 0)
          ++beyond;
        else
          cells.emplace_back(i, j, number ? static_cast<float>(*number) : kDeleteValue);
      }
    }
    const QString told = put("Paste", std::move(cells));
    return told.isEmpty() && beyond > 0 ? tr("%L1 values lie beyond the grid and were left out.").arg(beyond) : told;
  };
  content.clear = [rowOf, put](int top, int left, int bottom, int right) {
    std::vector<std::tuple<int, int, float>> cells;
    for (int row = bottom; row >= top; --row)
      for (int column = left; column <= right; ++column) cells.emplace_back(column, rowOf(row), kDeleteValue);
    return put("Delete Values", std::move(cells));
  };
  auto* table = new EditTable(std::move(content));
  connect(table, &EditTable::Told, this, [this](const QString& text) { panel_->Tell(text); });
  connect(table, &EditTable::Changed, this, &GridEditor::Follow);
  return table;
}

EditPanel* GridEditor::BuildPanel() {
  auto* panel = new EditPanel;
  panel->Group(tr("Selection"));
  mode_ = panel->Choice(tr("How:"), tr("What happens to the cells that were selected before"),
                        {tr("Anew"), tr("Added"), tr("Taken Away"), tr("Only Within")});
  auto* from = panel->Field(tr("From:"), tr("The smallest value that is selected; any with an empty field"));
  auto* to = panel->Field(tr("To:"), tr("The largest value that is selected; any with an empty field"));
  for (QLineEdit* field : {from, to}) field->setPlaceholderText(tr("any"));
  panel->Button(tr("Values"), tr("Selects the cells whose values lie between these two"), [this, panel, from, to] {
    constexpr double kInfinity = std::numeric_limits<double>::infinity();
    const auto low = from->text().trimmed().isEmpty() ? std::optional(-kInfinity) : panel->NumberIn(*from);
    const auto high = to->text().trimmed().isEmpty() ? std::optional(kInfinity) : panel->NumberIn(*to);
    if (low && high) edit_.SelectRange(*low, *high, Mode());
    if (low && high) ShowMap();
    return QString();
  });
  panel->Button(
      tr("Missing"), tr("Selects the cells without a value"),
      [this] {
        edit_.SelectMissing(Mode());
        ShowMap();
        return QString();
      },
      false);
  panel->Button(
      tr("None"), tr("Selects nothing: what is done is done to all cells"),
      [this] {
        edit_.SelectNothing();
        ShowMap();
        return QString();
      },
      false);

  panel->Group(tr("Change"));
  auto* operation = panel->Choice(tr("Do:"), tr("To each selected cell, or to all without a selection"),
                                  {tr("Set"), tr("Add", "number"), tr("Subtract"), tr("Multiply"), tr("Divide"),
                                   tr("Raise to at Least"), tr("Lower to at Most")});
  auto* operand = panel->Field(tr("Number:"), tr("In the unit of the file"));
  panel->Button(tr("Apply"), tr("Changes the selected cells, or all without a selection"),
                [this, panel, operation, operand] {
                  const auto number = panel->NumberIn(*operand);
                  if (!number) return QString();
                  WaitForPicture();
                  return ToQt(edit_.Apply(static_cast<CellOperation>(operation->currentIndex()), *number));
                });
  panel->Button(
      tr("Delete Values"), tr("The selected cells have no value then"),
      [this] {
        WaitForPicture();
        return ToQt(edit_.DeleteValues());
      },
      false);
  auto* old = panel->Field(tr("Replace:"), tr("A value; with an empty field, cells without one"));
  auto* by = panel->Field(tr("By:"), tr("Another value; with an empty field, none"));
  for (QLineEdit* field : {old, by}) field->setPlaceholderText(tr("no value"));
  panel->Button(tr("Replace"), tr("In the selected cells, or in all without a selection"), [this, old, by] {
    const auto value = ValueIn(*old), other = ValueIn(*by);
    if (!value || !other) return panel_->Told();
    WaitForPicture();
    return ToQt(edit_.Replace(*value, *other));
  });
  panel->Button(
      tr("Burn Shapes..."), tr("Gives the cells of a shape file the values of an attribute, or the one of the tools"),
      [this] { return Burn(); }, false);

  panel->Group(tr("Statistics"));
  statistics_ = panel->Text();
  statistics_->setTextFormat(Qt::RichText);
  panel->End();
  connect(panel, &EditPanel::Done, this, &GridEditor::Follow);
  return panel;
}

}  // namespace tervane
