// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/journal.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <ctime>
#include <filesystem>
#include <fstream>
#include <optional>
#include <system_error>

#include <fmt/chrono.h>
#include <fmt/format.h>
// Measurements that link this have RapidJSON compiled in another way: theirs and ours are two.
#define RAPIDJSON_NAMESPACE tervane::journal_json
#define RAPIDJSON_NAMESPACE_BEGIN namespace tervane::journal_json {
#define RAPIDJSON_NAMESPACE_END }
#include <rapidjson/document.h>
#include <rapidjson/stringbuffer.h>
#include <rapidjson/writer.h>

#include "core/kvf_writer.h"
#include "core/path.h"
#include "document/flow_model_document.h"
#include "document/journal_sections.h"
#include "platform/csv_cell.h"
#include "platform/files.h"
#include "platform/os.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// What waits longer than this for a journal that can be written is given up, oldest first.
constexpr std::size_t kMostWaiting = std::size_t{16} << 20;

/// The texts of a step and of a change, declared once for both directions.
constexpr std::pair<const char*, std::string JournalStep::*> kStepTexts[] = {{"time", &JournalStep::time},
                                                                             {"user", &JournalStep::user},
                                                                             {"action", &JournalStep::action},
                                                                             {"page", &JournalStep::page}};
constexpr std::pair<const char*, std::string JournalChange::*> kChangeTexts[] = {{"path", &JournalChange::path},
                                                                                 {"key", &JournalChange::key},
                                                                                 {"from", &JournalChange::from},
                                                                                 {"to", &JournalChange::to}};

using JsonWriter = journal_json::Writer<journal_json::StringBuffer>;

void PutText(JsonWriter& writer, const std::string& text) {
  writer.String(text.data(), static_cast<journal_json::SizeType>(text.size()));
}

template <class Object, class Texts>
void PutTexts(JsonWriter& writer, const Object& object, const Texts& texts) {
  for (const auto& [name, member] : texts) {
    if ((object.*member).empty()) continue;
    writer.Key(name);
    PutText(writer, object.*member);
  }
}

/// False where a member of that name is no text.
template <class Object, class Texts>
bool TakeTexts(const journal_json::Value& value, Object& object, const Texts& texts) {
  for (const auto& [name, member] : texts) {
    const auto found = value.FindMember(name);
    if (found == value.MemberEnd()) continue;
    if (!found->value.IsString()) return false;
    object.*member = std::string(found->value.GetString(), found->value.GetStringLength());
  }
  return true;
}

}  // namespace

std::string JournalBeside(const std::string& setup) { return setup + ".journal"; }

// ---- Lines

std::string WriteJournalLine(const JournalStep& step) {
  journal_json::StringBuffer buffer;
  JsonWriter writer(buffer);
  writer.StartObject();
  PutTexts(writer, step, kStepTexts);
  writer.Key("changes");
  writer.StartArray();
  for (const JournalChange& change : step.changes) {
    writer.StartObject();
    if (change.kind != SetupDifference::Kind::Changed) {
      writer.Key("kind");
      PutText(writer, std::string(NameOf(change.kind)));
    }
    PutTexts(writer, change, kChangeTexts);
    writer.EndObject();
  }
  writer.EndArray();
  writer.EndObject();
  return std::string(buffer.GetString(), buffer.GetSize()) + "\n";
}

std::optional<JournalStep> ReadJournalLine(std::string_view line, std::string& problem) {
  journal_json::Document json;
  json.Parse<journal_json::kParseIterativeFlag>(line.data(), line.size());
  if (json.HasParseError()) {
    problem = fmt::format("it is no JSON from byte {} on", json.GetErrorOffset() + 1);
    return std::nullopt;
  }
  problem = "it is no step of a journal";
  JournalStep step;
  if (!json.IsObject() || !TakeTexts(json, step, kStepTexts)) return std::nullopt;
  const auto changes = json.FindMember("changes");
  if (changes == json.MemberEnd() || !changes->value.IsArray()) return std::nullopt;
  for (const journal_json::Value& value : changes->value.GetArray()) {
    JournalChange change;
    if (!value.IsObject() || !TakeTexts(value, change, kChangeTexts)) return std::nullopt;
    if (const auto kind = value.FindMember("kind"); kind != value.MemberEnd()) {
      if (!kind->value.IsString()) return std::nullopt;
      const auto known = std::ranges::find(kDifferenceKinds, std::string_view(kind->value.GetString()));
      if (known == std::end(kDifferenceKinds)) return std::nullopt;
      change.kind = static_cast<SetupDifference::Kind>(known - std::begin(kDifferenceKinds));
    }
    step.changes.push_back(std::move(change));
  }
  problem.clear();
  return step;
}

// ---- The file

Journal ReadJournal(const std::string& path) {
  Journal journal;
  if (!FileExists(path)) return journal;
  FileContent content;
  if (FileResult result = ReadWholeFile(path, content); !result.Ok()) {
    journal.error = std::move(result.error);
    return journal;
  }
  std::string_view rest = content.Text();
  for (int number = 1; !rest.empty(); ++number) {
    const std::size_t end = std::min(rest.find('\n'), rest.size());
    const std::string_view line = Trimmed(rest.substr(0, end));
    rest.remove_prefix(std::min(end + 1, rest.size()));
    if (line.empty()) continue;
    std::string problem;
    if (auto step = ReadJournalLine(line, problem))
      journal.steps.push_back(std::move(*step));
    else
      journal.problems.push_back(fmt::format("{}:{}: {}; it is left as it is", path, number, problem));
  }
  return journal;
}

std::string AppendToJournal(const std::string& path, std::string_view lines) {
  if (const std::string other = WhyNoOwnFile(path); !other.empty())
    return fmt::format("cannot write {}: {}", path, other);
  namespace fs = std::filesystem;
  const fs::path native = NativePath(path);
  std::error_code ignored;
  const bool wasThere = fs::exists(native, ignored);
  const std::uintmax_t size = wasThere ? fs::file_size(native, ignored) : 0;
  // A line that a crash has cut off stays one that is told, and spoils no other.
  bool isCut = false;
  if (size > 0 && !ignored) {
    std::ifstream last(native, std::ios::binary);
    last.seekg(-1, std::ios::end);
    const int end = last.get();
    isCut = last && end != '\n';
  }
  errno = 0;
  std::ofstream file(native, std::ios::binary | std::ios::app);
  if (file) {
    const std::string all = (isCut ? "\n" : "") + std::string(lines);
    file.write(all.data(), static_cast<std::streamsize>(all.size()));
    file.flush();
  }
  if (file) return {};
  const int reason = errno;
  const bool isOpen = file.is_open();
  file.close();
  if (isOpen && wasThere)
    fs::resize_file(native, size, ignored);
  else if (isOpen)
    fs::remove(native, ignored);
  return fmt::format("cannot write {}: {}", path,
                     reason != 0 ? std::generic_category().message(reason) : std::string("the file is not writable"));
}

// ---- Looking at steps

bool IsInJournalStep(const JournalStep& step, std::string_view text) {
  const std::string wanted = LowerCase(text);
  const auto has = [&](const auto& object, const auto& texts) {
    return std::ranges::any_of(
        texts, [&](const auto& each) { return LowerCase(object.*each.second).find(wanted) != std::string::npos; });
  };
  return has(step, kStepTexts) ||
         std::ranges::any_of(step.changes, [&](const JournalChange& change) { return has(change, kChangeTexts); });
}

std::string JournalCsv(const std::vector<JournalStep>& steps) {
  std::string table = "time,user,action,page,kind,path,key,from,to\n";
  for (const JournalStep& step : steps) {
    std::string head;
    for (const auto& [name, member] : kStepTexts) head += CsvCell(step.*member) + ",";
    if (step.changes.empty()) table += head + ",,,,\n";
    for (const JournalChange& change : step.changes) {
      table += head + std::string(NameOf(change.kind));
      for (const auto& [name, member] : kChangeTexts) table += "," + CsvCell(change.*member);
      table += '\n';
    }
  }
  return table;
}

// ---- Keeping

JournalKeeper::JournalKeeper(const CFlowModelDoc& document)
    : known_(document.BuildFile(document.Root().SetupFolder())) {}

void JournalKeeper::Take(const CFlowModelDoc& document, std::string action, std::string page) {
  OpenKvf now(document.BuildFile(document.Root().SetupFolder()));
  const std::string target = document.Root().GetTargetName();
  // Sections that are longer come and go by undo alone.
  constexpr std::size_t kLongestSection = std::size_t{1} << 16;
  const auto textAt = [&](KvfFile& file, const std::string& path) {
    const KvfSection* section = FindSection(file, target, ParseSetupPath(path).steps);
    std::string text = section ? KvfTextInside(*section) : std::string();
    return text.size() <= kLongestSection ? text : std::string();
  };
  JournalStep step;
  for (SetupDifference& difference : CompareFiles(*known_, *now, target)) {
    JournalChange& change =
        step.changes.emplace_back(JournalChange{difference.kind, std::move(difference.path), std::move(difference.key),
                                                std::move(difference.from), std::move(difference.to)});
    if (!change.key.empty()) continue;
    if (change.kind == SetupDifference::Kind::Added) change.to = textAt(*now, change.path);
    if (change.kind == SetupDifference::Kind::Removed) change.from = textAt(*known_, change.path);
  }
  known_ = std::move(now);
  if (step.changes.empty()) return;
  step.action = std::move(action);
  step.page = std::move(page);
  Write(document, std::move(step));
}

void JournalKeeper::TakeEvent(const CFlowModelDoc& document, std::string action) {
  // Names of files may be told from another folder now.
  known_.reset(document.BuildFile(document.Root().SetupFolder()));
  JournalStep step;
  step.action = std::move(action);
  Write(document, std::move(step));
}

void JournalKeeper::Write(const CFlowModelDoc& document, JournalStep step) {
  step.time = fmt::format("{:%Y-%m-%d %H:%M:%S}", fmt::localtime(std::time(nullptr)));
  step.user = os::UserName();
  waiting_ += WriteJournalLine(step);
  if (document.PathName().empty()) return;
  trouble_ = AppendToJournal(JournalBeside(document.PathName()), waiting_);
  if (trouble_.empty()) {
    waiting_.clear();
    told_.clear();
  }
  while (waiting_.size() > kMostWaiting) waiting_.erase(0, waiting_.find('\n') + 1);
}

std::string JournalKeeper::TakeTrouble() {
  if (trouble_.empty() || trouble_ == told_) return {};
  told_ = trouble_;
  return trouble_;
}

bool SaveKeepingJournal(CFlowModelDoc& document, const std::string& path, const std::string& action,
                        std::string& trouble) {
  trouble.clear();
  CFlowModelDoc before;
  const bool keeps = FileExists(JournalBeside(path)) && before.OnOpenDocument(path);
  std::optional<JournalKeeper> keeper;
  if (keeps) keeper.emplace(before);
  if (!document.OnSaveDocument(path)) return false;
  if (!keeps) return true;
  keeper->Take(document, action, {});
  trouble = keeper->TakeTrouble();
  return true;
}

}  // namespace tervane
