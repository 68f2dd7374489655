// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Making the tables of pages. One declaration of a column serves showing, editing, copying and pasting:
//
//   auto table = std::make_shared<TableOf<Link>>(Node());
//   table->Value("Branch name", &Link::Branchname).Width(220);
//   table->Value("Chainage", &Link::Chainage).Quantity(kChainage).Format("%.6g");
//   table->Choice("Type", &Link::Type, {"Manual", "Automatic"}).GreyWhen([](Link& link) { return link.IsFixed(); });
//   table->Button("", "...", [this](Link& link) { ChooseFile(link); }).ToolTip("Choose a file").Width(30);
//   form.Table(table);
#pragma once

#include <concepts>
#include <functional>
#include <memory>
#include <string>
#include <type_traits>
#include <utility>
#include <vector>

#include "forms/table_form.h"

namespace tervane {

/// A column while it is made: what is said behind its making. Rules take the row.
template <class Row>
class ColumnOf {
 public:
  /// `control` is the field below a table that the column describes; null for a column of the table.
  ColumnOf(TableColumn& column, std::shared_ptr<RowsOf<Row>> rows, Control* control = nullptr)
      : column_(column), rows_(std::move(rows)), control_(control) {}

  ColumnOf& Width(int width) { return column_.width = width, *this; }
  /// The head goes over so many columns, this one included; the heads of the others are not shown.
  ColumnOf& HeadOver(int columns) { return column_.headSpan = columns, *this; }
  ColumnOf& ToolTip(std::string text) {
    if (control_) control_->ToolTip(text);
    return column_.toolTip = std::move(text), *this;
  }
  ColumnOf& ToolTipOf(auto text) { return column_.cellToolTip = ByRow<std::string>(std::move(text)), *this; }
  /// The rows hold the base unit of that item type; the numbers are shown and typed in the user's unit.
  ColumnOf& Quantity(int itemType) {
    if (control_) control_->Quantity(itemType);
    return column_.itemType = itemType, *this;
  }
  ColumnOf& Unit(std::string unit) {
    if (control_) control_->Unit(unit);
    return column_.unit = std::move(unit), *this;
  }
  /// The key of the rows that a column over functions shows; a column over a member knows it.
  ColumnOf& Key(std::string key) {
    if (control_) control_->Key(key);
    return column_.key = std::move(key), *this;
  }
  ColumnOf& Format(std::string format) { return column_.format = std::move(format), *this; }
  ColumnOf& Hint(int hint) {
    if (control_) control_->Hint(hint);
    return column_.hint = hint, *this;
  }
  ColumnOf& Filter(std::string filter) {
    if (control_) control_->Filter(filter);
    return column_.fileQuestion.filter = std::move(filter), *this;
  }
  ColumnOf& DefaultExtension(std::string extension) {
    if (control_) control_->DefaultExtension(extension);
    return column_.fileQuestion.defaultExtension = std::move(extension), *this;
  }
  /// Texts that are offered for a text, by the row; any other may be typed.
  ColumnOf& Offers(auto texts) {
    if (control_) control_->Offers(control_->options);
    return column_.offers = ByRow<std::vector<std::string>>(std::move(texts)), *this;
  }
  /// What a person sees of the values, where that is not what is typed.
  ColumnOf& ShownAs(auto text) { return column_.shown = ByRow<std::string>(std::move(text)), *this; }
  /// Cells that take nothing stand back on a grey ground.
  ColumnOf& GreyWhen(auto rule) { return column_.readOnly = ByRow<bool>(std::move(rule)), *this; }
  /// Of a button.
  ColumnOf& EnabledWhen(auto rule) {
    column_.readOnly = [enabled = ByRow<bool>(std::move(rule))](int row) { return !enabled(row); };
    return *this;
  }
  /// The column is absent at other times: those behind it take its number.
  ColumnOf& ShownWhen(std::function<bool()> rule) { return column_.shownWhen = std::move(rule), *this; }
  ColumnOf& Icon(std::string name) {
    column_.icon = [name = std::move(name)](int) { return name; };
    return *this;
  }
  ColumnOf& IconOf(auto name) { return column_.icon = ByRow<std::string>(std::move(name)), *this; }
  /// The cells are shown as links.
  ColumnOf& Link(std::function<void(Row&)> press) { return column_.press = ByRow<void>(std::move(press)), *this; }
  /// The control of a field below a table, to say where it stands.
  Control& Field() const { return *control_; }

 private:
  template <class Result, class Rule>
  std::function<Result(int)> ByRow(Rule rule) const {
    return [rows = rows_, rule = std::move(rule)](int row) -> Result { return std::invoke(rule, rows->At(row)); };
  }

  TableColumn& column_;
  std::shared_ptr<RowsOf<Row>> rows_;
  Control* control_;
};

/// What makes columns over rows of one class. `get` is a member of the rows, `&Link::Chainage`, or gives a value or a
/// reference to one. Of a member of nodes the declaration of its key tells quantity, unit and choices. A reference to
/// what is no constant can be changed; so can what has a `set`, which takes the row and the value, and gives nothing,
/// or why the value is refused.
template <class Row>
class ColumnMaker {
 public:
  virtual ~ColumnMaker() = default;

  /// A text, a number, a name of a file, a date, or the check of a bool, by the type of the value. A `CellPlace` or
  /// `CellValue` is another one for each row.
  template <class Get>
  ColumnOf<Row> Value(std::string head, Get get) {
    return Make(std::move(head), FixedKind<Get>(), std::move(get));
  }
  template <class Get, class Set>
  ColumnOf<Row> Value(std::string head, Get get, Set set) {
    return Make(std::move(head), FixedKind<Get>(), std::move(get), std::move(set));
  }
  /// An int that is 0 or 1.
  template <class Get>
  ColumnOf<Row> Check(std::string head, Get get) {
    return Make(std::move(head), CellKind::Check,
                [get](Row& row) { return CellPlace(CheckOf{&std::invoke(get, row)}); });
  }
  /// A member with the choices that its key's declaration offers.
  template <class Get>
  ColumnOf<Row> Choice(std::string head, Get get) {
    return Make(std::move(head), CellKind::Choice, std::move(get));
  }
  /// An int or a text of a list: `{"Float", "Integer"}` for the numbers from 0 on, `{{3, "Fixed"}, {7, "Free"}}` for
  /// other values, or what gives the `CellChoices` of a row.
  template <class Get, class Entries = CellChoices>
  ColumnOf<Row> Choice(std::string head, Get get, Entries entries) {
    ColumnOf<Row> column = Make(std::move(head), CellKind::Choice, std::move(get));
    SetChoices(std::move(entries));
    return column;
  }
  template <class Get, class Set, class Entries = CellChoices>
  ColumnOf<Row> Choice(std::string head, Get get, Set set, Entries entries) {
    ColumnOf<Row> column = Make(std::move(head), CellKind::Choice, std::move(get), std::move(set));
    SetChoices(std::move(entries));
    return column;
  }
  /// A button in each row; `text` may be empty where it has an icon.
  ColumnOf<Row> Button(std::string head, std::string text, std::function<void(Row&)> press) {
    ColumnOf<Row> column = Make(std::move(head), CellKind::Button, [text = std::move(text)](Row&) { return text; });
    made_->press = [rows = Rows(), press = std::move(press)](int row) { press(rows->At(row)); };
    return column;
  }
  /// What is computed from a row and all above it: `start()` gives the value in front of the first row, `step(value,
  /// row)` the one behind a row.
  template <class Start, class Step>
  ColumnOf<Row> Running(std::string head, Start start, Step step) {
    using Total = std::invoke_result_t<Start>;
    auto totals = std::make_shared<std::vector<Total>>();
    TableColumn& column = Add(std::move(head), KindOf(CellValue(Total())));
    column.get = [rows = Rows(), totals, start = std::move(start), step = std::move(step)](int row) {
      if (totals->empty()) totals->push_back(start());
      for (int next = static_cast<int>(totals->size()); next <= row; ++next)
        totals->push_back(std::invoke(step, totals->back(), rows->At(next)));
      return CellValue((*totals)[static_cast<std::size_t>(row)]);
    };
    column.forget = [totals] { totals->clear(); };
    return {column, Rows(), control_};
  }

 protected:
  /// Adds a column, or makes the field that a column describes and tells it by `SetControl`.
  virtual TableColumn& AddOf(std::string head, std::optional<CellKind> kind) = 0;
  virtual std::shared_ptr<RowsOf<Row>> Rows() const = 0;
  void SetControl(Control& control) { control_ = &control; }

 private:
  template <class Get>
  using Got = std::remove_cvref_t<std::invoke_result_t<const Get&, Row&>>;
  template <class Got>
  static constexpr bool kIsPlace = std::is_same_v<Got, CellPlace>;
  template <class Got>
  static constexpr bool kIsText = std::convertible_to<Got, std::string>;

  template <class Get>
  static std::optional<CellKind> FixedKind() {
    if constexpr (kIsPlace<Got<Get>> || std::is_same_v<Got<Get>, CellValue>)
      return std::nullopt;
    else if constexpr (kIsText<Got<Get>>)
      return CellKind::Text;
    else
      return KindOf(CellValue(Got<Get>()));
  }

  TableColumn& Add(std::string head, std::optional<CellKind> kind) {
    made_ = &AddOf(std::move(head), kind);
    made_->kind = kind;
    return *made_;
  }

  template <class Get>
  ColumnOf<Row> Make(std::string head, std::optional<CellKind> kind, Get get) {
    using Result = std::invoke_result_t<const Get&, Row&>;
    TableColumn& column = Add(std::move(head), kind);
    if constexpr (std::is_member_object_pointer_v<Get> && std::derived_from<Row, CYbSEKvfBase>) BindTo(get);
    column.get = GetterOf(get);
    if constexpr (kIsPlace<Got<Get>>)
      column.set = [rows = Rows(), get](int row, const CellValue& value) {
        StoreAt(std::invoke(get, rows->At(row)), value);
        return std::string();
      };
    else if constexpr (std::is_lvalue_reference_v<Result> && !std::is_const_v<std::remove_reference_t<Result>>)
      column.set = [rows = Rows(), get](int row, const CellValue& value) {
        std::invoke(get, rows->At(row)) = std::get<Got<Get>>(value);
        return std::string();
      };
    return {column, Rows(), control_};
  }

  template <class Get, class Set>
  ColumnOf<Row> Make(std::string head, std::optional<CellKind> kind, Get get, Set set) {
    using Value = Got<Get>;
    TableColumn& column = Add(std::move(head), kind);
    column.get = GetterOf(get);
    column.set = [rows = Rows(), set](int row, const CellValue& value) {
      const auto take = [&](const auto& given) -> std::string {
        if constexpr (std::is_void_v<decltype(std::invoke(set, rows->At(row), given))>)
          return std::invoke(set, rows->At(row), given), std::string();
        else
          return std::invoke(set, rows->At(row), given);
      };
      if constexpr (std::is_same_v<Value, CellValue>)
        return take(value);
      else if constexpr (kIsText<Value>)
        return take(std::get<std::string>(value));
      else
        return take(std::get<Value>(value));
    };
    return {column, Rows(), control_};
  }

  template <class Member>
  void BindTo(Member member) {
    const std::unique_ptr<Row> sample = Rows()->Sample();
    if (!sample) return;
    BoundKeys keys;
    keys.Add(*sample);
    const BoundKeys::Place* place = keys.Find(&std::invoke(member, *sample));
    if (!place) return;
    made_->Bind(*place);
    if (control_) control_->Key(place->key).Quantity(place->facts.itemType).Unit(std::string(place->facts.unit));
  }

  template <class Get>
  std::function<CellValue(int)> GetterOf(Get get) const {
    return [rows = Rows(), get = std::move(get)](int row) -> CellValue {
      if constexpr (kIsPlace<Got<Get>>)
        return ValueAt(std::invoke(get, rows->At(row)));
      else if constexpr (kIsText<Got<Get>>)
        return std::string(std::invoke(get, rows->At(row)));
      else
        return std::invoke(get, rows->At(row));
    };
  }

  template <class Entries>
  void SetChoices(Entries entries) {
    made_->choices.clear();
    if constexpr (std::invocable<const Entries&, Row&>)
      made_->rowChoices = [rows = Rows(), entries = std::move(entries)](int row) -> CellChoices {
        return std::invoke(entries, rows->At(row));
      };
    else
      made_->choices = std::move(entries);
  }

  TableColumn* made_ = nullptr;  ///< The latest.
  Control* control_ = nullptr;
};

/// A table over rows of one class: the items of a list, plain values that the page holds, or any other rows.
template <class Row>
class TableOf : public TableForm, public ColumnMaker<Row> {
 public:
  explicit TableOf(CYbSEKvfAbstractListBase<Row>& list) requires std::derived_from<Row, CYbSEKvfBase>
      : TableOf(std::make_shared<ListRows<Row>>(list)) {}
  explicit TableOf(std::vector<Row>& values) : TableOf(std::make_shared<ValueRows<Row>>(values)) {}
  explicit TableOf(std::shared_ptr<RowsOf<Row>> rows) : TableForm(rows), rows_(std::move(rows)) {}

  /// The current row; null where there is none.
  Row* Current() const { return CurrentRow() > 0 && CurrentRow() <= RowCount() ? &rows_->At(CurrentRow()) : nullptr; }
  Row& At(int row) const { return rows_->At(row); }
  /// Texts in front of the rows, instead of their numbers.
  void RowHeads(std::function<std::string(Row&)> head) {
    TableForm::RowHeads([rows = rows_, head = std::move(head)](int row) { return head(rows->At(row)); });
  }
  std::shared_ptr<RowsOf<Row>> Rows() const override { return rows_; }

 protected:
  TableColumn& AddOf(std::string head, std::optional<CellKind>) override { return AddColumn(std::move(head)); }

 private:
  std::shared_ptr<RowsOf<Row>> rows_;
};

}  // namespace tervane
