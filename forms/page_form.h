// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a page shows, without any toolkit: a list of controls, each with a label, a way to read and write its value, and
// rules that say when it is enabled and shown. A program turns it into widgets, a text, or a test.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "core/condition.h"
#include "core/host.h"
#include "core/node.h"
#include "forms/bound_keys.h"
#include "forms/entry.h"
#include "platform/dates.h"

namespace tervane {

class CData2DShpFile;
class DataFileNode;
class PageForm;
class TableForm;
struct DepthContent;
struct MapContent;
struct SectionContent;
struct SeriesContent;

/// Bits of a change that views are told of.
enum UpdateHint : int {
  kViewOnly = 0,  ///< Only what is shown is another: the document is as it was.
  kDataChanged = 1,
  kItemAdded = 2,
  kItemDeleted = 4,
  kTreeRebuilt = 8,
  kOrderChanged = 16,
  kRefreshPlots = 64,
};

enum class ControlKind {
  Check,
  Radio,   ///< A group of options of which one holds.
  Choice,  ///< The same as a drop list.
  Text,
  LongText,  ///< Several lines.
  Integer,
  Number,
  Date,
  File,   ///< A file name with a button that browses.
  Color,  ///< "#rrggbb", with a button that shows it and asks for another.
  Label,  ///< Text alone.
  Button,
  Table,
  Shown,     ///< A value that is only shown.
  Notice,    ///< A sentence or two that are only read; no place is taken while there is nothing to say.
  TextView,  ///< A text that is only read.
  TextFile,  ///< The text of a file, which is read as far as the user looks.
  Browser,   ///< A page in HTML.
  Report,    ///< A file in HTML, which may also be seen in the user's browser.
  Map,       ///< Grids, shapes and points from above.
  Chart,     ///< Curves over time.
  Section,   ///< A cut through the ground along a line of a map.
  Depths,    ///< Columns of the ground over depth.
  Group,     ///< A frame with a title around further controls.
  SubForms,  ///< A place at which one of several forms stands.
};
/// A map, chart, section or columns, which stands beside the form.
constexpr bool IsPlot(ControlKind kind) {
  return kind == ControlKind::Map || kind == ControlKind::Chart || kind == ControlKind::Section ||
         kind == ControlKind::Depths;
}

/// A condition of a page, over what it knows.
inline Condition Sentence(std::string sentence, std::function<bool()> rule) {
  return Condition::Sentence(std::move(sentence), [rule = std::move(rule)](const CYbSEKvfBase&) { return rule(); });
}

/// One control. Values travel as text, in the form in which they are shown and typed; options as their number.
class Control {
 public:
  ControlKind kind = ControlKind::Label;
  std::string label;
  std::string toolTip;
  std::string unit;                                   ///< A fixed unit; `UnitText` tells what is shown.
  int itemType = 0;                                   ///< The number is a quantity of that item type; 0 for none.
  std::function<int()> itemTypeBy;                    ///< Asked instead, where other values decide it.
  const DisplayUnits* displayUnits = nullptr;         ///< The user's units; null for base units.
  std::function<std::vector<std::string>()> options;  ///< Of a radio group or drop list.
  std::function<std::vector<std::string>()> offers;   ///< Of a text: what is offered; any other may be typed.
  std::vector<int> optionValues;           ///< What the node stores for each; empty for the options' numbers.
  std::string key;                         ///< Of the node, so that a finding leads here.
  bool isOfKey = false;                    ///< The value is the key's as it stands, not made of it by functions.
  const CYbSEKvfBase* node = nullptr;      ///< That holds the key; null where it changes.
  const CYbSEKvfBase* pageNode = nullptr;  ///< Of the form, by whose place in the tree the rules are asked.
  Host::FileQuestion fileQuestion;         ///< Of a file name.
  std::string folder;                      ///< Of a page of a browser: where what it names lies.
  std::function<std::string()> text;       ///< The value as shown; of a check "1" or "0", of options the number from 0.
  /// Takes a typed value; gives what was expected when it is none, and then changes nothing.
  std::function<std::string(const std::string&)> enter;
  std::function<void()> press;  ///< Of a button.
  /// Of a file: asks for one and what is chosen in it. False when the user gave up.
  std::function<bool(Host&)> browse;
  /// What a taken value brings with it; gives further hints of the change.
  std::function<int()> then;
  Condition enabledWhen, shownWhen;
  /// What the value belongs to, where that changes: what was refused is another one's then.
  std::function<std::uintptr_t()> subject;
  bool beside = false;  ///< Stands in the same row as the control before it.
  int hint = kDataChanged;
  bool revalidates = false;         ///< Other nodes' rules depend on the value.
  bool revalidatesLater = false;    ///< The same, at the next update of the views.
  std::shared_ptr<PageForm> group;  ///< The controls of a group.
  std::vector<std::shared_ptr<PageForm>> subForms;
  std::function<int()> currentSubForm;  ///< Which one is shown.
  std::shared_ptr<TableForm> table;
  std::function<MapContent()> map;       ///< What a map shows now.
  std::function<SeriesContent()> chart;  ///< What a chart shows now.
  std::function<SectionContent()> section;
  std::function<DepthContent()> depths;
  std::vector<std::pair<int, Condition>> optionRules;  ///< Of options by their value: when one may be chosen.

  bool IsOptionEnabled(int option) const;
  bool IsEnabled() const { return enabledWhen.Holds(*pageNode); }
  bool IsShown() const { return shownWhen.Holds(*pageNode); }
  std::string Text() const { return text ? text() : std::string(); }
  std::vector<std::string> Options() const { return options ? options() : std::vector<std::string>(); }
  FieldUnit NumberUnit() const { return {unit, itemTypeBy ? itemTypeBy() : itemType, displayUnits}; }
  /// The unit behind the value, as the user's choice is now; empty for none.
  std::string UnitText() const { return itemType ? NumberUnit().Text() : unit; }
  /// The units that a user may choose to see the quantity in; empty where there is nothing to choose.
  std::vector<UnitChoice> UnitChoices() const { return NumberUnit().Choices(); }
  /// The number of the chosen option, or -1 when the value is none of them.
  int Option() const;
  /// The value to enter for an option.
  std::string OptionValue(int option) const;

  // ---- Said behind the making of a control

  Control& EnabledWhen(Condition rule) { return enabledWhen = std::move(rule), *this; }
  Control& ShownWhen(Condition rule) { return shownWhen = std::move(rule), *this; }
  /// The same where no condition over keys fits: a sentence that is true when the function says so.
  Control& EnabledWhen(std::string sentence, std::function<bool()> rule) {
    return EnabledWhen(Sentence(std::move(sentence), std::move(rule)));
  }
  Control& ShownWhen(std::string sentence, std::function<bool()> rule) {
    return ShownWhen(Sentence(std::move(sentence), std::move(rule)));
  }
  /// The option of that value may be chosen only then.
  Control& OptionEnabledWhen(int value, Condition rule) {
    return optionRules.emplace_back(value, std::move(rule)), *this;
  }
  Control& Unit(std::string text_) { return unit = std::move(text_), *this; }
  /// The node stores the base unit of that item type; the number is shown and typed in the user's unit.
  Control& Quantity(int itemType_) { return itemType = itemType_, *this; }
  /// The same where other values decide it.
  Control& QuantityBy(std::function<int()> itemType_) { return itemTypeBy = std::move(itemType_), *this; }
  Control& Beside() { return beside = true, *this; }
  /// The key of a control over functions, so that findings and search lead to it; of another node than the page's.
  Control& Key(std::string name) { return key = std::move(name), *this; }
  Control& Of(const CYbSEKvfBase& owner, std::string name) { return node = &owner, Key(std::move(name)); }
  Control& Folder(std::string path) { return folder = std::move(path), *this; }
  /// Of a map, chart or section: stands above it.
  Control& Caption(std::string text_) { return label = std::move(text_), *this; }
  Control& ToolTip(std::string text_) { return toolTip = std::move(text_), *this; }
  Control& Revalidates() { return revalidates = true, *this; }
  Control& RevalidatesLater() { return revalidatesLater = true, *this; }
  Control& Hint(int hint_) { return hint = hint_, *this; }
  Control& Then(std::function<int()> then_) { return then = std::move(then_), *this; }
  /// Texts that are offered for a text; any other may be typed.
  Control& Offers(std::function<std::vector<std::string>()> texts) { return offers = std::move(texts), *this; }
  Control& Filter(std::string filter) { return fileQuestion.filter = std::move(filter), *this; }
  Control& DefaultExtension(std::string extension) {
    return fileQuestion.defaultExtension = std::move(extension), *this;
  }
};

/// The controls of a page, a group or a sub-form, in the order in which they stand and are reached by the keyboard.
class PageForm {
 public:
  explicit PageForm(CYbSEKvfBase& node) : PageForm(node, std::make_shared<BoundKeys>()) {}
  /// A part of a page, which shares what the page knows of keys.
  PageForm(CYbSEKvfBase& node, std::shared_ptr<BoundKeys> keys);

  /// A flag of the node, 0 or 1.
  Control& Check(std::string label, int& flag);
  Control& Check(std::string label, bool& flag);
  /// A choice of those that the key's declaration offers, or of others.
  Control& Radio(std::string label, int& value, std::vector<std::string> options = {});
  Control& Choice(std::string label, int& value, std::vector<std::string> options = {});
  /// The same for a value that is not a member.
  Control& Choice(std::string label, std::function<int()> get, std::function<void(int)> set,
                  std::vector<std::string> options);
  /// The same with options that change.
  Control& Choice(std::string label, std::function<int()> get, std::function<void(int)> set,
                  std::function<std::vector<std::string>()> options);
  Control& Text(std::string label, std::string& value);
  Control& Text(std::string label, std::function<std::string()> get, std::function<void(const std::string&)> set);
  /// A text to read, select and copy in its field, with its end in view: the name of a file.
  Control& ReadOnlyText(std::string label, std::function<std::string()> get);
  Control& LongText(std::string label, std::string& value);
  Control& Integer(std::string label, int& value);
  Control& Integer(std::string label, std::function<int()> get, std::function<void(int)> set);
  /// A number as it is stored, unless `Quantity` is said behind it. `format` is a printf format of one double, such as
  /// "%.1e"; empty for the shortest form.
  Control& Number(std::string label, float& value, std::string format = {});
  Control& Number(std::string label, double& value, std::string format = {});
  /// A fraction that is shown and typed times 100.
  Control& Percent(std::string label, float& value);
  /// A colour that the node keeps as three parts from 0 to 255, or as one number with red in its lowest byte.
  Control& Color(std::string label, int& red, int& green, int& blue);
  Control& Color(std::string label, int& blueGreenRed);
  Control& Date(std::string label, CYbDateTime& value);
  Control& Date(std::string label, std::function<CYbDateTime()> get, std::function<void(const CYbDateTime&)> set);
  Control& File(std::string label, FileName& value);
  /// A data file with the item that is chosen in it, by the request of its node.
  Control& DataFile(std::string label, DataFileNode& file);
  /// A shape file with the attribute that is chosen in it.
  Control& ShapeFile(std::string label, CData2DShpFile& file);
  Control& Label(std::string text);
  Control& Button(std::string label, std::function<void()> press);
  Control& Notice(std::function<std::string()> text);
  Control& TextView(std::string label, std::function<std::string()> text);
  /// The text of the file at a path.
  Control& TextFile(std::function<std::string()> path);
  Control& Browser(std::function<std::string()> page);
  /// The HTML file at a path, with all that it names beside it; what is missing or cannot be shown is told in words.
  Control& Report(std::function<std::string()> path);
  /// A value that is only shown.
  Control& Shown(std::string label, std::function<std::string()> text);
  Control& Table(std::shared_ptr<TableForm> table);
  /// What it shows is asked for anew whenever the page is brought in step with its node, so it must be at hand: grids
  /// and shapes are shared, not made for each call, and what is not there yet is awaited.
  Control& Map(std::function<MapContent()> content);
  /// The same for a chart.
  Control& Chart(std::function<SeriesContent()> content);
  /// The same for a section.
  Control& Section(std::function<SectionContent()> content);
  /// Columns over depth, asked for in the same way.
  Control& Depths(std::function<DepthContent()> content);
  /// A frame with a title; the controls are added to the form that it holds.
  PageForm& Group(std::string title, Condition shownWhen = {});
  /// The same, in one row with the group before it.
  PageForm& GroupBeside(std::string title);
  /// A form for `SubForms` over this page's node or another one.
  std::shared_ptr<PageForm> NewSubForm(CYbSEKvfBase& node) { return std::make_shared<PageForm>(node, keys_); }
  Control& SubForms(std::vector<std::shared_ptr<PageForm>> forms, std::function<int()> current);

  /// A control of that kind, whose value the caller binds.
  Control& Bare(ControlKind kind, std::string label) { return Add(kind, std::move(label)); }

  CYbSEKvfBase& Node() const { return node_; }
  BoundKeys& Keys() const { return *keys_; }
  const std::vector<std::unique_ptr<Control>>& Controls() const { return controls_; }
  std::vector<std::unique_ptr<Control>>& Controls() { return controls_; }

  /// Calls `visit` for all controls, also of groups and sub-forms.
  void ForEach(const std::function<void(Control&)>& visit);

  /// Shows and takes quantities in these units from now on, also in groups, sub-forms and tables; they are asked each
  /// time and must outlive the form. Null for base units.
  void SetDisplayUnits(const DisplayUnits* units);
  /// Lets the tables ask their rules anew.
  void Follow();

  /// How dates are shown and typed.
  static constexpr std::string_view kDateFormat = "%Y/%m/%d  %H:%M";

  /// What is put right when the page is shown to a user: a choice of what is no longer there. `mend` is true when it
  /// changed something, which is then a step to undo of that name.
  void MendWhenShown(std::string action, std::function<bool()> mend) {
    mends_.push_back({std::move(action), std::move(mend)});
  }
  /// The same for what follows from what the user did before: a part of the latest step, and no change of his where
  /// there is none.
  void FollowWhenShown(std::function<bool()> mend) { mends_.push_back({{}, std::move(mend)}); }
  struct Mend {
    std::string action;  ///< Empty for what follows from the latest step.
    std::function<bool()> mend;
  };
  const std::vector<Mend>& Mends() const { return mends_; }

 private:
  Control& Add(ControlKind kind, std::string label);
  /// A control of the key that is bound to this member.
  Control& AddBound(ControlKind kind, std::string label, const void* member);
  template <class Real>
  Control& AddNumber(std::string label, Real& value, std::string format);

  CYbSEKvfBase& node_;
  std::vector<std::unique_ptr<Control>> controls_;
  std::shared_ptr<BoundKeys> keys_;
  std::vector<Mend> mends_;
};

/// "check", "long text"
std::string_view NameOf(ControlKind kind);
/// What a control that holds no value shows, in short: "grid 142x97, 29 shapes"; empty for other kinds.
std::string SummaryOf(const Control& control);

/// A form as text, one line for each control in the order of the page: kind, label in double quotes, value, unit, and
/// `disabled` or `hidden` where it is so.
std::string FormText(PageForm& form, int level = 0);

}  // namespace tervane
