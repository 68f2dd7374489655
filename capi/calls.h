// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What every call of the C interface has around it: handles, one thread at a time, errors as results.
#pragma once

#include <atomic>
#include <functional>
#include <memory>
#include <mutex>
#include <string>
#include <string_view>
#include <vector>

#include "access/climate_change.h"
#include "access/open_setup.h"
#include "access/setup_accessor.h"
#include "capi/tervane.h"

namespace tervane::capi {

/// Why a call was not done; thrown inside of one, and never further.
struct CallError {
  tervane_result result;
  std::string text;
};
/// Of the latest call of this thread.
const char* LastErrorText();
[[noreturn]] void Refuse(tervane_result result, std::string text);

struct SetupObject {
  OpenSetup setup;
  std::unique_ptr<CTVNKvfAccessor> accessor;  ///< Of the same tree; made when it is first asked.
  std::atomic<bool> isInUse = false;
};
struct ClimateObject {
  CClimateChange_TVN climate;
  std::atomic<bool> isInUse = false;
};

/// Objects by their handles: the place of an object, how often that place was used before, and the kind.
template <class Object>
class Handles {
 public:
  explicit Handles(std::uint64_t kind) : kind_(kind) {}

  std::uint64_t Add(std::shared_ptr<Object> object);
  /// Null for a handle that was closed or is of another kind.
  std::shared_ptr<Object> Find(std::uint64_t handle);
  void Remove(std::uint64_t handle);

 private:
  struct Slot {
    std::shared_ptr<Object> object;
    std::uint32_t generation = 1;
  };
  /// Null likewise.
  Slot* SlotOf(std::uint64_t handle);

  const std::uint64_t kind_;
  std::mutex mutex_;
  std::vector<Slot> slots_;
};

/// The tables are never destroyed, so that a program may close its handles at its very end.
Handles<SetupObject>& Setups();
Handles<ClimateObject>& Climates();

/// Lets other threads use an object again.
struct FreeAtEnd {
  std::atomic<bool>& isInUse;
  ~FreeAtEnd() { isInUse = false; }
};

/// Runs an operation, one of all threads at a time, and turns what it throws into a result.
tervane_result Call(const std::function<void()>& operation);

/// The same with the object of a handle, for which only this thread may use it.
template <class Object>
tervane_result CallWith(Handles<Object>& handles, std::uint64_t handle, const std::function<void(Object&)>& operation) {
  std::shared_ptr<Object> object = handles.Find(handle);
  // What waits for the others must not wait for one that uses this object.
  const bool isFree = object && !object->isInUse.exchange(true);
  return Call([&] {
    // The last one that holds an object destroys it, which other threads must wait for too.
    const std::shared_ptr<Object> held = std::move(object);
    if (!held) Refuse(TERVANE_NO_HANDLE, "the handle was closed, or is none of this kind");
    if (!isFree) Refuse(TERVANE_BUSY, "another thread uses it");
    const FreeAtEnd free{held->isInUse};
    operation(*held);
  });
}
inline tervane_result CallWith(tervane_setup setup, const std::function<void(SetupObject&)>& operation) {
  return CallWith<SetupObject>(Setups(), setup, operation);
}
inline tervane_result CallWith(tervane_climate climate, const std::function<void(ClimateObject&)>& operation,
                               std::nullptr_t) {
  return CallWith<ClimateObject>(Climates(), climate, operation);
}

/// Refuses a null.
void Need(std::initializer_list<const void*> pointers);
/// Gives a text to the caller.
void Give(std::string_view text, char* buffer, std::size_t size, std::size_t* length);
/// Refuses what is not there.
void NeedThere(int isThere, std::string_view what);

}  // namespace tervane::capi
