// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Which solver a Modflow engine uses for flow below ground, the values of each solver, and what its flow packages are
// told. The keys bear the names that the packages give them.
#pragma once

#include <functional>
#include <optional>
#include <string_view>
#include <variant>
#include <vector>

#include "core/condition.h"
#include "core/node.h"

namespace tervane {

/// `SolverOption` with a Modflow engine.
enum ModflowSolver : int { kSolverSOR = 0, kSolverSIP = 1, kSolverPCG4 = 2, kSolverPCG2 = 3, kSolverLMG = 4 };
inline constexpr KeyChoice kModflowSolvers[] = {
    {kSolverSOR, "Slice-Successive Overrelaxation (SOR)"},
    {kSolverSIP, "Strongly Implicit Procedure (SIP)"},
    {kSolverPCG4, "Preconditioned Conjugate Gradient with Newton-Raphson (PCG4)"},
    {kSolverPCG2, "Preconditioned Conjugate Gradient (PCG2)"},
    {kSolverLMG, "Link Multi-Grid (LMG)"}};
/// The solvers that an engine has, in the order in which they are offered; none for the own engine.
std::vector<int> SolversOfEngine(int engine);

/// What a solver tells while it works.
enum SolverOutput : int { kNoSolverOutput = 0, kConvergence = 1, kConvergenceAndSummary = 2 };
inline constexpr KeyChoice kSolverOutputs[] = {
    {kNoSolverOutput, "No output from solver"},
    {kConvergence, "Print convergence behavior at each iteration"},
    {kConvergenceAndSummary, "Print convergence behavior at each iteration as well as solver iteration summary"}};

/// What makes one solver differ from the next.
struct ModflowSolverKind {
  std::string_view title, shortTitle, section;
  int solver;
};

/// A value of a solver: how its form shows it, and what its check demands of it.
struct SolverField {
  enum class Kind { Number, Check, Options };
  /// That it is above 0, or at least 0, and the error where it is not.
  struct Demand {
    std::string_view error;
    bool allowsZero = false;
    Condition when = {};
  };

  std::variant<int*, float*> value;
  std::string_view label = {};  ///< None for options, which tell themselves.
  Kind kind = Kind::Number;
  std::string_view frame = {};  ///< In which it stands with its neighbours of the same frame.
  Condition enabled = {};
  std::optional<Demand> demand = {};
  KeyChoices choices = {};          ///< Options that are not those of the key.
  std::string_view key = {};        ///< Of a value that the file holds in another's key.
  std::function<void()> then = {};  ///< What follows when it was entered.
};

/// The values of a solver. They stay in the file while another solver is used; only the one in use is checked.
class CCompControlParaModBase : public CTvnKvfBase {
 public:
  CCompControlParaModBase(const ModflowSolverKind& kind, CYbSEKvfBase* parent);

  int ValidateData() override;
  /// In the order of the form.
  virtual std::vector<SolverField> Fields() = 0;
};

class CCompControlParaModLMGKvf : public CCompControlParaModBase {
 public:
  explicit CCompControlParaModLMGKvf(CYbSEKvfBase* parent);

  enum Damping : int { kCooley = 0, kRelativeReducedResidual = 1, kSpecified = 2 };
  static constexpr KeyChoice kOutputs[] = {{0, "No printing"},
                                           {1, "Print residuals only"},
                                           {2, "Print residuals and memory usage"},
                                           {3, "Print residuals, memory usage and solver messages"}};
  static constexpr KeyChoice kDampings[] = {{kCooley, "Cooley's method"},
                                            {kRelativeReducedResidual, "Relative reduced residual method"},
                                            {kSpecified, "Specified damping"}};

  int MXITER = 20;
  int MXCYC = 50;
  float BCLOSE = 0.01f;
  /// How it is damped, and by how much where that is specified. The file has one number for both.
  int DampingKind = kSpecified;
  float DAMP = 1;
  float DUP = 1;
  float DLOW = 0.2f;
  float STOR1 = kDefaultSTOR1;
  float STOR2 = kDefaultSTOR2;
  float STOR3 = kDefaultSTOR3;
  int ICG = 1;
  int UseDefault = 1;
  int IOUTAMG = 0;

  /// The storage of new setups, wherever the defaults are to be used.
  void TakeUseDefault(int use);
  std::vector<SolverField> Fields() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
  void ExchangeState(KeyExchange& keys) override;

 private:
  static constexpr float kDefaultSTOR1 = 3, kDefaultSTOR2 = 2.2f, kDefaultSTOR3 = 5.4f;
};

class CCompControlParaModPCG2Kvf : public CCompControlParaModBase {
 public:
  explicit CCompControlParaModPCG2Kvf(CYbSEKvfBase* parent);

  int MXITER = 100;
  int ITER1 = 30;
  float HCLOSE = 0.001f;
  float RCLOSE = 0.01f;
  float RELAX = 1;
  int MUTPCG = kNoSolverOutput;
  float DAMP = 1;

  std::vector<SolverField> Fields() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

class CCompControlParaModPCG4Kvf : public CCompControlParaModBase {
 public:
  explicit CCompControlParaModPCG4Kvf(CYbSEKvfBase* parent);

  int MXITER = 200;
  int ITERI = 50;
  float HCLOSE = 0.01f;
  float BFACT = 0.1f;
  float RESRED = 1;
  int MNORTH = 5;
  int ApplyDampening = 1;
  int UseNewtonRaphson = 0;
  int OutputFromSolver = kNoSolverOutput;

  std::vector<SolverField> Fields() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

class CCompControlParaModSIPKvf : public CCompControlParaModBase {
 public:
  explicit CCompControlParaModSIPKvf(CYbSEKvfBase* parent);

  enum Seed : int { kAutoGenerated = 0, kSpecified = 1 };
  static constexpr KeyChoice kSeeds[] = {{kAutoGenerated, "Use auto-generated seed"}, {kSpecified, "Specify seed"}};

  int MXITER = 500;
  int NPARM = 5;
  float ACCL = 1;
  float HCLOSE = 0.0001f;
  int IPRSIP = 0;
  float WSEED = 0.001f;
  int SeedOption = kAutoGenerated;

  std::vector<SolverField> Fields() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

class CCompControlParaModSORKvf : public CCompControlParaModBase {
 public:
  explicit CCompControlParaModSORKvf(CYbSEKvfBase* parent);

  int MXITER = 500;
  float HCLOSE = 0.001f;
  float ACCL = 1;
  int IPRSOR = 999;

  std::vector<SolverField> Fields() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// The solver in use, and the values of all of them.
class CCompControlParaModKvf : public CTvnKvfBase {
 public:
  explicit CCompControlParaModKvf(CYbSEKvfBase* parent);

  int SolverOption = kSolverSOR;  ///< One of `ModflowSolver`.

  /// A solver that the engine does not have is told.
  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// What the flow packages of a Modflow engine are told.
class CCompControlParaModPackageKvf : public CTvnKvfBase {
 public:
  explicit CCompControlParaModPackageKvf(CYbSEKvfBase* parent);

  enum Weighting : int { kUpstream = 0, kMidpoint = 1 };

  int WeightingRelPermOption = kUpstream;
  float HDRY = 0;   ///< The head of a cell that turns dry.
  float HDRY2 = 1;  ///< Wetting factor.
  int WettingThreshold = 0;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

}  // namespace tervane
