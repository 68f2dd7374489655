// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A strict reader of MODFLOW 6 input, written from its description of input and not from our writer: what it does not
// know, it refuses.
#pragma once

#include <cstdint>
#include <cstring>
#include <map>
#include <set>
#include <sstream>
#include <stdexcept>
#include <string>
#include <vector>

#include <fmt/format.h>

#include "tests/support/temp_folder.h"

namespace tervane::test {

/// Blocks of an input file: the words of their lines.
struct InputBlock {
  std::string name;  ///< "PERIOD 3"
  std::vector<std::vector<std::string>> lines;
};

class ModelReader {
 public:
  using Row = std::vector<std::string>;
  struct Array {
    std::vector<double> values;  ///< Row by row from the north.
  };

  explicit ModelReader(std::string folder) : folder_(std::move(folder)) { Read(); }

  int layers = 0, rows = 0, columns = 0;
  std::vector<Row> periods;                   ///< PERLEN, NSTP, TSMULT.
  std::map<std::string, Array> arrays;        ///< "K/1": of a layer; "TOP/1"; "RECHARGE@2/1": of a period.
  std::map<std::string, std::string> typeOf;  ///< Of each package.
  std::map<std::string, std::map<int, std::vector<Row>>> stresses;  ///< Of a package by period.
  std::map<std::string, std::vector<InputBlock>> files;             ///< By type of package.

  double At(const std::string& array, int row, int column) const {
    return arrays.at(array).values.at(static_cast<std::size_t>((row - 1) * columns + column - 1));
  }
  bool IsActive(int layer, int row, int column) const { return At(fmt::format("IDOMAIN/{}", layer), row, column) > 0; }
  std::set<std::string> Options(const std::string& type) const {
    std::set<std::string> found;
    for (const InputBlock& block : files.at(type))
      if (block.name == "OPTIONS")
        for (const Row& line : block.lines) found.insert(line.front());
    return found;
  }

 private:
  [[noreturn]] static void Refuse(const std::string& why) { throw std::runtime_error(why); }
  static void Check(bool holds, const std::string& why) {
    if (!holds) Refuse(why);
  }

  static Row WordsOf(const std::string& line) {
    Row words;
    for (std::size_t at = line.find_first_not_of(' '); at != std::string::npos; at = line.find_first_not_of(' ', at)) {
      const bool isQuoted = line[at] == '\'';
      const std::size_t end = isQuoted ? line.find('\'', at + 1) : line.find(' ', at);
      Check(!isQuoted || end != std::string::npos, "a quote is not closed: " + line);
      words.push_back(isQuoted ? line.substr(at + 1, end - at - 1) : line.substr(at, end - at));
      at = end == std::string::npos ? end : end + (isQuoted ? 1 : 0);
      if (at == std::string::npos) break;
    }
    return words;
  }

  std::vector<InputBlock> Blocks(const std::string& file) const {
    std::istringstream text(ReadFile(folder_ + "/" + file));
    std::vector<InputBlock> blocks;
    bool isInside = false;
    for (std::string line; std::getline(text, line);) {
      const Row words = WordsOf(line);
      if (words.empty() || words[0].starts_with("#")) continue;
      const std::string name = words.size() > 2 ? words[1] + " " + words[2] : words.size() > 1 ? words[1] : "";
      if (words[0] == "BEGIN") {
        Check(!isInside, file + ": a block begins in another one");
        isInside = true;
        blocks.push_back({name, {}});
      } else if (words[0] == "END") {
        Check(isInside && name == blocks.back().name, file + ": a block ends that did not begin");
        isInside = false;
      } else {
        Check(isInside, file + ": a line stands outside all blocks: " + line);
        blocks.back().lines.push_back(words);
      }
    }
    Check(!isInside, file + ": a block does not end");
    return blocks;
  }

  Array ReadArray(const Row& control, bool isWhole) const {
    const auto count = static_cast<std::size_t>(rows * columns);
    Array array;
    if (control.at(0) == "CONSTANT") {
      array.values.assign(count, std::stod(control.at(1)));
      return array;
    }
    Check(control.at(0) == "OPEN/CLOSE", "no control line of an array: " + control.at(0));
    const std::string bytes = ReadFile(folder_ + "/" + control.at(1));
    if (control.size() > 2) {
      Check(control[2] == "(BINARY)", control[2]);
      constexpr std::size_t kHeader = 4 + 4 + 8 + 8 + 16 + 4 + 4 + 4;
      const std::size_t size = isWhole ? 4 : 8;
      Check(bytes.size() == kHeader + count * size, control[1] + " has another size");
      std::int32_t shape[3];
      std::memcpy(shape, bytes.data() + kHeader - sizeof shape, sizeof shape);
      Check(shape[0] == columns && shape[1] == rows, control[1] + " has another shape");
      for (std::size_t i = 0; i < count; ++i) {
        std::int32_t whole = 0;
        double number = 0;
        std::memcpy(isWhole ? static_cast<void*>(&whole) : &number, bytes.data() + kHeader + i * size, size);
        array.values.push_back(isWhole ? whole : number);
      }
      return array;
    }
    std::istringstream text(bytes);
    for (double value = 0; text >> value;) array.values.push_back(value);
    Check(text.eof() && array.values.size() == count, control[1] + " has not as many numbers as there are cells");
    return array;
  }

  void ReadArrays(const InputBlock& block, const std::string& suffix, const std::set<std::string>& known) {
    for (std::size_t i = 0; i < block.lines.size(); ++i) {
      const Row& head = block.lines[i];
      Check(known.contains(head[0]), "no array of this package: " + head[0]);
      const bool isLayered = head.size() > 1 && head[1] == "LAYERED";
      const bool isWhole = head[0] == "IDOMAIN" || head[0] == "IRCH" || head[0] == "IEVT";
      for (int layer = 1; layer <= (isLayered ? layers : 1); ++layer)
        arrays[fmt::format("{}{}/{}", head[0], suffix, layer)] = ReadArray(block.lines.at(++i), isWhole);
    }
  }

  void Read() {
    std::string model;
    for (const InputBlock& block : Blocks("mfsim.nam")) {
      if (block.name == "TIMING") files["TDIS"] = Blocks(block.lines.at(0).at(1));
      if (block.name == "MODELS") model = block.lines.at(0).at(1), Check(block.lines[0].at(2).size() <= 16, "name");
      if (block.name == "SOLUTIONGROUP 1") files["IMS"] = Blocks(block.lines.at(0).at(1));
    }
    for (const InputBlock& block : files.at("TDIS"))
      if (block.name == "PERIODDATA") periods = block.lines;
    for (const Row& period : periods)
      Check(std::stod(period.at(0)) > 0 && std::stoi(period.at(1)) >= 1 && std::stod(period.at(2)) > 0, "TDIS");
    for (const InputBlock& block : Blocks(model))
      if (block.name == "PACKAGES")
        for (const Row& line : block.lines) ReadPackage(line);
    for (const char* needed : {"DIS6", "NPF6", "IC6", "OC6"}) Check(files.contains(needed), needed);
  }

  void ReadPackage(const Row& line) {
    const std::string type = line.at(0), name = line.at(2);
    typeOf[name] = type;
    const std::vector<InputBlock>& blocks = files[type] = Blocks(line.at(1));
    static const std::map<std::string, std::set<std::string>> kArrays = {
        {"DIS6", {"DELR", "DELC", "TOP", "BOTM", "IDOMAIN"}},
        {"NPF6", {"ICELLTYPE", "K", "K22", "K33", "WETDRY"}},
        {"IC6", {"STRT"}},
        {"STO6", {"ICONVERT", "SS", "SY"}},
        {"RCH6", {"IRCH", "RECHARGE"}},
        {"EVT6", {"IEVT", "SURFACE", "RATE", "DEPTH"}}};
    if (type == "DIS6")
      for (const InputBlock& block : blocks)
        if (block.name == "DIMENSIONS") {
          layers = std::stoi(block.lines.at(0).at(1));
          rows = std::stoi(block.lines.at(1).at(1));
          columns = std::stoi(block.lines.at(2).at(1));
        }
    std::size_t most = 0;
    for (const InputBlock& block : blocks) {
      const bool isPeriod = block.name.starts_with("PERIOD ");
      if (block.name == "DIMENSIONS" && type != "DIS6") most = std::stoul(block.lines.at(0).at(1));
      if (isPeriod) Check(std::stoul(block.name.substr(7)) <= periods.size(), "a period that is none");
      if (block.name == "GRIDDATA" || ((type == "RCH6" || type == "EVT6") && isPeriod))
        ReadArrays(block, isPeriod ? "@" + block.name.substr(7) : "", kArrays.at(type));
      if (isPeriod && (type == "CHD6" || type == "GHB6" || type == "DRN6" || type == "WEL6"))
        ReadStress(type, name, std::stoi(block.name.substr(7)), block, most);
    }
    if (type == "DIS6") CheckLevels();
  }

  void CheckLevels() const {
    for (int layer = 1; layer <= layers; ++layer)
      for (int row = 1; row <= rows; ++row)
        for (int column = 1; column <= columns; ++column)
          if (IsActive(layer, row, column))
            Check(At(fmt::format("BOTM/{}", layer), row, column) <
                      At(layer == 1 ? "TOP/1" : fmt::format("BOTM/{}", layer - 1), row, column),
                  fmt::format("layer {} has no thickness in row {}, column {}", layer, row, column));
  }

  void ReadStress(const std::string& type, const std::string& name, int period, const InputBlock& block,
                  std::size_t most) {
    Check(block.lines.size() <= most, name + " has more entries than MAXBOUND");
    std::set<std::string> cells;
    for (const Row& entry : block.lines) {
      Check(entry.size() == (type == "GHB6" || type == "DRN6" ? 6U : 5U), name + ": words of an entry");
      const int layer = std::stoi(entry[0]), row = std::stoi(entry[1]), column = std::stoi(entry[2]);
      Check(layer >= 1 && layer <= layers && row >= 1 && row <= rows && column >= 1 && column <= columns, "a cell");
      Check(IsActive(layer, row, column), name + " names a cell that is not active");
      const double bottom = At(fmt::format("BOTM/{}", layer), row, column);
      if (type == "CHD6" || type == "DRN6") Check(std::stod(entry[3]) >= bottom - 1e-3, name + " lies below its cell");
      if (type == "CHD6")
        Check(cells.insert(entry[0] + " " + entry[1] + " " + entry[2]).second, "a cell has two heads");
    }
    stresses[name][period] = block.lines;
  }

  std::string folder_;
};

}  // namespace tervane::test
