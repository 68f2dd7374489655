// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The operations on parameter files that all nodes use. Counts, instances and positions are 1-based; every look-up
// accepts a null handle and gives null. Handles stay valid until `kvfClose`. A look-up marks what it finds, so that
// `CollectUnread` can tell what a file holds that nothing asked for.
//
// Reading: the handle is the section (or target) to look in. Writing: the handle is the file under construction, with
// its cursor in the innermost open section.
#pragma once

#include <string>
#include <string_view>

#include "core/kvf_tree.h"

namespace tervane {

/// Codes of the pending error.
enum KvfErrorCode : int {
  kKvfNoError = 0,
  kKvfCannotRead = 1001,
  kKvfCannotWrite = 1002,
  kKvfSyntaxError = 1003,
};

// ---- Life of a file

/// An empty file with the cursor at top level.
KvfFile* kvfCreate();
/// Reads a file. Null and code 1001 when it cannot be read; a handle that serves `kvfGetSyntaxErr` alone and code 1003
/// when it is no parameter file. All modes read alike.
KvfFile* kvfLoadFile(const std::string& path, int mode);
/// Writes the tree atomically. On failure the old file stands and code 1002 is pending.
void kvfWrite(KvfFile* file, const std::string& path);
/// Frees the tree and clears the caller's handle.
void kvfClose(KvfFile** file);
/// Appends copies of all nodes of one target to another, also across files.
void kvfCopy(KvfNode* source, KvfNode* destination);

// ---- Errors: one pending code for the whole process

int kvfPeekErrorGlb();
/// Gives the pending code and clears it.
int kvfGetErrorGlb();
/// Line and column of the fault, and its description; zeros and an empty text when the file has none.
void kvfGetSyntaxErr(KvfFile* file, int* line, int* column, const char** message);
/// The description of the latest error of any code, with the file's path.
const std::string& kvfErrorText();

// ---- Finding things

int kvfGetNoTargets(KvfFile* file);
KvfNode* kvfTargetByNum(KvfFile* file, int n);
KvfNode* kvfTargetByNameNum(KvfFile* file, std::string_view name, int instance);
KvfNode* kvfSectionByNameNum(KvfNode* section, std::string_view name, int instance);
KvfNode* kvfKeywordByNameNum(KvfNode* section, std::string_view name, int instance);
KvfNode* kvfKeywordByNum(KvfNode* section, int n);
int kvfGetNoNodes(KvfNode* section);
KvfNode* kvfNodeByNum(KvfNode* section, int n);
int kvfIsSection(const KvfNode* node);
int kvfIsKeyword(const KvfNode* node);
/// The name as a C string owned by the tree; null of a null handle.
const char* kvfGetName(KvfNode* node);
KvfParam* kvfParamByNum(KvfNode* keyword, int n);

// ---- Parameters through their handle; the value forms give zero or "" for a null handle or another type

int kvfIsInt(const KvfParam* param);
int kvfIsFloat(const KvfParam* param);
int kvfIsDouble(const KvfParam* param);
int kvfIsBool(const KvfParam* param);
int kvfIsString(const KvfParam* param);
int kvfIsFilename(const KvfParam* param);
int kvfGetInt(const KvfParam* param);
float kvfGetFloat(const KvfParam* param);
double kvfGetDouble(const KvfParam* param);
bool kvfGetBool(const KvfParam* param);
const char* kvfGetString(KvfParam* param);
/// The name as it stands in the file.
const char* kvfGetFilename(KvfParam* param);

// ---- Typed access by key
//
// All give non-zero when the value was found and stored. An absent key leaves the target as it was and gives 0, and so
// does a parameter of another type, which also leaves a note on the file. A number may stand in another number's form
// where nothing is lost: `6` and `6.0` for an int, a float or a double; a float for a double; a double for a float that
// keeps all its digits.

int kvfGetParam(KvfNode* section, std::string_view key, int* value, int instance, int position);
int kvfGetParam(KvfNode* section, std::string_view key, float* value, int instance, int position);
int kvfGetParam(KvfNode* section, std::string_view key, double* value, int instance, int position);
int kvfGetParam(KvfNode* section, std::string_view key, bool* value, int instance, int position);
int kvfGetParam(KvfNode* section, std::string_view key, std::string* value, int instance, int position);
/// A parameter of type filename, as what to open: absolute, against the folder of the file that holds it.
int kvfGetParamFilename(KvfNode* section, std::string_view key, std::string* value, int instance, int position);

/// Reads the first parameters of a keyword by a format of `i` (int*) and `s` (std::string*). All are stored, or none.
int kvfGetListParam(KvfNode* section, std::string_view key, int instance, const char* format, ...);

// ---- Building a file; all give non-zero when done

int kvfAddTarget(KvfFile* file, std::string_view name);
int kvfAddSection(KvfFile* file, std::string_view name);
/// Closes the innermost open section or target.
int kvfEndSection(KvfFile* file);
int kvfAddKeyword(KvfFile* file, std::string_view name);
int kvfAddInt(KvfFile* file, int value);
int kvfAddFloat(KvfFile* file, float value);
int kvfAddDouble(KvfFile* file, double value);
int kvfAddBool(KvfFile* file, bool value);
int kvfAddString(KvfFile* file, std::string_view value);
int kvfAddFilename(KvfFile* file, std::string_view value);

int kvfPutParam(KvfFile* file, std::string_view key, int value);
int kvfPutParam(KvfFile* file, std::string_view key, float value);
int kvfPutParam(KvfFile* file, std::string_view key, double value);
int kvfPutParam(KvfFile* file, std::string_view key, bool value);
int kvfPutParam(KvfFile* file, std::string_view key, std::string_view value);
int kvfPutParam(KvfFile* file, std::string_view key, const char* value);
int kvfPutParamFilename(KvfFile* file, std::string_view key, std::string_view value);
/// One keyword with a value for each letter of the format: `i` (int), `s` (const char*).
int kvfPutListParam(KvfFile* file, std::string_view key, const char* format, ...);

// ---- Result folder: two settings in the target SYSTEM of a file, read by the engines

/// Stores the root; an empty root is stored too.
void kvfSetProjectResultRoot(KvfFile* file, std::string_view root);
void kvfSetCustomResultFolder(KvfFile* file, int useCustomFolder, std::string_view folder);
/// The stored root, or null.
const char* kvfGetProjectResultRoot(KvfFile* file);
/// The flag and the folder as stored; 0 when the file holds neither.
int kvfGetCustomResultFolder(KvfFile* file, int* useCustomFolder, std::string* folder);
/// Length of the buffers that take a path.
inline constexpr int kKvfPathBuffer = 2048;
/// The name, without folder, that the file of a filename parameter has among the results; null when the parameter is
/// no filename or is empty.
const char* kvfGetResultFilename(KvfParam* param);
/// Full path of that file in the result folder, and the folder itself: the custom folder when it is in use, else
/// BASENAME_results below the project's root, or beside the file where there is no root. The texts are empty where the
/// parameter names nothing or the path does not fit.
void kvfGetResultFilenamePath(KvfParam* param, char* buffer);
void kvfGetResultFolderPath(KvfParam* param, char* buffer);

// ---- For the nodes' reading rules

/// Marks a key that a rule skips as known, so that it is no unread key.
void kvfMarkKnown(KvfNode* section, std::string_view key);
/// Leaves a note on a key of the section (its first instance), or on the section itself when it has no such key.
void kvfAddNote(KvfNode* section, std::string_view key, std::string text);
/// The absolute folder that relative filenames in the section start from.
const std::string& kvfFolderOf(const KvfNode* section);

}  // namespace tervane
