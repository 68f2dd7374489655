// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/page_form.h"

#include <algorithm>
#include <array>
#include <charconv>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "forms/plots.h"
#include "forms/report_file.h"
#include "forms/table_form.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

std::string_view NameOf(ControlKind kind) {
  constexpr std::array<std::string_view, 25> names{
      "check",  "radio", "choice", "text",    "long text", "integer", "number",  "date",      "file",
      "color",  "label", "button", "table",   "shown",     "notice",  "view",    "text file", "browser",
      "report", "map",   "chart",  "section", "depths",    "group",   "sub-form"};
  return names[static_cast<std::size_t>(kind)];
}

int Control::Option() const {
  const std::string value = Text();
  int number = -1;
  const auto result = std::from_chars(value.data(), value.data() + value.size(), number);
  if (result.ec != std::errc()) return -1;
  if (!optionValues.empty()) {
    const auto found = std::ranges::find(optionValues, number);
    return found == optionValues.end() ? -1 : static_cast<int>(found - optionValues.begin());
  }
  return number >= 0 && number < static_cast<int>(Options().size()) ? number : -1;
}

bool Control::IsOptionEnabled(int option) const {
  const std::string value = OptionValue(option);
  return std::ranges::all_of(optionRules, [&](const auto& rule) {
    return std::to_string(rule.first) != value || rule.second.Holds(*pageNode);
  });
}

std::string Control::OptionValue(int option) const {
  const bool isTold = option >= 0 && option < static_cast<int>(optionValues.size());
  return std::to_string(isTold ? optionValues[static_cast<std::size_t>(option)] : option);
}

namespace {

std::string EnterInt(const std::string& typed, const std::function<void(int)>& set) {
  int number = 0;
  std::string expected = EnterValue(number, typed);
  if (expected.empty()) set(number);
  return expected;
}

Control& BindColor(Control& control, std::function<unsigned()> get, std::function<void(unsigned)> set) {
  // A default of one part is none of the colour.
  control.isOfKey = false;
  control.text = [get = std::move(get)] { return fmt::format("#{:06x}", get() & 0xffffff); };
  control.enter = [set = std::move(set)](const std::string& typed) -> std::string {
    const std::string_view digits = Trimmed(typed);
    const std::size_t first = digits.starts_with('#') ? 1 : 0;
    unsigned color = 0;
    const auto result = std::from_chars(digits.data() + first, digits.data() + digits.size(), color, 16);
    if (digits.size() != first + 6 || result.ec != std::errc() || result.ptr != digits.data() + digits.size())
      return "a colour like #1f5fa8 was expected";
    set(color);
    return {};
  };
  return control;
}

}  // namespace

PageForm::PageForm(CYbSEKvfBase& node, std::shared_ptr<BoundKeys> keys) : node_(node), keys_(std::move(keys)) {
  keys_->Add(node);
}

Control& PageForm::Add(ControlKind kind, std::string label) {
  Control& control = *controls_.emplace_back(std::make_unique<Control>());
  control.kind = kind;
  control.label = std::move(label);
  control.node = control.pageNode = &node_;
  return control;
}

Control& PageForm::AddBound(ControlKind kind, std::string label, const void* member) {
  Control& control = Add(kind, std::move(label));
  const BoundKeys::Place* place = keys_->Find(member);
  if (!place) return control;
  control.node = place->node;
  control.key = place->key;
  control.isOfKey = true;
  control.unit = place->facts.unit;
  control.itemType = place->facts.itemType;
  std::vector<std::string> options;
  for (const KeyChoice& choice : place->facts.choices) {
    if (!choice.isOffered) continue;
    options.emplace_back(choice.text);
    control.optionValues.push_back(choice.value);
  }
  control.options = [options = std::move(options)] { return options; };
  return control;
}

Control& PageForm::Check(std::string label, int& flag) {
  Control& control = AddBound(ControlKind::Check, std::move(label), &flag);
  control.text = [&flag] { return std::string(flag ? "1" : "0"); };
  control.enter = [&flag](const std::string& typed) {
    flag = typed == "1";
    return std::string();
  };
  return control;
}

Control& PageForm::Check(std::string label, bool& flag) {
  Control& control = AddBound(ControlKind::Check, std::move(label), &flag);
  control.text = [&flag] { return std::string(flag ? "1" : "0"); };
  control.enter = [&flag](const std::string& typed) {
    flag = typed == "1";
    return std::string();
  };
  return control;
}

Control& PageForm::Radio(std::string label, int& value, std::vector<std::string> options) {
  Control& control = Choice(std::move(label), value, std::move(options));
  control.kind = ControlKind::Radio;
  return control;
}

Control& PageForm::Choice(std::string label, int& value, std::vector<std::string> options) {
  Control& control = AddBound(ControlKind::Choice, std::move(label), &value);
  if (!options.empty()) {
    control.optionValues.clear();
    control.options = [options = std::move(options)] { return options; };
  }
  control.text = [&value] { return std::to_string(value); };
  control.enter = [&value](const std::string& typed) { return EnterValue(value, typed); };
  return control;
}

Control& PageForm::Choice(std::string label, std::function<int()> get, std::function<void(int)> set,
                          std::function<std::vector<std::string>()> options) {
  Control& control = Add(ControlKind::Choice, std::move(label));
  control.options = std::move(options);
  control.text = [get = std::move(get)] { return std::to_string(get()); };
  control.enter = [set = std::move(set)](const std::string& typed) { return EnterInt(typed, set); };
  return control;
}

Control& PageForm::Text(std::string label, std::string& value) {
  Control& control = AddBound(ControlKind::Text, std::move(label), &value);
  control.text = [&value] { return value; };
  control.enter = [&value](const std::string& typed) { return EnterValue(value, typed); };
  return control;
}

Control& PageForm::Text(std::string label, std::function<std::string()> get,
                        std::function<void(const std::string&)> set) {
  Control& control = Add(ControlKind::Text, std::move(label));
  control.text = std::move(get);
  control.enter = [set = std::move(set)](const std::string& typed) {
    std::string value;
    std::string expected = EnterValue(value, typed);
    if (expected.empty()) set(value);
    return expected;
  };
  return control;
}

Control& PageForm::ReadOnlyText(std::string label, std::function<std::string()> get) {
  Control& control = Add(ControlKind::Text, std::move(label));
  control.text = std::move(get);
  return control;
}

Control& PageForm::LongText(std::string label, std::string& value) {
  Control& control = Text(std::move(label), value);
  control.kind = ControlKind::LongText;
  return control;
}

Control& PageForm::Integer(std::string label, int& value) {
  Control& control = AddBound(ControlKind::Integer, std::move(label), &value);
  control.text = [&value] { return std::to_string(value); };
  control.enter = [&value](const std::string& typed) { return EnterValue(value, typed); };
  return control;
}

Control& PageForm::Integer(std::string label, std::function<int()> get, std::function<void(int)> set) {
  Control& control = Add(ControlKind::Integer, std::move(label));
  control.text = [get = std::move(get)] { return std::to_string(get()); };
  control.enter = [set = std::move(set)](const std::string& typed) { return EnterInt(typed, set); };
  return control;
}

template <class Real>
Control& PageForm::AddNumber(std::string label, Real& value, std::string format) {
  Control& control = AddBound(ControlKind::Number, std::move(label), &value);
  control.text = [&value, &control, format = std::move(format)] {
    return ShownNumber(value, control.NumberUnit(), format);
  };
  control.enter = [&value, &control](const std::string& typed) {
    return EnterNumber(value, typed, control.NumberUnit());
  };
  return control;
}

Control& PageForm::Number(std::string label, float& value, std::string format) {
  return AddNumber(std::move(label), value, std::move(format));
}

Control& PageForm::Number(std::string label, double& value, std::string format) {
  return AddNumber(std::move(label), value, std::move(format));
}

Control& PageForm::Percent(std::string label, float& value) {
  Control& control = AddBound(ControlKind::Number, std::move(label), &value);
  control.unit = "%";
  control.text = [&value, &control] {
    const double percent = static_cast<double>(value) * 100;
    return ShownNumber(percent, control.NumberUnit(), "%.6g");
  };
  control.enter = [&value, &control](const std::string& typed) {
    double percent = 0;
    std::string expected = EnterNumber(percent, typed, control.NumberUnit());
    if (expected.empty()) value = static_cast<float>(percent / 100);
    return expected;
  };
  return control;
}

Control& PageForm::Color(std::string label, int& red, int& green, int& blue) {
  const auto part = [](int value) { return static_cast<unsigned>(std::clamp(value, 0, 255)); };
  return BindColor(
      AddBound(ControlKind::Color, std::move(label), &red),
      [&red, &green, &blue, part] { return part(red) << 16 | part(green) << 8 | part(blue); },
      [&red, &green, &blue](unsigned color) {
        red = static_cast<int>(color >> 16 & 0xff);
        green = static_cast<int>(color >> 8 & 0xff);
        blue = static_cast<int>(color & 0xff);
      });
}

Control& PageForm::Color(std::string label, int& blueGreenRed) {
  const auto turned = [](unsigned color) { return (color & 0xff) << 16 | (color & 0xff00) | (color >> 16 & 0xff); };
  return BindColor(
      AddBound(ControlKind::Color, std::move(label), &blueGreenRed),
      [&blueGreenRed, turned] { return turned(static_cast<unsigned>(blueGreenRed)); },
      [&blueGreenRed, turned](unsigned color) { blueGreenRed = static_cast<int>(turned(color)); });
}

Control& PageForm::Date(std::string label, CYbDateTime& value) {
  Control& control = Date(
      std::move(label), [&value] { return value; }, [&value](const CYbDateTime& date) { value = date; });
  if (const BoundKeys::Place* place = keys_->Find(&value)) {
    control.node = place->node;
    control.key = place->key;
    control.isOfKey = true;
  }
  return control;
}

Control& PageForm::Date(std::string label, std::function<CYbDateTime()> get,
                        std::function<void(const CYbDateTime&)> set) {
  Control& control = Add(ControlKind::Date, std::move(label));
  control.text = [get = std::move(get)] { return get().Format(kDateFormat); };
  control.enter = [set = std::move(set)](const std::string& typed) {
    CYbDateTime date;
    std::string expected = EnterValue(date, typed);
    if (expected.empty()) set(date);
    return expected;
  };
  return control;
}

Control& PageForm::File(std::string label, FileName& value) {
  Control& control = AddBound(ControlKind::File, std::move(label), &value);
  control.text = [&value] { return value.Text(); };
  control.enter = [&value, this](const std::string& typed) { return EnterValue(value, typed, &node_); };
  return control;
}

Control& PageForm::Label(std::string text) { return Add(ControlKind::Label, std::move(text)); }

Control& PageForm::Button(std::string label, std::function<void()> press) {
  Control& control = Add(ControlKind::Button, std::move(label));
  control.press = std::move(press);
  return control;
}

Control& PageForm::Choice(std::string label, std::function<int()> get, std::function<void(int)> set,
                          std::vector<std::string> options) {
  return Choice(std::move(label), std::move(get), std::move(set), [options = std::move(options)] { return options; });
}

Control& PageForm::Shown(std::string label, std::function<std::string()> text) {
  Control& control = Add(ControlKind::Shown, std::move(label));
  control.text = std::move(text);
  return control;
}

Control& PageForm::Notice(std::function<std::string()> text) {
  Control& control = Add(ControlKind::Notice, {});
  control.text = std::move(text);
  return control;
}

Control& PageForm::TextFile(std::function<std::string()> path) {
  Control& control = Add(ControlKind::TextFile, {});
  control.text = std::move(path);
  return control;
}

Control& PageForm::TextView(std::string label, std::function<std::string()> text) {
  Control& control = Add(ControlKind::TextView, std::move(label));
  control.text = std::move(text);
  return control;
}

Control& PageForm::Browser(std::function<std::string()> page) {
  Control& control = Add(ControlKind::Browser, {});
  control.text = std::move(page);
  return control;
}

Control& PageForm::Report(std::function<std::string()> path) {
  Control& control = Add(ControlKind::Report, {});
  control.text = std::move(path);
  return control;
}

Control& PageForm::Table(std::shared_ptr<TableForm> table) {
  Control& control = Add(ControlKind::Table, {});
  table->SetNode(&node_);
  control.table = std::move(table);
  return control;
}

Control& PageForm::Map(std::function<MapContent()> content) {
  Control& control = Add(ControlKind::Map, {});
  control.map = std::move(content);
  return control;
}

Control& PageForm::Chart(std::function<SeriesContent()> content) {
  Control& control = Add(ControlKind::Chart, {});
  control.chart = std::move(content);
  return control;
}

Control& PageForm::Section(std::function<SectionContent()> content) {
  Control& control = Add(ControlKind::Section, {});
  control.section = std::move(content);
  return control;
}

Control& PageForm::Depths(std::function<DepthContent()> content) {
  Control& control = Add(ControlKind::Depths, {});
  control.depths = std::move(content);
  return control;
}

PageForm& PageForm::Group(std::string title, Condition shownWhen) {
  Control& control = Add(ControlKind::Group, std::move(title));
  control.group = std::make_shared<PageForm>(node_, keys_);
  control.ShownWhen(std::move(shownWhen));
  return *control.group;
}

PageForm& PageForm::GroupBeside(std::string title) {
  PageForm& group = Group(std::move(title));
  controls_.back()->Beside();
  return group;
}

Control& PageForm::SubForms(std::vector<std::shared_ptr<PageForm>> forms, std::function<int()> current) {
  Control& control = Add(ControlKind::SubForms, {});
  control.subForms = std::move(forms);
  control.currentSubForm = std::move(current);
  return control;
}

void PageForm::ForEach(const std::function<void(Control&)>& visit) {
  for (const auto& control : controls_) {
    visit(*control);
    if (control->group) control->group->ForEach(visit);
    for (const auto& form : control->subForms) form->ForEach(visit);
  }
}

void PageForm::SetDisplayUnits(const DisplayUnits* units) {
  ForEach([units](Control& control) {
    control.displayUnits = units;
    if (control.table) control.table->SetDisplayUnits(units);
  });
}

void PageForm::Follow() {
  ForEach([](Control& control) {
    if (control.table) control.table->Follow();
  });
}

std::string SummaryOf(const Control& control) {
  switch (control.kind) {
    case ControlKind::Map:
      return Summary(Finished(control.map));
    case ControlKind::Chart:
      return Summary(Finished(control.chart));
    case ControlKind::Section:
      return Summary(Finished(control.section));
    case ControlKind::Depths:
      return Summary(control.depths());
    case ControlKind::Report:
      return Summary(ReadReport(control.Text()));
    default:
      return {};
  }
}

namespace {

std::string ShownValue(const Control& control) {
  switch (control.kind) {
    case ControlKind::Check:
      return control.Text() == "1" ? " on" : " off";
    case ControlKind::Radio:
    case ControlKind::Choice: {
      std::vector<std::string> options = control.Options();
      const int chosen = control.Option();
      // A list without options has nothing to choose.
      std::string shown = options.empty() ? std::string()
                          : chosen >= 0   ? options[static_cast<std::size_t>(chosen)]
                                          : control.Text() + " (not in the list)";
      for (std::size_t i = 0; i < options.size(); ++i)
        if (!control.IsOptionEnabled(static_cast<int>(i))) options[i] += " (disabled)";
      return Replaced(fmt::format(" = {} of [{}]", shown, fmt::join(options, " | ")), "\n", " ");
    }
    case ControlKind::Map:
    case ControlKind::Chart:
    case ControlKind::Section:
    case ControlKind::Depths:
    case ControlKind::Report:
      return " = " + Replaced(SummaryOf(control), "\n", "\\n");
    case ControlKind::Label:
    case ControlKind::Button:
    case ControlKind::Group:
    case ControlKind::SubForms:
    case ControlKind::Table:
      return {};
    default:
      return fmt::format(" = {}", Replaced(control.Text(), "\n", "\\n"));
  }
}

/// What a reader sees of a page of HTML, without its form.
std::string TextOfHtml(std::string_view html) {
  std::string text;
  const std::size_t body = html.find("<body");
  if (body != std::string_view::npos) html.remove_prefix(body);
  bool isTag = false;
  for (const char c : html) {
    if (c == '<') isTag = true;
    if (!isTag) text += c;
    if (c == '>') isTag = false;
  }
  constexpr std::pair<std::string_view, std::string_view> kNames[] = {
      {"&lt;", "<"}, {"&gt;", ">"}, {"&quot;", "\""}, {"&nbsp;", " "}, {"&amp;", "&"}};
  for (const auto& [name, sign] : kNames) text = Replaced(text, name, sign);
  return text;
}

/// A text of several lines as it is read, each with its indent.
std::string Lines(std::string_view text, const std::string& indent) {
  std::string lines;
  while (!text.empty()) {
    const std::size_t end = text.find('\n');
    std::string_view line = text.substr(0, end);
    while (!line.empty() && (line.back() == '\r' || line.back() == ' ')) line.remove_suffix(1);
    if (!line.empty()) lines += fmt::format("{}{}\n", indent, line);
    text.remove_prefix(end == std::string_view::npos ? text.size() : end + 1);
  }
  return lines;
}

bool IsTextOfLines(const Control& control) {
  return (control.kind == ControlKind::TextView || control.kind == ControlKind::Browser) &&
         control.Text().find('\n') != std::string::npos;
}

}  // namespace

std::string FormText(PageForm& form, int level) {
  std::string text;
  for (const auto& control : form.Controls()) {
    const std::string indent(2 * static_cast<std::size_t>(level), ' ');
    const std::string unit = control->UnitText();
    text += fmt::format("{}{} \"{}\"{}{}{}{}\n", indent, NameOf(control->kind), Replaced(control->label, "\n", " "),
                        IsTextOfLines(*control) ? "" : ShownValue(*control), unit.empty() ? "" : " " + unit,
                        control->IsEnabled() ? "" : " disabled", control->IsShown() ? "" : " hidden");
    if (IsTextOfLines(*control))
      text +=
          Lines(control->kind == ControlKind::Browser ? TextOfHtml(control->Text()) : control->Text(), indent + "  ");
    if (control->group) text += FormText(*control->group, level + 1);
    if (control->table) text += TableText(*control->table, level + 1);
    if (control->kind == ControlKind::SubForms) {
      const int current = control->currentSubForm();
      if (current >= 0 && current < static_cast<int>(control->subForms.size()))
        text += FormText(*control->subForms[static_cast<std::size_t>(current)], level + 1);
    }
  }
  return text;
}

}  // namespace tervane
