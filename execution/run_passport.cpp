// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "execution/run_passport.h"

#include <algorithm>
#include <chrono>
#include <filesystem>

#include <fmt/format.h>

#include "core/key_exchange.h"
#include "platform/dates.h"
#include "platform/file_hash.h"
#include "platform/paths.h"
#include "platform/version.h"

namespace tervane {

namespace {

constexpr std::string_view kTarget = "TERVANE_RUN_PASSPORT";
constexpr int kVersion = 1;

std::string TimeText(std::int64_t milliseconds) {
  return milliseconds == 0 ? std::string()
                           : CYbDateTime::FromSecondsSinceEpoch(milliseconds / 1000).Format("%Y-%m-%d %H:%M:%S");
}

void PutStamp(const FileStamp& stamp, PassportInput& input) {
  input.size = stamp.exists ? std::to_string(stamp.size) : std::string();
  input.modified = stamp.exists ? TextOfTime(stamp.time) : std::string();
}

bool IsAsItWas(const PassportInput& input) {
  PassportInput now;
  PutStamp(StampOf(input.path), now);
  return now.size == input.size && now.modified == input.modified;
}

void ExchangePassport(KeyExchange& keys, RunPassport& passport) {
  keys("Id", passport.id);
  keys("Setup", passport.setup);
  keys("Engine", passport.engine);
  keys("Options", passport.options);
  keys("Program", passport.program);
  keys("User", passport.user);
  keys("Host", passport.host);
  keys("Begun", passport.begun);
  keys("Ended", passport.ended);
  keys("Outcome", passport.outcome);
}

void ExchangeInput(KeyExchange& keys, PassportInput& input) {
  keys("File", input.path);
  keys("Size", input.size);
  keys("Modified", input.modified);
  keys("Hash", input.hash);
  keys("Problem", input.problem);
}

InputFate FateOf(const PassportInput& input, bool isQuick, ProgressPart progress) {
  PassportInput now;
  PutStamp(StampOf(input.path), now);
  if (now.size.empty()) return input.size.empty() ? InputFate::Same : InputFate::Gone;
  if (input.size.empty()) return InputFate::New;
  if (now.size != input.size) return InputFate::Changed;
  if (now.modified == input.modified) return input.problem.empty() ? InputFate::Same : InputFate::Unknown;
  if (isQuick) return InputFate::Changed;
  if (input.hash.empty()) return InputFate::Unknown;
  std::string hash;
  if (!HashFile(input.path, hash, progress).Ok()) return InputFate::Unknown;
  return hash == input.hash ? InputFate::Same : InputFate::Changed;
}

}  // namespace

bool RunPassport::HasAllHashes() const {
  return std::ranges::none_of(inputs, [](const PassportInput& input) {
    return input.hash.empty() && input.problem.empty() && !input.size.empty();
  });
}

std::string TextOfTime(std::filesystem::file_time_type time) {
  const auto since =
      std::chrono::duration_cast<std::chrono::nanoseconds>(std::chrono::file_clock::to_sys(time).time_since_epoch());
  const auto seconds = std::chrono::floor<std::chrono::seconds>(since);
  return fmt::format("{}.{:09}", TimeText(seconds.count() * 1000), (since - seconds).count());
}

PassportFiles PassportFilesOf(std::string_view resultFolder, std::string_view setup) {
  const std::string stem = fmt::format("{}/{}_Passport", resultFolder, BaseNameOf(setup));
  return {stem + ".kvf", stem + ".tvd"};
}

RunPassport PassportOf(const RunState& state, const std::vector<std::string>& inputs) {
  RunPassport passport;
  passport.id = state.id;
  passport.setup = state.setup;
  passport.engine = state.engine;
  passport.options = state.options;
  passport.program = fmt::format("Tervane {}", kProgramVersion);
  passport.user = state.starter.user;
  passport.host = state.starter.host;
  passport.begun = TimeText(state.begun);
  for (const std::string& path : inputs) {
    PassportInput& input = passport.inputs.emplace_back();
    input.path = path;
    PutStamp(StampOf(path), input);
  }
  return passport;
}

FileResult WritePassport(const RunPassport& passport, const std::string& path) {
  KvfFile* file = kvfCreate();
  kvfAddTarget(file, kTarget);
  kvfPutParam(file, "Version", kVersion);
  KeyExchange keys = KeyExchange::Writing(file);
  RunPassport written = passport;
  ExchangePassport(keys, written);
  kvfPutParam(file, "NumberOfInputs", static_cast<int>(written.inputs.size()));
  for (PassportInput& input : written.inputs) {
    kvfAddSection(file, "Input");
    ExchangeInput(keys, input);
    kvfEndSection(file);
  }
  kvfEndSection(file);
  kvfGetErrorGlb();  // what an earlier writer left
  kvfWrite(file, path);
  kvfClose(&file);
  return {kvfGetErrorGlb() == kKvfNoError ? std::string() : kvfErrorText(), {}};
}

std::optional<RunPassport> ReadPassport(const std::string& path, std::string& problem) {
  problem.clear();
  if (!FileExists(path)) return std::nullopt;
  kvfGetErrorGlb();  // what an earlier reader left
  KvfFile* file = kvfLoadFile(path, 0);
  std::optional<RunPassport> passport;
  KvfNode* target = nullptr;
  if (kvfGetErrorGlb() != kKvfNoError)
    problem = kvfErrorText();
  else if (!(target = kvfTargetByNameNum(file, kTarget, 1)))
    problem = fmt::format("{} is no passport of a run", path);
  int version = 0;
  if (target && (!kvfGetParam(target, "Version", &version, 1, 1) || version > kVersion))
    problem = fmt::format("{} was written by a newer version of the program", path);
  if (problem.empty()) {
    passport.emplace();
    KeyExchange keys = KeyExchange::Reading(target, KeyInfo::kNoLimit);
    ExchangePassport(keys, *passport);
    for (int number = 1; KvfNode* section = kvfSectionByNameNum(target, "Input", number); ++number) {
      KeyExchange ofInput = KeyExchange::Reading(section, KeyInfo::kNoLimit);
      ExchangeInput(ofInput, passport->inputs.emplace_back());
    }
  }
  kvfClose(&file);
  return passport;
}

void HashInputs(RunPassport& passport, ProgressPart progress) {
  std::size_t done = 0;
  for (PassportInput& input : passport.inputs) {
    const auto count = static_cast<double>(passport.inputs.size());
    const ProgressPart part = progress.Part(static_cast<double>(done) / count, static_cast<double>(done + 1) / count);
    ++done;
    if (progress.IsCancelled()) return;
    if (input.size.empty() || !input.hash.empty() || !input.problem.empty()) continue;
    std::string hash;
    const FileResult hashed = HashFile(input.path, hash, part);
    if (progress.IsCancelled()) return;
    if (!hashed.Ok())
      input.problem = hashed.error;
    else if (!IsAsItWas(input))
      input.problem = "it changed while the run went on";
    else
      input.hash = std::move(hash);
  }
}

void FinishPassport(RunPassport passport, const RunState& state, const std::string& path) {
  std::string problem;
  const std::optional<RunPassport> onDisk = ReadPassport(path, problem);
  if (!onDisk || onDisk->id != passport.id) return;
  passport.ended = TimeText(state.ended);
  passport.outcome = OutcomeSentence(state);
  WritePassport(passport, path);
}

std::string_view NameOf(InputFate fate) {
  switch (fate) {
    case InputFate::Same:
      return {};
    case InputFate::Changed:
      return "has changed";
    case InputFate::Gone:
      return "is gone";
    case InputFate::New:
      return "was not there";
    case InputFate::Unknown:
      return "may have changed: its content was not noted";
  }
  return {};
}

std::vector<InputChange> ChangedInputs(const RunPassport& passport, bool isQuick, ProgressPart progress) {
  std::vector<InputChange> changes;
  for (const PassportInput& input : passport.inputs)
    if (const InputFate fate = FateOf(input, isQuick, progress); fate != InputFate::Same)
      changes.push_back({input.path, fate});
  return changes;
}

}  // namespace tervane
