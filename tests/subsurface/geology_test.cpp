// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/geology.h"

#include <functional>
#include <limits>

#include <gmock/gmock.h>

#include "simspec/basic_parameters.h"
#include "simspec/model_components.h"
#include "simspec/water_quality_processes.h"
#include "subsurface/saturated_zone.h"
#include "tests/simspec/test_setup.h"

namespace tervane::geology_test {
namespace {

using test::TestSetup;

class Species : public CTvnKvfBase, public SpeciesTypes {
 public:
  explicit Species(CYbSEKvfBase* parent) : CTvnKvfBase("", "", parent) {}
  bool HasSpeciesOfType(int type) const override { return type == sorbed; }
  int sorbed = -1;
};
class Templates : public CTvnKvfBase, public ProcessTemplates {
 public:
  explicit Templates(CYbSEKvfBase* parent) : CTvnKvfBase("", "", parent) {}
  bool IsBuiltInUsed(int code) const override { return code == used; }
  bool IsTemplateUsed(int /*compartment*/) const override { return true; }
  int used = 0;
};

struct Choice {
  TestSetup setup;
  CSatZoneKvf& zone = setup.At<CSatZoneKvf>("SaturatedZone");
  CBasicParaKvf& basics = setup.At<CBasicParaKvf>("SimSpec");
  CModelCompKvf& own = setup.At<CModelCompKvf>("SimSpec/ModelComp");
  CModModelCompKvf& modflow = setup.At<CModModelCompKvf>("SimSpec/ModModelComp");
  CModelCompWQKvf& quality = setup.At<CModelCompWQKvf>("ModelCompWQ");
  Species& species = *setup.Root().NewChild<Species>();
  Templates& templates = *setup.Root().NewChild<Templates>();

  Choice() {
    setup.Root().RegisterImportantNode(&species, "SPECIES_LIST");
    setup.Root().RegisterImportantNode(&templates, "KINETRASPEC");
    setup.Root().Important(kGeologicalLenses)->AddItem();
  }
  void Advection(int dispersion = 0) {
    own.WQ = quality.SZ = 1;
    zone.DispersionOption = dispersion;
  }
  void Particles(int dispersion) {
    Advection(dispersion);
    quality.SZ = 0;
    own.ADPTRadio = kParticleTracking;
  }
  /// With Surfact, where flow is variably saturated.
  void Surfact(int air) {
    basics.ModelType = kEngineModflowSurfact;
    modflow.WithAirFlow = air;
    modflow.ChooseVariablySaturated(1);
  }
  std::string Used(const char* path) {
    auto& owner = setup.At<CYbSEKvfBase>(path);
    std::string names;
    for (CYbSEKvfBase* child = owner.GetFirstChild(); child; child = owner.GetNextChild(child))
      if (child->IsDlgUsedInSetup()) names += (names.empty() ? "" : " ") + child->GetSectionName();
    return names;
  }
};

TEST(Geology, EngineSwitchesAndTransportDecideWhichPropertiesTakePart) {
  const std::string flow = "LowerLevel HorHydrCon VerHydrCon SpecificYield StorageCoef";
  const struct {
    const char* what;
    std::function<void(Choice&)> choose;
    std::string layer;
    std::string lense;  ///< Behind its extent and upper level.
  } cases[] = {
      {"new", [](Choice&) {}, flow, flow},
      {"no water movement", [](Choice& c) { c.own.WM = 0, c.Advection(); }, "Porosity", "-Porosity"},
      {"units", [](Choice& c) { c.zone.ParameterDistribution = 1, c.Advection(2); }, "LowerLevel GeoUnit",
       "LowerLevel GeoUnit"},
      {"advection", [](Choice& c) { c.Advection(); }, flow + " Porosity", flow + " Porosity"},
      {"water quality elsewhere", [](Choice& c) { c.Advection(), c.quality.SZ = 0; }, flow, flow},
      {"isotropy", [](Choice& c) { c.Advection(1); }, flow + " Porosity LHHDispCoeff THHDispCoeff",
       flow + " Porosity LHHDispCoeff THHDispCoeff"},
      {"anisotropy", [](Choice& c) { c.Advection(2); },
       flow + " Porosity LHHDispCoeff THHDispCoeff TVHDispCoeff LVVDispCoeff THVDispCoeff",
       flow + " Porosity LHHDispCoeff THHDispCoeff TVHDispCoeff LVVDispCoeff THVDispCoeff"},
      {"immobile water", [](Choice& c) { c.Advection(), c.zone.MassTransferToImmobileWater = 1; },
       flow + " Porosity MatrixPorosity", flow + " Porosity MatrixPorosity"},
      {"sorbed species", [](Choice& c) { c.Advection(), c.species.sorbed = 1; }, flow + " Porosity BulkDensity",
       flow + " Porosity BulkDensity"},
      {"templates without processes", [](Choice& c) { c.Advection(), c.templates.used = 1120; }, flow + " Porosity",
       flow + " Porosity"},
      {"templates",
       [](Choice& c) {
         c.Advection(), c.templates.used = 1120, c.quality.IncludeProcesses = 1, c.quality.ProcessType = kKinetra;
       },
       flow + " Porosity BulkDensity", flow + " Porosity BulkDensity"},
      {"particles", [](Choice& c) { c.Particles(0), c.species.sorbed = 1, c.zone.MassTransferToImmobileWater = 1; },
       flow + " Porosity", flow + " Porosity"},
      {"particles with isotropy", [](Choice& c) { c.Particles(1); }, flow + " Porosity LHHDispCoeff THHDispCoeff",
       flow + " Porosity LHHDispCoeff THHDispCoeff"},
      {"Modflow 96", [](Choice& c) { c.basics.ModelType = kEngineModflow96, c.Advection(2); },
       flow + " HorizontalAnisotropyRatio", flow + " HorizontalAnisotropyRatio"},
      {"rewetting", [](Choice& c) { c.basics.ModelType = kEngineModflow2000, c.zone.Threshold = 1; },
       flow + " HorizontalAnisotropyRatio", flow + " WettingThreshold HorizontalAnisotropyRatio"},
      {"variably saturated", [](Choice& c) { c.Surfact(0), c.zone.Threshold = 1; },
       flow + " HorizontalAnisotropyRatio VanGenuchtenAlpha VanGenuchtenBeta ResidualSaturation",
       flow + " HorizontalAnisotropyRatio VanGenuchtenAlpha VanGenuchtenBeta ResidualSaturation"},
      {"Brooks-Corey", [](Choice& c) { c.Surfact(0), c.zone.TypeOfRelPerm = 1; },
       flow + " HorizontalAnisotropyRatio VanGenuchtenAlpha VanGenuchtenBeta ResidualSaturation "
              "BrooksCoreyRelativePermeabilityExponent",
       flow + " HorizontalAnisotropyRatio VanGenuchtenAlpha VanGenuchtenBeta ResidualSaturation "
              "BrooksCoreyRelativePermeabilityExponent"},
      {"air", [](Choice& c) { c.Surfact(1), c.zone.TypeAmbientWaterHeadInput = 1; },
       flow + " HydrHeadUsedForAirFlow HorizontalAnisotropyRatio VanGenuchtenAlpha VanGenuchtenBeta ResidualSaturation",
       flow +
           " HydrHeadUsedForAirFlow HorizontalAnisotropyRatio VanGenuchtenAlpha VanGenuchtenBeta ResidualSaturation"},
      {"air below other layers",
       [](Choice& c) { c.Surfact(1), c.zone.TypeAmbientWaterHeadInput = 1, c.zone.TypeOfVerDiscr = 2; },
       flow + " HorizontalAnisotropyRatio VanGenuchtenAlpha VanGenuchtenBeta ResidualSaturation",
       flow + " HorizontalAnisotropyRatio VanGenuchtenAlpha VanGenuchtenBeta ResidualSaturation"},
  };
  for (const auto& c : cases) {
    Choice choice;
    c.choose(choice);
    EXPECT_EQ(choice.Used("SaturatedZone/GeoLayersSZ/Layer_1"), c.layer) << c.what;
    const std::string lense = c.lense.starts_with('-') ? c.lense.substr(1) : "HorBoundary UpperLevel " + c.lense;
    EXPECT_EQ(choice.Used("SaturatedZone/GeoLensesSZ/Lense_1"), lense) << c.what;
    EXPECT_EQ(choice.setup.IsUsed("SaturatedZone/GeoUnitsSZProperties"), choice.zone.ParameterDistribution == 1);
    EXPECT_EQ(choice.setup.IsUsed("SaturatedZone/HeadElevationUsedForAirFlow"), false) << c.what;
  }
  Choice hydrostatic;
  hydrostatic.Surfact(1);
  EXPECT_TRUE(hydrostatic.setup.IsUsed("SaturatedZone/HeadElevationUsedForAirFlow"));
  EXPECT_EQ(hydrostatic.zone.GetTitle(), "Subsurface");
}

TEST(Geology, ALayerIsJudgedByThoseOfItsValuesThatTakePart) {
  const struct {
    const char* property;
    float value;
    const char* message;
  } cases[] = {{"Porosity", 1, ""},
               {"Porosity", 1.01f, "Valid Range: 0 to 1.0 inclusive"},
               {"Porosity", -0.01f, "Valid Range: 0 to 1.0 inclusive"},
               {"SpecificYield", 2, "Valid Range: 0 to 1.0 inclusive"},
               {"LHHDispCoeff", 0, "Valid Range: Must be Greater than 0"},
               {"LHHDispCoeff", 0.5f, ""},
               {"MatrixPorosity", 7, ""},  // not in use
               {"TVHDispCoeff", -1, ""}};  // not in use
  for (const auto& c : cases) {
    Choice choice;
    choice.Advection(1);
    for (const char* item : {"GeoLayersSZ/Layer_1", "GeoLensesSZ/Lense_1"}) {
      auto& owner = choice.setup.At<CYbSEKvfBase>(std::string("SaturatedZone/") + item);
      PropertyOf(owner, "LHHDispCoeff")->FixedValue = 10;
      PropertyOf(owner, "THHDispCoeff")->FixedValue = 10;
      PropertyOf(owner, c.property)->FixedValue = c.value;
      owner.Validate();
      std::string told;
      for (CYbSEKvfBase* child = owner.GetFirstChild(); child; child = owner.GetNextChild(child))
        for (const Finding& finding : child->Findings()) told += child->GetSectionName() + ": " + finding.text;
      const bool isLayer = owner.GetSectionName() == "Layer_%d";
      EXPECT_EQ(told, isLayer && *c.message ? std::string(c.property) + ": " + c.message : "") << item << c.property;
    }
  }
}

TEST(Geology, LayersAreNumberedOnceAndForAll) {
  TestSetup fresh;
  EXPECT_EQ(fresh.Written("SaturatedZone:id"), "2");
  EXPECT_EQ(fresh.WrittenKeys("SaturatedZone/GeoLayersSZ/Layer_1"), "Name=\"Aquifer\" id=1");
  EXPECT_EQ(fresh.Root().Important(kGeologicalLayers)->AddItem()->id, 2);
  fresh.Root().Important(kGeologicalLayers)->DeleteItem(2, 1);
  EXPECT_EQ(fresh.Root().Important(kGeologicalLayers)->AddItem()->id, 3);

  // The list is sized before the layers of the file have told their numbers.
  TestSetup read(
      "section SaturatedZone {\nid = 9\nsection GeoLayersSZ {\nNumberOfLayers = 3\nsection Layer_1 {\nName = \"Clay\"\n"
      "id = 4\n}\nsection Layer_2 {\nid = 8\n}\nsection Layer_3 {\nid = 5\n}\n}\n}");
  EXPECT_EQ(read.Written("SaturatedZone:id"), "9");
  EXPECT_EQ(read.Written("SaturatedZone/GeoLayersSZ/Layer_2:id"), "8");
  EXPECT_EQ(read.Root().Important(kGeologicalLayers)->GetItemName(1), "Clay");
  EXPECT_EQ(read.Root().Important(kGeologicalLayers)->GetItemName(4), "");
}

TEST(Geology, ARowThatOnlyStandsForAllTakesNoNumber) {
  test::TestSetup setup;
  auto& zone = setup.At<CSatZoneKvf>("SaturatedZone");
  zone.Layers().NewItem();
  EXPECT_EQ(zone.id, 2);
  zone.id = std::numeric_limits<int>::max();
  EXPECT_EQ(zone.Layers().AddItem()->id, std::numeric_limits<int>::max());
}

TEST(Geology, TheLaterOfTwoCountsOfLayersHolds) {
  const auto count = [](const std::string& keys) {
    test::TestSetup setup("section SaturatedZone {\nsection GeoLayersSZ {\n" + keys + "}\n}");
    return setup.At<CSatZoneKvf>("SaturatedZone").Layers().GetItemCount();
  };
  EXPECT_EQ(count("NumberOfLayers = 3\n"), 3);
  EXPECT_EQ(count("YbSEKvfListItemCount = 2\n"), 2);
  EXPECT_EQ(count("NumberOfLayers = 3\nYbSEKvfListItemCount = 2\n"),
            count("YbSEKvfListItemCount = 2\nNumberOfLayers = 3\n"));
}

TEST(Geology, PropertiesAreCopiedWithTheirFilesButNotTheLowerLevel) {
  test::TestSetup setup;
  CGeoLayerSZKvf& layers = setup.At<CSatZoneKvf>("SaturatedZone").Layers();
  CGeoLayerSZItemKvf& from = *layers.GetItem(1);
  CGeoLayerSZItemKvf& to = *layers.AddItem();
  PropertyOf(from, "LowerLevel")->FixedValue = -40;
  PropertyOf(from, "HorHydrCon")->Type = CData2DKvf::kGridFile;
  PropertyOf(from, "HorHydrCon")->GridFile().File = FileName("k.nds2", "/setups");
  PropertyOf(from, "HorHydrCon")->GridFile().Items = {2};
  PropertyOf(from, "SpecificYield")->FixedValue = 0.3F;
  CopyProperties(from, to);
  EXPECT_EQ(PropertyOf(to, "LowerLevel")->FixedValue, 0);
  EXPECT_EQ(PropertyOf(to, "HorHydrCon")->Type, CData2DKvf::kGridFile);
  EXPECT_EQ(PropertyOf(to, "HorHydrCon")->GridFile().File.Text(), "k.nds2");
  EXPECT_EQ(PropertyOf(to, "HorHydrCon")->GridFile().SelectedItem(), 2);
  EXPECT_EQ(PropertyOf(to, "SpecificYield")->FixedValue, 0.3F);
  EXPECT_EQ(to.Name, "Layer");
}

}  // namespace
}  // namespace tervane::geology_test
