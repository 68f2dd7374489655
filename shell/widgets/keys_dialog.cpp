// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/keys_dialog.h"

#include <QDialogButtonBox>
#include <QTextBrowser>
#include <QVBoxLayout>

#include "shell/widgets/theme.h"

namespace tervane {

std::vector<KeyGroup> KeysOfParts() {
  const auto tr = [](const char* text) { return KeysDialog::tr(text); };
  return {
      {tr("In the field that finds"),
       {{tr("Down"), tr("Into the list")}, {tr("Enter"), tr("To the hit")}, {tr("Esc"), tr("Back to the tree")}}},
      {tr("In a field"),
       {{tr("Enter, Tab"), tr("Enter the value")},
        {tr("Esc"), tr("Back to the value of the setup")},
        {tr("Up, Down"), tr("In a date: count the part at the cursor")},
        {tr("Alt+Down"), tr("Open the list of names, or the calendar")}}},
      {tr("In a table"),
       {{tr("Arrows, Tab, Shift+Tab"), tr("Move; with Shift, arrows select")},
        {tr("Enter, Shift+Enter"), tr("To the cell below, above")},
        {"F2", tr("Edit the cell")},
        {tr("Alt+Down"), tr("Open the list or the calendar of the cell")},
        {tr("Space"), tr("Switch a check, press a button")},
        {tr("Ctrl+D"), tr("Fill down")},
        {tr("Ctrl+Alt+D"), tr("Give the row's values to all rows, where a table offers it")},
        {tr("Del"), tr("Empty texts and file names")},
        {tr("Ctrl+Insert, Ctrl+Del"), tr("Insert a row, delete the row")},
        {tr("Ctrl+Up, Ctrl+Down"), tr("Move the row")},
        {tr("Ctrl+Page Down, Ctrl+Page Up"), tr("To the field behind, before the table")}}},
      {tr("On a map"),
       {{"+, -", tr("Zoom in, zoom out")},
        {tr("Arrows"), tr("Move the map")},
        {tr("Ctrl with arrows"), tr("Move the reading mark; with Shift, by a pixel")},
        {tr("Enter"), tr("Click at the reading mark; again at the same place, the line that is drawn ends")},
        {tr("Backspace"), tr("Take back the last point of a line")},
        {tr("Home"), tr("Show everything")},
        {tr("Page Up, Page Down"), tr("Scroll the legend")},
        {tr("Esc"), tr("Give up what is asked, take the reading mark away")}}},
      {tr("On a chart or a section"),
       {{"+, -", tr("Zoom in, zoom out")},
        {tr("Arrows"), tr("Move what is seen")},
        {tr("Ctrl+Left, Ctrl+Right"), tr("Move the reading mark")},
        {tr("Enter"), tr("Give the date at the reading mark, where one is asked for")},
        {tr("Home"), tr("Show everything")},
        {tr("Page Up, Page Down"), tr("Scroll charts below each other")}}},
      {tr("In the 3D view"),
       {{tr("Arrows"), tr("Turn it; with Shift, move it")},
        {"+, -", tr("Zoom in, zoom out")},
        {tr("Home"), tr("Show everything")}}},
      {tr("In a grid that is edited"),
       {{"M", tr("Move the map")},
        {"B, L, P, F", tr("Paint with a brush, along a line, an area, what hangs together")},
        {"R, A", tr("Select a rectangle, an area")},
        {"[, ]", tr("A smaller, a larger brush")}}},
      {tr("Where steps of time are played"), {{tr("Space"), tr("Play, pause")}}},
      {tr("In a library"), {{"F2", tr("To the name of the entry")}, {tr("Del"), tr("Delete the entry")}}},
      {tr("In the text of the setup"),
       {{"Ctrl+.", tr("Fold the section around the cursor, or open it")},
        {tr("Enter, Shift+Enter"), tr("While finding: to the next, to the one before")},
        {tr("Esc"), tr("While finding: back to the text")}}},
      {tr("In a log"),
       {{tr("Home, End"), tr("To the first line, to the last one")},
        {"Ctrl+A, Ctrl+C", tr("Choose all lines, copy the chosen ones")}}},
  };
}

KeysDialog::KeysDialog(const std::vector<KeyRow>& commands, QWidget* parent) : QDialog(parent) {
  setWindowTitle(tr("Keys"));
  const Theme& theme = Theme::Get();
  QString html;
  const auto add = [&html](const KeyGroup& group) {
    html += "<h3>" + group.place.toHtmlEscaped() + "</h3><table>";
    for (const KeyRow& row : group.rows)
      html += QString("<tr><td>%1&nbsp;&nbsp;</td><td>%2</td></tr>")
                  .arg(row.keys.toHtmlEscaped(), row.what.toHtmlEscaped());
    html += "</table>";
  };
  add({tr("Everywhere"), commands});
  for (const KeyGroup& group : KeysOfParts()) add(group);
  auto* list = new QTextBrowser;
  list->setAccessibleName(windowTitle());
  list->setHtml(html);
  auto* buttons = new QDialogButtonBox(QDialogButtonBox::Close);
  connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
  auto* column = new QVBoxLayout(this);
  column->addWidget(list);
  column->addWidget(buttons);
  resize(theme.Scaled(640), theme.Scaled(560));
}

}  // namespace tervane
