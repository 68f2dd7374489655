// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A parameter file in memory: targets hold sections and keywords, keywords hold typed parameters. The file owns two
// arenas, one with its nodes, one with its names and texts; the text that it was read from is not kept. Nodes never
// move.
#pragma once

#include <algorithm>
#include <cstdint>
#include <deque>
#include <memory>
#include <span>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

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
    const char* text;  ///< String and Filename: `length` bytes, no escapes, and a NUL behind.
  };
  std::uint32_t length = 0;
  KvfType type = KvfType::Int;
  bool lookedUp = false;

  KvfParam() : asInt(0) {}
  bool IsText() const { return type == KvfType::String || type == KvfType::Filename; }
  std::string_view Text() const { return {text, length}; }
};

/// A name; nodes of the same name share it.
struct KvfName {
  const char* text = "";  ///< A NUL stands behind, and behind that the written form where blanks surround the name.
  std::uint32_t length = 0;
  std::uint8_t blanksBefore = 0;  ///< Blanks inside the quotes: kept in the file, no part of the name.
  std::uint8_t blanksAfter = 0;
  bool isBare = false;  ///< It may be written without quotes.

  std::string_view Text() const { return {text, length}; }
  std::string_view Written() const {
    if (blanksBefore + blanksAfter == 0) return Text();
    return {text + length + 1, std::size_t{blanksBefore} + length + blanksAfter};
  }
};

/// A target, a section or a keyword. The parameters of a keyword usually lie right behind it.
struct alignas(KvfParam) KvfNode {
  const KvfName* name = &kNoName;
  KvfNode* next = nullptr;  ///< The following node of the same parent.
  KvfParam* params = nullptr;
  std::uint32_t count = 0;      ///< Number of parameters of a keyword, of children of a section.
  std::uint32_t line : 29 = 0;  ///< Where it was read; 0 for a node that was not.
  KvfKind kind : 2 = KvfKind::Section;
  bool lookedUp : 1 = false;

  static constexpr KvfName kNoName{};

  std::string_view Name() const { return name->Text(); }
  /// The name with the blanks that surround it in the file.
  std::string_view WrittenName() const { return name->Written(); }
  bool IsKeyword() const { return kind == KvfKind::Keyword; }
  /// Lines behind the last that fits are told as that one.
  void SetLine(std::uint32_t number) {
    constexpr std::uint32_t last = (1u << 29) - 1;
    line = std::min(number, last) & last;
  }
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
  T* New(std::size_t count = 1) {
    auto* first = static_cast<T*>(Allocate(count * sizeof(T), alignof(T)));
    std::uninitialized_default_construct_n(first, count);
    return first;
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

/// The names of a file. Those that come again and again are stored once.
class KvfNames {
 public:
  explicit KvfNames(KvfArena& texts) : texts_(texts) {}

  /// The name of a written form, which may have blanks around it.
  const KvfName* Of(std::string_view written);

 private:
  /// What tells short names apart, and hardly ever confuses long ones: the first and the last eight characters.
  struct Ends {
    std::uint64_t first, last;
    bool operator==(const Ends&) const = default;
  };
  struct Recent {
    Ends ends;
    const KvfName* name;
  };

  static Ends EndsOf(std::string_view name);
  const KvfName* Make(std::string_view written);

  KvfArena& texts_;
  std::vector<Recent> recent_;  ///< At each place the latest name of those that have it.
};

/// Where and why a text is no parameter file. Line and column (in characters) count from 1.
struct KvfSyntaxError {
  int line = 0;
  int column = 0;
  std::string message;  ///< "118:7: SearchRadius = 12x: a number was expected"
};

struct KvfComment {
  int line;
  std::string_view text;  ///< From its # on.
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

  std::string path;         ///< Where it was read from; empty for a file under construction.
  std::string folder;       ///< Absolute folder that relative filenames start from; of a file under construction, the
                            ///< folder that it will be written to. Empty when unknown.
  std::string_view header;  ///< Comments before the first target, written again in front.
  std::vector<KvfComment> comments;  ///< The comments that come later.
  KvfArena nodes;                    ///< Nodes and their parameters.
  KvfArena texts;                    ///< Names and texts.
  KvfSection top;                    ///< Its children are the targets.
  KvfSyntaxError syntaxError;
  std::vector<KvfNote> notes;
  int itemsWithoutSection = 0;  ///< What the counts of lists have asked for beyond the sections that there are.

  // Writing mode.
  std::vector<KvfSection*> open;  ///< The cursor: the open sections, outermost first; `top` is not among them.
  KvfNode* currentKeyword = nullptr;
  std::string unwritable;  ///< What was added although no file can hold it; empty when all is well.

  KvfSection& Cursor() { return open.empty() ? top : *open.back(); }
  KvfSection* AddSection(KvfSection& parent, KvfKind kind, std::string_view writtenName, std::uint32_t line = 0);
  /// A keyword with a place for so many parameters right behind it.
  KvfNode* AddKeyword(KvfSection& parent, std::string_view writtenName, std::uint32_t room, std::uint32_t line = 0) {
    void* place = nodes.Allocate(sizeof(KvfNode) + room * sizeof(KvfParam), alignof(KvfNode));
    auto* keyword = new (place) KvfNode;
    keyword->name = names_.Of(writtenName);
    keyword->kind = KvfKind::Keyword;
    keyword->SetLine(line);
    keyword->params = reinterpret_cast<KvfParam*>(keyword + 1);
    Append(parent, *keyword);
    return keyword;
  }
  /// A keyword that gets parameters one by one; only the latest can. Nearly all have one.
  void BeginKeyword(KvfSection& parent, std::string_view writtenName, std::uint32_t line = 0) {
    room_ = 1;
    currentKeyword = AddKeyword(parent, writtenName, room_, line);
  }
  KvfParam& AddParam(KvfType type) {
    if (currentKeyword->count == room_) MakeRoomForParam();
    auto* param = new (&currentKeyword->params[currentKeyword->count++]) KvfParam;
    param->type = type;
    return *param;
  }
  /// Gives a keyword one parameter instead of those that it has.
  KvfParam& ReplaceParams(KvfNode& keyword, KvfType type);
  void SetText(KvfParam& param, std::string_view value);
  /// Appends copies of all children of `from` to `to`.
  void CopyChildren(const KvfSection& from, KvfSection& to);
  /// Takes all nodes out of a section.
  void Clear(KvfSection& section);

  void Append(KvfSection& parent, KvfNode& child) {
    (parent.lastChild ? parent.lastChild->next : parent.firstChild) = &child;
    parent.lastChild = &child;
    ++parent.count;
    parent.index = nullptr;
  }
  KvfIndex& IndexOf(KvfSection& section);

 private:
  KvfSection* NewSection(KvfKind kind, std::string_view writtenName, std::uint32_t line);
  void MakeRoomForParam();

  KvfNames names_{texts};
  std::deque<KvfIndex> indices_;
  std::uint32_t room_ = 0;  ///< Number of parameters that have a place at `currentKeyword`.
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
