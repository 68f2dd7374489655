// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The tree of nodes: one node owns one section of the setup file. It holds the section's values as plain fields with
// their defaults, declares their keys, checks them, and says whether it takes part in the setup.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "core/condition.h"
#include "core/key_exchange.h"
#include "core/kvf.h"
#include "core/page_class.h"
#include "core/path.h"
#include "platform/key_number.h"

namespace tervane {

class CYbSEKvfGlobalBase;

/// A note only tells: nothing needs to be done.
enum class Severity { Error, Warning, Note };
/// "error", "warning", "note".
std::string_view NameOf(Severity severity);

/// What a validation found at a node.
struct Finding {
  Severity severity;
  std::string text;
  std::string key;     ///< The key that it speaks of; may be empty.
  std::string detail;  ///< The reason behind a fixed text; may be empty.

  bool operator==(const Finding&) const = default;
};

/// A line of the overview page.
struct OverviewLine {
  std::string title;
  int level = 0;
  std::string text;
};

/// The name under which a node is found from anywhere in its tree, with what it is found as: the node's class, or a
/// narrow class for code in folders below that class. Declared once, beside that class.
template <class Node>
struct ImportantName {
  std::string_view text;
};

/// A node. Owns its children; knows its parent, which outlives it.
class CYbSEKvfBase {
 public:
  /// The section name may hold one `%d` for the node's number; empty means that the node works in its parent's section.
  CYbSEKvfBase(std::string title, std::string sectionName, CYbSEKvfBase* parent);
  explicit CYbSEKvfBase(CYbSEKvfBase* parent) : CYbSEKvfBase({}, {}, parent) {}
  virtual ~CYbSEKvfBase();
  CYbSEKvfBase(const CYbSEKvfBase&) = delete;
  CYbSEKvfBase& operator=(const CYbSEKvfBase&) = delete;

  // ---- Tree

  /// Makes a child at the end: `NewChild<CSimTitleKvf>()`; the parent is passed as the constructor's last argument.
  template <class Node, class... Arguments>
  Node* NewChild(Arguments&&... arguments) {
    auto node = std::make_unique<Node>(std::forward<Arguments>(arguments)..., this);
    Node* child = node.get();
    AddChild(std::move(node));
    return child;
  }
  /// The same for a child that others find by a name.
  template <class Node, class FoundAs, class... Arguments>
  Node* NewImportantChild(ImportantName<FoundAs> name, Arguments&&... arguments);
  void AddChild(std::shared_ptr<CYbSEKvfBase> child);
  /// Takes a child (also a list's item) out of the walk; it stays alive with the caller, who must not keep it longer
  /// than the tree, and registered. Null when the node is no child.
  std::shared_ptr<CYbSEKvfBase> RemoveChild(CYbSEKvfBase* child);
  void SwapChilds(CYbSEKvfBase* a, CYbSEKvfBase* b);

  /// The first child of that class, or null.
  template <class Node>
  Node* Child() const {
    for (const auto& child : children_)
      if (auto* node = dynamic_cast<Node*>(child.get())) return node;
    return nullptr;
  }

  /// The walk over all children, in a list the plain children first and then the items. The node whose follower has
  /// been fetched may be removed.
  CYbSEKvfBase* GetFirstChild() const { return children_.empty() ? nullptr : children_.front().get(); }
  CYbSEKvfBase* GetNextChild(const CYbSEKvfBase* child) const;
  /// The children by number from 1; in a list the items alone.
  virtual CYbSEKvfBase* GetChild(int number) const;
  virtual int GetChildCount() const { return static_cast<int>(children_.size()); }
  /// Place of a child from 1, -1 when it is none; in a list the place among the items.
  virtual int GetNumberWhatIs(const CYbSEKvfBase* child) const;

  /// A second list of nodes, loaded and saved in front of the children.
  void AddProperty(std::shared_ptr<CYbSEKvfBase> property) { properties_.push_back(std::move(property)); }
  CYbSEKvfBase* GetProperty(int number) const;
  int GetPropertyCount() const { return static_cast<int>(properties_.size()); }

  CYbSEKvfBase* GetParent() const { return parent_; }
  /// The number of this node among all that the process made: what a view holds, since no later node has it.
  std::uint64_t Serial() const { return serial_; }
  /// The root of the tree; null in a tree without one.
  CYbSEKvfGlobalBase* GetRoot() const { return root_; }
  /// The node registered under that name, or null.
  template <class Node>
  Node* Important(ImportantName<Node> name) const {
    return dynamic_cast<Node*>(ImportantNode(name.text));
  }

  // ---- Section

  virtual const std::string& GetSectionName() const { return sectionName_; }
  virtual void SetSectionName(std::string name) { sectionName_ = std::move(name); }
  /// The section name with the node's number in the place of `%d`.
  std::string FormattedSectionName() const;
  void SetSectionNumber(int number) { sectionNumber_ = number; }
  /// The section number when it is set, else the place among the parent's children.
  virtual int GetNumberWhatAmI() const;
  virtual int GetSectionUsed() const { return sectionUsed_; }
  void SetSectionUsed(int used) { sectionUsed_ = used; }

  // ---- Texts

  virtual const std::string& GetTitle() const { return title_; }
  virtual void SetTitle(std::string title) { SetTexts(std::move(title), std::move(abbreviatedTitle_)); }
  /// Name of the node's class; that of its type unless the node is one of several rows of one type.
  std::string ClassName() const;
  virtual const std::string& GetAbbreviatedTitle() const { return abbreviatedTitle_; }
  virtual void SetAbbreviatedTitle(std::string title) { SetTexts(std::move(title_), std::move(title)); }
  void SetHelp(std::string helpFile, std::string page);
  /// The page name given to `SetHelp`.
  const std::string& GetHtml() const { return helpPage_; }
  const std::string& GetHelpFile() const { return helpFile_; }

  /// The class of the node's page in that tree, or null when the tree does not show the node.
  virtual const PageClass* GetDlgRuntimeClass(int treeId) const {
    return treeId == kSetupDataTree ? setupPage_ : nullptr;
  }

  // ---- File

  /// Reads the node and all below it from its section in the parent's section. Nothing fails: what is missing keeps
  /// its value.
  virtual void Load(KvfNode* parentSection);
  virtual void Save(KvfFile* file);
  virtual void ReadData(KvfNode* section);
  virtual void WriteData(KvfFile* file);
  /// Adds what the node's declaration tells of its keys.
  void DescribeKeys(std::vector<KeyInfo>& keys);
  /// A list reads and writes its item count here.
  virtual void LoadSize(KvfNode* /*section*/) {}
  virtual void SaveSize(KvfFile* /*file*/) {}

  void ReadTouched(KvfNode* section);
  void Touch() { touched_ = 1; }
  void TouchAllChildren();
  int GetHasBeenTouched() const { return touched_; }

  // ---- Taking part and validation

  /// The node's own answer, by its rule.
  virtual int IsDlgUsedInSetup() { return takesPart_.Holds(*this); }
  /// Its rule; one that always holds where the node has none.
  const Condition& TakesPartRule() const { return takesPart_; }
  /// The section bore another name in documents up to that version; a constant.
  void SetOldSectionName(int lastVersion, std::string_view name) { oldSection_ = {lastVersion, name}; }
  /// Sets the rule; a word behind the making of a child: `NewChild<...>(...)->TakesPartWhen(OwnEngine())`.
  void TakesPartWhen(Condition rule) { takesPart_ = std::move(rule); }
  /// Whether the node takes part: its own answer and that of all nodes above it. Written to the file.
  virtual int IsDataUsedInSetup();

  /// Clears and makes the findings of this node and of all below it; nodes that take no part have none. Non-zero when
  /// no error stands.
  int Validate() { return ValidateAs(IsDataUsedInSetup() != 0); }
  /// The node's own checks; 0 when the node is not valid.
  virtual int ValidateData() { return 1; }
  /// Result of the latest validation, also of the nodes below.
  int Valid() const { return valid_; }
  const std::vector<Finding>& Findings() const { return findings_; }
  void ReValidate() { Validate(); }
  /// Asks for a validation of the whole tree at the next update.
  void SetRevalidateAll();

  /// Adds the node's lines to the overview: one for each key.
  virtual int AddToOverview(std::vector<OverviewLine>& lines, int level);

  /// Reset hook of list items.
  virtual void SetDefault() {}

  /// False for a node that shows what others wrote: nothing at or below it is the setup's, so that undo, validation and
  /// findings pass over it. There may be very many such nodes.
  virtual bool HoldsSetup() const { return true; }

 protected:
  /// The keys of the node in the order of the file.
  virtual void ExchangeKeys(KeyExchange& /*keys*/) {}
  /// All that a change may change: the keys, and behind them what the node holds beside the file.
  virtual void ExchangeState(KeyExchange& keys) { ExchangeKeys(keys); }

  void AddError(std::string text, std::string key = {}, std::string detail = {});
  void AddWarning(std::string text, std::string key = {}, std::string detail = {});
  void AddFinding(Finding finding) { findings_.push_back(std::move(finding)); }

  /// The name of a node that has no type of its own, but is a row of a table; a constant.
  void SetClassName(std::string_view name) { className_ = name; }
  /// The page that the tree of the setup data shows.
  void SetPage(const PageClass& page) { setupPage_ = &page; }
  void SectionName(std::string name) { sectionName_ = std::move(name); }
  /// The node's section in the parent's section, marked as looked up; null when there is none.
  KvfNode* FindSection(KvfNode* parentSection) const;
  void LoadChildren(KvfNode* section);
  void SaveChildren(KvfFile* file);
  CYbSEKvfBase* ImportantNode(std::string_view name) const;

  // For lists, whose items stand behind the plain children.
  std::vector<std::shared_ptr<CYbSEKvfBase>> children_;
  std::size_t plainChildren_ = 0;
  /// Place of a child in `children_`, or -1.
  std::ptrdiff_t IndexOfChild(const CYbSEKvfBase* child) const;
  bool MissedSection(const CYbSEKvfBase& child) const { return child.missedSection_; }
  /// While the node is validated: as one of those below its parent, which was validated just before.
  bool IsValidatedWithParent() const { return parent_ && parent_->validatesBelow_; }

 private:
  /// Validates, where the nodes above have said whether this one takes part.
  int ValidateAs(bool takesPart);
  /// Adds the findings for values that their keys do not allow.
  void CheckValues();
  void SetTexts(std::string title, std::string abbreviatedTitle);
  friend class CYbSEKvfGlobalBase;
  friend class UndoStack;

  // What every walk asks stands in front, close together: a walk over many nodes waits for memory more than it works.
  // What undo compares stands there and at the end, beside the values of the node's class.
  std::vector<std::shared_ptr<CYbSEKvfBase>> properties_;
  CYbSEKvfBase* parent_;
  CYbSEKvfGlobalBase* root_;
  const std::uint64_t serial_;
  int touched_ = 0;
  int sectionNumber_ = -1;
  int sectionUsed_ = 1;
  int sectionInstance_ = 1;              ///< Which of several like sections of the parent is this node's.
  mutable std::uint32_t placeHint_ = 0;  ///< Place among the siblings when last asked; checked before use.
  int valid_ = 1;
  bool missedSection_ = false;  ///< The latest load looked for the section and did not find it.
  bool isImportant_ = false;    ///< Registered at the root at least once.
  /// The latest validation found nothing here and below: where nothing takes part, nothing is to be cleared.
  bool isClear_ = true;
  bool validatesBelow_ = false;
  std::vector<Finding> findings_;
  Condition takesPart_;
  std::string sectionName_, helpFile_, helpPage_;
  std::string_view className_;  ///< Empty where the type tells it.
  struct {
    int lastVersion = -1;
    std::string_view name;
  } oldSection_;  ///< Without a name where the section had always the same.
  const PageClass* setupPage_ = nullptr;
  std::string title_, abbreviatedTitle_;
  std::uint64_t textsNumber_ = 0;  ///< A number of both, so that undo need not read them.
};

/// A node that is meant to hold further nodes.
class CYbSEKvfGroupBase : public CYbSEKvfBase {
 public:
  using CYbSEKvfBase::CYbSEKvfBase;

  /// A group without a section has no data of its own: its children work in its parent's section.
  void Load(KvfNode* parentSection) override;
  void Save(KvfFile* file) override;
};

class CTvnKvfGroupBase : public CYbSEKvfGroupBase {
 public:
  using CYbSEKvfGroupBase::CYbSEKvfGroupBase;
};

class CTvnKvfBase : public CYbSEKvfBase {
 public:
  using CYbSEKvfBase::CYbSEKvfBase;
};

/// The root of a tree: the target of the file, and the table by which nodes find each other.
class CYbSEKvfGlobalBase : public CYbSEKvfBase {
 public:
  explicit CYbSEKvfGlobalBase(std::string targetName);
  ~CYbSEKvfGlobalBase() override;

  const std::string& GetTargetName() const { return targetName_; }
  void RegisterImportantNode(CYbSEKvfBase* node, std::string_view name);
  /// The node under that name, or null.
  CYbSEKvfBase* GetImportantNode(std::string_view name) const;
  void UnregisterImportantNode(std::string_view name);
  /// Takes out all names of a node, before it dies.
  void UnregisterNode(const CYbSEKvfBase* node);

  /// Whether `IsDataUsedInSetup` is written into every section.
  virtual int WriteUsedFlags() { return 0; }
  /// Version of the document that was read; -1 when its file holds none or nothing was read.
  virtual int ReadDocVersion() const { return -1; }

  /// Reads the children from the target; `parentSection` is the file's top level.
  void Load(KvfNode* parentSection) override;
  void Save(KvfFile* file) override;

  /// Folder of the setup's file, from which the names of files that the user picks start; empty for a new setup.
  const std::string& SetupFolder() const { return setupFolder_; }
  void SetSetupFolder(std::string folder) { setupFolder_ = std::move(folder); }

  /// True once after `SetRevalidateAll`.
  bool TakeRevalidateAll() { return std::exchange(revalidateAll_, false); }

 private:
  friend class CYbSEKvfBase;

  /// Names are looked up all the time, as constants: without copies.
  struct HashOfName {
    using is_transparent = void;
    std::size_t operator()(std::string_view name) const { return std::hash<std::string_view>()(name); }
  };

  std::string targetName_;
  std::unordered_map<std::string, CYbSEKvfBase*, HashOfName, std::equal_to<>> importantNodes_;
  std::string setupFolder_;
  bool revalidateAll_ = false;
};

template <class Node, class FoundAs, class... Arguments>
Node* CYbSEKvfBase::NewImportantChild(ImportantName<FoundAs> name, Arguments&&... arguments) {
  static_assert(std::is_base_of_v<FoundAs, Node>);
  Node* child = NewChild<Node>(std::forward<Arguments>(arguments)...);
  // Parts of a tree stand alone in tests and in references.
  if (root_) root_->RegisterImportantNode(child, name.text);
  return child;
}

/// A rectangle of map coordinates; undefined when all four are exactly 0.
struct DataArea {
  double x0 = 0, y0 = 0, x1 = 0, y1 = 0;

  bool IsUndefined() const { return x0 == 0.0 && y0 == 0.0 && x1 == 0.0 && y1 == 0.0; }
  bool operator==(const DataArea& other) const {
    return SameNumber(x0, other.x0) && SameNumber(y0, other.y0) && SameNumber(x1, other.x1) && SameNumber(y1, other.y1);
  }
};

/// A root that knows the area that maps show.
class CTvnKvfGlobalBase : public CYbSEKvfGlobalBase {
 public:
  using CYbSEKvfGlobalBase::CYbSEKvfGlobalBase;

  /// The largest area; non-zero when it changed.
  int SetMaxDataArea(const DataArea& area) {
    const bool changed = !(area == maxArea_);
    maxArea_ = area;
    return changed;
  }
  void SetDefaultDataArea(const DataArea& area) { defaultArea_ = area; }
  const DataArea& GetMaxDataArea() const { return maxArea_; }
  const DataArea& GetDefaultDataArea() const { return defaultArea_; }
  /// Sets `undefined` to whether the default area is undefined.
  void IsUndefined(int& undefined) const { undefined = defaultArea_.IsUndefined(); }

 protected:
  void ExchangeState(KeyExchange& keys) override {
    for (DataArea* area : {&maxArea_, &defaultArea_})
      for (double* value : {&area->x0, &area->y0, &area->x1, &area->y1}) keys("area", *value);
  }

 private:
  DataArea maxArea_, defaultArea_;
};

/// A node as a walk meets it.
struct NodePlace {
  CYbSEKvfBase& node;
  std::string path;  ///< As every program and message writes it; a node without a section goes by its class name.
  int depth;         ///< 1 for the children of the root.
  bool takesPart;    ///< Together with all nodes above it.
};
/// Visits all nodes below the root, parents first, in the order of the walk.
void WalkNodes(CYbSEKvfBase& root, const std::function<void(const NodePlace&)>& visit);

/// The path steps of a node's children. Call `StepOf` in the order of the walk: a call computes the steps of the child
/// and of the children skipped before it; nothing is computed without a call.
class ChildSteps {
 public:
  explicit ChildSteps(const CYbSEKvfBase& parent) : parent_(parent), next_(parent.GetFirstChild()) {}
  std::string StepOf(const CYbSEKvfBase& child);

 private:
  const CYbSEKvfBase& parent_;
  CYbSEKvfBase* next_;
  std::unordered_map<std::string, int> instances_;
};
/// The path of one node, as a walk gives it; empty for the root.
std::string PathOf(const CYbSEKvfBase& node);

/// The child that a step of a path names, or null.
CYbSEKvfBase* FindChild(const CYbSEKvfBase& parent, const PathStep& step);
/// The node at the end of the steps, or null; no steps lead to the root itself.
CYbSEKvfBase* FindNode(CYbSEKvfBase& root, const std::vector<PathStep>& steps);
/// The node's name in a path, without an instance number.
std::string StepName(const CYbSEKvfBase& node);

/// The overview of a tree: the lines of all nodes that take part. 0 on failure.
int GenerateOverview(CYbSEKvfBase& root, std::vector<OverviewLine>& lines);
/// The lines as the text of the overview page.
std::string OverviewText(const std::vector<OverviewLine>& lines);

/// Name of the node's class.
inline std::string ClassNameOf(const CYbSEKvfBase& node) { return node.ClassName(); }

}  // namespace tervane
