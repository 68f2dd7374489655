// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/cart.h"

#include <cmath>
#include <unordered_map>
#include <utility>

#include <fmt/format.h>

#include "geometry/proj_calls.h"
#include "platform/program_module.h"
#include "platform/text.h"
#include "platform/text_fields.h"

namespace tervane {

namespace projections {

namespace {

const LateCalls<Calls>& Loaded() {
  static const LateCalls<Calls> loaded = LoadCalls<Calls>(kModuleName, kEntryName, "knows projections");
  return loaded;
}

}  // namespace

const Calls& Library() { return *Loaded().calls; }
const std::string& WhyNoLibrary() { return Loaded().problem; }

void ContextCloser::operator()(PJ_CONTEXT* context) const { Library().proj_context_destroy(context); }

Context MakeContext() {
  if (!WhyNoLibrary().empty()) return nullptr;
  Context context(Library().proj_context_create());
  Library().proj_log_level(context.get(), PJ_LOG_NONE);
  // No text that somebody typed should make the program ask the network.
  Library().proj_context_set_enable_network(context.get(), 0);
  return context;
}

}  // namespace projections

namespace {

using projections::Context;
using projections::Library;
using projections::MakeContext;

struct ObjectCloser {
  void operator()(PJ* object) const { Library().proj_destroy(object); }
};
using Object = std::unique_ptr<PJ, ObjectCloser>;

/// PROJ's contexts must not be shared by threads. Opening the database costs some milliseconds, once for each thread.
PJ_CONTEXT* ThreadContext() {
  thread_local const Context context = MakeContext();
  return context.get();
}

Object FindByName(const std::string& name) {
  PJ_OBJ_LIST* const list =
      Library().proj_create_from_name(ThreadContext(), nullptr, name.c_str(), nullptr, 0, 0, 1, nullptr);
  Object found;
  if (list && Library().proj_list_get_count(list) > 0) found.reset(Library().proj_list_get(ThreadContext(), list, 0));
  Library().proj_list_destroy(list);
  return found;
}

/// The coordinate system of a text, without what is bound to it; null when it is none.
Object MakeSystem(const std::string& text) {
  std::string asked(Trimmed(text));
  if (asked.empty() || asked.find('\0') != std::string::npos || !ThreadContext()) return nullptr;
  // A PROJ string is an operation unless it says otherwise.
  const bool isProjText = asked.starts_with('+') || asked.starts_with("proj=");
  if (isProjText && asked.find("type=crs") == std::string::npos) asked += " +type=crs";
  // PROJ takes a bare word for a name and guesses, long and wrongly: only a name that is written out is one here.
  const bool isName = !isProjText && asked.find_first_of("[{:") == std::string::npos;
  Object object(isName ? FindByName(asked).release() : Library().proj_create(ThreadContext(), asked.c_str()));
  if (!object || !Library().proj_is_crs(object.get())) return nullptr;
  // A system with heights has its plane as its first part, one that is bound to another stands inside.
  for (int depth = 0; depth < 8; ++depth) {
    const PJ_TYPE type = Library().proj_get_type(object.get());
    if (type == PJ_TYPE_BOUND_CRS)
      object.reset(Library().proj_get_source_crs(ThreadContext(), object.get()));
    else if (type == PJ_TYPE_COMPOUND_CRS)
      object.reset(Library().proj_crs_get_sub_crs(ThreadContext(), object.get(), 0));
    else
      break;
    if (!object) return nullptr;
  }
  return object;
}

bool IsEmpty(const std::string& text) { return Trimmed(text).empty(); }

/// What is asked of the same few texts again and again; making a system takes some milliseconds.
struct Facts {
  bool isKnown = false;
  PJ_TYPE type = PJ_TYPE_UNKNOWN;
  std::string name;
};

const Facts& FactsOf(const std::string& text) {
  constexpr std::size_t kMostTexts = 64;
  thread_local std::unordered_map<std::string, Facts> known;
  if (const auto found = known.find(text); found != known.end()) return found->second;
  if (known.size() >= kMostTexts) known.clear();
  Facts& facts = known[text];
  if (const Object system = MakeSystem(text)) {
    const char* const name = Library().proj_get_name(system.get());
    facts = {true, Library().proj_get_type(system.get()), name ? name : ""};
  }
  return facts;
}

bool IsAngles(PJ_TYPE type) { return type == PJ_TYPE_GEOGRAPHIC_2D_CRS || type == PJ_TYPE_GEOGRAPHIC_3D_CRS; }

bool IsEquivalent(const PJ* a, const PJ* b) {
  return Library().proj_is_equivalent_to_with_ctx(ThreadContext(), a, b,
                                                  PJ_COMP_EQUIVALENT_EXCEPT_AXIS_ORDER_GEOGCRS) != 0;
}

/// The system of the EPSG register that the object certainly means, if any.
Object Registered(const PJ* object) {
  int* confidences = nullptr;
  PJ_OBJ_LIST* const list = Library().proj_identify(ThreadContext(), object, "EPSG", nullptr, &confidences);
  Object found;
  // Above this PROJ has found the same definition, perhaps under another name.
  constexpr int kSame = 90;
  if (list && Library().proj_list_get_count(list) > 0 && confidences[0] >= kSame)
    found.reset(Library().proj_list_get(ThreadContext(), list, 0));
  Library().proj_list_destroy(list);
  Library().proj_int_list_destroy(confidences);
  return found;
}

}  // namespace

std::string CYbMapProjection::IDtoProjectionString(int id) {
  if (id != 1) return {};
  return R"WKT(ENGCRS["Local plane",EDATUM["Local plane"],CS[Cartesian,2],AXIS["easting (X)",east,ORDER[1]],)WKT"
         R"WKT(AXIS["northing (Y)",north,ORDER[2]],LENGTHUNIT["metre",1]])WKT";
}

std::string CYbMapProjection::Problem() const {
  if (IsEmpty(text_) || FactsOf(text_).isKnown) return {};
  if (!projections::WhyNoLibrary().empty()) return projections::WhyNoLibrary();
  return fmt::format("\"{}\" is no coordinate system that is known: WKT, EPSG:CODE or +proj=... is expected",
                     Shown(text_));
}

bool CYbMapProjection::IsGeographical() const { return IsAngles(FactsOf(text_).type); }

bool CYbMapProjection::IsLocal() const { return IsEmpty(text_) || FactsOf(text_).type == PJ_TYPE_ENGINEERING_CRS; }

std::string CYbMapProjection::Name() const {
  const std::string& name = FactsOf(text_).name;
  // What a PROJ string makes has no name of its own.
  const bool isNamed = !name.empty() && name != "unknown" && name != "unnamed";
  return isNamed ? name : text_;
}

bool CYbMapProjection::IsSameAs(const CYbMapProjection& other) const {
  if (Trimmed(text_) == Trimmed(other.text_)) return true;
  const Object a = MakeSystem(text_), b = MakeSystem(other.text_);
  if (!a || !b) return false;
  if (IsEquivalent(a.get(), b.get())) return true;
  // The names of datums differ between makers; the register knows them.
  const Object registeredA = Registered(a.get()), registeredB = Registered(b.get());
  return registeredA && registeredB && IsEquivalent(registeredA.get(), registeredB.get());
}

namespace {

/// An operation in a context of its own, so that it may be used in another thread than the one that made it.
struct Operation {
  Context context;
  Object operation;

  /// No operation when no way is known from one system to the other; both are of this thread.
  Operation(const PJ* from, const PJ* to) : context(MakeContext()) {
    const Object ownFrom(Library().proj_clone(context.get(), from)), ownTo(Library().proj_clone(context.get(), to));
    const Object made(
        Library().proj_create_crs_to_crs_from_pj(context.get(), ownFrom.get(), ownTo.get(), nullptr, nullptr));
    // Longitude first, whatever order the register has.
    if (made) operation.reset(Library().proj_normalize_for_visualization(context.get(), made.get()));
  }

  bool Convert(PJ_DIRECTION direction, double& x, double& y) const {
    if (!std::isfinite(x) || !std::isfinite(y)) return false;
    Library().proj_errno_reset(operation.get());
    const PJ_COORD result = Library().proj_trans(operation.get(), direction, Library().proj_coord(x, y, 0, HUGE_VAL));
    if (Library().proj_errno(operation.get()) != 0 || !std::isfinite(result.xy.x) || !std::isfinite(result.xy.y))
      return false;
    x = result.xy.x;
    y = result.xy.y;
    return true;
  }
};

std::string WhyNotOnGlobe(const CYbMapProjection& projection) {
  std::string problem = projection.Problem();
  return problem.empty() && projection.IsLocal() ? "a local plane has no place on the globe" : problem;
}

}  // namespace

struct CYbCartography::Transformation {
  Operation operation;
};

CYbCartography::CYbCartography(const std::string& projection, double longitude, double latitude, double rotation) {
  const CYbMapProjection asked(projection);
  problem_ = WhyNotOnGlobe(asked);
  if (problem_.empty() && (longitude != 0 || latitude != 0 || rotation != 0)) {
    problem_ = "a place and a rotation beside the projection are not supported";
  }
  if (!problem_.empty()) return;
  const Object system = MakeSystem(projection), target(Library().proj_create(ThreadContext(), "EPSG:4326"));
  if (system && target)
    transformation_ = std::make_unique<Transformation>(Transformation{{system.get(), target.get()}});
  if (!transformation_ || !transformation_->operation.operation)
    problem_ = fmt::format("no way is known from {} to longitude and latitude", asked.Name());
}

CYbCartography::~CYbCartography() = default;

bool CYbCartography::Proj2Geo(double x, double y, double& longitude, double& latitude) const {
  if (!problem_.empty() || !transformation_->operation.Convert(PJ_FWD, x, y)) return false;
  longitude = x;
  latitude = y;
  return true;
}

struct CYbProjectionChange::Transformation {
  Operation operation;
};

CYbProjectionChange::CYbProjectionChange(const std::string& from, const std::string& to) {
  const CYbMapProjection asked(from), wanted(to);
  problem_ = WhyNotOnGlobe(asked);
  if (problem_.empty()) problem_ = WhyNotOnGlobe(wanted);
  if (!problem_.empty()) return;
  const Object source = MakeSystem(from), target = MakeSystem(to);
  if (source && target)
    transformation_ = std::make_unique<Transformation>(Transformation{{source.get(), target.get()}});
  if (!transformation_ || !transformation_->operation.operation)
    problem_ = fmt::format("no way is known from {} to {}", asked.Name(), wanted.Name());
}

CYbProjectionChange::~CYbProjectionChange() = default;

bool CYbProjectionChange::Convert(double& x, double& y, bool isForward) const {
  return problem_.empty() && transformation_->operation.Convert(isForward ? PJ_FWD : PJ_INV, x, y);
}

FileResult ReadProjectionFile(const std::string& path, std::string& text) {
  text.clear();
  FileContent content;
  FileResult result = ReadWholeFile(path, content);
  if (!result.Ok()) return result;
  // What is larger is no text of a projection, and PROJ should not try.
  constexpr std::size_t kMost = 100'000;
  if (content.size > kMost)
    return {fmt::format("cannot read {}: {} bytes are too many for a projection", path, content.size), {}};
  text = Trimmed(content.Text());
  if (text.empty()) return {fmt::format("cannot read {}: it is empty", path), {}};
  if (const std::string problem = CYbMapProjection(text).Problem(); !problem.empty()) {
    result.error = fmt::format("cannot read {}: {}", path, problem);
  }
  return result;
}

}  // namespace tervane
