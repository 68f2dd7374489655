// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/file_controls.h"

#include <algorithm>

#include "overlays/grid_state.h"
#include "overlays/overlays.h"
#include "platform/item_types.h"
#include "platform/units.h"

namespace tervane {

std::optional<FileName> CreateFileByDialog(const CYbSEDlgBase& page, Host::FileQuestion question, const FileName& now,
                                           const std::function<FileResult(const std::string& path)>& write) {
  const CYbSEKvfGlobalBase* root = page.Node().GetRoot();
  const std::string folder = root ? root->SetupFolder() : std::string();
  question.current = now.IsEmpty() ? folder : now.Absolute();
  const auto path = page.Outside().AskFileToSave(question);
  if (!path) return std::nullopt;
  if (const FileResult created = write(*path); !created.Ok()) {
    page.Outside().ShowMessage(created.error, Host::Icon::Error);
    return std::nullopt;
  }
  return FileName::Picked(*path, folder);
}

void AllowRequest(const CYbSEKvfBase& node, const FileName& file, bool EditorRequests::*part) {
  if (auto* root = dynamic_cast<CGlobal*>(node.GetRoot()); root && !file.IsEmpty()) root->Requests.*part = true;
}

void EditDataFile(const PageContext& context, const CYbSEKvfBase& node, const FileName& file, std::optional<int> item) {
  if (const COverlaysKvf* overlays = node.Important(kOverlays)) {
    if (PrepareGridState(*overlays, file, item, context.host).empty()) return;
  }
  context.host.OpenInEditor(file.Absolute());
}

bool MayCreateFile(const PageContext& context) {
  if (!context.document.PathName().empty()) return true;
  context.host.ShowMessage("You must save your setup before you can create a file.", Host::Icon::Warning);
  return false;
}

Control& UnitKeyChoice(PageForm& form, const std::string& label, const char* key, int& unitKey, int itemType) {
  const ItemType* type = FindItemType(itemType);
  std::vector<int> keys;
  std::vector<std::string> texts;
  for (const int unit : type ? type->unitKeys : std::span<const int>()) {
    keys.push_back(unit);
    texts.emplace_back(FindUnit(unit)->text);
  }
  return form
      .Choice(
          label,
          [&unitKey, keys] {
            const auto found = std::ranges::find(keys, unitKey);
            return found == keys.end() ? unitKey : static_cast<int>(found - keys.begin());
          },
          [&unitKey, keys](int choice) {
            if (choice >= 0 && choice < static_cast<int>(keys.size())) unitKey = keys[static_cast<std::size_t>(choice)];
          },
          std::move(texts))
      .Key(key);
}

}  // namespace tervane
