// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/open_setup.h"

#include <fmt/format.h>

#include "access/setup_place.h"
#include "access/written_setup.h"
#include "document/item_owner.h"
#include "document/node_reading.h"

namespace tervane {

OpenSetup::OpenSetup() : setup_(std::make_unique<AccessedSetup>()) { Begin(); }

OpenSetup::~OpenSetup() { root_->Drop(); }

void OpenSetup::Begin() {
  if (root_) root_->Drop();
  places_.clear();
  keys_ = std::make_unique<SetupKeys>(Document());
  root_ = std::make_shared<HeldNode>(Root(), nullptr);
}

bool OpenSetup::Open(const std::string& path) {
  // The tree goes also where reading fails.
  root_->Drop();
  const bool isOpen = setup_->Open(path);
  Begin();
  return isOpen;
}

bool OpenSetup::Save(const std::string& path) {
  keys_->Forget();
  const std::string& to = path.empty() ? Document().PathName() : path;
  if (to.empty()) return setup_->Refuse("the setup was never saved: a path was expected");
  const bool hasFolder = !Root().SetupFolder().empty();
  if (!setup_->Save(to)) return false;
  if (!hasFolder) keys_->TakeFolder();
  return true;
}

bool OpenSetup::CopyTo(OpenSetup& copy, std::string& problem) const {
  std::string text;
  const std::string& folder = Root().SetupFolder();
  if (!Document().BuildText(folder, text, problem)) return false;
  auto document = std::make_unique<CFlowModelDoc>();
  // The path stands for the folder from which names of files start; there is none before the first save.
  if (!document->OpenText(text, Document().PathName())) {
    problem = document->Error();
    return false;
  }
  document->BecomeNew();
  copy.root_->Drop();
  copy.setup_->Take(std::move(document));
  copy.Begin();
  return true;
}

std::shared_ptr<HeldNode> OpenSetup::Hold(CYbSEKvfBase& node) const {
  if (!node.GetParent()) return root_;
  return std::make_shared<HeldNode>(node, Hold(*node.GetParent()));
}

const OpenSetup::Place* OpenSetup::Find(const std::string& path, std::string& problem) {
  if (placesRevision_ != keys_->Revision()) places_.clear();
  placesRevision_ = keys_->Revision();
  const auto known = places_.find(path);
  if (known != places_.end() && known->second.node->Get()) return &known->second;
  const SetupPath parsed = ParseSetupPath(path);
  CYbSEKvfBase* node = FindNodeOrTell(Root(), parsed, path, problem);
  if (!node) return nullptr;
  return &places_.insert_or_assign(path, Place{Hold(*node), parsed.key}).first->second;
}

CYbSEKvfBase* OpenSetup::InsertItem(CYbSEKvfBase& owner, int place, CYbSEKvfBase* like, std::string& problem) {
  const ItemOwner items(&owner);
  const auto refuse = [&](std::string_view why) -> CYbSEKvfBase* {
    problem = fmt::format("{}: {}", PathOf(owner), why);
    return nullptr;
  };
  if (!items.Node()) return refuse("it holds no items");
  // Written before the list changes: it may stand in it.
  OpenKvf text;
  KvfSection* section = nullptr;
  if (like) {
    const ItemOwner others(like->GetParent());
    if (!others.Holds(*like) || like->ClassName().empty()) return refuse("what is to be copied is no item");
    text.reset(kvfCreate());
    text->folder = like->GetRoot()->SetupFolder();
    kvfAddTarget(text.get(), "Item");
    like->Save(text.get());
    kvfEndSection(text.get());
    KvfSection* target = AsSection(text->top.firstChild);
    section = target ? AsSection(target->firstChild) : nullptr;
    if (!section) return refuse("what is to be copied has no section");
  }
  const bool isBehind = place > items.Count();
  CYbSEKvfBase* item = isBehind ? items.Add() : items.Insert(place);
  keys_->Forget();
  if (!item)
    return refuse(isBehind ? "no further item can be made here" : "an item can only be added behind the others");
  if (like && item->ClassName() != like->ClassName()) {
    items.Remove(*item);
    return refuse(fmt::format("its items are of another kind than {}", PathOf(*like)));
  }
  if (section) LoadAnew(*item, *section);
  return item;
}

bool OpenSetup::RemoveItem(CYbSEKvfBase& owner, int place) {
  const ItemOwner items(&owner);
  CYbSEKvfBase* item = items.Item(place);
  if (!item) return false;
  items.Remove(*item);
  keys_->Forget();
  return true;
}

bool OpenSetup::MoveItem(CYbSEKvfBase& owner, int from, int to) {
  const ItemOwner items(&owner);
  const int count = items.Count();
  if (from < 1 || to < 1 || from > count || to > count) return false;
  keys_->Forget();
  for (; from > to; --from)
    if (!items.MoveUp(from)) return false;
  // Down: each of the others steps up past it.
  for (; from < to; ++from)
    if (!items.MoveUp(from + 1)) return false;
  return true;
}

std::vector<SetupFinding> OpenSetup::Validate() {
  Root().Validate();
  keys_->Forget();
  return FindingsOf(Document());
}

}  // namespace tervane
