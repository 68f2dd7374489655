// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a cell of a table holds: a value of one of the types that are shown and typed, or nothing.
#pragma once

#include <initializer_list>
#include <string>
#include <variant>
#include <vector>

#include "core/key_facts.h"
#include "forms/entry.h"

namespace tervane {

/// How a cell is edited.
enum class CellKind { Text, Number, Integer, Check, Choice, File, Date, Button };

/// A cell that is empty and takes nothing.
struct NoCell {
  std::string why = "the cell cannot be changed";
  bool operator==(const NoCell&) const = default;
};

/// A number that is not finite is shown as an empty cell.
using CellValue = std::variant<NoCell, bool, int, float, double, std::string, FileName, CYbDateTime>;

/// An int that is 0 or 1.
struct CheckOf {
  int* flag;
};
/// Where the value of a cell is stored, for columns whose cells differ from row to row.
using CellPlace = std::variant<NoCell, CheckOf, bool*, int*, float*, double*, std::string*, FileName*, CYbDateTime*>;
CellValue ValueAt(const CellPlace& place);
/// The value is of the type that `ValueAt` gave.
void StoreAt(const CellPlace& place, CellValue value);

CellKind KindOf(const CellValue& value);
/// The value as it is typed. `unit` and `format` (printf, of one double) are those of numbers; of a
/// date it is made of %Y %m %d %H %M.
std::string CellText(const CellValue& value, const FieldUnit& unit = {}, const std::string& format = {});
/// Takes a typed value of the same type; gives what was expected when it is none. `node` says to which folder a name of
/// a file is relative; null where none is known.
std::string EnterCell(CellValue& value, const std::string& typed, const FieldUnit& unit, const CYbSEKvfBase* node);

/// An entry of a choice list: its text, and the value that is stored for it, as it is typed.
struct CellChoice {
  CellChoice(int value_, std::string text_) : value(std::to_string(value_)), text(std::move(text_)) {}
  CellChoice(std::string value_, std::string text_) : value(std::move(value_)), text(std::move(text_)) {}

  std::string value, text;
};

/// The entries of a choice list in their order: `{"Float", "Integer"}` for the numbers from 0 on, `{{1110, "Porosity"},
/// {1120, "Bulk density"}}` for other values.
class CellChoices : public std::vector<CellChoice> {
 public:
  CellChoices() = default;
  CellChoices(std::initializer_list<const char*> texts) {
    for (const char* text : texts) emplace_back(static_cast<int>(size()), text);
  }
  CellChoices(std::initializer_list<CellChoice> entries) : vector(entries) {}
  /// Those of a key that pages offer.
  static CellChoices Of(KeyChoices keyChoices) {
    CellChoices choices;
    for (const KeyChoice& choice : keyChoices)
      if (choice.isOffered) choices.emplace_back(choice.value, std::string(choice.text));
    return choices;
  }
  /// Texts that are stored as they are.
  static CellChoices Texts(const std::vector<std::string>& texts) {
    CellChoices choices;
    for (const std::string& text : texts) choices.emplace_back(text, text);
    return choices;
  }
  std::vector<std::string> ShownTexts() const {
    std::vector<std::string> texts;
    for (const CellChoice& choice : *this) texts.push_back(choice.text);
    return texts;
  }
  /// The place of a stored value from 0 on; -1 when it is none of them.
  int IndexOf(const std::string& value) const {
    for (std::size_t i = 0; i < size(); ++i)
      if ((*this)[i].value == value) return static_cast<int>(i);
    return -1;
  }
};

}  // namespace tervane
