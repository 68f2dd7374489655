// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/key_exchange.h"

#include <functional>
#include <limits>

#include <gmock/gmock.h>

#include "core/list.h"
#include "tests/core/node_tree.h"

namespace tervane {
namespace {

using testing::HasSubstr;

/// One member of each type, as it stands before a reading.
struct Values {
  int number = 5;
  float single = 0.1f;
  double real = 0.25;
  bool flag = false;
  std::string text = "t";
  FileName file{"maps/a.nds2", "/s"};
  CYbDateTime date{2001, 2, 3, 4, 5, 6};

  CYbSEKvfListBase<CTvnKvfBase>* list = nullptr;
  std::string custom = "12";

  std::string All() const {
    return std::to_string(number) + ' ' + std::to_string(single) + ' ' + std::to_string(real) + ' ' +
           std::to_string(flag) + ' ' + text + ' ' + file.Text() + ' ' + date.Format("%Y-%m-%d %H:%M:%S") + ' ' +
           std::to_string(list->GetItemCount()) + ' ' + custom;
  }
};

class Items : public CYbSEKvfListBase<CTvnKvfBase> {
 public:
  explicit Items(CYbSEKvfBase* parent) : CYbSEKvfListBase("", "", parent) { SetItemCount(2, 1); }
  std::unique_ptr<CTvnKvfBase> NewItem() override { return std::make_unique<CTvnKvfBase>("", "", this); }
};

class KeyExchangeTest : public testing::Test {
 public:
  using Declaration = std::function<void(KeyExchange&, Values&)>;

  KeyExchangeTest() { before_.list = &items_; }

  /// The values after reading `content`, and the notes and what was not read, joined.
  Values Read(const Declaration& declare, const std::string& content, int version, std::string& complaints) {
    Values values = before_;
    values.list->SetItemCount(2, 1);
    KvfFile* file = kvfCreate();
    file->folder = "/setups";
    file->text = FileContent::Of("target T {\nsection S {\n" + content + "\n}\n}\n");
    EXPECT_TRUE(ParseKvf(*file)) << file->syntaxError.message;
    KvfNode* section = kvfSectionByNameNum(kvfTargetByNameNum(file, "T", 1), "S", 1);
    KeyExchange keys = KeyExchange::Reading(section, version);
    EXPECT_TRUE(keys.IsReading() && !keys.IsWriting() && !keys.IsDescribing());
    EXPECT_EQ(keys.Section(), section);
    declare(keys, values);
    for (const KvfPlacedNote& note : CollectNotes(*file)) complaints += note.key + ": " + note.text;
    for (const KvfUnread& unread : CollectUnread(*file)) complaints += "unread: " + unread.text;
    kvfClose(&file);
    return values;
  }

  std::string Write(const Declaration& declare) {
    Values values = before_;
    values.list->SetItemCount(2, 1);
    KvfFile* file = kvfCreate();
    file->folder = "/s";
    kvfAddTarget(file, "T");
    KeyExchange keys = KeyExchange::Writing(file);
    EXPECT_TRUE(keys.IsWriting() && !keys.IsReading() && !keys.IsDescribing());
    declare(keys, values);
    std::string text;
    AppendKvfNodes(file->Cursor(), 0, text);
    kvfClose(&file);
    return text.empty() ? text : text.substr(0, text.size() - 1);
  }

 private:
  Values before_;
  Items items_{nullptr};
};

TEST_F(KeyExchangeTest, OneDeclarationReadsWritesAndDescribesAKey) {
  struct Case {
    const char* word;
    Declaration declare;
    const char* content;  ///< A value that differs from the one before.
    const char* old;      ///< Of all values after reading `content` in version 8; empty: as before.
    const char* current;  ///< The same in version 9.
    const char* written;
    const char* type;
    int since = -1;
    int until = KeyInfo::kNoLimit;
    const char* absent = "";  ///< All values after reading an empty section; empty: as before.
  };
  const char* before = "5 0.100000 0.250000 0 t maps/a.nds2 2001-02-03 04:05:06 2 12";
  const char* number6 = "6 0.100000 0.250000 0 t maps/a.nds2 2001-02-03 04:05:06 2 12";
  const auto with = [&](const char* from, const char* to) {
    std::string all = before;
    return all.replace(all.find(from), std::string(from).size(), to);
  };
  const std::string single = with("0.100000", "6.500000"), real = with("0.250000", "6.500000"),
                    flag = with(" 0 t", " 1 t"), text = with(" t ", " u "), file = with("maps/a.nds2", "b/c.nds2"),
                    date = with("2001-02-03 04:05:06", "2010-11-12 13:14:00"),
                    day = with("2001-02-03 04:05:06", "2010-11-12 00:00:00"), count = with(" 2 12", " 4 12"),
                    custom = with(" 2 12", " 2 6"), zero = with("5 0.1", "0 0.1"), empty = with(" t ", "  ");
  const auto plain = [](auto Values::*member) {
    return [member](KeyExchange& keys, Values& values) { keys("Key", values.*member); };
  };
  const Case cases[] = {
      {"int", plain(&Values::number), "Key = 6", number6, number6, "Key = 5", "int"},
      {"float", plain(&Values::single), "Key = 6.5f", single.c_str(), single.c_str(), "Key = 0.1f", "float"},
      {"double", plain(&Values::real), "Key = 6.5", real.c_str(), real.c_str(), "Key = 0.25", "double"},
      {"bool", plain(&Values::flag), "Key = true", flag.c_str(), flag.c_str(), "Key = false", "bool"},
      {"string", plain(&Values::text), "Key = \"u\"", text.c_str(), text.c_str(), "Key = \"t\"", "string"},
      {"filename", plain(&Values::file), "Key = file \"b/c.nds2\"", file.c_str(), file.c_str(),
       "Key = file \"maps/a.nds2\"", "filename"},
      {"date", plain(&Values::date), "Key = 2010, 11, 12, 13, 14", date.c_str(), date.c_str(), "Key = 2001, 2, 3, 4, 5",
       "date"},
      {"Since", [](KeyExchange& keys, Values& values) { keys.Since(9)("Key", values.number); }, "Key = 6", "", number6,
       "Key = 5", "int", 9},
      {"Until", [](KeyExchange& keys, Values& values) { keys.Until(8, "Key", values.number); }, "Key = 6", number6, "",
       "", "int", -1, 8},
      {"ReadOnly", [](KeyExchange& keys, Values& values) { keys.ReadOnly("Key", values.number); }, "Key = 6", number6,
       number6, "", "int"},
      {"WriteOnly", [](KeyExchange& keys, Values&) { keys.WriteOnly("Key", 14); }, "Key = 6", "", "", "Key = 14", "int",
       KeyInfo::kNoLimit},
      {"FromOne", [](KeyExchange& keys, Values& values) { keys.FromOne("Key", values.number); }, "Key = 7", number6,
       number6, "Key = 6", "int"},
      {"OrZero", [](KeyExchange& keys, Values& values) { keys.OrZero("Key", values.number); }, "Key = 6", number6,
       number6, "Key = 5", "int", -1, KeyInfo::kNoLimit, zero.c_str()},
      {"OrZero of a text", [](KeyExchange& keys, Values& values) { keys.OrZero("Key", values.text); }, "Key = \"u\"",
       text.c_str(), text.c_str(), "Key = \"t\"", "string", -1, KeyInfo::kNoLimit, empty.c_str()},
      {"Custom",
       [](KeyExchange& keys, Values& values) {
         keys.Custom(
             "Key", [&] { return std::stoi(values.custom); },
             [&](int value) { values.custom = std::to_string(value); });
       },
       "Key = 6", custom.c_str(), custom.c_str(), "Key = 12", "int"},
      {"Day", [](KeyExchange& keys, Values& values) { keys.Day("Key", values.date); }, "Key = 2010, 11, 12",
       day.c_str(), day.c_str(), "Key = 2001, 2, 3", "day"},
      {"Count", [](KeyExchange& keys, Values& values) { keys.Count("Key", *values.list); }, "Key = 4", count.c_str(),
       count.c_str(), "Key = 2", "int"}};
  for (const Case& c : cases) {
    const auto orBefore = [&](const char* expected) { return *expected ? expected : before; };
    std::string complaints;
    EXPECT_EQ(Read(c.declare, c.content, 8, complaints).All(), orBefore(c.old)) << c.word;
    EXPECT_EQ(Read(c.declare, c.content, 9, complaints).All(), orBefore(c.current)) << c.word;
    EXPECT_EQ(Read(c.declare, "", 9, complaints).All(), orBefore(c.absent)) << c.word;
    EXPECT_EQ(complaints, "") << c.word;  // A key that a version skips is known all the same.
    EXPECT_EQ(Write(c.declare), c.written) << c.word;

    // A value of another type leaves the member as an absent key does, and a note.
    const bool isText = std::string(c.type) == "string" || std::string(c.type) == "bool";
    EXPECT_EQ(Read(c.declare, isText ? "Key = 1" : "Key = \"x\"", 8, complaints).All(), orBefore(c.absent)) << c.word;
    EXPECT_EQ(complaints.empty(), *c.old == '\0') << c.word;

    std::vector<KeyInfo> described;
    Values values;
    Items items{nullptr};
    values.list = &items;
    KeyExchange keys = KeyExchange::Describing(described, -1);
    EXPECT_TRUE(keys.IsDescribing() && !keys.IsWriting() && !keys.IsReading());
    c.declare(keys, values);
    ASSERT_EQ(described.size(), 1U) << c.word;
    const KeyInfo& info = described[0];
    EXPECT_EQ(info.key + " = " + info.defaultValue, *c.written ? c.written : "Key = ") << c.word;
    EXPECT_EQ(info.type, c.type) << c.word;
    EXPECT_EQ(info.since, c.since) << c.word;
    EXPECT_EQ(info.until, c.until) << c.word;
    EXPECT_EQ(info.written, *c.written != '\0') << c.word;
  }
}

TEST_F(KeyExchangeTest, VersionsAreReadFromTheirFirstToTheirLast) {
  struct Case {
    int version;
    int number;  ///< 6 from the old key, 7 from the new one.
  };
  for (const Case& c : {Case{-1, 6}, {-5, 6}, {0, 6}, {8, 6}, {9, 7}, {14, 7}, {99, 7}}) {
    std::string complaints;
    const Values values = Read(
        [&](KeyExchange& keys, Values& v) {
          EXPECT_EQ(keys.Until(8, "Old", v.number), c.version < 9);
          keys.Since(9)("New", v.number);
          keys("Always", v.real);
        },
        "Old = 6\n New = 7\n Always = 1.5", c.version, complaints);
    EXPECT_EQ(values.number, c.number) << c.version;
    EXPECT_EQ(values.real, 1.5) << c.version;
    EXPECT_EQ(complaints, "");
  }
}

TEST_F(KeyExchangeTest, ValuesAtTheEdgeAreReadAndTold) {
  struct Case {
    const char* content;
    Declaration declare;
    std::function<std::string(const Values&)> value;
    const char* expected;
    const char* note;  ///< Part of it; empty for none.
  };
  const Declaration date = [](KeyExchange& keys, Values& values) { keys("Key", values.date); };
  const Declaration day = [](KeyExchange& keys, Values& values) { keys.Day("Key", values.date); };
  const Declaration file = [](KeyExchange& keys, Values& values) { keys("Key", values.file); };
  const Declaration fromOne = [](KeyExchange& keys, Values& values) { keys.FromOne("Key", values.number); };
  const auto month = [](const Values& values) { return std::to_string(values.date.Month()); };
  const auto name = [](const Values& values) { return values.file.Text() + " " + values.file.Absolute(); };
  const auto number = [](const Values& values) { return std::to_string(values.number); };
  for (const Case& c : {Case{"Key = 2001, 13, 1, 0, 0", date, month, "13", "a date were expected"},
                        {"Key = 0, 0, 0, 0, 0", date, month, "0", ""},
                        {"Key = 2001, 5, 1", date, month, "2", "nothing stands where"},
                        {"Key = 2001, 2, 30", day, month, "2", "a date were expected"},
                        {"Key = 0, 0, 0", day, month, "0", ""},
                        {"Key = file \"b.shp\"", file, name, "b.shp /setups/b.shp", ""},
                        {"Key = file \"\"", file, name, " ", ""},
                        {"Key = file \"maps\\\\\"", file, name, " ", "a folder stands where"},
                        {"Key = file \"maps/\"", file, name, " ", "a folder stands where"},
                        {"Key = \"b.shp\"", file, name, "maps/a.nds2 /s/maps/a.nds2", "stands where a file name"},
                        {"Key = 1", fromOne, number, "0", ""},
                        {"Key = -2147483648", fromOne, number, "2147483647", ""}}) {
    std::string complaints;
    EXPECT_EQ(c.value(Read(c.declare, c.content, 14, complaints)), c.expected) << c.content;
    EXPECT_THAT(complaints, HasSubstr(c.note)) << c.content;
    EXPECT_EQ(complaints.empty(), *c.note == '\0') << c.content;
  }
  EXPECT_EQ(Write([](KeyExchange& keys, Values& values) {
              values.number = std::numeric_limits<int>::max();
              keys.FromOne("Key", values.number);
            }),
            "Key = -2147483648");
}

TEST(KeyExchange, AMissingSectionReadsLikeAnEmptyOne) {
  int number = 5;
  KeyExchange keys = KeyExchange::Reading(nullptr, 14);
  EXPECT_TRUE(keys.IsReading());
  keys("Key", number);
  keys.Since(15)("Later", number);
  EXPECT_EQ(number, 5);
}

}  // namespace
}  // namespace tervane
