// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/global.h"

#include <filesystem>
#include <fstream>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::global_test {
namespace {

namespace fs = std::filesystem;
using test::SavedText;
using test::SetupText;
using test::ValueOf;

std::vector<fs::path> OldSetups() {
  std::vector<fs::path> files;
  for (const auto& entry : fs::directory_iterator(fs::path(TERVANE_SOURCE_DIR) / "examples/old"))
    if (entry.path().extension() == ".tvd") files.push_back(entry.path());
  return files;
}

TEST(Global, SetupsOfOldVersionsGiveTheValuesBesideThem) {
  ASSERT_GE(OldSetups().size(), 5u);
  for (const fs::path& path : OldSetups()) {
    SCOPED_TRACE(path);
    CFlowModelDoc document;
    ASSERT_TRUE(document.OnOpenDocument(path.string())) << document.Error();
    // What an old version held and a rule skips is known, not unread.
    EXPECT_TRUE(document.Report().IsEmpty());
    std::ifstream values(fs::path(path).replace_extension(".values"));
    int count = 0;
    for (std::string line; std::getline(values, line);) {
      if (line.starts_with('#')) continue;
      const std::size_t sign = line.find(" = ");
      ASSERT_NE(sign, std::string::npos) << line;
      EXPECT_EQ(ValueOf(document, line.substr(0, sign)), line.substr(sign + 3)) << line;
      ++count;
    }
    EXPECT_GE(count, 3);
  }
}

TEST(Global, AnOldSetupSavedOpensTheSame) {
  for (const fs::path& path : OldSetups()) {
    SCOPED_TRACE(path);
    CFlowModelDoc document, reopened;
    ASSERT_TRUE(document.OnOpenDocument(path.string()));
    const std::string saved = SavedText(document);
    ASSERT_TRUE(reopened.OpenText(saved, path.string()));
    EXPECT_TRUE(reopened.Report().IsEmpty());
    EXPECT_EQ(SavedText(reopened), saved);
  }
}

TEST(Global, TheStoredDefaultSetupIsWhatANewDocumentWrites) {
  EXPECT_EQ(test::ReadFile(TERVANE_SOURCE_DIR "/examples/default.tvd"), SavedText(CFlowModelDoc()))
      << "when a default changed on purpose: tervane new examples/default.tvd --force";
}

TEST(Global, ALaterVersionIsReadLikeOursAndWrittenAsOurs) {
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(SetupText(99, R"(section SimSpec {
    section CompControlParaTimeStep {
      MaxAllowedTimeStep = 3f
      MaxAllowedOLTimeStep = 0.25f
    }
  })"),
                                "a.tvd"));
  EXPECT_EQ(ValueOf(document, "SimSpec/CompControlParaTimeStep:MaxAllowedOLTimeStep"), "0.25");
  EXPECT_EQ(ValueOf(document, "FlowModelDocVersion:Version"), "14");
}

TEST(Global, OfATargetThatRepeatsTheFirstCounts) {
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(
      SetupText(14, "section SimSpec {\nModelType = 2\n}") + SetupText(14, "section SimSpec {\nModelType = 3\n}"),
      "a.tvd"));
  EXPECT_EQ(ValueOf(document, "SimSpec:ModelType"), "2");
  ASSERT_EQ(document.Report().unread.size(), 1u);
  EXPECT_EQ(document.Report().unread[0].kind, KvfUnread::Kind::Target);
}

/// A node that tells in which order nodes are read, and how often.
class Witness : public CYbSEKvfGroupBase {
 public:
  Witness(std::string name, std::vector<std::string>& log, CYbSEKvfBase* parent)
      : CYbSEKvfGroupBase(name, name, parent), name_(std::move(name)), log_(log) {}
  void ReadData(KvfNode* /*section*/) override { log_.push_back(name_); }

 private:
  std::string name_;
  std::vector<std::string>& log_;
};

TEST(Global, ReadsSpeciesBeforeWhatKeepsAListPerSpeciesAndTheSaturatedZoneTwice) {
  const std::vector<std::string> names = {"Overland",    "Unsatzone",    "SATZONE", "STORINGRESULTS",
                                          "PROCESSESWQ", "SPECIES_LIST", "Plain"};
  std::string sections = "section Evapotrans {\n}\n";
  for (const std::string& name : names) sections += fmt::format("section {} {{\n}}\n", name);
  struct Case {
    int version;
    std::vector<std::string> order;
  };
  const Case cases[] = {
      {14, {"SATZONE", "STORINGRESULTS", "Plain", "SPECIES_LIST", "PROCESSESWQ", "Overland", "Unsatzone", "SATZONE"}},
      // The storing of results lies inside the simulation specification, which the file does not hold.
      {1, {"SATZONE", "Plain", "SPECIES_LIST", "PROCESSESWQ", "Overland", "Unsatzone", "SATZONE"}},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.version);
    std::vector<std::string> log;
    CFlowModelDoc document;
    CGlobal& root = document.Global();
    for (const std::string& name : names) root.RegisterImportantNode(root.NewChild<Witness>(name, log), name);
    ASSERT_TRUE(document.OpenText(SetupText(c.version, sections), "a.tvd"));
    EXPECT_EQ(log, c.order);
    // Read from old files, never written, and still found.
    EXPECT_NE(root.GetImportantNode("Evapotrans"), nullptr);
    EXPECT_EQ(SavedText(document).find("Evapotrans"), std::string::npos);
    EXPECT_NE(SavedText(document).find("section Plain"), std::string::npos);
  }
}

TEST(Global, AFileOfVersion1HoldsTheStoringOfResultsInSimSpec) {
  std::vector<std::string> log;
  CFlowModelDoc document;
  CGlobal& root = document.Global();
  root.RegisterImportantNode(root.NewChild<Witness>("StoringOfResults", log), "STORINGRESULTS");
  ASSERT_TRUE(document.OpenText(SetupText(1, "section SimSpec {\nsection StoringOfResults {\n}\n}\n"), "a.tvd"));
  EXPECT_EQ(log, std::vector<std::string>{"StoringOfResults"});
  EXPECT_TRUE(document.Report().IsEmpty());
}

}  // namespace
}  // namespace tervane::global_test
