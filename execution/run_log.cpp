// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "execution/run_log.h"

#include <algorithm>

namespace tervane {

// ---- LogReader

bool LogReader::Open() {
  std::error_code error;
  os::File file = os::File::OpenForReading(path_, error);
  if (error) return false;
  const os::File::Status status = file.GetStatus(error);
  if (error || !status.isRegular) return false;
  file_ = std::move(file);
  opened_ = status;
  place_ = 0;
  return true;
}

std::string LogReader::Read(std::size_t most) {
  std::error_code error;
  if (!file_.IsOpen() && !Open()) return {};
  std::string bytes(most, '\0');
  bytes.resize(file_.Read(bytes.data(), most, error));
  place_ += bytes.size();
  if (!bytes.empty()) return bytes;
  // At the end. The name may lead to another file by now, or the file may have been begun anew.
  os::File now = os::File::OpenForReading(path_, error);
  if (error) return {};
  const os::File::Status status = now.GetStatus(error);
  if (error || (status.volume == opened_.volume && status.number == opened_.number && status.size >= place_)) return {};
  if (!Open()) return {};
  bytes.resize(most);
  bytes.resize(file_.Read(bytes.data(), most, error));
  place_ = bytes.size();
  return bytes;
}

// ---- LogPiece

std::string_view LogPiece::Line(std::size_t index) const {
  const std::size_t begin = index == 0 ? 0 : ends_[index - 1];
  return std::string_view(text_).substr(begin, ends_[index] - begin);
}

void LogPiece::EndLine() {
  longest_ = std::max(longest_, text_.size() - (ends_.empty() ? 0 : ends_.back()));
  ends_.push_back(text_.size());
}

void LogPiece::Add(const LogPiece& other) {
  const std::size_t before = text_.size();
  text_ += other.text_;
  for (const std::size_t end : other.ends_) ends_.push_back(before + end);
  longest_ = std::max(longest_, other.longest_);
}

// ---- LineCutter

LogPiece LineCutter::Cut(std::string_view bytes) {
  LogPiece lines;
  while (!bytes.empty()) {
    const std::size_t end = bytes.find('\n');
    Take(bytes.substr(0, end), lines);
    if (end == std::string_view::npos) break;
    EndLine(lines);
    bytes.remove_prefix(end + 1);
  }
  return lines;
}

LogPiece LineCutter::Rest() {
  LogPiece lines;
  if (!begun_.empty()) EndLine(lines);
  return lines;
}

void LineCutter::Take(std::string_view part, LogPiece& lines) {
  while (!part.empty()) {
    if (endsInReturn_) EndLine(lines);
    const std::size_t end = part.find('\r');
    const std::string_view text = part.substr(0, end);
    const std::size_t room = kLongestLine - begun_.size();
    begun_ += text.substr(0, room);
    isCut_ = isCut_ || text.size() > room;
    if (end == std::string_view::npos) break;
    endsInReturn_ = true;
    part.remove_prefix(end + 1);
  }
}

void LineCutter::EndLine(LogPiece& lines) {
  lines.Append(begun_);
  if (isCut_) lines.Append("…");
  lines.EndLine();
  begun_.clear();
  isCut_ = endsInReturn_ = false;
}

// ---- LogTail

void LogTail::Add(LogPiece piece) {
  if (piece.Count() == 0) return;
  // Small pieces grow together, so that a slow engine does not leave one for each line.
  constexpr std::size_t kSmall = 64u << 10;
  count_ += piece.Count();
  bytes_ += piece.Bytes();
  longest_ = std::max(longest_, piece.Longest());
  if (!pieces_.empty() && pieces_.back().piece.Bytes() + piece.Bytes() <= kSmall)
    pieces_.back().piece.Add(piece);
  else
    pieces_.push_back({dropped_ + count_ - piece.Count(), std::move(piece)});
  while (pieces_.size() > 1) {
    const LogPiece& front = pieces_.front().piece;
    if (count_ - front.Count() < kMostLines && bytes_ <= kMostBytes) break;
    count_ -= front.Count();
    bytes_ -= front.Bytes();
    dropped_ += front.Count();
    pieces_.pop_front();
  }
}

void LogTail::Add(std::string_view line) {
  LogPiece piece;
  piece.Append(line);
  piece.EndLine();
  Add(std::move(piece));
}

void LogTail::Add(LogTail other) {
  if (other.dropped_ > 0) {
    // What went there came behind all that is kept here.
    dropped_ += count_ + other.dropped_;
    count_ = bytes_ = 0;
    pieces_.clear();
  }
  longest_ = std::max(longest_, other.longest_);
  for (Placed& placed : other.pieces_) Add(std::move(placed.piece));
}

std::string_view LogTail::Line(std::size_t index) const {
  const std::uint64_t number = dropped_ + index;
  const auto behind = std::upper_bound(pieces_.begin(), pieces_.end(), number,
                                       [](std::uint64_t wanted, const Placed& each) { return wanted < each.first; });
  const Placed& placed = *std::prev(behind);
  return placed.piece.Line(static_cast<std::size_t>(number - placed.first));
}

}  // namespace tervane
