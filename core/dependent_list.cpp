// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/dependent_list.h"

#include <atomic>

namespace tervane {

void CTvnDependentListBase::RemoveListener(CTvnDependentListBase* list) {
  const auto found = std::find(listeners_.begin(), listeners_.end(), list);
  if (found != listeners_.end()) listeners_.erase(found);
}

void CTvnDependentListBase::Notify(int value, void* object) {
  OnNotify(value, object);
  for (CTvnDependentListBase* listener : listeners_) listener->Notify(value, object);
}

int NewEntryId() {
  static std::atomic<int> latest{0};
  return ++latest;
}

}  // namespace tervane
