// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/key_exchange.h"

#include <algorithm>
#include <cmath>

#include <fmt/format.h>

#include "core/kvf_writer.h"
#include "core/list.h"
#include "platform/text.h"

namespace tervane {

KeyExchange KeyExchange::Reading(KvfNode* section, int docVersion) {
  // A missing section reads like an empty one.
  static KvfSection empty;
  KeyExchange keys;
  keys.section_ = section ? section : &empty;
  // A version below "none" is as old.
  keys.docVersion_ = std::max(docVersion, -1);
  return keys;
}

KeyExchange KeyExchange::Writing(KvfFile* file) {
  KeyExchange keys;
  keys.file_ = file;
  return keys;
}

KeyExchange KeyExchange::Describing(std::vector<KeyInfo>& described, int docVersion) {
  KeyExchange keys;
  keys.scratch_ = std::make_shared<KvfFile>();
  keys.file_ = keys.scratch_.get();
  keys.keys_ = &described;
  keys.docVersion_ = docVersion;
  kvfAddTarget(keys.file_, "Keys");
  return keys;
}

KeyExchange KeyExchange::Keeping(StateBuffer& state) {
  KeyExchange keys;
  keys.state_ = &state;
  keys.docVersion_ = KeyInfo::kNoLimit;  // no rule of an old version holds
  return keys;
}

KeyExchange KeyExchange::Restoring(StateBuffer& state) {
  KeyExchange keys = Keeping(state);
  keys.isRestoring_ = true;
  return keys;
}

KeyExchange KeyExchange::Fingerprinting(StateFingerprint& fingerprint) {
  KeyExchange keys;
  keys.fingerprint_ = &fingerprint;
  keys.docVersion_ = KeyInfo::kNoLimit;
  return keys;
}

KeyExchange KeyExchange::Checking(StrayReport report) {
  KeyExchange keys;
  keys.report_ = std::move(report);
  keys.docVersion_ = KeyInfo::kNoLimit;
  return keys;
}

void KeyExchange::Finish() {
  if (!report_ || checked_.key.empty()) return;
  if (std::string text = WhyStray(checked_.facts, checked_.value); !text.empty())
    report_(Trimmed(checked_.key), std::move(text), std::isfinite(checked_.value));
  checked_.key.clear();
  checked_.facts = {};
  checked_.member = nullptr;
}

bool KeyExchange::Reads(const Rule& rule) {
  if (docVersion_ >= rule.since && docVersion_ <= rule.until) return true;
  kvfMarkKnown(section_, rule.key);
  return false;
}

void KeyExchange::Describe(const Rule& rule, std::string_view type, const void* member) {
  const KvfNode* keyword = file_->currentKeyword;
  if (!keyword) return;
  keys_->push_back({.key = std::string(rule.key),
                    .type = std::string(type),
                    .defaultValue = rule.written ? KvfValuesText(*keyword) : std::string(),
                    .since = rule.since,
                    .until = rule.until,
                    .written = rule.written,
                    .member = member});
}

template <class Value>
void KeyExchange::Several(std::string_view key, std::vector<Value>& values) {
  if (report_) return Finish();
  if (state_ || fingerprint_) return void(ExchangeState({key}, values));
  if (IsReading()) {
    const KvfNode* keyword = kvfKeywordByNameNum(section_, key, 1);
    if (!keyword) return;
    std::vector<Value> read(keyword->count);
    for (std::uint32_t i = 0; i < keyword->count; ++i)
      if (!kvfGetParam(section_, key, &read[i], 1, static_cast<int>(i) + 1)) return;
    values = std::move(read);
    return;
  }
  kvfAddKeyword(file_, key);
  for (const Value& value : values) {
    if constexpr (std::is_same_v<Value, int>)
      kvfAddInt(file_, value);
    else
      kvfAddString(file_, value);
  }
  if (keys_) Describe({key}, std::is_same_v<Value, int> ? "int list" : "string list", &values);
}

template void KeyExchange::Several(std::string_view key, std::vector<int>& values);
template void KeyExchange::Several(std::string_view key, std::vector<std::string>& values);

void KeyExchange::Lines(std::string_view countKey, std::string_view key, std::vector<KeyLine>& lines) {
  if (report_) return Finish();
  if (IsReading()) {
    int count = 0;
    if (!kvfGetParam(section_, countKey, &count, 1, 1)) return;
    lines.clear();
    KeyLine line;
    for (int n = 1; n <= count; ++n) {
      if (!kvfGetListParam(section_, key, n, "sii", &line.text, &line.first, &line.second)) break;
      lines.push_back(line);
    }
    return;
  }
  kvfPutParam(file_, countKey, static_cast<int>(lines.size()));
  if (keys_) Describe({countKey}, "int", nullptr);
  for (const KeyLine& line : lines) kvfPutListParam(file_, key, "sii", line.text.c_str(), line.first, line.second);
  if (!keys_) return;
  Describe({key}, "string, int, int", nullptr);
  // Without lines, what was written last is their number.
  if (lines.empty()) keys_->back().defaultValue.clear();
}

template <class Value>
void KeyExchange::Repeated(const RepeatedKeys& names, std::vector<Value>& values) {
  if (report_) return Finish();
  if (state_ || fingerprint_) return void(ExchangeState({names.key}, values));
  if (IsReading()) {
    KvfNode* section = kvfSectionByNameNum(section_, names.section, 1);
    if (!section) return;
    kvfMarkKnown(section, names.count);
    values.clear();
    Value value{};
    for (int n = 1; kvfGetParam(section, names.key, &value, n, 1); ++n) values.push_back(value);
    return;
  }
  kvfAddSection(file_, names.section);
  kvfPutParam(file_, names.count, static_cast<int>(values.size()));
  if (keys_) Describe({names.count}, "int", nullptr);
  for (const Value& value : values) kvfPutParam(file_, names.key, value);
  if (keys_) {
    Describe({names.key}, std::is_same_v<Value, int> ? "int, repeated" : "string, repeated", &values);
    if (values.empty()) keys_->back().defaultValue.clear();
    for (KeyInfo* key : {&keys_->back(), &keys_->back() - 1}) key->section = names.section;
  }
  kvfEndSection(file_);
}

template void KeyExchange::Repeated(const RepeatedKeys& names, std::vector<int>& values);
template void KeyExchange::Repeated(const RepeatedKeys& names, std::vector<std::string>& values);

void KeyExchange::Day(std::string_view key, CYbDateTime& value) {
  if (report_) return Finish();
  if (state_ || fingerprint_) return void(ExchangeState({key}, value));
  int year = value.Year(), month = value.Month(), day = value.Day();
  if (IsReading()) {
    if (!kvfGetListParam(section_, key, 1, "iii", &year, &month, &day)) return;
    value = CYbDateTime(year, month, day);
    if (!value.IsValid() && (year != 0 || month != 0 || day != 0))
      kvfAddNote(section_, key, "year, month, day that name a date were expected");
    return;
  }
  kvfPutListParam(file_, key, "iii", year, month, day);
  if (keys_) Describe({key}, "day", &value);
}

void KeyExchange::Count(std::string_view key, CYbSEKvfListBaseInterface& list) {
  if (report_) return Finish();
  if (state_ || fingerprint_) return;
  if (IsReading()) {
    list.ReadItemCount(section_, key);
    return;
  }
  int count = list.GetChildCount();
  Exchange({key}, count);
  Declared().HeldIn(nullptr);
}

bool KeyExchange::Read(std::string_view key, FileName& value) {
  const KvfNode* keyword = kvfKeywordByNameNum(section_, key, 1);
  std::string absolute;
  // The absolute form is asked for its notes on a wrong type; what is kept is the text as it stood.
  if (!keyword || !kvfGetParamFilename(section_, key, &absolute, 1, 1)) return false;
  const std::string_view text = keyword->params[0].Text();
  if (EndsInSeparator(text)) {
    kvfAddNote(section_, key, "a folder stands where a file was expected: it reads as empty");
    value = FileName();
  } else {
    value = text.empty() ? FileName() : FileName(std::string(text), kvfFolderOf(section_));
  }
  return true;
}

bool KeyExchange::Read(std::string_view key, CYbDateTime& value) {
  int year = 0, month = 0, day = 0, hour = 0, minute = 0;
  if (!kvfGetListParam(section_, key, 1, "iiiii", &year, &month, &day, &hour, &minute)) return false;
  value = CYbDateTime(year, month, day, hour, minute);
  // Five zeros stand for "no date".
  const bool isEmpty = year == 0 && month == 0 && day == 0 && hour == 0 && minute == 0;
  if (!value.IsValid() && !isEmpty)
    kvfAddNote(section_, key, "year, month, day, hour, minute that name a date were expected");
  return true;
}

void KeyExchange::Write(std::string_view key, const FileName& value) {
  kvfPutParamFilename(file_, key, value.TextIn(file_->folder));
}

void KeyExchange::Write(std::string_view key, const CYbDateTime& value) {
  kvfPutListParam(file_, key, "iiiii", value.Year(), value.Month(), value.Day(), value.Hour(), value.Minute());
}

}  // namespace tervane
