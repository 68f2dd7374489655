// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Bodies of the ground in which particles are registered.
#pragma once

#include <string>

#include "core/list.h"
#include "wqpt/extent.h"

namespace tervane {

class CRegLensePTItemKvf : public CYbSEKvfGroupBase {
 public:
  /// Named and coded by the number that it gets in the list.
  explicit CRegLensePTItemKvf(CYbSEKvfBase* parent);

  std::string LenseName;
  int RegistrationCode;
  int ExtentType = kPartDomain;

  const std::string& GetTitle() const override { return LenseName.empty() ? CYbSEKvfGroupBase::GetTitle() : LenseName; }
  const std::string& GetAbbreviatedTitle() const override { return LenseName; }
  void SetAbbreviatedTitle(std::string title) override { LenseName = std::move(title); }

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

class CRegLensePTListKvf : public CYbSEKvfListBase<CRegLensePTItemKvf> {
 public:
  explicit CRegLensePTListKvf(CYbSEKvfBase* parent);

 protected:
  void ExchangeKeys(KeyExchange& keys) override { keys.Count("NumberOfLenses", *this); }
};
inline constexpr ImportantName<CRegLensePTListKvf> kRegistrationLenses{"REGISTRATION_LENSES"};

/// The quantity is the number of particles at the begin in the cells of a computational layer.
bool IsParticleNumber(const CData2DKvf& quantity);

/// Makes what particle tracking asks of a computational layer: numbers of particles, and codes of registration.
void MakeParticleValues(CYbSEKvfBase& layer);

}  // namespace tervane
