// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/kvf_tree.h"

#include <algorithm>
#include <bit>
#include <cstring>
#include <functional>
#include <unordered_map>

#include <fmt/format.h>

#include "core/kvf_chars.h"
#include "core/path.h"
#include "platform/os.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// Up to this number of nodes a walk along the list is faster than making an index.
constexpr std::uint32_t kWalkLimit = 48;

constexpr std::size_t kFirstChunk = 16 * 1024;
constexpr std::size_t kLargestChunk = 8 * 1024 * 1024;

}  // namespace

// ---- Arena

void* KvfArena::AllocateChunk(std::size_t size) {
  const std::size_t usual = chunks_.empty() ? kFirstChunk : std::min(chunks_.back().size * 2, kLargestChunk);
  const std::size_t chunkSize = std::max(size, usual);
  chunks_.push_back({std::make_unique_for_overwrite<char[]>(chunkSize), chunkSize});
  size_ += chunkSize;
  char* start = chunks_.back().memory.get();
  os::PreferLargePages(start, chunkSize);
  next_ = start + size;
  end_ = start + chunkSize;
  return start;
}

const char* KvfArena::Copy(std::string_view text) {
  if (text.empty()) return "";
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

// ---- Names

KvfNames::Ends KvfNames::EndsOf(std::string_view name) {
  const auto load = [&]<class Word>(std::size_t place, Word word) {
    std::memcpy(&word, &name[place], sizeof word);
    return std::uint64_t{word};
  };
  if (name.size() >= 8) return {load(0, std::uint64_t{}), load(name.size() - 8, std::uint64_t{})};
  if (name.size() >= 4) return {load(0, std::uint32_t{}), load(name.size() - 4, std::uint32_t{})};
  if (name.empty()) return {0, 0};
  return {load(0, std::uint8_t{}), load(name.size() / 2, std::uint8_t{}) << 8 | load(name.size() - 1, std::uint8_t{})};
}

const KvfName* KvfNames::Of(std::string_view written) {
  // Enough places that the names of a setup rarely meet.
  constexpr int binaryDigits = 10;
  if (recent_.empty()) recent_.resize(std::size_t{1} << binaryDigits);
  const Ends ends = EndsOf(written);
  const std::uint64_t mixed = (ends.first + std::rotl(ends.last, 29)) * 0x9E37'79B9'7F4A'7C15;
  Recent& recent = recent_[static_cast<std::size_t>(mixed >> (64 - binaryDigits))];
  const std::string_view known = recent.name ? recent.name->Written() : std::string_view();
  // The ends are all of a name of up to 16 characters.
  const bool isThis =
      recent.name && recent.ends == ends && known.size() == written.size() && (known.size() <= 16 || known == written);
  if (!isThis) recent = {ends, Make(written)};
  return recent.name;
}

const KvfName* KvfNames::Make(std::string_view written) {
  const std::string_view text = Trimmed(written);
  auto* name = texts_.New<KvfName>();
  name->length = static_cast<std::uint32_t>(text.size());
  if (text.size() == written.size() || text.empty()) {
    name->text = texts_.Copy(text);
    name->isBare = IsBareName(text);
    return name;
  }
  constexpr std::size_t most = 255;
  const auto before = static_cast<std::size_t>(text.data() - written.data());
  name->blanksBefore = static_cast<std::uint8_t>(std::min(before, most));
  name->blanksAfter = static_cast<std::uint8_t>(std::min(written.size() - before - text.size(), most));
  std::string both(text);
  both += '\0';
  both.append(text.data() - name->blanksBefore, name->blanksBefore + text.size() + name->blanksAfter);
  name->text = texts_.Copy(both);
  return name;
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

KvfSection* KvfFile::NewSection(KvfKind kind, std::string_view writtenName, std::uint32_t line) {
  auto* section = nodes.New<KvfSection>();
  section->name = names_.Of(writtenName);
  section->kind = kind;
  section->SetLine(line);
  section->file = this;
  return section;
}

KvfSection* KvfFile::AddSection(KvfSection& parent, KvfKind kind, std::string_view writtenName, std::uint32_t line) {
  KvfSection* section = NewSection(kind, writtenName, line);
  Append(parent, *section);
  return section;
}

void KvfFile::MakeRoomForParam() {
  const std::size_t oldSize = room_ * sizeof(KvfParam);
  if (nodes.Extend(currentKeyword->params, oldSize, oldSize + sizeof(KvfParam))) {
    ++room_;
    return;
  }
  // Doubling keeps a long list linear that does not fit where it began.
  room_ *= 2;
  auto* moved = static_cast<KvfParam*>(nodes.Allocate(room_ * sizeof(KvfParam), alignof(KvfParam)));
  std::uninitialized_copy_n(currentKeyword->params, currentKeyword->count, moved);
  currentKeyword->params = moved;
}

KvfParam& KvfFile::ReplaceParams(KvfNode& keyword, KvfType type) {
  keyword.params = nodes.New<KvfParam>();
  keyword.params->type = type;
  keyword.count = 1;
  return *keyword.params;
}

void KvfFile::SetText(KvfParam& param, std::string_view value) {
  param.text = texts.Copy(value);
  param.length = static_cast<std::uint32_t>(value.size());
}

void KvfFile::CopyChildren(const KvfSection& from, KvfSection& to) {
  // `to` may be `from` or lie in it: a copy must not be copied again.
  const KvfNode* const last = from.lastChild;
  for (const KvfNode* node = from.firstChild; node; node = node == last ? nullptr : node->next) {
    if (const KvfSection* section = AsSection(node)) {
      KvfSection* copy = NewSection(KvfKind::Section, section->WrittenName(), 0);
      CopyChildren(*section, *copy);
      Append(to, *copy);
      continue;
    }
    KvfNode* copy = AddKeyword(to, node->WrittenName(), node->count);
    for (; copy->count < node->count; ++copy->count) {
      auto* param = new (&copy->params[copy->count]) KvfParam(node->params[copy->count]);
      param->lookedUp = false;
      if (param->IsText()) SetText(*param, param->Text());
    }
  }
}

void KvfFile::Clear(KvfSection& section) {
  section.firstChild = section.lastChild = nullptr;
  section.count = 0;
  section.index = nullptr;
}

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
    const int line = static_cast<int>(node.line);
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

  for (const KvfComment& comment : file.comments)
    result.push_back(
        {KvfUnread::Kind::Comment,
         comment.line,
         {},
         fmt::format("comment {}: comments behind the first target are not kept", Excerpt(Trimmed(comment.text)))});
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
        result.push_back({static_cast<int>(node.line), place, isKey ? std::string(node.Name()) : std::string(), *text});
    }
    return !node.IsKeyword();
  });
  return result;
}

}  // namespace tervane
