// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "core/node.h"
#include "simspec/pages.h"

namespace tervane {

/// Title and description of a simulation.
class CSimTitleBase : public CTvnKvfBase {
 public:
  CSimTitleBase(std::string title, std::string abbreviatedTitle, std::string section, CYbSEKvfBase* parent)
      : CTvnKvfBase(std::move(title), std::move(section), parent) {
    SetAbbreviatedTitle(std::move(abbreviatedTitle));
  }

  std::string Title;
  std::string Description;

 protected:
  void ExchangeKeys(KeyExchange& keys) override {
    keys("Title", Title);
    keys("Description", Description);
  }
};

class CSimTitleKvf : public CSimTitleBase {
 public:
  explicit CSimTitleKvf(CYbSEKvfBase* parent) : CSimTitleBase("Simulation title", "", "SimTitle", parent) {
    SetPage(kSimTitlePage);
  }
};

class CSimTitleWQKvf : public CSimTitleBase {
 public:
  explicit CSimTitleWQKvf(CYbSEKvfBase* parent)
      : CSimTitleBase("Water Quality Simulation Title", "WQ Simulation Title", "SimTitleWQ", parent) {
    SetPage(kSimTitleWQPage);
  }
};

class CSimTitlePTKvf : public CSimTitleBase {
 public:
  explicit CSimTitlePTKvf(CYbSEKvfBase* parent)
      : CSimTitleBase("Particle Tracking Simulation Title", "PT Simulation Title", "SimTitlePT", parent) {
    SetPage(kSimTitlePTPage);
  }
};

}  // namespace tervane
