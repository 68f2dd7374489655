// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A parameter file in memory: targets hold sections and keywords, keywords hold typed parameters. The file owns one
// buffer with its text and one arena with its tree; names and texts are views into either. Nodes never move.
#pragma once

#include <cstdint>
#include <deque>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "platform/files.h"

namespace tervane {

struct KvfFile;

enum class KvfKind : std::uint8_t { File, Target, Section, Keyword };
enum class KvfType : std::uint8_t { Int, Float, Double, Bool, String, Filename };

/// One typed value of a keyword.
struct KvfParam {
  union {
    std::int32_t asInt;
    float asFloat;
    double asDouble;
    bool asBool;
    const char* text;  ///< String and Filename: `length` bytes, no escapes.
  };
  std::uint32_t length = 0;
  KvfType type = KvfType::Int;
  bool lookedUp = false;
  bool terminated = false;  ///< The text is followed by a NUL.

  KvfParam() : asInt(0) {}
  bool IsText() const { return type == KvfType::String || type == KvfType::Filename; }
  std::string_view Text() const { return {text, length}; }
};

/// A target, a section or a keyword.
struct KvfNode {
  const char* nameText = "";
  std::uint32_t nameLength = 0;
  KvfKind kind = KvfKind::Section;
  bool lookedUp : 1 = false;
  bool nameTerminated : 1 = false;
  std::uint8_t blanksBefore = 0;  ///< Blanks around the name inside its quotes: kept in the file, no part of the name.
  std::uint8_t blanksAfter = 0;
  KvfNode* next = nullptr;  ///< The following node of the same parent.
  KvfParam* params = nullptr;
  std::uint32_t count = 0;     ///< Number of parameters of a keyword, of children of a section.
  std::uint32_t capacity = 0;  ///< Number of parameters of a keyword that have a place.

  std::string_view Name() const { return {nameText, nameLength}; }
  /// The name with the blanks that surround it in the file.
  std::string_view WrittenName() const {
    return {nameText - blanksBefore, std::size_t{nameLength} + blanksBefore + blanksAfter};
  }
  bool IsKeyword() const { return kind == KvfKind::Keyword; }
};

class KvfIndex;

/// A node that holds others: the file's top level, a target or a section.
struct KvfSection : KvfNode {
  KvfFile* file = nullptr;
  KvfNode* firstChild = nullptr;
  KvfNode* lastChild = nullptr;
  KvfIndex* index = nullptr;  ///< Made when a large section is first asked.
};

/// The nodes of a large section by number and by name, so that asking for each of n nodes costs n steps.
class KvfIndex {
 public:
  explicit KvfIndex(const KvfSection& section);

  KvfNode* Node(std::size_t number) const { return At(nodes_, number); }
  KvfNode* Keyword(std::size_t number) const { return At(keywords_, number); }
  KvfNode* Find(bool keyword, std::string_view name, std::size_t instance);

 private:
  /// The nodes of one kind by name.
  class Names {
   public:
    void Add(const std::vector<KvfNode*>& nodes);
    KvfNode* Find(std::string_view name, std::size_t instance);

   private:
    struct Group {
      std::uint32_t hash;
      std::uint32_t first;  ///< Place of the first node in `grouped_`.
      std::uint32_t count;
    };

    static std::uint32_t HashOf(std::string_view name);
    std::string_view NameOf(const Group& group) const { return grouped_[group.first]->Name(); }
    const Group* FindGroup(std::string_view name);

    std::vector<std::uint32_t> slots_;  ///< Number of a group from 1, or 0, at its hash or behind.
    std::vector<Group> groups_;         ///< In the order of their first nodes.
    std::vector<KvfNode*> grouped_;     ///< Equal names side by side, in the order of the file.
    std::size_t latest_ = 0;            ///< The group that was found last.
  };

  static KvfNode* At(const std::vector<KvfNode*>& nodes, std::size_t number) {
    return number >= 1 && number <= nodes.size() ? nodes[number - 1] : nullptr;
  }

  std::vector<KvfNode*> nodes_, keywords_;
  Names keywordNames_, sectionNames_;
};

/// Memory that is handed out in order and freed as a whole.
class KvfArena {
 public:
  /// Uninitialised memory; `alignment` is a power of two.
  void* Allocate(std::size_t size, std::size_t alignment) {
    auto* start = reinterpret_cast<char*>((reinterpret_cast<std::uintptr_t>(next_) + alignment - 1) & ~(alignment - 1));
    // Behind a chunk that is full to an odd byte the next aligned place lies beyond its end.
    if (start == nullptr || start > end_ || size > static_cast<std::size_t>(end_ - start)) return AllocateChunk(size);
    next_ = start + size;
    return start;
  }
  template <class T>
  T* New() {
    return new (Allocate(sizeof(T), alignof(T))) T;
  }
  /// A copy of the text, followed by a NUL.
  const char* Copy(std::string_view text);
  /// Lengthens the latest allocation in place; false where that is not possible.
  bool Extend(const void* start, std::size_t oldSize, std::size_t newSize);
  bool Owns(const void* address) const;
  /// Bytes of all that was handed out, and of the rest of the latest piece.
  std::size_t Size() const { return size_; }

 private:
  void* AllocateChunk(std::size_t size);

  struct Chunk {
    std::unique_ptr<char[]> memory;
    std::size_t size;
  };
  std::vector<Chunk> chunks_;
  std::size_t size_ = 0;
  char* next_ = nullptr;
  char* end_ = nullptr;
};

/// Where and why a text is no parameter file. Line and column (in characters) count from 1.
struct KvfSyntaxError {
  int line = 0;
  int column = 0;
  std::string message;  ///< "118:7: SearchRadius = 12x: a number was expected"
};

/// What a reader found odd about a node that it read all the same.
struct KvfNote {
  const KvfNode* node;
  std::string text;
};

/// A parameter file. Reading mode: made by the parser. Writing mode: empty, with a cursor at top level.
struct KvfFile {
  KvfFile();
  KvfFile(const KvfFile&) = delete;
  KvfFile& operator=(const KvfFile&) = delete;

  std::string path;    ///< Where it was read from; empty for a file under construction.
  std::string folder;  ///< Absolute folder that relative filenames start from; of a file under construction, the
                       ///< folder that it will be written to. Empty when unknown.
  FileContent text;
  std::string_view header;              ///< Comments before the first target, written again in front.
  std::vector<std::uint32_t> comments;  ///< Places in the text of the comments that come later.
  KvfArena arena;
  KvfSection top;  ///< Its children are the targets.
  KvfSyntaxError syntaxError;
  std::vector<KvfNote> notes;

  // Writing mode.
  std::vector<KvfSection*> open;  ///< The cursor: the open sections, outermost first; `top` is not among them.
  KvfNode* currentKeyword = nullptr;
  std::string unwritable;  ///< What was added although no file can hold it; empty when all is well.

  KvfSection& Cursor() { return open.empty() ? top : *open.back(); }
  KvfSection* AddSection(KvfSection& parent, KvfKind kind, std::string_view writtenName);
  KvfNode* AddKeyword(KvfSection& parent, std::string_view writtenName);
  KvfParam& AddParam(KvfNode& keyword, KvfType type) {
    if (keyword.count == keyword.capacity) MakeRoomForParam(keyword);
    auto* param = new (&keyword.params[keyword.count++]) KvfParam;
    param->type = type;
    return *param;
  }
  void SetText(KvfParam& param, std::string_view value);
  /// Appends copies of all children of `from` to `to`.
  void CopyChildren(const KvfSection& from, KvfSection& to);
  /// Takes all nodes out of a section.
  void Clear(KvfSection& section);

  /// The line of a node, from 1; 0 for a node that was not parsed.
  int LineOf(const KvfNode& node) const;
  int LineAt(const char* place) const;

  void Append(KvfSection& parent, KvfNode& child) {
    (parent.lastChild ? parent.lastChild->next : parent.firstChild) = &child;
    parent.lastChild = &child;
    ++parent.count;
    parent.index = nullptr;
  }
  KvfIndex& IndexOf(KvfSection& section);

 private:
  KvfSection* NewSection(KvfKind kind, std::string_view writtenName);
  void SetName(KvfNode& node, std::string_view writtenName);
  void MakeRoomForParam(KvfNode& keyword);

  std::deque<KvfIndex> indices_;
  mutable std::vector<std::uint32_t> lineStarts_;  ///< Made when a line is first asked.
};

// Walking without leaving a trace: nothing below marks a node as looked up.

/// The n-th node of that name among the keywords or the sections, or null.
KvfNode* FindKvfNode(KvfSection& section, bool keyword, std::string_view name, std::size_t instance = 1);
KvfNode* FindKvfNode(KvfSection& section, std::size_t number);
KvfNode* FindKvfKeyword(KvfSection& section, std::size_t number);

inline KvfSection* AsSection(KvfNode* node) {
  return node && !node->IsKeyword() ? static_cast<KvfSection*>(node) : nullptr;
}
inline const KvfSection* AsSection(const KvfNode* node) {
  return node && !node->IsKeyword() ? static_cast<const KvfSection*>(node) : nullptr;
}

/// Something in a file that nothing asked for.
struct KvfUnread {
  enum class Kind { Target, Section, Keyword, Parameter, Comment };
  Kind kind;
  int line;
  std::string
      path;  ///< As every program and message writes it: sections joined by `/`, `:Key` behind; below the target.
  std::string text;  ///< A sentence for the user.
};

struct KvfPlacedNote {
  int line;
  std::string path;  ///< Path of the section.
  std::string key;
  std::string text;
};

/// What nothing looked up since the file was parsed, in the order of the file; a section that nothing looked up stands
/// for all that it holds. Comments behind the first target come last.
std::vector<KvfUnread> CollectUnread(const KvfFile& file);
/// The notes with their places, in the order of the file.
std::vector<KvfPlacedNote> CollectNotes(const KvfFile& file);

}  // namespace tervane
