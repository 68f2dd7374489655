// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/kvf_tree.h"

#include <algorithm>
#include <bit>
#include <cstring>
#include <functional>
#include <unordered_map>

#include <fmt/format.h>

#include "core/path.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// Up to this number of nodes a walk along the list is faster than making an index.
constexpr std::uint32_t kWalkLimit = 48;

constexpr std::size_t kFirstChunk = 16 * 1024;
constexpr std::size_t kLargestChunk = 1024 * 1024;

}  // namespace

// ---- Arena

void* KvfArena::AllocateChunk(std::size_t size) {
  const std::size_t usual = chunks_.empty() ? kFirstChunk : std::min(chunks_.back().size * 2, kLargestChunk);
  const std::size_t chunkSize = std::max(size, usual);
  chunks_.push_back({std::make_unique_for_overwrite<char[]>(chunkSize), chunkSize});
  size_ += chunkSize;
  char* start = chunks_.back().memory.get();
  next_ = start + size;
  end_ = start + chunkSize;
  return start;
}

const char* KvfArena::Copy(std::string_view text) {
  auto* copy = static_cast<char*>(Allocate(text.size() + 1, 1));
  std::memcpy(copy, text.data(), text.size());
  copy[text.size()] = '\0';
  return copy;
}

bool KvfArena::Extend(const void* start, std::size_t oldSize, std::size_t newSize) {
  const char* oldEnd = static_cast<const char*>(start) + oldSize;
  if (oldEnd != next_ || newSize - oldSize > static_cast<std::size_t>(end_ - next_)) return false;
  next_ += newSize - oldSize;
  return true;
}

bool KvfArena::Owns(const void* address) const {
  return std::any_of(chunks_.begin(), chunks_.end(), [&](const Chunk& chunk) {
    const char* start = chunk.memory.get();
    return std::greater_equal<>()(address, static_cast<const void*>(start)) &&
           std::less<>()(address, static_cast<const void*>(start + chunk.size));
  });
}

// ---- Index

KvfIndex::KvfIndex(const KvfSection& section) {
  std::vector<KvfNode*> sections;
  nodes_.reserve(section.count);
  for (KvfNode* node = section.firstChild; node; node = node->next) {
    nodes_.push_back(node);
    (node->IsKeyword() ? keywords_ : sections).push_back(node);
  }
  keywordNames_.Add(keywords_);
  sectionNames_.Add(sections);
}

std::uint32_t KvfIndex::Names::HashOf(std::string_view name) {
  return static_cast<std::uint32_t>(std::hash<std::string_view>()(name));
}

void KvfIndex::Names::Add(const std::vector<KvfNode*>& nodes) {
  if (nodes.empty()) return;
  slots_.resize(std::bit_ceil(2 * nodes.size()));
  std::vector<const KvfNode*> firstNodes;  // of the groups
  std::vector<std::uint32_t> groupOf;      // of the nodes
  groupOf.reserve(nodes.size());
  for (const KvfNode* node : nodes) {
    const std::uint32_t hash = HashOf(node->Name());
    std::size_t slot = hash & (slots_.size() - 1);
    const auto isOther = [&](std::uint32_t number) {
      return number != 0 && (groups_[number - 1].hash != hash || firstNodes[number - 1]->Name() != node->Name());
    };
    while (isOther(slots_[slot])) slot = (slot + 1) & (slots_.size() - 1);
    if (slots_[slot] == 0) {
      groups_.push_back({hash, 0, 0});
      firstNodes.push_back(node);
      slots_[slot] = static_cast<std::uint32_t>(groups_.size());
    }
    groupOf.push_back(slots_[slot] - 1);
    ++groups_[groupOf.back()].count;
  }
  std::uint32_t first = 0;
  for (Group& group : groups_) {
    group.first = first;
    first += std::exchange(group.count, 0);
  }
  grouped_.resize(nodes.size());
  for (std::size_t i = 0; i < nodes.size(); ++i) {
    Group& group = groups_[groupOf[i]];
    grouped_[group.first + group.count++] = nodes[i];
  }
}

const KvfIndex::Names::Group* KvfIndex::Names::FindGroup(std::string_view name) {
  // Most ask in the order of the file, so the same name or the next one is meant: a list of many items is then read
  // without leaps through memory.
  for (std::size_t number = latest_; number < std::min(latest_ + 2, groups_.size()); ++number)
    if (NameOf(groups_[number]) == name) return &groups_[latest_ = number];
  const std::uint32_t hash = HashOf(name);
  for (std::size_t slot = hash & (slots_.size() - 1); slots_[slot] != 0; slot = (slot + 1) & (slots_.size() - 1)) {
    const std::size_t number = slots_[slot] - 1;
    if (groups_[number].hash == hash && NameOf(groups_[number]) == name) return &groups_[latest_ = number];
  }
  return nullptr;
}

KvfNode* KvfIndex::Names::Find(std::string_view name, std::size_t instance) {
  if (groups_.empty()) return nullptr;
  const Group* group = FindGroup(name);
  return group && instance >= 1 && instance <= group->count ? grouped_[group->first + instance - 1] : nullptr;
}

KvfNode* KvfIndex::Find(bool keyword, std::string_view name, std::size_t instance) {
  return (keyword ? keywordNames_ : sectionNames_).Find(name, instance);
}

KvfNode* FindKvfNode(KvfSection& section, bool keyword, std::string_view name, std::size_t instance) {
  if (section.count > kWalkLimit) return section.file->IndexOf(section).Find(keyword, name, instance);
  for (KvfNode* node = section.firstChild; node; node = node->next)
    if (node->IsKeyword() == keyword && node->Name() == name && instance-- == 1) return node;
  return nullptr;
}

KvfNode* FindKvfNode(KvfSection& section, std::size_t number) {
  if (number < 1 || number > section.count) return nullptr;
  if (section.count > kWalkLimit) return section.file->IndexOf(section).Node(number);
  KvfNode* node = section.firstChild;
  while (--number > 0) node = node->next;
  return node;
}

KvfNode* FindKvfKeyword(KvfSection& section, std::size_t number) {
  if (section.count > kWalkLimit) return section.file->IndexOf(section).Keyword(number);
  for (KvfNode* node = section.firstChild; node; node = node->next)
    if (node->IsKeyword() && number-- == 1) return node;
  return nullptr;
}

// ---- File

KvfFile::KvfFile() {
  top.kind = KvfKind::File;
  top.file = this;
}

KvfIndex& KvfFile::IndexOf(KvfSection& section) {
  if (!section.index) section.index = &indices_.emplace_back(section);
  return *section.index;
}

void KvfFile::SetName(KvfNode& node, std::string_view writtenName) {
  std::string_view name = Trimmed(writtenName);
  auto before = static_cast<std::size_t>(name.data() - writtenName.data());
  std::size_t after = writtenName.size() - name.size() - before;
  constexpr std::size_t most = 255;
  before = std::min(before, most);
  after = std::min(after, most);
  const std::string_view kept(name.data() - before, before + name.size() + after);
  node.nameText = arena.Copy(kept) + before;
  node.nameLength = static_cast<std::uint32_t>(name.size());
  node.nameTerminated = after == 0;
  node.blanksBefore = static_cast<std::uint8_t>(before);
  node.blanksAfter = static_cast<std::uint8_t>(after);
}

KvfSection* KvfFile::NewSection(KvfKind kind, std::string_view writtenName) {
  auto* section = arena.New<KvfSection>();
  section->kind = kind;
  section->file = this;
  SetName(*section, writtenName);
  return section;
}

KvfSection* KvfFile::AddSection(KvfSection& parent, KvfKind kind, std::string_view writtenName) {
  KvfSection* section = NewSection(kind, writtenName);
  Append(parent, *section);
  return section;
}

KvfNode* KvfFile::AddKeyword(KvfSection& parent, std::string_view writtenName) {
  auto* keyword = arena.New<KvfNode>();
  keyword->kind = KvfKind::Keyword;
  SetName(*keyword, writtenName);
  Append(parent, *keyword);
  return keyword;
}

void KvfFile::MakeRoomForParam(KvfNode& keyword) {
  const std::size_t oldSize = keyword.capacity * sizeof(KvfParam);
  if (keyword.capacity > 0 && arena.Extend(keyword.params, oldSize, oldSize + sizeof(KvfParam))) {
    ++keyword.capacity;
    return;
  }
  // Texts may lie behind: doubling keeps a long list of them linear.
  keyword.capacity = std::max(2 * keyword.capacity, std::uint32_t{1});
  auto* moved = static_cast<KvfParam*>(arena.Allocate(keyword.capacity * sizeof(KvfParam), alignof(KvfParam)));
  std::uninitialized_copy_n(keyword.params, keyword.count, moved);
  keyword.params = moved;
}

void KvfFile::SetText(KvfParam& param, std::string_view value) {
  param.text = arena.Copy(value);
  param.length = static_cast<std::uint32_t>(value.size());
  param.terminated = true;
}

void KvfFile::CopyChildren(const KvfSection& from, KvfSection& to) {
  // `to` may be `from` or lie in it: a copy must not be copied again.
  const KvfNode* const last = from.lastChild;
  for (const KvfNode* node = from.firstChild; node; node = node == last ? nullptr : node->next) {
    if (const KvfSection* section = AsSection(node)) {
      KvfSection* copy = NewSection(KvfKind::Section, section->WrittenName());
      CopyChildren(*section, *copy);
      Append(to, *copy);
      continue;
    }
    KvfNode* copy = AddKeyword(to, node->WrittenName());
    copy->params = static_cast<KvfParam*>(arena.Allocate(node->count * sizeof(KvfParam), alignof(KvfParam)));
    copy->count = copy->capacity = node->count;
    for (std::uint32_t i = 0; i < node->count; ++i) {
      auto* param = new (&copy->params[i]) KvfParam(node->params[i]);
      param->lookedUp = false;
      if (param->IsText()) SetText(*param, node->params[i].Text());
    }
  }
}

void KvfFile::Clear(KvfSection& section) {
  section.firstChild = section.lastChild = nullptr;
  section.count = 0;
  section.index = nullptr;
}

int KvfFile::LineAt(const char* place) const {
  const char* start = text.data.get();
  if (!start || std::less<>()(place, start) || std::greater<>()(place, start + text.size)) return 0;
  if (lineStarts_.empty()) {
    lineStarts_.push_back(0);
    for (const char* at = start;
         (at = static_cast<const char*>(std::memchr(at, '\n', static_cast<std::size_t>(start + text.size - at))));)
      lineStarts_.push_back(static_cast<std::uint32_t>(++at - start));
  }
  const auto offset = static_cast<std::uint32_t>(place - start);
  const auto behind = std::upper_bound(lineStarts_.begin(), lineStarts_.end(), offset);
  return static_cast<int>(behind - lineStarts_.begin());
}

int KvfFile::LineOf(const KvfNode& node) const { return LineAt(node.nameText - node.blanksBefore); }

// ---- Reports

namespace {

/// A short quotation of a text for a message.
std::string Excerpt(std::string_view text) {
  constexpr std::size_t longest = 60;
  if (text.size() <= longest) return std::string(text);
  std::size_t cut = longest;
  while (cut > 0 && (static_cast<unsigned char>(text[cut]) & 0xC0) == 0x80) --cut;
  return std::string(text.substr(0, cut)) + "...";
}

bool IsUnread(const KvfNode& node) {
  if (!node.lookedUp) return true;
  const KvfSection* section = AsSection(&node);
  if (!section)
    return std::any_of(node.params, node.params + node.count, [](const KvfParam& param) { return !param.lookedUp; });
  for (const KvfNode* child = section->firstChild; child; child = child->next)
    if (IsUnread(*child)) return true;
  return false;
}

/// Walks the tree in the order of the file and calls `visit(node, parent's path, instance number)`; descends where it
/// answers true.
template <class Visit>
void WalkWithPaths(const KvfSection& section, const std::string& path, const Visit& visit) {
  std::unordered_map<std::string_view, int> sections, keywords;
  for (const KvfNode* node = section.firstChild; node; node = node->next) {
    const int instance = ++(node->IsKeyword() ? keywords : sections)[node->Name()];
    if (!visit(*node, path, instance)) continue;
    // The target itself is no part of a path.
    const bool isTarget = node->kind == KvfKind::Target;
    WalkWithPaths(*AsSection(node), isTarget ? std::string() : JoinPath(path, PathName(node->Name(), instance)), visit);
  }
}

}  // namespace

std::vector<KvfUnread> CollectUnread(const KvfFile& file) {
  std::vector<KvfUnread> result;
  const auto visit = [&](const KvfNode& node, const std::string& path, int instance) {
    if (!IsUnread(node)) return false;
    const std::string name = PathName(node.Name(), instance);
    const int line = file.LineOf(node);
    const std::string_view before = instance > 1 ? "another " : "";
    const std::string_view reason =
        instance > 1 && node.kind != KvfKind::Target ? "a repetition that nothing reads" : "nothing reads it";
    if (node.kind == KvfKind::Target) {
      if (node.lookedUp) return true;
      result.push_back({KvfUnread::Kind::Target, line, name, fmt::format("{}target {}: {}", before, name, reason)});
    } else if (!node.IsKeyword()) {
      if (node.lookedUp) return true;
      result.push_back(
          {KvfUnread::Kind::Section, line, JoinPath(path, name), fmt::format("section {}: {}", node.Name(), reason)});
    } else if (!node.lookedUp) {
      result.push_back(
          {KvfUnread::Kind::Keyword, line, path + ":" + name, fmt::format("key {}: {}", node.Name(), reason)});
    } else {
      result.push_back(
          {KvfUnread::Kind::Parameter, line, path + ":" + name,
           fmt::format("key {}: it has {} values, and nothing reads all of them", node.Name(), node.count)});
    }
    return false;
  };
  WalkWithPaths(file.top, {}, visit);

  const std::string_view text = file.text.Text();
  for (const std::uint32_t place : file.comments) {
    const std::string_view comment = text.substr(place, text.find('\n', place) - place);
    result.push_back(
        {KvfUnread::Kind::Comment,
         file.LineAt(text.data() + place),
         {},
         fmt::format("comment {}: comments behind the first target are not kept", Excerpt(Trimmed(comment)))});
  }
  return result;
}

std::vector<KvfPlacedNote> CollectNotes(const KvfFile& file) {
  std::vector<KvfPlacedNote> result;
  if (file.notes.empty()) return result;
  std::unordered_map<const KvfNode*, std::vector<const std::string*>> notes;
  for (const KvfNote& note : file.notes) notes[note.node].push_back(&note.text);
  WalkWithPaths(file.top, {}, [&](const KvfNode& node, const std::string& path, int instance) {
    if (const auto found = notes.find(&node); found != notes.end()) {
      const bool isKey = node.IsKeyword();
      const std::string place = isKey ? path : JoinPath(path, PathName(node.Name(), instance));
      for (const std::string* text : found->second)
        result.push_back({file.LineOf(node), place, isKey ? std::string(node.Name()) : std::string(), *text});
    }
    return !node.IsKeyword();
  });
  return result;
}

}  // namespace tervane
