// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The process templates of a setup: one for each compartment, with what its constants and forcings are bound to.
#pragma once

#include <array>
#include <memory>
#include <string>
#include <vector>

#include "core/list.h"
#include "simspec/water_quality_processes.h"
#include "wqpt/kinetra_template.h"

namespace tervane {

/// A constant or forcing of a template, and the value of the model that it is bound to.
struct KinetraBinding {
  const CKinetraSolverItem* item;  ///< Of the template that holds it.
  int dataType = -1;               ///< A code of `KinetraParameter`, -1 while unbound.
  int unit = -1;                   ///< A unit key, -1 while none is chosen.
};

/// A template in use: its file, how it is integrated, and its bindings.
class CKinetraSolver {
 public:
  enum IntegrationMethod : int { kEuler = 0, kRk4 = 1, kRkqc = 2 };

  int enabled = 0;
  FileName file;
  int method = kEuler;
  int frequency = 1;  ///< Of updates.
  std::vector<KinetraBinding> constants, forcings;

  const KinetraTemplate& Content() const { return *content_; }
  const std::shared_ptr<const KinetraTemplate>& SharedContent() const { return content_; }
  /// Reads the file. Bindings stay with the symbols that the template still has, in any case.
  void Load();
  /// Takes a content that was read before, with bindings as `BoundNumbers` gave them.
  void Restore(std::shared_ptr<const KinetraTemplate> content, const std::vector<int>& boundNumbers);
  std::vector<int> BoundNumbers() const;

 private:
  std::shared_ptr<const KinetraTemplate> content_ = std::make_shared<const KinetraTemplate>();
};

/// The compartments, as places of their templates.
enum KinetraCompartment : int { kKinetraOverland = 0, kKinetraUnsaturated = 1, kKinetraSaturated = 2 };
inline constexpr int kKinetraCompartments = 3;

/// The bindings of a compartment's constants or forcings. They are held by the template in use.
class CKinetraCompSpecKvf : public CTvnKvfBase {
 public:
  CKinetraCompSpecKvf(int compartment, bool isOfForcings, CYbSEKvfBase* parent);

  bool IsOfForcings() const { return isOfForcings_; }
  /// What is to be said of the latest reading, where a bound symbol was not in the template; else empty.
  const std::string& ReadingMessage() const { return readingMessage_; }
  /// What the compartment has to offer: a mask of `KinetraNeeds`.
  std::uint64_t Mask() const;
  CKinetraSolver& Solver() const;
  std::vector<KinetraBinding>& Bindings() const { return isOfForcings_ ? Solver().forcings : Solver().constants; }

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
  /// Nothing: the parent holds it all.
  void ExchangeState(KeyExchange& /*keys*/) override {}

 private:
  int compartment_;
  bool isOfForcings_;
  std::string readingMessage_;
};

/// The node, "KINETRASPEC".
class CKinetraSpecKvf : public CTvnKvfBase, public ProcessTemplates {
 public:
  explicit CKinetraSpecKvf(CYbSEKvfBase* parent);

  CKinetraSolver& Solver(int compartment) { return solvers_[static_cast<std::size_t>(compartment)]; }
  const CKinetraSolver& Solver(int compartment) const { return solvers_[static_cast<std::size_t>(compartment)]; }

  /// Templates are modelled, and each compartment of those bits takes part in water quality and has its template on.
  bool IsCompartmentActive(int bits) const;
  bool IsTemplateUsed(int compartment) const override { return IsCompartmentActive(compartment); }
  bool IsBuiltInUsed(int code) const override;

  /// Takes another template, which for overland flow must be another file. With `lSync` the compartment's values and
  /// the species get what the template has and they lack.
  void SetTemplate(int compartment, FileName file, bool lSync);
  /// Gives new water quality layers the values that the template in use there asks for.
  void CompleteLayers();
  /// Reads the templates of all active compartments anew, with the same step. Gives what was added, in words.
  std::vector<std::string> RefreshTemplates();
  /// The templates in use whose files are others now than when they were read, each once.
  std::vector<std::string> TemplatesOtherOnDisk() const;

  void ReadData(KvfNode* section) override;
  /// Warnings alone: templates that cannot be read, symbols that are declared twice.
  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
  void ExchangeState(KeyExchange& keys) override;

 private:
  void SynchronizeValues(int compartment, std::vector<std::string>& added);
  void UpdateSpecies(std::vector<std::string>& added);

  std::array<CKinetraSolver, kKinetraCompartments> solvers_;
  /// All that undo may lead back to.
  std::vector<std::shared_ptr<const KinetraTemplate>> contents_;
};
inline constexpr ImportantName<CKinetraSpecKvf> kKinetraSpecification{"KINETRASPEC"};

/// `IsCompartmentActive` as a rule.
Condition CompartmentActive(int bits);
/// All of that but whether the template is on.
Condition CompartmentMayHaveTemplate(int compartment);

}  // namespace tervane
