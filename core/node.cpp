// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/node.h"

#include <algorithm>
#include <atomic>
#include <typeinfo>

#include <fmt/format.h>

#include "core/kvf_writer.h"
#include "core/node_deaths.h"
#include "platform/os.h"

namespace tervane {

namespace {

std::atomic<std::uint64_t> nextSerial{1}, nodeDeaths{0};

/// Whether the document that is read holds the section under its old name.
bool BearsOldName(const auto& oldSection, const CYbSEKvfGlobalBase* root) {
  return !oldSection.name.empty() && (root ? root->ReadDocVersion() : -1) <= oldSection.lastVersion;
}

}  // namespace

CYbSEKvfBase::CYbSEKvfBase(std::string title, std::string sectionName, CYbSEKvfBase* parent)
    : parent_(parent),
      root_(parent ? parent->root_ : nullptr),
      serial_(nextSerial++),
      sectionName_(std::move(sectionName)) {
  if (!title.empty()) SetTexts(std::move(title), {});
}

CYbSEKvfBase::~CYbSEKvfBase() {
  nodeDeaths.fetch_add(1, std::memory_order_relaxed);
  if (isImportant_ && root_ && root_ != this) root_->UnregisterNode(this);
}

std::uint64_t NodeDeaths() { return nodeDeaths; }

void CYbSEKvfBase::SetTexts(std::string title, std::string abbreviatedTitle) {
  title_ = std::move(title);
  abbreviatedTitle_ = std::move(abbreviatedTitle);
  StateFingerprint fingerprint;
  fingerprint.Put(title_);
  fingerprint.Put(abbreviatedTitle_);
  textsNumber_ = fingerprint.Number();
}

// ---- Tree

void CYbSEKvfBase::AddChild(std::shared_ptr<CYbSEKvfBase> child) {
  const auto place = children_.begin() + static_cast<std::ptrdiff_t>(plainChildren_++);
  children_.insert(place, std::move(child));
}

std::shared_ptr<CYbSEKvfBase> CYbSEKvfBase::RemoveChild(CYbSEKvfBase* child) {
  const std::ptrdiff_t place = IndexOfChild(child);
  if (place < 0) return nullptr;
  std::shared_ptr<CYbSEKvfBase> removed = std::move(children_[static_cast<std::size_t>(place)]);
  children_.erase(children_.begin() + place);
  if (static_cast<std::size_t>(place) < plainChildren_) --plainChildren_;
  return removed;
}

void CYbSEKvfBase::SwapChilds(CYbSEKvfBase* a, CYbSEKvfBase* b) {
  const std::ptrdiff_t placeA = IndexOfChild(a);
  const std::ptrdiff_t placeB = IndexOfChild(b);
  if (placeA < 0 || placeB < 0) return;
  std::swap(children_[static_cast<std::size_t>(placeA)], children_[static_cast<std::size_t>(placeB)]);
  std::swap(a->placeHint_, b->placeHint_);
}

CYbSEKvfBase* CYbSEKvfBase::GetNextChild(const CYbSEKvfBase* child) const {
  const std::ptrdiff_t place = IndexOfChild(child);
  const auto next = static_cast<std::size_t>(place + 1);
  return place >= 0 && next < children_.size() ? children_[next].get() : nullptr;
}

CYbSEKvfBase* CYbSEKvfBase::GetChild(int number) const {
  return number >= 1 && number <= static_cast<int>(children_.size())
             ? children_[static_cast<std::size_t>(number - 1)].get()
             : nullptr;
}

int CYbSEKvfBase::GetNumberWhatIs(const CYbSEKvfBase* child) const {
  const std::ptrdiff_t place = IndexOfChild(child);
  return place < 0 ? -1 : static_cast<int>(place) + 1;
}

std::ptrdiff_t CYbSEKvfBase::IndexOfChild(const CYbSEKvfBase* child) const {
  if (!child) return -1;
  const auto isAtHint = [&] {
    return child->placeHint_ < children_.size() && children_[child->placeHint_].get() == child;
  };
  // After a change all places are numbered anew, so that a walk over n children costs n steps.
  if (!isAtHint() && child->parent_ == this)
    for (std::size_t place = 0; place < children_.size(); ++place)
      children_[place]->placeHint_ = static_cast<std::uint32_t>(place);
  return isAtHint() ? static_cast<std::ptrdiff_t>(child->placeHint_) : -1;
}

CYbSEKvfBase* CYbSEKvfBase::GetProperty(int number) const {
  return number >= 1 && number <= GetPropertyCount() ? properties_[static_cast<std::size_t>(number - 1)].get()
                                                     : nullptr;
}

CYbSEKvfBase* CYbSEKvfBase::ImportantNode(std::string_view name) const {
  return root_ ? root_->GetImportantNode(name) : nullptr;
}

// ---- Section

std::string CYbSEKvfBase::FormattedSectionName() const {
  const std::string& name = GetSectionName();
  const std::size_t place = name.find("%d");
  if (place == std::string::npos) return name;
  return fmt::format("{}{}{}", std::string_view(name).substr(0, place), GetNumberWhatAmI(),
                     std::string_view(name).substr(place + 2));
}

int CYbSEKvfBase::GetNumberWhatAmI() const {
  if (sectionNumber_ >= 0) return sectionNumber_;
  return parent_ ? parent_->GetNumberWhatIs(this) : -1;
}

KvfNode* CYbSEKvfBase::FindSection(KvfNode* parentSection) const {
  const std::string name = BearsOldName(oldSection_, root_) ? std::string(oldSection_.name) : FormattedSectionName();
  return kvfSectionByNameNum(parentSection, name, sectionInstance_);
}

void CYbSEKvfBase::SetHelp(std::string helpFile, std::string page) {
  helpFile_ = std::move(helpFile);
  helpPage_ = std::move(page);
}

// ---- File

void CYbSEKvfBase::Load(KvfNode* parentSection) {
  if (!GetSectionUsed()) return;
  const bool hasSection = !GetSectionName().empty();
  KvfNode* section = hasSection ? FindSection(parentSection) : parentSection;
  missedSection_ = section == nullptr;
  if (!section) return;
  if (hasSection)
    ReadTouched(section);
  else if (parent_)
    touched_ = parent_->touched_;
  LoadSize(section);
  ReadData(section);
  LoadChildren(section);
}

void CYbSEKvfBase::ReadTouched(KvfNode* section) {
  kvfGetParam(section, "Touched", &touched_, 1, 1);
  // Computed anew at every save.
  kvfMarkKnown(section, "IsDataUsedInSetup");
}

void CYbSEKvfBase::LoadChildren(KvfNode* section) {
  for (const auto& property : properties_) property->Load(section);
  // Like sections without a number in their name are told apart by their place among each other.
  std::unordered_map<std::string, int> instances;
  // By place, since a node that is read may give children to others.
  for (std::size_t place = 0; place < children_.size(); ++place) {
    CYbSEKvfBase& child = *children_[place];
    const std::string name(BearsOldName(child.oldSection_, root_) ? child.oldSection_.name : child.GetSectionName());
    const bool isNumbered = name.find("%d") != std::string::npos;
    // A child without a section in the file takes no place.
    if (!name.empty() && !isNumbered && child.GetSectionUsed()) child.sectionInstance_ = ++instances[name];
    child.Load(section);
  }
}

void CYbSEKvfBase::Save(KvfFile* file) {
  if (!GetSectionUsed()) return;
  const bool hasSection = !GetSectionName().empty();
  if (hasSection) {
    kvfAddSection(file, FormattedSectionName());
    kvfPutParam(file, "Touched", touched_);
    if (root_ && root_->WriteUsedFlags()) kvfPutParam(file, "IsDataUsedInSetup", IsDataUsedInSetup());
    SaveSize(file);
  }
  WriteData(file);
  SaveChildren(file);
  if (hasSection) kvfEndSection(file);
}

void CYbSEKvfBase::SaveChildren(KvfFile* file) {
  for (const auto& property : properties_) property->Save(file);
  for (const auto& child : children_) child->Save(file);
}

void CYbSEKvfGroupBase::Load(KvfNode* parentSection) {
  if (!GetSectionName().empty())
    CYbSEKvfBase::Load(parentSection);
  else if (GetSectionUsed() && parentSection)
    LoadChildren(parentSection);
}

void CYbSEKvfGroupBase::Save(KvfFile* file) {
  if (!GetSectionName().empty())
    CYbSEKvfBase::Save(file);
  else if (GetSectionUsed())
    SaveChildren(file);
}

void CYbSEKvfBase::ReadData(KvfNode* section) {
  KeyExchange keys = KeyExchange::Reading(section, root_ ? root_->ReadDocVersion() : -1);
  ExchangeKeys(keys);
}

void CYbSEKvfBase::WriteData(KvfFile* file) {
  KeyExchange keys = KeyExchange::Writing(file);
  ExchangeKeys(keys);
}

void CYbSEKvfBase::DescribeKeys(std::vector<KeyInfo>& keys) {
  KeyExchange describing = KeyExchange::Describing(keys, root_ ? root_->ReadDocVersion() : -1);
  ExchangeKeys(describing);
}

void CYbSEKvfBase::TouchAllChildren() {
  for (const auto* nodes : {&properties_, &children_})
    for (const auto& node : *nodes) {
      node->Touch();
      node->TouchAllChildren();
    }
}

// ---- Taking part and validation

int CYbSEKvfBase::IsDataUsedInSetup() {
  for (CYbSEKvfBase* node = this; node; node = node->parent_)
    if (!node->IsDlgUsedInSetup()) return 0;
  return 1;
}

int CYbSEKvfBase::ValidateAs(bool takesPart) {
  if (!takesPart && isClear_) return valid_;
  findings_.clear();
  valid_ = 1;
  if (!HoldsSetup()) return valid_;
  if (takesPart) {
    const bool isValid = ValidateData() != 0;
    CheckValues();
    valid_ = isValid && std::none_of(findings_.begin(), findings_.end(),
                                     [](const Finding& finding) { return finding.severity == Severity::Error; });
  }
  isClear_ = findings_.empty();
  validatesBelow_ = true;
  const auto validate = [&](CYbSEKvfBase& node) {
    if (!node.ValidateAs(takesPart && node.IsDlgUsedInSetup())) valid_ = 0;
    isClear_ = isClear_ && node.isClear_;
  };
  for (const auto& property : properties_) validate(*property);
  for (std::size_t place = 0; place < children_.size(); ++place) validate(*children_[place]);
  validatesBelow_ = false;
  isClear_ = isClear_ && valid_;
  return valid_;
}

void CYbSEKvfBase::CheckValues() {
  KeyExchange keys = KeyExchange::Checking([this](std::string_view key, std::string text, bool isNumber) {
    isNumber ? AddWarning(std::move(text), std::string(key)) : AddError(std::move(text), std::string(key));
  });
  ExchangeKeys(keys);
  keys.Finish();
}

void CYbSEKvfBase::SetRevalidateAll() {
  if (root_) root_->revalidateAll_ = true;
}

std::string_view NameOf(Severity severity) {
  return severity == Severity::Error ? "error" : severity == Severity::Warning ? "warning" : "note";
}

namespace {

/// A node that judges its children is asked again by each of them, and tells nothing twice.
void AddOnce(std::vector<Finding>& findings, Finding finding) {
  if (std::ranges::find(findings, finding) == findings.end()) findings.push_back(std::move(finding));
}

}  // namespace

void CYbSEKvfBase::AddError(std::string text, std::string key, std::string detail) {
  AddOnce(findings_, {Severity::Error, std::move(text), std::move(key), std::move(detail)});
}

void CYbSEKvfBase::AddWarning(std::string text, std::string key, std::string detail) {
  AddOnce(findings_, {Severity::Warning, std::move(text), std::move(key), std::move(detail)});
}

// ---- Root

CYbSEKvfGlobalBase::CYbSEKvfGlobalBase(std::string targetName)
    : CYbSEKvfBase(nullptr), targetName_(std::move(targetName)) {
  root_ = this;
}

CYbSEKvfGlobalBase::~CYbSEKvfGlobalBase() {
  // Nodes look each other up while they die: from here on nobody is found.
  importantNodes_.clear();
  properties_.clear();
  children_.clear();
}

void CYbSEKvfGlobalBase::RegisterImportantNode(CYbSEKvfBase* node, std::string_view name) {
  node->isImportant_ = true;
  importantNodes_[std::string(name)] = node;
}

CYbSEKvfBase* CYbSEKvfGlobalBase::GetImportantNode(std::string_view name) const {
  const auto found = importantNodes_.find(name);
  return found == importantNodes_.end() ? nullptr : found->second;
}

void CYbSEKvfGlobalBase::UnregisterImportantNode(std::string_view name) { importantNodes_.erase(std::string(name)); }

void CYbSEKvfGlobalBase::UnregisterNode(const CYbSEKvfBase* node) {
  std::erase_if(importantNodes_, [node](const auto& entry) { return entry.second == node; });
}

void CYbSEKvfGlobalBase::Load(KvfNode* parentSection) {
  LoadChildren(kvfSectionByNameNum(parentSection, targetName_, 1));
}

void CYbSEKvfGlobalBase::Save(KvfFile* file) {
  kvfAddTarget(file, targetName_);
  for (const auto& child : children_) child->Save(file);
  kvfEndSection(file);
}

// ---- Walks

namespace {

void WalkBelow(CYbSEKvfBase& node, const std::string& path, int depth, bool takesPart,
               const std::function<void(const NodePlace&)>& visit) {
  ChildSteps steps(node);
  for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child)) {
    const NodePlace place{*child, JoinPath(path, steps.StepOf(*child)), depth, takesPart && child->IsDlgUsedInSetup()};
    visit(place);
    WalkBelow(*child, place.path, depth + 1, place.takesPart, visit);
  }
}

}  // namespace

void WalkNodes(CYbSEKvfBase& root, const std::function<void(const NodePlace&)>& visit) {
  WalkBelow(root, {}, 1, root.IsDataUsedInSetup() != 0, visit);
}

std::string StepName(const CYbSEKvfBase& node) {
  return node.GetSectionName().empty() ? ClassNameOf(node) : node.FormattedSectionName();
}

std::string ChildSteps::StepOf(const CYbSEKvfBase& child) {
  for (; next_; next_ = parent_.GetNextChild(next_)) {
    const std::string name = StepName(*next_);
    const int instance = ++instances_[name];
    if (next_ != &child) continue;
    next_ = parent_.GetNextChild(next_);
    return PathName(name, instance);
  }
  return {};
}

std::string PathOf(const CYbSEKvfBase& node) {
  const CYbSEKvfBase* parent = node.GetParent();
  return parent ? JoinPath(PathOf(*parent), ChildSteps(*parent).StepOf(node)) : std::string();
}

CYbSEKvfBase* FindChild(const CYbSEKvfBase& parent, const PathStep& step) {
  int instance = 0;
  for (CYbSEKvfBase* child = parent.GetFirstChild(); child; child = parent.GetNextChild(child))
    if (StepName(*child) == step.name && ++instance == step.instance) return child;
  return nullptr;
}

CYbSEKvfBase* FindNode(CYbSEKvfBase& root, const std::vector<PathStep>& steps) {
  CYbSEKvfBase* node = &root;
  for (const PathStep& step : steps) node = node ? FindChild(*node, step) : nullptr;
  return node;
}

std::string CYbSEKvfBase::ClassName() const {
  if (!className_.empty()) return std::string(className_);
  std::string name = os::DemangledName(typeid(*this));
  const std::size_t scope = name.rfind("::");
  return scope == std::string::npos ? name : name.substr(scope + 2);
}

// ---- Overview

int CYbSEKvfBase::AddToOverview(std::vector<OverviewLine>& lines, int level) {
  KvfFile written;
  kvfAddTarget(&written, "Keys");
  WriteData(&written);
  for (const KvfNode* node = written.Cursor().firstChild; node; node = node->next)
    if (node->IsKeyword())
      lines.push_back({GetTitle(), level, fmt::format("{} = {}", node->Name(), KvfValuesText(*node))});
  return 1;
}

int GenerateOverview(CYbSEKvfBase& root, std::vector<OverviewLine>& lines) {
  int result = root.AddToOverview(lines, 0);
  WalkNodes(root, [&](const NodePlace& place) {
    if (place.takesPart && !place.node.AddToOverview(lines, place.depth)) result = 0;
  });
  return result;
}

std::string OverviewText(const std::vector<OverviewLine>& lines) {
  std::string text, lastTitle;
  for (const OverviewLine& line : lines) {
    const std::string indent(static_cast<std::size_t>(line.level), ' ');
    if (line.title != lastTitle) {
      lastTitle = line.title;
      text += fmt::format("{}PAGE: {}\r\n", indent, lastTitle);
    }
    text += fmt::format("{}      {}\r\n", indent, line.text);
  }
  return text;
}

}  // namespace tervane
