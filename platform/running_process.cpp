// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/running_process.h"

#include <algorithm>
#include <charconv>

#include <fmt/format.h>

#include "platform/os.h"

namespace tervane {

RunningProcess RunningProcess::This() {
  const std::uint32_t process = os::ProcessId();
  return {os::UserName(), os::HostName(), process, os::ProcessStartTime(process)};
}

bool RunningProcess::IsOnThisHost() const { return host == os::HostName(); }

bool RunningProcess::IsThis() const { return IsOnThisHost() && process == os::ProcessId() && MayRun(); }

bool RunningProcess::MayRun() const {
  if (!IsOnThisHost()) return true;
  if (!os::IsProcessAlive(process)) return false;
  const std::string now = os::ProcessStartTime(process);
  return started.empty() || now.empty() || started == now;
}

std::string NamedLine(std::string_view name, std::string_view value) {
  std::string line = fmt::format("{}: ", name);
  for (const char c : value) {
    if (static_cast<unsigned char>(c) < 0x20 || c == '%' || c == 0x7F)
      line += fmt::format("%{:02X}", static_cast<unsigned char>(c));
    else
      line += c;
  }
  return line += '\n';
}

std::optional<std::string> NamedValue(std::string_view lines, std::string_view name) {
  while (!lines.empty()) {
    std::string_view line = lines.substr(0, lines.find('\n'));
    lines.remove_prefix(std::min(line.size() + 1, lines.size()));
    if (!line.starts_with(name) || !line.substr(name.size()).starts_with(": ")) continue;
    line.remove_prefix(name.size() + 2);
    std::string value;
    for (std::size_t i = 0; i < line.size(); ++i) {
      unsigned char byte = 0;
      if (line[i] == '%' && i + 2 < line.size() &&
          std::from_chars(&line[i + 1], &line[i + 1] + 2, byte, 16).ptr == &line[i + 1] + 2) {
        value += static_cast<char>(byte);
        i += 2;
      } else {
        value += line[i];
      }
    }
    return value;
  }
  return std::nullopt;
}

std::string ProcessLines(const RunningProcess& process, const std::string& prefix) {
  return NamedLine(prefix + "user", process.user) + NamedLine(prefix + "host", process.host) +
         NamedLine(prefix + "process", std::to_string(process.process)) +
         NamedLine(prefix + "started", process.started);
}

std::optional<RunningProcess> ProcessOfLines(std::string_view lines, const std::string& prefix) {
  const std::optional<std::string> host = NamedValue(lines, prefix + "host");
  const std::optional<std::string> number = NamedValue(lines, prefix + "process");
  if (!host || !number) return std::nullopt;
  RunningProcess process{NamedValue(lines, prefix + "user").value_or(""), *host, 0,
                         NamedValue(lines, prefix + "started").value_or("")};
  const char* end = number->data() + number->size();
  const std::from_chars_result read = std::from_chars(number->data(), end, process.process);
  if (read.ec != std::errc() || read.ptr != end) return std::nullopt;
  return process;
}

}  // namespace tervane
