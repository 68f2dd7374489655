// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "edits/edited_file.h"

#include <fmt/format.h>

#include "platform/file_hash.h"
#include "platform/os.h"
#include "platform/paths.h"

namespace tervane {

namespace {

constexpr std::size_t kMostSteps = 1000;
constexpr std::size_t kMostBytes = std::size_t{1} << 30;
constexpr std::uint64_t kMostHashed = std::uint64_t{1} << 30;

std::string HashOfFile(const std::string& path, const FileStamp& stamp) {
  std::string hash;
  if (!stamp.exists || stamp.size > kMostHashed || !HashFile(path, hash).Ok()) return {};
  return hash;
}

}  // namespace

void KnownFile::Remember(const std::string& path) {
  stamp_ = StampOf(path);
  other_.reset();
  hash_ = HashOfFile(path, stamp_);
}

bool KnownFile::IsOther(const std::string& path) {
  const FileStamp now = StampOf(path);
  if (now == stamp_) return false;
  if (now == other_) return true;
  // Copied back or touched: the same content under another time.
  const bool isOther = hash_.empty() || now.size != stamp_.size || HashOfFile(path, now) != hash_;
  if (isOther)
    other_ = now;
  else
    stamp_ = now;
  return isOther;
}

std::string EditedFile::Reload() {
  // Before the reading, so that no change of another program comes between unseen.
  KnownFile known;
  known.Remember(path_);
  std::string problem = Read();
  if (!problem.empty()) return problem;
  known_ = std::move(known);
  AskRights();
  ForgetSteps();
  problem_.clear();
  return {};
}

void EditedFile::AskRights() {
  std::error_code error;
  whyReadOnly_ = os::MayWrite(path_, error) || error ? std::string() : "you may not write to the file";
}

FileResult EditedFile::Save(const std::string& path, ProgressPart progress) {
  const bool isInPlace = IsSameFile(path, path_) || path == path_;
  if (isInPlace && !WhyReadOnly().empty())
    return {fmt::format("cannot write {}: {}; save it under another name", path, WhyReadOnly()), {}};
  FileResult result = Write(path, progress);
  if (!result.Ok()) return result;
  if (!isInPlace) whyHeld_.clear();
  path_ = isInPlace ? path_ : path;
  AskRights();
  known_.Remember(path_);
  saved_ = done_.size();
  isSavedLost_ = false;
  Saved();
  return result;
}

void EditedFile::Take(std::string name, std::unique_ptr<EditStep> step) {
  for (const NamedStep& undone : undone_) bytes_ -= undone.step->Bytes();
  if (saved_ > done_.size()) isSavedLost_ = true;
  undone_.clear();
  bytes_ += step->Bytes();
  done_.push_back({std::move(name), std::move(step)});
  std::size_t gone = 0;
  while (done_.size() - gone > 1 && (done_.size() - gone > kMostSteps || bytes_ > kMostBytes))
    bytes_ -= done_[gone++].step->Bytes();
  if (gone > 0) {
    done_.erase(done_.begin(), done_.begin() + static_cast<std::ptrdiff_t>(gone));
    if (saved_ < gone) isSavedLost_ = true;
    saved_ -= std::min(saved_, gone);
  }
  Stepped();
}

void EditedFile::ForgetSteps() {
  done_.clear();
  undone_.clear();
  saved_ = bytes_ = 0;
  isSavedLost_ = false;
}

std::string EditedFile::Go(std::vector<NamedStep>& from, std::vector<NamedStep>& to) {
  if (from.empty()) return {};
  if (std::string why = from.back().step->Prepare(); !why.empty()) return why;
  NamedStep step = std::move(from.back());
  from.pop_back();
  bytes_ -= step.step->Bytes();
  step.step->Swap();
  bytes_ += step.step->Bytes();
  to.push_back(std::move(step));
  Stepped();
  return {};
}

}  // namespace tervane
