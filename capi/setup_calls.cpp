// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <fmt/format.h>

#include "access/file_merge.h"
#include "access/key_units.h"
#include "capi/calls.h"
#include "core/kvf_writer.h"
#include "document/item_owner.h"
#include "document/setup_diff.h"
#include "document/setup_lock.h"
#include "platform/files.h"

namespace tervane::capi {

namespace {

tervane_result Start(std::shared_ptr<SetupObject> object, tervane_setup* setup) {
  *setup = Setups().Add(std::move(object));
  return TERVANE_OK;
}

OpenSetup::Place PlaceAt(SetupObject& object, const char* path) {
  Need({path});
  std::string problem;
  const OpenSetup::Place* place = object.setup.Find(path, problem);
  if (!place) Refuse(TERVANE_NOT_THERE, problem);
  return *place;
}

CYbSEKvfBase& NodeAt(SetupObject& object, const char* path) { return *PlaceAt(object, path).node->Get(); }

const KvfNode& KeyAt(SetupObject& object, const OpenSetup::Place& place) {
  std::string problem;
  const KvfNode* key = object.setup.Keys().Find(*place.node->Get(), place.key, problem);
  if (!key) Refuse(TERVANE_NOT_THERE, problem);
  return *key;
}

KeyUnits UnitsAt(SetupObject& object, const OpenSetup::Place& place, const char* unit) {
  std::string problem;
  const auto info = object.setup.Keys().InfoOf(*place.node->Get(), place.key.name);
  const auto units = UnitsBetween(info ? info->facts : KeyFacts(), unit, problem);
  if (!units) Refuse(TERVANE_REFUSED, problem);
  return *units;
}

CYbSEKvfBase& ItemAt(CYbSEKvfBase& owner, int number) {
  const ItemOwner items(&owner);
  CYbSEKvfBase* item = items.Item(number);
  if (!item)
    Refuse(TERVANE_NOT_THERE, fmt::format("{}: there is no item {}: it has {}", PathOf(owner), number, items.Count()));
  return *item;
}

}  // namespace

}  // namespace tervane::capi

using namespace tervane;
using namespace tervane::capi;

extern "C" {

tervane_result tervane_new(tervane_setup* setup) {
  return Call([&] {
    Need({setup});
    Start(std::make_shared<SetupObject>(), setup);
  });
}

tervane_result tervane_open(const char* path, tervane_setup* setup) {
  return Call([&] {
    Need({path, setup});
    auto object = std::make_shared<SetupObject>();
    if (!object->setup.Open(path)) Refuse(TERVANE_FAILED, object->setup.Error());
    Start(std::move(object), setup);
  });
}

tervane_result tervane_copy(tervane_setup setup, tervane_setup* copy) {
  return CallWith(setup, [&](SetupObject& object) {
    Need({copy});
    auto made = std::make_shared<SetupObject>();
    std::string problem;
    if (!object.setup.CopyTo(made->setup, problem)) Refuse(TERVANE_FAILED, problem);
    Start(std::move(made), copy);
  });
}

tervane_result tervane_save(tervane_setup setup, const char* path) {
  return CallWith(setup, [&](SetupObject& object) {
    if (!object.setup.Save(path ? path : "")) Refuse(TERVANE_FAILED, object.setup.Error());
  });
}

tervane_result tervane_close(tervane_setup setup) {
  return CallWith(setup, [&](SetupObject&) { Setups().Remove(setup); });
}

tervane_result tervane_get_text(tervane_setup setup, const char* path, char* buffer, size_t size, size_t* length) {
  return CallWith(setup, [&](SetupObject& object) {
    Give(PlainValuesText(KeyAt(object, PlaceAt(object, path))), buffer, size, length);
  });
}

tervane_result tervane_set_text(tervane_setup setup, const char* path, const char* value) {
  return CallWith(setup, [&](SetupObject& object) {
    Need({value});
    const OpenSetup::Place place = PlaceAt(object, path);
    KeyAt(object, place);
    const std::string problem = object.setup.Keys().Set(*place.node->Get(), place.key, std::string_view(value));
    if (!problem.empty()) Refuse(TERVANE_REFUSED, problem);
  });
}

tervane_result tervane_get_number(tervane_setup setup, const char* path, const char* unit, double* value) {
  return CallWith(setup, [&](SetupObject& object) {
    Need({value});
    const OpenSetup::Place place = PlaceAt(object, path);
    const KvfNode& key = KeyAt(object, place);
    if (key.count == 0 || key.params[0].IsText()) Refuse(TERVANE_REFUSED, fmt::format("{}: it holds no number", path));
    const PlainValue plain = PlainValueOf(key.params[0]);
    double number = 0;
    if (const auto* whole = std::get_if<std::int64_t>(&plain))
      number = static_cast<double>(*whole);
    else if (const auto* truth = std::get_if<bool>(&plain))
      number = *truth ? 1 : 0;
    else
      number = std::get<double>(plain);
    *value = unit ? UnitsAt(object, place, unit).toOther(number) : number;
  });
}

tervane_result tervane_set_number(tervane_setup setup, const char* path, const char* unit, double value) {
  return CallWith(setup, [&](SetupObject& object) {
    const OpenSetup::Place place = PlaceAt(object, path);
    KeyAt(object, place);
    const PlainValue plain = unit ? UnitsAt(object, place, unit).fromOther(value) : value;
    const std::string problem = object.setup.Keys().Set(*place.node->Get(), place.key, std::span(&plain, 1));
    if (!problem.empty()) Refuse(TERVANE_REFUSED, problem);
  });
}

tervane_result tervane_item_count(tervane_setup setup, const char* path, int* count) {
  return CallWith(setup, [&](SetupObject& object) {
    Need({count});
    const ItemOwner items(&NodeAt(object, path));
    if (!items.Node()) Refuse(TERVANE_NOT_THERE, fmt::format("{}: it holds no items", path));
    *count = items.Count();
  });
}

tervane_result tervane_insert_item(tervane_setup setup, const char* path, int number, char* item, size_t size,
                                   size_t* length) {
  return CallWith(setup, [&](SetupObject& object) {
    CYbSEKvfBase& owner = NodeAt(object, path);
    if (number < 1) Refuse(TERVANE_ARGUMENT, fmt::format("{}: items are counted from 1: {} is none", path, number));
    std::string problem;
    CYbSEKvfBase* made = object.setup.InsertItem(owner, number, nullptr, problem);
    if (!made) Refuse(TERVANE_REFUSED, problem);
    if (!item) return;
    try {
      Give(PathOf(*made), item, size, length);
    } catch (...) {
      // What is told as not done must not be done.
      ItemOwner(&owner).Remove(*made);
      object.setup.Keys().Forget();
      throw;
    }
  });
}

tervane_result tervane_delete_item(tervane_setup setup, const char* path, int number) {
  return CallWith(setup, [&](SetupObject& object) {
    CYbSEKvfBase& owner = NodeAt(object, path);
    ItemAt(owner, number);
    object.setup.RemoveItem(owner, number);
  });
}

tervane_result tervane_item_path(tervane_setup setup, const char* path, int number, char* buffer, size_t size,
                                 size_t* length) {
  return CallWith(
      setup, [&](SetupObject& object) { Give(PathOf(ItemAt(NodeAt(object, path), number)), buffer, size, length); });
}

tervane_result tervane_takes_part(tervane_setup setup, const char* path, int* takes_part) {
  return CallWith(setup, [&](SetupObject& object) {
    Need({takes_part});
    *takes_part = NodeAt(object, path).IsDataUsedInSetup() != 0;
  });
}

tervane_result tervane_validate(tervane_setup setup, tervane_finding_sink sink, void* context) {
  std::vector<SetupFinding> findings;
  const tervane_result result = CallWith(setup, [&](SetupObject& object) {
    Need({reinterpret_cast<const void*>(sink)});
    findings = object.setup.Validate();
  });
  // Afterwards, so that the caller may do in it what he likes.
  for (const SetupFinding& finding : findings) {
    const tervane_finding told{static_cast<tervane_severity>(finding.kind),
                               finding.path.c_str(),
                               finding.key.c_str(),
                               finding.text.c_str(),
                               finding.detail.c_str(),
                               finding.line};
    sink(&told, context);
  }
  return result;
}

tervane_result tervane_diff(tervane_setup from, tervane_setup to, tervane_difference_sink sink, void* context) {
  struct Told {
    std::string place;
    SetupDifference difference;
  };
  std::vector<Told> told;
  const tervane_result result = CallWith(from, [&](SetupObject& before) {
    Need({reinterpret_cast<const void*>(sink)});
    const std::shared_ptr<SetupObject> after = Setups().Find(to);
    if (!after) Refuse(TERVANE_NO_HANDLE, "the second handle was closed, or is none of a setup");
    if (after.get() == &before) return;
    if (after->isInUse.exchange(true)) Refuse(TERVANE_BUSY, "another thread uses the second setup");
    const FreeAtEnd free{after->isInUse};
    for (SetupDifference& difference : CompareDocuments(before.setup.Document(), after->setup.Document())) {
      std::string place =
          difference.key.empty() ? difference.path : fmt::format("{}:{}", difference.path, difference.key);
      told.push_back({std::move(place), std::move(difference)});
    }
  });
  for (const auto& [place, difference] : told)
    sink(place.c_str(), difference.from.c_str(), difference.to.c_str(), context);
  return result;
}

tervane_result tervane_merge(const char* base, const char* mine, const char* theirs, const char* out, int* conflicts) {
  return Call([&] {
    Need({base, mine, theirs, out});
    if (FileExists(out)) Refuse(TERVANE_FAILED, fmt::format("{} exists; choose another name", out));
    const FileMerge merge = MergeSetupFiles(base, mine, theirs, out);
    if (!merge.result.problem.empty()) Refuse(TERVANE_FAILED, merge.result.problem);
    if (const FileResult written = WriteFileAtomically(out, merge.text); !written.Ok())
      Refuse(TERVANE_FAILED, written.error);
    if (conflicts) *conflicts = static_cast<int>(merge.result.conflicts.size());
  });
}

}  // extern "C"
