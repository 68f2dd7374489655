// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/kvf.h"

#include <algorithm>
#include <cmath>
#include <cstdarg>
#include <cstring>
#include <limits>

#include <fmt/format.h>

#include "core/kvf_parser.h"
#include "core/kvf_writer.h"
#include "platform/files.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

struct PendingError {
  int code = kKvfNoError;
  std::string text;
};

PendingError& Pending() {
  static PendingError pending;
  return pending;
}

void SetError(int code, std::string text) { Pending() = {code, std::move(text)}; }

/// Files from their creation to their close, so that a parameter's file can be found.
std::vector<KvfFile*>& OpenFiles() {
  static std::vector<KvfFile*> files;
  return files;
}

KvfFile* NewFile() { return OpenFiles().emplace_back(new KvfFile); }

template <class Node>
Node* LookedUp(Node* found) {
  if (found) found->lookedUp = true;
  return found;
}

constexpr std::string_view TypeName(KvfType type) {
  switch (type) {
    case KvfType::Int:
      return "a whole number";
    case KvfType::Float:
      return "a float";
    case KvfType::Double:
      return "a number";
    case KvfType::Bool:
      return "true or false";
    case KvfType::String:
      return "a text in quotes";
    case KvfType::Filename:
      return "a file name (file \"...\")";
  }
  return {};
}

// ---- Conversions: true where nothing is lost

bool Convert(const KvfParam& param, int& value) {
  if (param.type == KvfType::Int) return value = param.asInt, true;
  if (param.type != KvfType::Float && param.type != KvfType::Double) return false;
  const double number = param.type == KvfType::Float ? static_cast<double>(param.asFloat) : param.asDouble;
  if (!(number >= std::numeric_limits<int>::min() && number <= std::numeric_limits<int>::max())) return false;
  if (std::trunc(number) != number) return false;
  return value = static_cast<int>(number), true;
}

bool Convert(const KvfParam& param, double& value) {
  switch (param.type) {
    case KvfType::Int:
      return value = param.asInt, true;
    case KvfType::Float:
      return value = static_cast<double>(param.asFloat), true;
    case KvfType::Double:
      return value = param.asDouble, true;
    default:
      return false;
  }
}

bool Convert(const KvfParam& param, float& value) {
  if (param.type == KvfType::Float) return value = param.asFloat, true;
  double number = 0;
  if (!Convert(param, number)) return false;
  if (std::isfinite(number) && std::abs(number) > static_cast<double>(std::numeric_limits<float>::max())) return false;
  const auto narrow = static_cast<float>(number);
  // A float stands for every number of which it shows all digits: 0.1 is the float 0.1, 0.123456789 is none.
  if (static_cast<double>(narrow) != number && !std::isnan(number) && ShortestNumber(narrow) != ShortestNumber(number))
    return false;
  return value = narrow, true;
}

bool Convert(const KvfParam& param, bool& value) { return param.type == KvfType::Bool && (value = param.asBool, true); }

bool Convert(const KvfParam& param, std::string& value) {
  return param.type == KvfType::String && (value = param.Text(), true);
}

constexpr KvfType TypeOf(const int&) { return KvfType::Int; }
constexpr KvfType TypeOf(const float&) { return KvfType::Float; }
constexpr KvfType TypeOf(const double&) { return KvfType::Double; }
constexpr KvfType TypeOf(const bool&) { return KvfType::Bool; }
constexpr KvfType TypeOf(const std::string&) { return KvfType::String; }

void NoteType(KvfNode* section, const KvfNode& keyword, const KvfParam* param, KvfType expected) {
  const std::string found = param ? KvfValueText(*param) : "nothing";
  AsSection(section)->file->notes.push_back(
      {&keyword,
       fmt::format("{} stands where {} was expected: the value that held before stays", found, TypeName(expected))});
}

template <class Value>
int GetParam(KvfNode* section, std::string_view key, Value* value, int instance, int position) {
  KvfNode* keyword = kvfKeywordByNameNum(section, key, instance);
  if (!keyword) return 0;
  KvfParam* param = kvfParamByNum(keyword, position);
  if (param && Convert(*param, *value)) return 1;
  NoteType(section, *keyword, param, TypeOf(*value));
  return 0;
}

/// The open file in whose tree a parameter lies, or null: it does not know it itself.
KvfFile* OwnerOf(const KvfParam* param) {
  const auto owner = std::find_if(OpenFiles().begin(), OpenFiles().end(),
                                  [&](const KvfFile* file) { return file->nodes.Owns(param); });
  return owner == OpenFiles().end() ? nullptr : *owner;
}

constexpr std::string_view kSystemTarget = "SYSTEM";
constexpr std::string_view kRootKey = "ProjectResultRoot";
constexpr std::string_view kUseCustomKey = "UseCustomResultFolder";
constexpr std::string_view kCustomKey = "CustomResultFolder";

KvfSection* SystemTarget(KvfFile& file, bool make) {
  if (KvfNode* found = FindKvfNode(file.top, false, kSystemTarget)) return AsSection(found);
  return make ? file.AddSection(file.top, KvfKind::Target, kSystemTarget) : nullptr;
}

KvfParam& SystemParam(KvfFile& file, std::string_view key, KvfType type) {
  KvfSection& target = *SystemTarget(file, true);
  KvfNode* keyword = FindKvfNode(target, true, key);
  if (!keyword) keyword = file.AddKeyword(target, key, 0);
  return file.ReplaceParams(*keyword, type);
}

}  // namespace

// ---- Life of a file

KvfFile* kvfCreate() { return NewFile(); }

KvfFile* kvfLoadFile(const std::string& path, int /*mode*/) {
  KvfFile* file = NewFile();
  file->path = path;
  file->folder = FolderOf(AbsoluteFromHere(path));
  FileContent text;
  if (const FileResult result = ReadWholeFile(path, text); !result.Ok()) {
    SetError(kKvfCannotRead, result.error);
    kvfClose(&file);
    return nullptr;
  }
  if (!ParseKvf(text, *file)) {
    SetError(kKvfSyntaxError, fmt::format("{}:{}", path, file->syntaxError.message));
    file->Clear(file->top);
  }
  return file;
}

void kvfWrite(KvfFile* file, const std::string& path) {
  if (!file) return;
  std::string text, error;
  if (!WriteKvfText(*file, text, error))
    return SetError(kKvfCannotWrite, fmt::format("cannot write {}: {}", path, error));
  if (const FileResult result = WriteFileAtomically(path, text); !result.Ok()) SetError(kKvfCannotWrite, result.error);
}

void kvfClose(KvfFile** file) {
  if (!file || !*file) return;
  std::erase(OpenFiles(), *file);
  delete *file;
  *file = nullptr;
}

void kvfCopy(KvfNode* source, KvfNode* destination) {
  const KvfSection* from = AsSection(source);
  KvfSection* to = AsSection(destination);
  if (from && to) to->file->CopyChildren(*from, *to);
}

// ---- Errors

int kvfPeekErrorGlb() { return Pending().code; }

int kvfGetErrorGlb() { return std::exchange(Pending().code, kKvfNoError); }

void kvfGetSyntaxErr(KvfFile* file, int* line, int* column, const char** message) {
  *line = file ? file->syntaxError.line : 0;
  *column = file ? file->syntaxError.column : 0;
  *message = file ? file->syntaxError.message.c_str() : "";
}

const std::string& kvfErrorText() { return Pending().text; }

// ---- Finding things

int kvfGetNoTargets(KvfFile* file) { return file ? static_cast<int>(file->top.count) : 0; }

KvfNode* kvfTargetByNum(KvfFile* file, int n) {
  return file && n >= 1 ? LookedUp(FindKvfNode(file->top, static_cast<std::size_t>(n))) : nullptr;
}

KvfNode* kvfTargetByNameNum(KvfFile* file, std::string_view name, int instance) {
  return file ? kvfSectionByNameNum(&file->top, name, instance) : nullptr;
}

KvfNode* kvfSectionByNameNum(KvfNode* section, std::string_view name, int instance) {
  KvfSection* in = AsSection(section);
  return in && instance >= 1 ? LookedUp(FindKvfNode(*in, false, Trimmed(name), static_cast<std::size_t>(instance)))
                             : nullptr;
}

KvfNode* kvfKeywordByNameNum(KvfNode* section, std::string_view name, int instance) {
  KvfSection* in = AsSection(section);
  return in && instance >= 1 ? LookedUp(FindKvfNode(*in, true, Trimmed(name), static_cast<std::size_t>(instance)))
                             : nullptr;
}

KvfNode* kvfKeywordByNum(KvfNode* section, int n) {
  KvfSection* in = AsSection(section);
  return in && n >= 1 ? LookedUp(FindKvfKeyword(*in, static_cast<std::size_t>(n))) : nullptr;
}

int kvfGetNoNodes(KvfNode* section) {
  const KvfSection* in = AsSection(section);
  return in ? static_cast<int>(in->count) : 0;
}

KvfNode* kvfNodeByNum(KvfNode* section, int n) {
  KvfSection* in = AsSection(section);
  return in && n >= 1 ? LookedUp(FindKvfNode(*in, static_cast<std::size_t>(n))) : nullptr;
}

int kvfIsSection(const KvfNode* node) { return node && node->kind == KvfKind::Section; }
int kvfIsKeyword(const KvfNode* node) { return node && node->IsKeyword(); }

const char* kvfGetName(KvfNode* node) { return node ? node->name->text : nullptr; }

KvfParam* kvfParamByNum(KvfNode* keyword, int n) {
  if (!keyword || !keyword->IsKeyword() || n < 1 || static_cast<std::uint32_t>(n) > keyword->count) return nullptr;
  return LookedUp(&keyword->params[n - 1]);
}

// ---- Parameters through their handle

int kvfIsInt(const KvfParam* param) { return param && param->type == KvfType::Int; }
int kvfIsFloat(const KvfParam* param) { return param && param->type == KvfType::Float; }
int kvfIsDouble(const KvfParam* param) { return param && param->type == KvfType::Double; }
int kvfIsBool(const KvfParam* param) { return param && param->type == KvfType::Bool; }
int kvfIsString(const KvfParam* param) { return param && param->type == KvfType::String; }
int kvfIsFilename(const KvfParam* param) { return param && param->type == KvfType::Filename; }
int kvfGetInt(const KvfParam* param) { return kvfIsInt(param) ? param->asInt : 0; }
float kvfGetFloat(const KvfParam* param) { return kvfIsFloat(param) ? param->asFloat : 0; }
double kvfGetDouble(const KvfParam* param) { return kvfIsDouble(param) ? param->asDouble : 0; }
bool kvfGetBool(const KvfParam* param) { return kvfIsBool(param) && param->asBool; }
const char* kvfGetString(KvfParam* param) { return kvfIsString(param) ? param->text : ""; }
const char* kvfGetFilename(KvfParam* param) { return kvfIsFilename(param) ? param->text : ""; }

// ---- Typed access by key

int kvfGetParam(KvfNode* section, std::string_view key, int* value, int instance, int position) {
  return GetParam(section, key, value, instance, position);
}
int kvfGetParam(KvfNode* section, std::string_view key, float* value, int instance, int position) {
  return GetParam(section, key, value, instance, position);
}
int kvfGetParam(KvfNode* section, std::string_view key, double* value, int instance, int position) {
  return GetParam(section, key, value, instance, position);
}
int kvfGetParam(KvfNode* section, std::string_view key, bool* value, int instance, int position) {
  return GetParam(section, key, value, instance, position);
}
int kvfGetParam(KvfNode* section, std::string_view key, std::string* value, int instance, int position) {
  return GetParam(section, key, value, instance, position);
}

int kvfGetParamFilename(KvfNode* section, std::string_view key, std::string* value, int instance, int position) {
  KvfNode* keyword = kvfKeywordByNameNum(section, key, instance);
  if (!keyword) return 0;
  KvfParam* param = kvfParamByNum(keyword, position);
  if (!kvfIsFilename(param)) return NoteType(section, *keyword, param, KvfType::Filename), 0;
  *value = ResolvedPath(param->Text(), kvfFolderOf(section));
  return 1;
}

int kvfGetListParam(KvfNode* section, std::string_view key, int instance, const char* format, ...) {
  KvfNode* keyword = kvfKeywordByNameNum(section, key, instance);
  if (!keyword) return 0;
  const int size = static_cast<int>(std::strlen(format));
  for (int i = 0; i < size; ++i) {
    const KvfParam* param = kvfParamByNum(keyword, i + 1);
    const bool isNumber = format[i] == 'i';
    int number = 0;
    if (param && (isNumber ? Convert(*param, number) : param->type == KvfType::String)) continue;
    NoteType(section, *keyword, param, isNumber ? KvfType::Int : KvfType::String);
    return 0;
  }
  std::va_list targets;
  va_start(targets, format);
  for (int i = 0; i < size; ++i) {
    const KvfParam& param = keyword->params[i];
    if (format[i] == 'i')
      Convert(param, *va_arg(targets, int*));
    else
      *va_arg(targets, std::string*) = param.Text();
  }
  va_end(targets);
  return 1;
}

// ---- Building a file

namespace {

/// Has the writer refuse a file with a text that no escape stands for.
void RefuseNul(KvfFile& file, std::string_view text, std::string_view what) {
  if (text.find('\0') != std::string_view::npos)
    file.unwritable = fmt::format("{} in {} holds a NUL", what, file.Cursor().Name());
}

int OpenSection(KvfFile* file, KvfKind kind, std::string_view name) {
  if (!file || Trimmed(name).empty() || (kind == KvfKind::Target) != file->open.empty()) return 0;
  RefuseNul(*file, name, "a name");
  file->open.push_back(file->AddSection(file->Cursor(), kind, name));
  if (file->open.size() > kKvfDeepestNesting)
    file->unwritable = fmt::format("section {} is nested deeper than {}", Trimmed(name), kKvfDeepestNesting);
  file->currentKeyword = nullptr;
  return 1;
}

/// A further parameter of the current keyword that is no text.
template <class Value>
int AddPlain(KvfFile* file, KvfType type, Value KvfParam::*member, Value value) {
  if (!file || !file->currentKeyword) return 0;
  file->AddParam(type).*member = value;
  return 1;
}

int AddText(KvfFile* file, KvfType type, std::string_view value) {
  if (!file || !file->currentKeyword) return 0;
  RefuseNul(*file, value, file->currentKeyword->Name());
  file->SetText(file->AddParam(type), value);
  return 1;
}

}  // namespace

int kvfAddTarget(KvfFile* file, std::string_view name) { return OpenSection(file, KvfKind::Target, name); }
int kvfAddSection(KvfFile* file, std::string_view name) { return OpenSection(file, KvfKind::Section, name); }

int kvfEndSection(KvfFile* file) {
  if (!file || file->open.empty()) return 0;
  file->open.pop_back();
  file->currentKeyword = nullptr;
  return 1;
}

int kvfAddKeyword(KvfFile* file, std::string_view name) {
  if (!file || file->open.empty() || Trimmed(name).empty()) return 0;
  RefuseNul(*file, name, "a name");
  file->BeginKeyword(file->Cursor(), name);
  return 1;
}

int kvfAddInt(KvfFile* file, int value) { return AddPlain(file, KvfType::Int, &KvfParam::asInt, value); }
int kvfAddFloat(KvfFile* file, float value) { return AddPlain(file, KvfType::Float, &KvfParam::asFloat, value); }
int kvfAddDouble(KvfFile* file, double value) { return AddPlain(file, KvfType::Double, &KvfParam::asDouble, value); }
int kvfAddBool(KvfFile* file, bool value) { return AddPlain(file, KvfType::Bool, &KvfParam::asBool, value); }
int kvfAddString(KvfFile* file, std::string_view value) { return AddText(file, KvfType::String, value); }
int kvfAddFilename(KvfFile* file, std::string_view value) { return AddText(file, KvfType::Filename, value); }

int kvfPutParam(KvfFile* file, std::string_view key, int value) {
  return kvfAddKeyword(file, key) && kvfAddInt(file, value);
}
int kvfPutParam(KvfFile* file, std::string_view key, float value) {
  return kvfAddKeyword(file, key) && kvfAddFloat(file, value);
}
int kvfPutParam(KvfFile* file, std::string_view key, double value) {
  return kvfAddKeyword(file, key) && kvfAddDouble(file, value);
}
int kvfPutParam(KvfFile* file, std::string_view key, bool value) {
  return kvfAddKeyword(file, key) && kvfAddBool(file, value);
}
int kvfPutParam(KvfFile* file, std::string_view key, std::string_view value) {
  return kvfAddKeyword(file, key) && kvfAddString(file, value);
}
int kvfPutParam(KvfFile* file, std::string_view key, const char* value) {
  return kvfPutParam(file, key, std::string_view(value));
}
int kvfPutParamFilename(KvfFile* file, std::string_view key, std::string_view value) {
  return kvfAddKeyword(file, key) && kvfAddFilename(file, value);
}

int kvfPutListParam(KvfFile* file, std::string_view key, const char* format, ...) {
  if (!kvfAddKeyword(file, key)) return 0;
  std::va_list values;
  va_start(values, format);
  for (; *format; ++format) {
    if (*format == 'i')
      kvfAddInt(file, va_arg(values, int));
    else
      kvfAddString(file, va_arg(values, const char*));
  }
  va_end(values);
  return 1;
}

// ---- Result folder

void kvfSetProjectResultRoot(KvfFile* file, std::string_view root) {
  if (file) file->SetText(SystemParam(*file, kRootKey, KvfType::Filename), root);
}

void kvfSetCustomResultFolder(KvfFile* file, int useCustomFolder, std::string_view folder) {
  if (!file) return;
  SystemParam(*file, kUseCustomKey, KvfType::Int).asInt = useCustomFolder;
  file->SetText(SystemParam(*file, kCustomKey, KvfType::Filename), folder);
}

const char* kvfGetProjectResultRoot(KvfFile* file) {
  KvfNode* target = kvfTargetByNameNum(file, kSystemTarget, 1);
  KvfNode* keyword = kvfKeywordByNameNum(target, kRootKey, 1);
  KvfParam* root = kvfParamByNum(keyword, 1);
  if (kvfIsFilename(root)) return kvfGetFilename(root);
  if (keyword) NoteType(target, *keyword, root, KvfType::Filename);
  return nullptr;
}

int kvfGetCustomResultFolder(KvfFile* file, int* useCustomFolder, std::string* folder) {
  KvfNode* target = kvfTargetByNameNum(file, kSystemTarget, 1);
  const int hasFlag = kvfGetParam(target, kUseCustomKey, useCustomFolder, 1, 1);
  std::string resolved;  // Asked for its note on a wrong type; the text as stored is what the caller gets.
  if (!kvfGetParamFilename(target, kCustomKey, &resolved, 1, 1)) return hasFlag;
  *folder = FindKvfNode(*AsSection(target), true, kCustomKey)->params[0].Text();
  return 1;
}

namespace {

std::string ResultFolderOf(KvfFile& file) {
  int useCustom = 0;
  std::string custom;
  kvfGetCustomResultFolder(&file, &useCustom, &custom);
  if (useCustom && !custom.empty()) return ResolvedPath(custom, file.folder);
  const char* root = kvfGetProjectResultRoot(&file);
  const std::string base = root && *root ? ResolvedPath(root, file.folder) : file.folder;
  return ResolvedPath(fmt::format("{}_results", BaseNameOf(file.path)), base);
}

void CopyPath(const std::string& path, char* buffer) {
  const bool fits = path.size() < static_cast<std::size_t>(kKvfPathBuffer);
  std::memcpy(buffer, fits ? path.c_str() : "", fits ? path.size() + 1 : 1);
}

}  // namespace

const char* kvfGetResultFilename(KvfParam* param) {
  if (!kvfIsFilename(param) || FileNameOf(param->Text()).empty()) return nullptr;
  return param->text + (FileNameOf(param->text).data() - param->text);
}

void kvfGetResultFilenamePath(KvfParam* param, char* buffer) {
  KvfFile* file = OwnerOf(param);
  const char* name = kvfGetResultFilename(param);
  CopyPath(file && name ? ResolvedPath(name, ResultFolderOf(*file)) : std::string(), buffer);
}

void kvfGetResultFolderPath(KvfParam* param, char* buffer) {
  KvfFile* file = OwnerOf(param);
  CopyPath(kvfGetResultFilename(param) && file ? ResultFolderOf(*file) : std::string(), buffer);
}

// ---- For the nodes' reading rules

void kvfMarkKnown(KvfNode* section, std::string_view key) {
  if (KvfNode* keyword = kvfKeywordByNameNum(section, key, 1))
    for (std::uint32_t i = 0; i < keyword->count; ++i) keyword->params[i].lookedUp = true;
}

void kvfAddNote(KvfNode* section, std::string_view key, std::string text) {
  KvfSection* in = AsSection(section);
  if (!in || !in->file) return;
  const KvfNode* keyword = FindKvfNode(*in, true, Trimmed(key));
  in->file->notes.push_back({keyword ? keyword : section, std::move(text)});
}

const std::string& kvfFolderOf(const KvfNode* section) {
  static const std::string none;
  const KvfSection* in = AsSection(section);
  return in && in->file ? in->file->folder : none;
}

}  // namespace tervane
