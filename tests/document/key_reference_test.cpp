// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/key_reference.h"

#include <map>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "core/kvf_writer.h"
#include "tests/support/setup.h"

namespace tervane::key_reference_test {
namespace {

using test::SavedText;
using test::SetupText;
using test::ValueOf;

/// A setup in which all lists have items, so that every node class is there.
constexpr const char* kEveryNode = R"(section SimSpec {
  section ModelComp {
    WQ = 1
  }
}
section Overlays {
  section Foreground {
    YbSEKvfListItemCount = 1
    section OverlayItem_1 {
    }
  }
}
section Subcatchments {
  NO_ZONES = 1
  section Subcatchment {
    section Riverlinks {
      Noofreaches = 1
      section Riverlink_1 {
      }
    }
  }
}
section OverlandSubcatchment {
  NO_ZONES = 1
  section TopographicalRouting {
  }
}
section Climate {
  section PrecipitationRate {
    section STATION_BASED {
      NO_TIMESERIES = 1
    }
    section TIME_SERIES_1 {
    }
  }
  section POTEVAPTRANS {
    section STATION_BASED {
      NO_TIMESERIES = 1
    }
    section TIME_SERIES_1 {
    }
  }
}
section LandUse {
  section Vegetation {
    section GLOBAL {
      section VEG_PROP_FILES {
        YbSEKvfListItemCount = 1
        section VegNo_1 {
          section VEG_PROP_FILE {
            VEGETATION = "Maize"
          }
        }
      }
    }
    section STATION_BASED {
      NO_TIMESERIES = 1
    }
    section TIME_SERIES_1 {
    }
  }
  section CommandAreas {
    NO_AREAS = 1
    section CommandArea {
    }
  }
  section Demands {
    NO_DEMANDS = 1
    section Demand {
    }
  }
}
section StoringOfResults {
  section DetailedTimeseriesOutput {
    NumberOfItems = 1
    section Item_1 {
    }
  }
  section DetailedFvrTimeseriesOutput {
    NumberOfItems = 1
    section Item_1 {
    }
  }
  section GridSeriesOutput {
    NumberOfItems = 1
    section Item_1 {
      DataType = 10
    }
  }
}
section Results_Post_Processing {
  section PT_Reg_Extraction {
    YbSEKvfListItemCount = 1
    section Extraction_1 {
      section WellNames {
        wellname = "North"
      }
      section SinkCodes {
        sinkcode = 3
      }
    }
  }
}
section ExtraParams {
  NoOfParams = 2
  section ExtraParam_1 {
  }
  section ExtraParam_2 {
  }
})";

/// Gives a parameter another value of its type.
void Change(KvfFile& file, KvfParam& param) {
  switch (param.type) {
    case KvfType::Int:
      param.asInt = param.asInt == 1 ? 0 : 1;
      break;
    case KvfType::Float:
      param.asFloat = param.asFloat * 2 + 0.1f;
      break;
    case KvfType::Double:
      param.asDouble = param.asDouble * 2 + 0.1;
      break;
    case KvfType::Bool:
      param.asBool = !param.asBool;
      break;
    case KvfType::String:
      file.SetText(param, "a \"quoted\" text\n\xC3\xA6");
      break;
    case KvfType::Filename:
      file.SetText(param, "maps\\a b.nds2");
      break;
  }
}

/// Keys that follow from others, so that a changed value is not kept as it is.
bool IsDerived(const std::string& key) {
  for (const char* derived : {"IsDataUsedInSetup", "FlowModelDocVersion:Version", "YbSEKvfListItemCount",
                              // Counts 0 or 1 instead of 2 items, the others are then unread.
                              "ExtraParams:NoOfParams", ":NO_", "NumberOfSources", "Riverlinks:Noofreaches",
                              "NO_TIMESERIES", "ITEM_COUNT", ":NumberOf", ":NoInternal",
                              // Of the zone's identity and place.
                              ":GRIDCODE", "ProfileSecNumber", ":SoilSecNumber", ":AreaCode", ":DemandCode",
                              // Of other keys of the source.
                              ":RS_6", ":RS_7", "Source1:TYPE",
                              // What a solver of Modflow is told of other keys.
                              ":IPRPCG", ":INEWT", ":IDMPBOT", "PCG4:MUTPCG", ":IPCALC",
                              // A type that the setup cannot store.
                              "GridSeriesOutput/Item_1:DataType",
                              // A kind of value that the file's value has not.
                              "ExtraParam_1:Type", "ExtraParam_2:Type",
                              // A zero area and an area of which the file says that it is undefined are the same.
                              "ZoomDataArea"})
    if (key.find(derived) != std::string::npos) return true;
  return false;
}

void CollectKeys(KvfSection& section, const std::string& path, std::vector<std::pair<std::string, KvfNode*>>& keys) {
  std::map<std::string, int, std::less<>> instances;
  for (KvfNode* node = section.firstChild; node; node = node->next) {
    if (node->IsKeyword()) {
      keys.emplace_back(fmt::format("{}:{}", path, node->Name()), node);
      continue;
    }
    const int instance = ++instances[std::string(node->Name())];
    const std::string step = instance == 1 ? std::string(node->Name()) : fmt::format("{}#{}", node->Name(), instance);
    CollectKeys(*AsSection(node), JoinPath(path, step), keys);
  }
}

TEST(KeyReference, EveryKeyOfEveryNodeIsReadBackAsItWasWritten) {
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(SetupText(14, kEveryNode), "/data/a.tvd"));
  KvfFile* file = document.BuildFile("/data");
  std::vector<std::pair<std::string, KvfNode*>> keys;
  CollectKeys(*AsSection(file->top.firstChild), {}, keys);
  std::erase_if(keys, [](const auto& key) { return IsDerived(key.first); });
  EXPECT_GT(keys.size(), 150U);
  // Keys that stand far apart in the file are changed together, so that it is read some ten times and not a thousand.
  constexpr std::size_t kTogether = 61;
  for (std::size_t first = 0; first < std::min(kTogether, keys.size()); ++first) {
    std::vector<std::vector<KvfParam>> before;
    std::string changed;
    for (std::size_t k = first; k < keys.size(); k += kTogether) {
      KvfNode* node = keys[k].second;
      before.emplace_back(node->params, node->params + node->count);
      for (std::uint32_t i = 0; i < node->count; ++i)
        // Of a date only the year, so that it stays one.
        if (node->count == 1 || i == 0) Change(*file, node->params[i]);
      changed += " " + keys[k].first;
    }
    std::string text, error;
    ASSERT_TRUE(WriteKvfText(*file, text, error)) << error;
    CFlowModelDoc reopened;
    ASSERT_TRUE(reopened.OpenText(text, "/data/a.tvd")) << reopened.Error();
    EXPECT_TRUE(reopened.Report().unread.empty()) << changed;
    for (std::size_t k = first; k < keys.size(); k += kTogether) {
      const auto& [key, node] = keys[k];
      // A hot start date needs all its five numbers.
      if (key.find("HotStartDate") == std::string::npos || node->count == 1) {
        EXPECT_EQ(ValueOf(reopened, key), PlainValuesText(*node)) << key;
      }
      const std::vector<KvfParam>& old = before[(k - first) / kTogether];
      std::copy(old.begin(), old.end(), node->params);
    }
  }
  kvfClose(&file);
}

TEST(KeyReference, ListsEveryKeyThatANewSetupHoldsWithItsDefault) {
  const KeyReference reference;
  CFlowModelDoc document;
  ASSERT_TRUE(
      document.OpenText(SetupText(14, "section ExtraParams {\nNoOfParams = 1\nsection ExtraParam_1 {\n}\n}"), "a.tvd"));
  KvfFile* file = document.BuildFile("");
  std::vector<std::pair<std::string, KvfNode*>> keys;
  CollectKeys(*AsSection(file->top.firstChild), {}, keys);
  for (auto& [key, node] : keys) {
    const std::string path = key.substr(0, key.find(':'));
    const std::string_view name = node->Name();
    if (name == "Touched" || name == "IsDataUsedInSetup" || name == "YbSEKvfListItemCount" || name == "NoOfParams" ||
        name.find("ZoomDataArea") != name.npos || name == "DataTypeID")  // Which each package has of its own.
      continue;
    // Numbers behind the name of a file are made at each save.
    const bool isFile = node->count > 0 && node->params[0].type == KvfType::Filename;
    EXPECT_EQ(reference.DefaultOf(path, name), isFile ? KvfValueText(node->params[0]) : KvfValuesText(*node)) << key;
  }
  kvfClose(&file);
}

TEST(KeyReference, TellsInWhichVersionsAnOldKeyIsRead) {
  const KeyReference reference;
  const auto find = [&](std::string_view path, std::string_view key) {
    for (const KeySection& section : reference.Sections())
      if (section.path == path)
        for (const KeyInfo& info : section.keys)
          if (info.key == key) return info;
    return KeyInfo{};
  };
  const KeyInfo old = find("SimSpec/CompControlParaTimeStep", "MaxAllowedTimeStep");
  EXPECT_EQ(old.until, 9);
  EXPECT_FALSE(old.written);
  EXPECT_EQ(find("SimSpec/CompControlParaTimeStep", "MaxAllowedOLTimeStep").since, 10);
  EXPECT_EQ(find("ExtraParams/ExtraParam_%d", "Name").type, "string");
  EXPECT_EQ(find("SimSpec/SimulationPeriod", "SIMSTART").type, "date");
  // Values one behind the other, in a section of their own.
  EXPECT_EQ(find("Results_Post_Processing/PT_Reg_Extraction/Extraction_%d/WellNames", "wellname").type,
            "string, repeated");
  // Stations and zones are known though a new setup has none.
  EXPECT_EQ(find("Climate/PrecipitationRate/TIME_SERIES_%d", "Elevation").type, "float");
  EXPECT_EQ(find("Climate/SNOWMELTCONST", "Threshold").until, 10);
  // Keys that another node takes over when an old setup is read.
  for (const char* key : {"Paved", "PavedGradientCheck", "SpecifyMaxPavedStorageChangeRate"}) {
    EXPECT_EQ(find("LandUse", key).until, 13) << key;
    EXPECT_FALSE(find("LandUse", key).written) << key;
  }
}

}  // namespace
}  // namespace tervane::key_reference_test
