// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <pybind11/stl.h>

#include "access/file_merge.h"
#include "document/setup_lock.h"
#include "platform/files.h"
#include "platform/version.h"
#include "python/bindings.h"

namespace py = pybind11;

namespace tervane::python {

void Raise(const char* exception, const std::string& text) {
  const py::object type = py::module_::import("tervane._errors").attr(exception);
  PyErr_SetObject(type.ptr(), py::str(text).ptr());
  throw py::error_already_set();
}

CYbSEKvfBase& Node::Get() const {
  CYbSEKvfBase* node = held->Get();
  if (!node) Raise("StaleNode", "the setup has this node no more");
  return *node;
}

namespace {

py::dict Merge(const std::string& base, const std::string& mine, const std::string& theirs, const std::string& out) {
  SetupLock lock;
  if (lock.Take(out, SetupLock::Purpose::OneChange) == SetupLock::Outcome::Held)
    Raise("SetupError", out + ": " + lock.Reason());
  // Into mine is what version control asks for.
  if (out != mine && FileExists(out) && !IsSameFile(out, mine))
    Raise("SetupError", out + ": it exists; choose another name");
  const FileMerge merge = MergeSetupFiles(base, mine, theirs, out);
  RaiseProblem(merge.result.problem);
  if (const FileResult written = WriteFileAtomically(out, merge.text); !written.Ok())
    Raise("SetupError", written.error);
  constexpr const char* kKinds[] = {"value", "deleted by me", "deleted by them", "order"};
  py::list conflicts;
  for (const MergeConflict& conflict : merge.result.conflicts) {
    using namespace py::literals;
    conflicts.append(py::dict("kind"_a = kKinds[static_cast<std::size_t>(conflict.kind)], "path"_a = conflict.path,
                              "key"_a = conflict.key, "base"_a = conflict.base, "mine"_a = conflict.mine,
                              "theirs"_a = conflict.theirs, "text"_a = conflict.Sentence()));
  }
  py::dict result;
  result["taken"] = merge.result.takenFromThem;
  result["conflicts"] = conflicts;
  return result;
}

}  // namespace

}  // namespace tervane::python

PYBIND11_MODULE(_tervane, module) {
  using namespace tervane::python;
  py::options options;
  options.disable_function_signatures();
  module.attr("version") = tervane::kProgramVersion;
  module.def("merge", &Merge, py::arg("base"), py::arg("mine"), py::arg("theirs"), py::arg("out"));
  BindSetups(module);
  BindDataFiles(module);
  BindRuns(module);
  BindClimate(module);
}
