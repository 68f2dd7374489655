// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// How the time to open, save and validate a setup grows with its size, and what a check of a small one costs.
#include <algorithm>
#include <chrono>
#include <filesystem>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include <fcntl.h>
#include <fmt/format.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include "bench/median_table.h"
#include "document/flow_model_document.h"
#include "platform/files.h"
#include "simspec/extra_params.h"

namespace tervane::bench {

namespace {

constexpr int kFew = 10'000;
constexpr int kMany = 100'000;
constexpr const char* kSetupPath = "/setups/example.tvd";

// ---- Two trees that grow

/// A section whose name many others of the same parent bear.
class WellNode : public CYbSEKvfBase {
 public:
  explicit WellNode(CYbSEKvfBase* parent) : CYbSEKvfBase("Well", "Well", parent) {}

  int Number = 0;
  double Depth = 12.5;
  std::string Name = "a well";

  int ValidateData() override { return Depth > 0; }

 protected:
  void ExchangeKeys(KeyExchange& keys) override {
    keys("Number", Number);
    keys("Depth", Depth);
    keys("Name", Name);
  }
};

class WellsRoot : public CYbSEKvfGlobalBase {
 public:
  explicit WellsRoot(int count) : CYbSEKvfGlobalBase("WELLS") {
    for (int number = 1; number <= count; ++number) NewChild<WellNode>()->Number = number;
  }
};

std::unique_ptr<CYbSEDocument> NewWells(int count) {
  return std::make_unique<CYbSEDocument>(std::make_unique<WellsRoot>(count));
}

CExtraParamsKvf* ExtraParamsOf(const CYbSEDocument& document) {
  for (CYbSEKvfBase* child = document.Root().GetFirstChild(); child; child = document.Root().GetNextChild(child))
    if (auto* list = dynamic_cast<CExtraParamsKvf*>(child)) return list;
  return nullptr;
}

std::unique_ptr<CYbSEDocument> NewSetup() { return std::make_unique<CFlowModelDoc>(); }

std::string TextOf(const CYbSEDocument& document) {
  std::string text, error;
  if (!document.BuildText("/setups", text, error)) fmt::print("not saved: {}\n", error);
  return text;
}

std::string SetupWithItems(int count) {
  const std::unique_ptr<CYbSEDocument> setup = NewSetup();
  CExtraParamsKvf& list = *ExtraParamsOf(*setup);
  list.SetItemCount(count, 1);
  for (int number = 1; number <= count; ++number) {
    CExtraParamsItemKvf& item = *list.GetItem(number);
    item.Name = fmt::format("parameter {}", number);
    item.Type = number % 5;
    item.FloatValue = 0.5 * number;
    item.TextValue = "a text";
    item.FilenameValue = FileName("maps/map.nds2", "/setups");
  }
  return TextOf(*setup);
}

/// Opens into a new document; gives it back so that it dies outside the time.
std::unique_ptr<CYbSEDocument>& Open(std::unique_ptr<CYbSEDocument>& document, const std::string& text) {
  if (!document->OpenText(text, kSetupPath)) fmt::print("not opened: {}\n", document->Error());
  return document;
}

/// One kind of setup in two sizes.
struct Growth {
  std::string name;
  std::function<std::unique_ptr<CYbSEDocument>(int count)> make;
  std::function<std::string(int count)> makeText;

  struct Size {
    std::string label, text;
    int count;
    std::unique_ptr<CYbSEDocument> opened;
  };
  Size few, many;

  void Add(MedianTable& table) {
    for (Size* size : {&few, &many}) {
      size->count = size == &few ? kFew : kMany;
      size->label = fmt::format("{} {}", size->count, name);
      size->text = makeText(size->count);
      size->opened = make(size->count);
      Open(size->opened, size->text);
      if (TextOf(*size->opened) != size->text) fmt::print("WRONG: {} do not come back as they were read\n", name);
      table.Add(
          "open " + size->label, [this, size] { return make(size->count); },
          [size](auto& document) { return Open(document, size->text).get(); });
      table.Add("save " + size->label, [size] { return TextOf(*size->opened); });
      table.Add("validate " + size->label, [size] { return size->opened->Root().Validate(); });
    }
    // Ten times the size; the rest is for what no longer fits the processor's caches.
    for (const char* what : {"open ", "save ", "validate "}) table.Limit(what + many.label, what + few.label, 12);
  }
};

// ---- The program

/// Runs the program and waits for it; gives the milliseconds, negative when it could not run.
double TimeOfRun(std::vector<std::string> arguments) {
  std::vector<char*> pointers;
  for (std::string& argument : arguments) pointers.push_back(argument.data());
  pointers.push_back(nullptr);
  posix_spawn_file_actions_t actions;
  posix_spawn_file_actions_init(&actions);
  posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, "/dev/null", O_WRONLY, 0);
  const auto start = std::chrono::steady_clock::now();
  pid_t process = 0;
  int status = 0;
  const bool ran = posix_spawn(&process, pointers[0], &actions, nullptr, pointers.data(), environ) == 0 &&
                   waitpid(process, &status, 0) == process && WIFEXITED(status);
  const std::chrono::duration<double, std::milli> time = std::chrono::steady_clock::now() - start;
  posix_spawn_file_actions_destroy(&actions);
  return ran ? time.count() : -1;
}

void MeasureCheck() {
  const std::string program = TERVANE_BIN_DIR "/tervane";
  if (access(program.c_str(), X_OK) != 0) {
    fmt::print("\ntervane check: not measured, {} has not been built\n", program);
    return;
  }
  const std::string folder =
      (std::filesystem::temp_directory_path() / fmt::format("tervane_bench_{}", getpid())).string();
  std::filesystem::create_directory(folder);
  const std::string setup = folder + "/default.tvd";
  if (const FileResult written = WriteFileAtomically(setup, TextOf(*NewSetup())); !written.Ok())
    fmt::print("{}\n", written.error);
  std::vector<double> times;
  for (int run = 0; run < 21; ++run) times.push_back(TimeOfRun({program, "check", setup}));
  std::filesystem::remove_all(folder);
  // The first run brings the program and its libraries into memory.
  times.erase(times.begin());
  if (*std::min_element(times.begin(), times.end()) < 0) {
    fmt::print("\ntervane check: {} could not be run\n", program);
    return;
  }
  std::nth_element(times.begin(), times.begin() + 10, times.end());
  fmt::print("\ntervane check of a default setup: {:.2f} ms (median of 20 runs, from start to end of the process)\n",
             times[10]);
}

}  // namespace

}  // namespace tervane::bench

int main(int argc, char** argv) {
  using namespace tervane::bench;
  Growth items{"extra parameters", [](int) { return NewSetup(); }, SetupWithItems, {}, {}};
  Growth wells{"equal sections", NewWells, [](int count) { return TextOf(*NewWells(count)); }, {}, {}};
  MedianTable table(31);
  items.Add(table);
  wells.Add(table);
  table.Run(argc, argv);
  MeasureCheck();
  return 0;
}
