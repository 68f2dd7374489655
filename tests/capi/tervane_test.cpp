// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "capi/tervane.h"

#include <atomic>
#include <filesystem>
#include <string>
#include <thread>
#include <vector>

#include <gmock/gmock.h>

#include "capi/tervane_names.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::capi_test {
namespace {

using testing::HasSubstr;

/// A setup that is closed at the end.
struct Opened {
  Opened() { EXPECT_EQ(tervane_new(&handle), TERVANE_OK) << tervane_last_error(); }
  explicit Opened(const std::string& path) {
    EXPECT_EQ(tervane_open(path.c_str(), &handle), TERVANE_OK) << tervane_last_error();
  }
  ~Opened() { tervane_close(handle); }
  Opened(const Opened&) = delete;
  Opened& operator=(const Opened&) = delete;

  std::string Text(const char* path) const {
    char text[200] = "";
    return tervane_get_text(handle, path, text, sizeof text, nullptr) == TERVANE_OK ? text : tervane_last_error();
  }

  tervane_setup handle = 0;
};

TEST(CInterface, TellsItsVersion) {
  EXPECT_EQ(tervane_abi(), TERVANE_ABI);
  EXPECT_STRNE(tervane_version(), "");
}

TEST(CInterface, OpensChangesAndSaves) {
  const test::TempFolder folder;
  const std::string path = folder.Write("a.tvd", test::SetupText(14, ""));
  const Opened setup(path);
  EXPECT_EQ(tervane_set_text(setup.handle, "SimSpec/SimTitle:Title", "Warm, wet"), TERVANE_OK);
  EXPECT_EQ(tervane_set_number(setup.handle, "SimSpec/CompControlParaTimeStep:InitialTimeStep", "days", 2), TERVANE_OK)
      << tervane_last_error();
  double hours = 0;
  EXPECT_EQ(tervane_get_number(setup.handle, "SimSpec/CompControlParaTimeStep:InitialTimeStep", nullptr, &hours),
            TERVANE_OK);
  EXPECT_EQ(hours, 48);
  EXPECT_EQ(tervane_save(setup.handle, nullptr), TERVANE_OK) << tervane_last_error();
  const Opened again(path);
  EXPECT_EQ(again.Text("SimSpec/SimTitle:Title"), "Warm, wet");
  int isUsed = 0;
  EXPECT_EQ(tervane_takes_part(again.handle, "SimSpec/SimTitle", &isUsed), TERVANE_OK);
  EXPECT_EQ(isUsed, 1);
}

TEST(CInterface, TellsWhyACallWasNotDone) {
  const Opened setup;
  double number = 0;
  char small[4] = "";
  std::size_t length = 0;
  const struct {
    tervane_result result, expected;
    std::string text;
  } cases[] = {
      {tervane_open("/no/such.tvd", nullptr), TERVANE_ARGUMENT, tervane_last_error()},
      {tervane_set_text(setup.handle, "SimSpec:ModelTyp", "1"), TERVANE_NOT_THERE, tervane_last_error()},
      {tervane_set_text(setup.handle, "SimSpec:ModelType", "x"), TERVANE_REFUSED, tervane_last_error()},
      {tervane_get_number(setup.handle, "SimSpec/SimTitle:Title", nullptr, &number), TERVANE_REFUSED,
       tervane_last_error()},
      {tervane_get_text(setup.handle, "SimSpec/SimulationPeriod:SIMSTART", small, sizeof small, &length),
       TERVANE_TOO_SMALL, tervane_last_error()},
      {tervane_save(setup.handle, nullptr), TERVANE_FAILED, tervane_last_error()},
      {tervane_delete_item(setup.handle, "Species", 1), TERVANE_NOT_THERE, tervane_last_error()},
      {tervane_get_grid_file(setup.handle, 9, small, 4, nullptr, nullptr), TERVANE_ARGUMENT, tervane_last_error()},
  };
  for (const auto& row : cases) {
    EXPECT_EQ(row.result, row.expected) << row.text;
    EXPECT_NE(row.text, "");
  }
  EXPECT_EQ(length, std::string("2000, 1, 1, 0, 0").size());
  EXPECT_EQ(tervane_abi(), TERVANE_ABI);
}

TEST(CInterface, StaleAndForeignHandlesAreRefused) {
  tervane_setup first = 0, second = 0;
  ASSERT_EQ(tervane_new(&first), TERVANE_OK);
  EXPECT_EQ(tervane_close(first), TERVANE_OK);
  ASSERT_EQ(tervane_new(&second), TERVANE_OK);
  int count = 0;
  for (const tervane_setup handle : {first, tervane_setup{0}, tervane_setup{12345}, ~tervane_setup{0}}) {
    EXPECT_EQ(tervane_close(handle), TERVANE_NO_HANDLE);
    EXPECT_EQ(tervane_item_count(handle, "Species", &count), TERVANE_NO_HANDLE);
    EXPECT_EQ(tervane_climate_value_count(handle, TERVANE_PRECIPITATION, &count), TERVANE_NO_HANDLE);
  }
  EXPECT_EQ(tervane_climate_close(second), TERVANE_NO_HANDLE);
  EXPECT_EQ(tervane_close(second), TERVANE_OK);
}

TEST(CInterface, ItemsFindingsAndDifferences) {
  const Opened setup;
  tervane_setup before = 0;
  ASSERT_EQ(tervane_copy(setup.handle, &before), TERVANE_OK);
  char item[100];
  for (int i = 0; i < 2; ++i)
    ASSERT_EQ(tervane_insert_item(setup.handle, "Species", 99, item, sizeof item, nullptr), TERVANE_OK);
  int count = 0;
  EXPECT_EQ(tervane_item_count(setup.handle, "Species", &count), TERVANE_OK);
  EXPECT_EQ(count, 2);
  EXPECT_EQ(tervane_set_text(setup.handle, (std::string(item) + ":Name").c_str(), "Nitrate"), TERVANE_OK)
      << tervane_last_error();
  EXPECT_EQ(tervane_delete_item(setup.handle, "Species", 1), TERVANE_OK);
  ASSERT_EQ(tervane_item_path(setup.handle, "Species", 1, item, sizeof item, nullptr), TERVANE_OK);
  EXPECT_EQ(setup.Text((std::string(item) + ":Name").c_str()), "Nitrate");

  using Lines = std::vector<std::string>;
  Lines differences, findings;
  EXPECT_EQ(tervane_diff(
                before, setup.handle,
                [](const char* place, const char*, const char*, void* lines) {
                  static_cast<Lines*>(lines)->emplace_back(place);
                },
                &differences),
            TERVANE_OK);
  EXPECT_THAT(differences, testing::Contains(std::string(item)));
  EXPECT_EQ(
      tervane_validate(
          setup.handle,
          [](const tervane_finding* finding, void* lines) { static_cast<Lines*>(lines)->emplace_back(finding->text); },
          &findings),
      TERVANE_OK);
  EXPECT_FALSE(findings.empty());
  tervane_close(before);
}

TEST(CInterface, OldNamesAnswerOneAndNought) {
  const test::TempFolder folder;
  tervane_setup setup = 0;
  ASSERT_EQ(tervane_OpenFile(folder.Write("a.tvd", test::SetupText(14, "")).c_str(), &setup), 1);
  double start = 0, end = 0;
  EXPECT_EQ(tervane_SetSimPeriod(setup, 40000.5, 40010), 1);
  EXPECT_EQ(tervane_GetSimPeriod(setup, &start, &end), 1);
  EXPECT_EQ(start, 40000.5);
  char file[300];
  int item = 0;
  EXPECT_EQ(tervane_SetManningNumNds2(setup, folder.File("m.nds2").c_str()), 1);
  EXPECT_EQ(tervane_GetManningNumNds2(setup, file, sizeof file, &item), 0);
  EXPECT_EQ(tervane_GetNds2Kvf(setup, "Overland", "Manning", file, sizeof file), 1);
  EXPECT_EQ(tervane_set_number(setup, (std::string(file) + ":Type").c_str(), nullptr, 1), TERVANE_OK)
      << tervane_last_error();
  EXPECT_EQ(tervane_GetManningNumNds2(setup, file, sizeof file, &item), 1) << tervane_last_error();
  EXPECT_EQ(std::string(file), folder.File("m.nds2"));
  EXPECT_EQ(item, 1);
  EXPECT_EQ(tervane_close(setup), TERVANE_OK);
}

TEST(CInterface, TheDefinitionIsWrittenWhenTheLastCopyGoes) {
  const test::TempFolder folder;
  tervane_climate climate = 0, copy = 0;
  ASSERT_EQ(tervane_climate_open(folder.Write("a.tvd", test::SetupText(14, "")).c_str(), &climate), TERVANE_OK);
  ASSERT_EQ(tervane_climate_copy(climate, &copy), TERVANE_OK);
  EXPECT_EQ(tervane_GetNoPrecValues(climate), 1);
  EXPECT_EQ(tervane_GetNoPrecTimeSeries(climate), 0);
  EXPECT_EQ(tervane_GetNoPrecGridSeries(climate), 0);
  float value = 0;
  EXPECT_EQ(tervane_SetPrecValues(copy, 1, 2.5F), 1);
  EXPECT_EQ(tervane_GetPrecValues(climate, 1, &value), 1);
  EXPECT_EQ(value, 2.5F);
  EXPECT_EQ(tervane_GetPrecValues(climate, 2, &value), 0);
  char file[10];
  EXPECT_EQ(tervane_GetTempGridFileItem(climate, 2, file, sizeof file, nullptr), 0);
  EXPECT_EQ(tervane_climate_close(climate), TERVANE_OK);
  EXPECT_FALSE(std::filesystem::exists(folder.File("CCDefinition_TVN.def")));
  EXPECT_EQ(tervane_climate_close(copy), TERVANE_OK);
  EXPECT_TRUE(std::filesystem::exists(folder.File("CCDefinition_TVN.def")));
}

TEST(CInterface, ManyThreadsHaveSetupsOfTheirOwn) {
  std::atomic<int> done = 0;
  std::vector<std::thread> threads;
  for (int t = 0; t < 4; ++t)
    threads.emplace_back([&done] {
      tervane_setup setup = 0;
      tervane_new(&setup);
      for (int i = 0; i < 50; ++i) done += tervane_set_number(setup, "SimSpec:ModelType", nullptr, i % 4) == TERVANE_OK;
      tervane_close(setup);
    });
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(done, 200);
}

// What the last thread lets go is destroyed while others read: nothing of it may be shared unguarded.
TEST(CInterface, SetupsAreClosedWhileOthersAreReadAndUsed) {
  const test::TempFolder folder;
  const std::string path = folder.Write("a.tvd", test::SetupText(14, ""));
  std::atomic<int> done = 0;
  std::atomic<tervane_setup> shared = 0;
  std::vector<std::thread> threads;
  for (int t = 0; t < 4; ++t)
    threads.emplace_back([&] {
      for (int i = 0; i < 25; ++i) {
        tervane_setup setup = 0;
        tervane_climate climate = 0;
        done += tervane_open(path.c_str(), &setup) == TERVANE_OK;
        done += tervane_climate_open(path.c_str(), &climate) == TERVANE_OK;
        shared = setup;
        char text[100];
        int count = 0;
        // Of what is kept for reading there is more to destroy.
        (void)tervane_get_text(setup, "SimSpec/SimTitle:Title", text, sizeof text, nullptr);
        // Of another thread, perhaps just when that one closes it.
        const tervane_result other = tervane_item_count(shared, "Species", &count);
        done += other == TERVANE_OK || other == TERVANE_BUSY || other == TERVANE_NO_HANDLE;
        tervane_result closed = TERVANE_BUSY;
        while (closed == TERVANE_BUSY) closed = tervane_close(setup);
        done += closed == TERVANE_OK;
        done += tervane_climate_close(climate) == TERVANE_OK;
      }
    });
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(done, 4 * 25 * 5);
}

TEST(CInterface, AnItemThatIsToldAsNotMadeIsNotMade) {
  const Opened setup;
  char small[3] = "";
  std::size_t length = 0;
  int count = -1;
  EXPECT_EQ(tervane_insert_item(setup.handle, "Species", 1, small, sizeof small, &length), TERVANE_TOO_SMALL);
  EXPECT_GT(length, sizeof small);
  for (const int number : {0, -1}) {
    EXPECT_EQ(tervane_insert_item(setup.handle, "Species", number, nullptr, 0, nullptr), TERVANE_ARGUMENT);
    EXPECT_THAT(tervane_last_error(), HasSubstr("counted from 1"));
  }
  EXPECT_EQ(tervane_item_count(setup.handle, "Species", &count), TERVANE_OK);
  EXPECT_EQ(count, 0);
}

}  // namespace
}  // namespace tervane::capi_test
