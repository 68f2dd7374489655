// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The values of those constants and forcings of process templates that the user specifies: over ground, in each water
// quality layer, and layer by layer in the soil. An item bears the symbol of its variable. Lists grow with the template
// and never shrink.
#pragma once

#include <memory>
#include <string>
#include <unordered_set>
#include <vector>

#include "core/named_item.h"
#include "platform/text.h"
#include "spatial/data2d.h"
#include "spatial/stations.h"

namespace tervane {

/// A list of such values.
class KinetraValueList {
 public:
  virtual ~KinetraValueList() = default;
  /// Appends an item for each symbol that has none, in any case; gives those.
  virtual std::vector<std::string> AppendMissing(const std::vector<std::string>& symbols) = 0;
};

/// An item: the symbol stands ahead of the node's own keys.
template <class Node>
class KinetraValue : public Node {
 public:
  /// `titlePrefix` stands in front of the symbol in the title.
  template <class... Arguments>
  explicit KinetraValue(std::string titlePrefix, Arguments&&... arguments)
      : Node(std::forward<Arguments>(arguments)...), titlePrefix_(std::move(titlePrefix)) {}

  std::string Name;

  const std::string& GetTitle() const override { return shownTitle_ = titlePrefix_ + Name; }
  const std::string& GetAbbreviatedTitle() const override { return Name; }

 protected:
  void ExchangeKeys(KeyExchange& keys) override {
    keys("Name", Name);
    Node::ExchangeKeys(keys);
  }

 private:
  std::string titlePrefix_;
  mutable std::string shownTitle_;
};

// ---- Over an area

class KinetraConstantKvf : public KinetraValue<CData2DKvf> {
 public:
  KinetraConstantKvf(std::string_view className, CYbSEKvfBase* parent);
};
class KinetraForcingKvf : public KinetraValue<C2DStationBasedDataKvf> {
 public:
  KinetraForcingKvf(std::string_view className, CYbSEKvfBase* parent);
};

// ---- In the soil, layer by layer

/// How a variable of the soil is told.
enum KinetraDistribution : int { kKinetraUniform = 0, kKinetraByLayers = 1 };
inline constexpr KeyChoice kKinetraDistributions[] = {{kKinetraUniform, "Uniform"}, {kKinetraByLayers, "Layer based"}};

/// A layer of a constant.
class CKinetraConstantsUZWQLayerItemKvf : public NamedItemKvf {
 public:
  CKinetraConstantsUZWQLayerItemKvf(const int& distribution, CYbSEKvfBase* parent);
};
/// A layer of a forcing.
class CKinetraForcingsUZWQLayerItemKvf : public NamedItemKvf {
 public:
  CKinetraForcingsUZWQLayerItemKvf(const int& distribution, CYbSEKvfBase* parent);
};

/// The layers of a variable, whatever they hold; for pages.
class KinetraSoilLayers {
 public:
  virtual ~KinetraSoilLayers() = default;

  int DistributionType = kKinetraUniform;
  double Distribution_UniformValue = 0;
};

template <class Layer>
class KinetraSoilListKvf : public CYbSEKvfAbstractListBase<Layer>, public KinetraSoilLayers {
 public:
  using CYbSEKvfAbstractListBase<Layer>::CYbSEKvfAbstractListBase;

  std::unique_ptr<Layer> NewItem() override { return std::make_unique<Layer>(DistributionType, this); }

 protected:
  void ExchangeKeys(KeyExchange& keys) override {
    keys("DistributionType", DistributionType).OneOf(kKinetraDistributions);
    keys("Distribution_UniformValue", Distribution_UniformValue).Quantity(quantity::kUndefined);
    keys.Count("NumberOfLayers", *this);
  }
};

class CKinetraConstantsUZWQLayerListKvf : public KinetraValue<KinetraSoilListKvf<CKinetraConstantsUZWQLayerItemKvf>> {
 public:
  CKinetraConstantsUZWQLayerListKvf(std::string_view className, CYbSEKvfBase* parent);
};
class CKinetraForcingsUZWQLayerListKvf : public KinetraValue<KinetraSoilListKvf<CKinetraForcingsUZWQLayerItemKvf>> {
 public:
  CKinetraForcingsUZWQLayerListKvf(std::string_view className, CYbSEKvfBase* parent);
};

// ---- The lists

/// What makes one list differ from the next.
struct KinetraListKind {
  const char* title;
  const char* section;
  const char* helpPage;
  const char* itemClassName;
};

template <class Item>
class KinetraListKvf : public CYbSEKvfAbstractListBase<Item>, public KinetraValueList {
 public:
  /// `kind` must outlive the node: a constant.
  KinetraListKvf(const KinetraListKind& kind, Condition takesPart, CYbSEKvfBase* parent);

  std::unique_ptr<Item> NewItem() override { return std::make_unique<Item>(itemClassName_, this); }

  std::vector<std::string> AppendMissing(const std::vector<std::string>& symbols) override {
    std::unordered_set<std::string> there;
    for (int number = 1; number <= this->GetItemCount(); ++number) there.insert(LowerCase(this->GetItem(number)->Name));
    std::vector<std::string> added;
    for (const std::string& symbol : symbols) {
      if (!there.insert(LowerCase(symbol)).second) continue;
      this->AddItem()->Name = symbol;
      added.push_back(symbol);
    }
    return added;
  }

 private:
  std::string_view itemClassName_;
};

class CKinetraConstantsOLKvf : public KinetraListKvf<KinetraConstantKvf> {
 public:
  explicit CKinetraConstantsOLKvf(CYbSEKvfBase* parent);
};
inline constexpr ImportantName<CKinetraConstantsOLKvf> kKinetraConstantsOverland{"KINETRACONSTANTSOL"};

class CKinetraForcingsOLKvf : public KinetraListKvf<KinetraForcingKvf> {
 public:
  explicit CKinetraForcingsOLKvf(CYbSEKvfBase* parent);
};
inline constexpr ImportantName<CKinetraForcingsOLKvf> kKinetraForcingsOverland{"KINETRAFORCINGSOL"};

class CKinetraConstantsSZKvf : public KinetraListKvf<KinetraConstantKvf> {
 public:
  explicit CKinetraConstantsSZKvf(CYbSEKvfBase* parent);
};
class CKinetraForcingsSZKvf : public KinetraListKvf<KinetraForcingKvf> {
 public:
  explicit CKinetraForcingsSZKvf(CYbSEKvfBase* parent);
};

class CKinetraConstantsUZKvf : public KinetraListKvf<CKinetraConstantsUZWQLayerListKvf> {
 public:
  explicit CKinetraConstantsUZKvf(CYbSEKvfBase* parent);
};
inline constexpr ImportantName<CKinetraConstantsUZKvf> kKinetraConstantsSoil{"KINETRA_CONSTANTS_UZ"};

class CKinetraForcingsUZKvf : public KinetraListKvf<CKinetraForcingsUZWQLayerListKvf> {
 public:
  explicit CKinetraForcingsUZKvf(CYbSEKvfBase* parent);
};
inline constexpr ImportantName<CKinetraForcingsUZKvf> kKinetraForcingsSoil{"KINETRA_FORCINGS_UZ"};

}  // namespace tervane
