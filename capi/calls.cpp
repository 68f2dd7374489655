// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "capi/calls.h"

#include <cstring>
#include <exception>
#include <new>

#include <fmt/format.h>

#include "platform/version.h"

namespace tervane::capi {

namespace {

std::string& LastError() {
  thread_local std::string error;
  return error;
}

constexpr std::uint64_t kPlaceBits = 24, kGenerationBits = 32;
constexpr std::uint64_t kMostPlaces = (std::uint64_t{1} << kPlaceBits) - 1;

}  // namespace

const char* LastErrorText() { return LastError().c_str(); }

void Refuse(tervane_result result, std::string text) { throw CallError{result, std::move(text)}; }

template <class Object>
std::uint64_t Handles<Object>::Add(std::shared_ptr<Object> object) {
  const std::scoped_lock lock(mutex_);
  std::size_t place = 0;
  while (place < slots_.size() && slots_[place].object) ++place;
  if (place == kMostPlaces) Refuse(TERVANE_FAILED, "there are too many open handles: close some");
  if (place == slots_.size()) slots_.emplace_back();
  slots_[place].object = std::move(object);
  return (kind_ << (kPlaceBits + kGenerationBits)) | (std::uint64_t{slots_[place].generation} << kPlaceBits) |
         (place + 1);
}

template <class Object>
typename Handles<Object>::Slot* Handles<Object>::SlotOf(std::uint64_t handle) {
  const std::uint64_t place = handle & kMostPlaces;
  if (handle >> (kPlaceBits + kGenerationBits) != kind_ || place == 0 || place > slots_.size()) return nullptr;
  Slot& slot = slots_[place - 1];
  return slot.object && slot.generation == static_cast<std::uint32_t>(handle >> kPlaceBits) ? &slot : nullptr;
}

template <class Object>
std::shared_ptr<Object> Handles<Object>::Find(std::uint64_t handle) {
  const std::scoped_lock lock(mutex_);
  const Slot* slot = SlotOf(handle);
  return slot ? slot->object : nullptr;
}

template <class Object>
void Handles<Object>::Remove(std::uint64_t handle) {
  const std::scoped_lock lock(mutex_);
  if (Slot* slot = SlotOf(handle)) {
    slot->object = nullptr;
    ++slot->generation;
  }
}

template class Handles<SetupObject>;
template class Handles<ClimateObject>;

Handles<SetupObject>& Setups() {
  static auto& handles = *new Handles<SetupObject>(1);
  return handles;
}

Handles<ClimateObject>& Climates() {
  static auto& handles = *new Handles<ClimateObject>(2);
  return handles;
}

tervane_result Call(const std::function<void()>& operation) {
  static std::mutex& oneAtATime = *new std::mutex;
  const auto fail = [](tervane_result result, const char* text) {
    try {
      LastError() = text;
    } catch (const std::bad_alloc&) {
      LastError().clear();
    }
    return result;
  };
  try {
    LastError().clear();
    // Parameter files are written and read by one at a time.
    const std::scoped_lock lock(oneAtATime);
    operation();
    return TERVANE_OK;
  } catch (const CallError& error) {
    return fail(error.result, error.text.c_str());
  } catch (const std::bad_alloc&) {
    return fail(TERVANE_NO_MEMORY, "there is not enough memory for this");
  } catch (const std::exception& error) {
    return fail(TERVANE_FAILED, error.what());
  } catch (...) {
    return fail(TERVANE_FAILED, "an unknown fault of the library");
  }
}

void Need(std::initializer_list<const void*> pointers) {
  for (const void* pointer : pointers)
    if (!pointer) Refuse(TERVANE_ARGUMENT, "a null was given where none may be");
}

void Give(std::string_view text, char* buffer, std::size_t size, std::size_t* length) {
  if (length) *length = text.size();
  if (!buffer || size <= text.size())
    Refuse(TERVANE_TOO_SMALL, fmt::format("{} bytes were expected, and a NUL behind them", text.size()));
  std::memcpy(buffer, text.data(), text.size());
  buffer[text.size()] = '\0';
}

void NeedThere(int isThere, std::string_view what) {
  if (!isThere) Refuse(TERVANE_NOT_THERE, fmt::format("the setup has no {}", what));
}

}  // namespace tervane::capi

extern "C" {

const char* tervane_version(void) { return tervane::kProgramVersion; }

int tervane_abi(void) { return TERVANE_ABI; }

const char* tervane_last_error(void) { return tervane::capi::LastErrorText(); }

}  // extern "C"
