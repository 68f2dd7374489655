// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/library_editor.h"

#include <algorithm>
#include <cmath>

#include <fmt/format.h>

#include "data/csv_reader.h"
#include "forms/table_of.h"
#include "pages/library_views.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

constexpr std::chrono::milliseconds kQuick(1000);

std::string Capital(std::string_view word) {
  std::string text(word);
  if (!text.empty() && text[0] >= 'a' && text[0] <= 'z') text[0] = static_cast<char>(text[0] - 'a' + 'A');
  return text;
}

}  // namespace

/// Stands for the library where pages speak of a node: it bears the findings.
class LibraryEditor::Node : public CTvnKvfBase {
 public:
  explicit Node(const LibraryKind& kind) : CTvnKvfBase(Capital(kind.entryName), std::string(kind.entryName), nullptr) {}

  std::vector<Finding> found;

  int ValidateData() override {
    for (const Finding& finding : found) AddFinding(finding);
    return found.empty() ? 1 : 0;
  }
};

/// A state to go back to; what it shares with others costs nothing.
class LibraryEditor::StateStep : public EditStep {
 public:
  StateStep(LibraryEditor& editor, State state) : editor_(editor), state_(std::move(state)) {}

  void Swap() override {
    State now = editor_.shadow_;
    editor_.GoTo(state_);
    state_ = std::move(now);
  }
  std::size_t Bytes() const override { return sizeof(*this) + state_.entries.size() * sizeof(state_.entries[0]); }

 private:
  LibraryEditor& editor_;
  State state_;
};

/// The rows of the current entry.
class LibraryEditor::Rows : public RowsOf<LibraryRow> {
 public:
  explicit Rows(LibraryEditor& editor) : editor_(editor) {}

  int Count() const override { return HasEntry() ? static_cast<int>(Values().size()) : 0; }
  LibraryRow& At(int row) const override { return Values()[static_cast<std::size_t>(row - 1)]; }
  bool CanChange() const override { return true; }
  void Add() override {
    if (!HasEntry()) return;
    LibraryRow row;
    // The next row continues the last ones, so that only what differs needs to be typed.
    if (const auto& rows = Values(); !rows.empty()) {
      row.values = rows.back().values;
      row.values[0] += rows.size() > 1 ? std::max(1.0, row.values[0] - rows[rows.size() - 2].values[0]) : 1;
    }
    Values().push_back(std::move(row));
  }
  void Insert(int row) override {
    if (row < 1 || row > Count()) return;
    LibraryRow made;
    made.values = At(row).values;
    Values().insert(Values().begin() + (row - 1), std::move(made));
  }
  void Delete(int row) override {
    if (row >= 1 && row <= Count()) Entry().DeleteRow(static_cast<std::size_t>(row - 1));
  }

 private:
  bool HasEntry() const { return editor_.current_ < editor_.library_.entries.size(); }
  LibraryEntry& Entry() const { return editor_.library_.entries[editor_.current_]; }
  std::vector<LibraryRow>& Values() const { return Entry().rows; }

  LibraryEditor& editor_;
};

class LibraryEditor::Page : public CYbSEDlgBase {
 public:
  Page(LibraryEditor& editor, const PageContext& context) : CYbSEDlgBase(*editor.node_, context), editor_(editor) {}

 protected:
  void Describe(PageForm& form) override {
    const LibraryKind& kind = editor_.Kind();
    const Condition hasEntry =
        Sentence(fmt::format("the library has a {}", kind.entryName), [this] { return Entry() != nullptr; });
    const LibraryView* view = ViewOf(kind);
    for (std::size_t i = 0; i < kind.fields.size(); ++i) {
      if (!kind.fields[i].models.empty()) {
        DescribeNumbers(form, i, hasEntry);
        continue;
      }
      form.Text(
              std::string(kind.fields[i].label),
              [this, i] { return Entry() ? Entry()->fields[i].text : std::string(); },
              [this, i](const std::string& text) {
                if (Entry()) Entry()->fields[i].text = text;
              })
          .ToolTip(std::string(kind.fields[i].toolTip))
          .EnabledWhen(hasEntry);
    }
    if (kind.HasRows()) DescribeRows(form, hasEntry);
    if (view && view->describe) view->describe(form, *this, [this] { return Entry(); });
    if (view && view->map)
      form.Map([this, view] { return view->map(editor_.Content(), editor_.Current()); }).ShownWhen(hasEntry);
    form.Chart([this] {
      SeriesContent none;
      none.message = fmt::format("The library has no {}.", editor_.Kind().entryNames);
      if (!Entry()) return none;
      return ChartOf(editor_.Content(), *Entry());
    });
  }

 private:
  /// The numbers of a field: its model, where there are several, and the parameters of each.
  void DescribeNumbers(PageForm& form, std::size_t field, const Condition& hasEntry) {
    const LibraryField& declared = editor_.Kind().fields[field];
    const bool isNamed = !declared.models.front().name.empty();
    if (isNamed) {
      std::vector<std::string> names;
      for (const LibraryModel& model : declared.models) names.emplace_back(model.name);
      form.Choice(
              std::string(declared.label),
              [this, field, &declared] {
                const LibraryModel* model = Entry() ? ModelOf(declared, Entry()->fields[field].text) : nullptr;
                return model ? static_cast<int>(model - declared.models.data()) : -1;
              },
              [this, field, &declared](int choice) {
                if (Entry() && choice >= 0 && choice < static_cast<int>(declared.models.size()))
                  ChooseModel(declared.models[static_cast<std::size_t>(choice)], Entry()->fields[field]);
              },
              std::move(names))
          .ToolTip(std::string(declared.toolTip))
          .EnabledWhen(hasEntry);
    }
    for (const LibraryModel& model : declared.models)
      for (std::size_t i = 0; i < model.parameters.size(); ++i) {
        const LibraryColumn& parameter = model.parameters[i];
        Control& number =
            form.Bare(ControlKind::Number, isNamed ? fmt::format("{}:", parameter.head) : std::string(declared.label));
        number.Unit(std::string(parameter.unit)).ToolTip(std::string(parameter.toolTip)).EnabledWhen(hasEntry);
        number.text = [this, field, i] {
          const double value = Entry() ? Entry()->Number(field, i) : std::nan("");
          return std::isnan(value) ? std::string() : ShortestNumber(value);
        };
        number.enter = [this, field, i, &model, &parameter](const std::string& typed) -> std::string {
          const auto value = ParseCsvNumber(typed, true);
          if (!value) return "a number was expected";
          std::string wrong = WhyWrong(parameter, *value);
          if (!wrong.empty() || !Entry()) return wrong;
          LibraryText& text = Entry()->fields[field];
          if (text.numbers.size() != model.parameters.size()) ChooseModel(model, text);
          text.numbers[i] = *value;
          return {};
        };
        if (isNamed)
          number.ShownWhen(fmt::format("the model is {}", model.name),
                           [this, field, &model] { return Entry() && Entry()->fields[field].text == model.name; });
      }
  }

  void DescribeRows(PageForm& form, const Condition& hasEntry) {
    const LibraryKind& kind = editor_.Kind();
    auto table = std::make_shared<TableOf<LibraryRow>>(std::make_shared<Rows>(editor_));
    table->ItemName(Capital(kind.rowName), Capital(kind.rowNames));
    table->KeepOrder();
    for (std::size_t i = 0; i < kind.columns.size(); ++i) {
      const LibraryColumn& column = kind.columns[i];
      table
          ->Value(
              std::string(column.head), [i](const LibraryRow& row) { return row.values[i]; },
              [i, &column](LibraryRow& row, double value) {
                std::string wrong = WhyWrong(column, value);
                if (wrong.empty()) row.values[i] = value;
                return wrong;
              })
          .Unit(std::string(column.unit))
          .ToolTip(std::string(column.toolTip))
          .Width(85);
    }
    if (!kind.rowFile.key.empty()) {
      table
          ->Value(
              std::string(kind.rowFile.label),
              [this](const LibraryRow& row) { return FileName(row.file, editor_.Content().folder); },
              [this](LibraryRow& row, const FileName& file) {
                row.file = file.IsEmpty() ? std::string() : StoredPath(file.Absolute(), editor_.Content().folder);
              })
          .ToolTip(std::string(kind.rowFile.toolTip))
          .Width(220);
      table->Value("Item", &LibraryRow::item).Width(60);
    }
    form.Table(table).EnabledWhen(hasEntry);
  }

  LibraryEntry* Entry() const {
    auto& entries = editor_.library_.entries;
    return editor_.current_ < entries.size() ? &entries[editor_.current_] : nullptr;
  }

  LibraryEditor& editor_;
};

LibraryEditor::LibraryEditor(const LibraryKind& kind, std::string path)
    : EditedFile(std::move(path)),
      library_(kind),
      document_(std::make_unique<CYbSEKvfGlobalBase>(std::string(kind.target))),
      node_(std::make_unique<Node>(kind)) {
  Begin();
}

LibraryEditor::~LibraryEditor() = default;

std::string LibraryEditor::Read() {
  Library read(*library_.kind);
  if (std::string problem = ReadLibrary(Path(), read); !problem.empty()) return problem;
  // What was chosen stays chosen, by its name.
  const auto chosen = current_ < library_.entries.size() ? read.Find(library_.entries[current_].Name()) : std::nullopt;
  library_ = std::move(read);
  current_ = chosen.value_or(0);
  source_ = nullptr;
  shadow_ = {};
  shadow_ = saved_ = Now();
  Check();
  return {};
}

// ---- Entries

void LibraryEditor::Choose(std::size_t entry) {
  if (entry >= library_.entries.size()) return;
  current_ = shadow_.current = entry;
  source_ = nullptr;
  Check();
}

void LibraryEditor::Add() {
  Insert(library_.NewEntry(library_.FreeName("New " + std::string(Kind().entryName))), ActionName("Add"));
}

void LibraryEditor::Duplicate() {
  if (current_ >= library_.entries.size()) return;
  LibraryEntry copy = library_.entries[current_];
  copy.fields.front().text = library_.FreeName(copy.Name());
  // What only stands in front of the entry is not its own.
  copy.context.others.clear();
  Insert(std::move(copy), ActionName("Copy"));
}

void LibraryEditor::Insert(LibraryEntry entry, const std::string& action) {
  const std::size_t place = std::min(current_ + 1, library_.entries.size());
  library_.entries.insert(library_.entries.begin() + static_cast<std::ptrdiff_t>(place), std::move(entry));
  current_ = place;
  CommitValue(action);
}

void LibraryEditor::Delete() {
  if (current_ >= library_.entries.size()) return;
  library_.DeleteEntry(current_);
  current_ = std::min(current_, std::max<std::size_t>(library_.entries.size(), 1) - 1);
  CommitValue(ActionName("Delete"));
}

std::string LibraryEditor::ActionName(const char* verb) const {
  return fmt::format("{} {}", verb, Capital(Kind().entryName));
}

bool LibraryEditor::HasFindings(std::size_t entry) const {
  return std::ranges::any_of(findings_, [&](const LibraryFinding& finding) { return finding.entry == entry; });
}

void LibraryEditor::Check() {
  findings_ = FindingsOf(library_);
  node_->found.clear();
  // What is wrong with the entry that is shown comes first.
  for (const bool isShown : {true, false})
    for (const LibraryFinding& finding : findings_) {
      if ((finding.entry == current_) != isShown) continue;
      std::string text = finding.text;
      if (finding.row) text = fmt::format("{} {}: {}", Capital(Kind().rowName), *finding.row + 1, text);
      if (finding.entry && !isShown) {
        const std::string& name = library_.entries[*finding.entry].Name();
        text = fmt::format("{}: {}", name.empty() ? std::to_string(*finding.entry + 1) : name, text);
      }
      node_->found.push_back({finding.severity, Capital(text), {}, {}});
    }
  node_->Validate();
}

std::unique_ptr<CYbSEDlgBase> LibraryEditor::MakePage(Host& host, std::function<void()> changed,
                                                      std::function<void()> soon) {
  PageContext context{document_, host,
                      [this, changed = std::move(changed)](int, const std::string& action, const void* source) {
                        CommitValue(action, source);
                        changed();
                      }};
  context.syncSoon = std::move(soon);
  auto page = std::make_unique<Page>(*this, context);
  page->Initialize();
  return page;
}

// ---- Changes

bool LibraryEditor::State::HoldsSame(const State& other) const {
  return atEnd == other.atEnd &&
         std::ranges::equal(entries, other.entries, [](const auto& a, const auto& b) { return a == b || *a == *b; });
}

LibraryEditor::State LibraryEditor::Now() const {
  State state{{}, library_.atEnd, current_};
  const auto& now = library_.entries;
  const auto& before = shadow_.entries;
  std::size_t first = 0, last = 0;
  const std::size_t most = std::min(now.size(), before.size());
  while (first < most && now[first] == *before[first]) ++first;
  while (last < most - first && now[now.size() - 1 - last] == *before[before.size() - 1 - last]) ++last;
  state.entries.reserve(now.size());
  for (std::size_t i = 0; i < now.size(); ++i) {
    if (i < first)
      state.entries.push_back(before[i]);
    else if (i >= now.size() - last)
      state.entries.push_back(before[i + before.size() - now.size()]);
    else
      state.entries.push_back(std::make_shared<const LibraryEntry>(now[i]));
  }
  return state;
}

void LibraryEditor::CommitValue(const std::string& action, const void* source) {
  if (current_ < library_.entries.size()) library_.entries[current_].SetRefusedAside();
  State now = Now();
  const auto time = std::chrono::steady_clock::now();
  if (!now.HoldsSame(shadow_)) {
    const bool isSame = source && source == source_ && time - latest_ < kQuick && CanUndo() && UndoName() == action;
    if (!isSame) Take(action, std::make_unique<StateStep>(*this, shadow_));
  }
  shadow_ = std::move(now);
  source_ = source;
  latest_ = time;
  Check();
}

void LibraryEditor::GoTo(const State& state) {
  library_.entries.clear();
  for (const auto& entry : state.entries) library_.entries.push_back(*entry);
  library_.atEnd = state.atEnd;
  current_ = state.current;
  shadow_ = state;
  source_ = nullptr;
  Check();
}

bool LibraryEditor::IsModified() const { return !shadow_.HoldsSame(saved_); }

FileResult LibraryEditor::Write(const std::string& path, ProgressPart /*progress*/) {
  return WriteLibrary(path, library_);
}

void LibraryEditor::Saved() {
  saved_ = shadow_;
  source_ = nullptr;
}

}  // namespace tervane
