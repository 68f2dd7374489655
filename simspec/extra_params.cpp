// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/extra_params.h"

#include <fmt/format.h>

#include "simspec/basic_parameters.h"
#include "simspec/review_notes.h"

namespace tervane {

void CExtraParamsItemKvf::ExchangeKeys(KeyExchange& keys) {
  keys("Name", Name);
  keys("Type", Type).OneOf(kKinds);
  const auto exchangeValue = [&](int kind) {
    switch (kind) {
      case kFloat:
        keys("Value", FloatValue);
        break;
      case kInteger:
        keys("Value", IntegerValue);
        break;
      case kBool:
        keys("Value", BoolValue);
        break;
      case kText:
        keys("Value", TextValue);
        break;
      case kFilename:
        keys("Value", FilenameValue);
        break;
      default:
        break;
    }
  };
  if (keys.IsDescribing())
    for (const int kind : {kFloat, kInteger, kBool, kText, kFilename}) exchangeValue(kind);
  else
    exchangeValue(Type);
}

void CExtraParamsItemKvf::ExchangeState(KeyExchange& keys) {
  keys("Name", Name);
  keys("Type", Type);
  keys("float", FloatValue);
  keys("integer", IntegerValue);
  keys("bool", BoolValue);
  keys("text", TextValue);
  keys("file name", FilenameValue);
}

int CExtraParamsKvf::GetSectionUsed() const {
  const auto* basics = Important(kBasicParameters);
  return basics ? basics->UsesExtraParams : 1;
}

int CExtraParamsKvf::ValidateData() {
  for (int number = 1; number <= GetItemCount(); ++number) {
    ReviewNote note;
    std::string problem;
    if (HoldsReviewNote(*GetItem(number)) && !ReadReviewNote(*GetItem(number), note, problem))
      AddWarning(fmt::format("{} cannot be read, and is kept as it is", GetItem(number)->Name), {}, problem);
  }
  return 1;
}

std::string CExtraParamsKvf::GetItemName(int number) const {
  const CExtraParamsItemKvf* item = GetItem(number);
  return item ? item->Name : std::string();
}

}  // namespace tervane
