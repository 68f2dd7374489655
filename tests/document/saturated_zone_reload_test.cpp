// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/saturated_zone_reload.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "core/kvf_parser.h"
#include "core/list.h"

namespace tervane::saturated_zone_reload_test {
namespace {

/// Tells each reading as SECTION, with the value that was read.
std::vector<std::string> readings;

class Node : public CYbSEKvfGroupBase {
 public:
  Node(std::string section, CYbSEKvfBase* parent) : CYbSEKvfGroupBase(section, section, parent) {}
  void ReadData(KvfNode* section) override {
    int value = 0;
    kvfGetParam(section, "V", &value, 1, 1);
    readings.push_back(fmt::format("{} {}", FormattedSectionName(), value));
  }
};

class Layer : public Node {
 public:
  explicit Layer(CYbSEKvfBase* parent) : Node("Layer_%d", parent) {
    NewChild<Node>("InternalBoundary");
    NewChild<Node>("Initial");
  }
};

class LayerList : public CYbSEKvfListBase<Layer> {
 public:
  LayerList(std::string section, CYbSEKvfBase* parent) : CYbSEKvfListBase(section, section, parent) {}
  void ReadData(KvfNode* /*section*/) override { readings.push_back(GetSectionName()); }
};

constexpr const char* kZone = R"(target T {
  section SaturatedZone {
    Touched = 1
    V = 7
    section CompLayersGeoSZ {
      YbSEKvfListItemCount = 1
      section Layer_1 {
        V = 5
      }
    }
    section CompLayersSZ {
      YbSEKvfListItemCount = 2
      section Layer_1 {
        V = 1
        section InternalBoundary {
        }
        section Initial {
          V = 3
        }
      }
    }
    section Drainage {
      V = 9
    }
  }
})";

TEST(SaturatedZoneReload, ReadsTheZoneAndTheLayersOnceMoreWithoutListsAndInternalBoundaries) {
  KvfFile* file = kvfCreate();
  ASSERT_TRUE(ParseKvf(FileContent::Of(kZone), *file));
  KvfNode* target = kvfTargetByNameNum(file, "T", 1);

  CYbSEKvfGlobalBase root("T");
  auto* zone = root.NewChild<Node>("SaturatedZone");
  // The order of the lists in the tree does not matter: the plain layers come first.
  zone->NewChild<LayerList>("CompLayersGeoSZ");
  zone->NewChild<LayerList>("CompLayersSZ");
  zone->NewChild<Node>("Drainage");
  zone->Load(target);

  readings.clear();
  ReloadSaturatedZone(*zone, target);
  EXPECT_THAT(readings, testing::ElementsAre("SaturatedZone 7", "Drainage 9", "Layer_1 1", "Initial 3", "Layer_1 5"));

  readings.clear();
  zone->SetSectionUsed(0);
  ReloadSaturatedZone(*zone, target);
  EXPECT_THAT(readings, testing::IsEmpty());
  kvfClose(&file);
}

}  // namespace
}  // namespace tervane::saturated_zone_reload_test
