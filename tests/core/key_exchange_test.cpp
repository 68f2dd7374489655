// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/key_exchange.h"

#include <functional>
#include <limits>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "core/list.h"
#include "tests/core/node_tree.h"

namespace tervane::key_exchange_test {
namespace {

using test::LoadText;
using test::Root;
using test::Saved;
using testing::HasSubstr;

class Items : public CYbSEKvfListBase<CTvnKvfBase> {
 public:
  explicit Items(CYbSEKvfBase* parent) : CYbSEKvfListBase("", "", parent) { SetItemCount(2, 1); }
  std::unique_ptr<CTvnKvfBase> NewItem() override { return std::make_unique<CTvnKvfBase>("", "", this); }
};

/// A node with a member of each type, of which it exchanges what it is told to.
class Values : public CYbSEKvfBase {
 public:
  using Declaration = std::function<void(KeyExchange&, Values&)>;
  Values(Declaration declare, CYbSEKvfBase* parent) : CYbSEKvfBase("", "S", parent), Declare(std::move(declare)) {}

  Declaration Declare;
  int Number = 5;
  float Single = 0.1f;
  double Real = 0.25;
  bool Flag = false;
  std::string Text = "t", Custom = "12";
  FileName File{"a", "/s"};
  CYbDateTime Date{2001, 2, 3, 4, 5, 6};
  Items List{this};

  std::string All() const {
    return fmt::format("{} {} {} {} <{}> <{}> <{}> {} {} {}", Number, Single, Real, Flag, Text, File.Text(),
                       File.Absolute(), Date.Format("%Y-%m-%d %H:%M:%S"), Date.Month(), List.GetItemCount()) +
           " " + Custom;
  }

 protected:
  void ExchangeKeys(KeyExchange& keys) override { Declare(keys, *this); }
};

using Keys = KeyExchange;
auto Plain(auto Values::*member) {
  return [member](Keys& keys, Values& values) { keys("Key", values.*member); };
}
void Day(Keys& keys, Values& values) { keys.Day("Key", values.Date); }
void FromOne(Keys& keys, Values& values) { keys.FromOne("Key", values.Number); }

TEST(KeyExchange, OneDeclarationReadsWritesAndDescribesAKey) {
  struct Case {
    const char* word;
    Values::Declaration declare;
    const char *content, *before, *after;  ///< A value, a part of all values, and what reading makes of it.
    const char *written, *type;
    int since = -1, until = KeyInfo::kNoLimit;
    const char* absent = nullptr;  ///< What an empty section makes of the part; null: nothing.
  };
  const int none = KeyInfo::kNoLimit;
  const char* date = "2001-02-03 04:05:06 2";
  const Case cases[] = {
      {"int", Plain(&Values::Number), "Key = 6", "5 ", "6 ", "Key = 5", "int"},
      {"float", Plain(&Values::Single), "Key = 6.5f", "0.1 ", "6.5 ", "Key = 0.1f", "float"},
      {"double", Plain(&Values::Real), "Key = 6.5", "0.25", "6.5", "Key = 0.25", "double"},
      {"bool", Plain(&Values::Flag), "Key = true", "false", "true", "Key = false", "bool"},
      {"string", Plain(&Values::Text), "Key = \"u\"", "<t>", "<u>", "Key = \"t\"", "string"},
      {"file", Plain(&Values::File), "Key = file \"b\"", "<a> </s/a>", "<b> </data/b>", "Key = file \"a\"", "filename"},
      {"date", Plain(&Values::Date), "Key = 2010, 11, 12, 13, 14", date, "2010-11-12 13:14:00 11",
       "Key = 2001, 2, 3, 4, 5", "date"},
      {"Since", [](Keys& k, Values& v) { k.Since(9)("Key", v.Number); }, "Key = 6", "5 ", "6 ", "Key = 5", "int", 9},
      {"Until", [](Keys& k, Values& v) { k.Until(8, "Key", v.Number); }, "Key = 6", "5 ", "6 ", "", "int", -1, 8},
      {"ReadOnly", [](Keys& k, Values& v) { k.ReadOnly("Key", v.Number); }, "Key = 6", "5 ", "6 ", "", "int"},
      {"WriteOnly", [](Keys& k, Values&) { k.WriteOnly("Key", 14); }, "Key = 6", "5 ", "6 ", "Key = 14", "int", none},
      {"FromOne", FromOne, "Key = 7", "5 ", "6 ", "Key = 6", "int"},
      {"OrZero", [](Keys& k, Values& v) { k.OrZero("Key", v.Text); }, "Key = \"u\"", "<t>", "<u>", "Key = \"t\"",
       "string", -1, none, "<>"},
      {"Custom",
       [](Keys& k, Values& v) {
         k.Custom(
             "Key", [&] { return std::stoi(v.Custom); }, [&](int value) { v.Custom = std::to_string(value); });
       },
       "Key = 6", " 12", " 6", "Key = 12", "int"},
      {"Day", Day, "Key = 2010, 11, 12", date, "2010-11-12 00:00:00 11", "Key = 2001, 2, 3", "day"},
      {"Count", [](Keys& k, Values& v) { k.Count("Key", v.List); }, "Key = 4", " 2 12", " 4 12", "Key = 2", "int"}};
  for (const Case& c : cases) {
    SCOPED_TRACE(c.word);
    const std::string wrong = std::string_view("string bool").find(c.type) != std::string_view::npos ? "1" : "\"x\"";
    for (const int version : {-5, -1, 8, 9, 99}) {
      const bool isRead = c.since <= std::max(version, -1) && version <= c.until;
      // A value of another type leaves the member as an absent key does, and a note.
      for (const std::string& content : {std::string(c.content), std::string(), "Key = " + wrong}) {
        Root root;
        root.Version = version;
        auto* values = root.NewChild<Values>(c.declare);
        std::string expected = values->All();
        const char* part = !isRead ? c.before : content == c.content ? c.after : c.absent ? c.absent : c.before;
        expected.replace(expected.find(c.before), std::string_view(c.before).size(), part);
        EXPECT_EQ(LoadText(root, "section S { " + content + "; }").empty(), !isRead || content != "Key = " + wrong);
        EXPECT_EQ(values->All(), expected);
      }
    }
    Root root;
    auto* values = root.NewChild<Values>(c.declare);
    EXPECT_EQ(Saved(root), std::string("section S { Touched = 0; ") + c.written + (*c.written ? "; }" : "}"));
    std::vector<KeyInfo> described;
    values->DescribeKeys(described);
    ASSERT_EQ(described.size(), 1U);
    const KeyInfo& info = described[0];
    EXPECT_EQ(info.key + " = " + info.defaultValue, *c.written ? c.written : "Key = ");
    EXPECT_EQ(info.type, c.type);
    EXPECT_EQ(info.since, c.since);
    EXPECT_EQ(info.until, c.until);
    EXPECT_EQ(info.written, *c.written != '\0');
  }
}

TEST(KeyExchange, ValuesAtTheEdgeAreReadAndTold) {
  struct Case {
    const char* value;
    Values::Declaration declare;
    const char *shown, *note;  ///< A part of all values, and of the note; null for none.
  };
  const Values::Declaration date = Plain(&Values::Date), file = Plain(&Values::File);
  const Case cases[] = {{"2001, 13, 1, 0, 0", date, " 13 ", "a date were expected"},
                        {"0, 0, 0, 0, 0", date, " 0 ", nullptr},
                        {"2001, 5, 1", date, " 2 ", "nothing stands where"},
                        {"2001, 2, 30", Day, " 2 ", "a date were expected"},
                        {"0, 0, 0", Day, " 0 ", nullptr},
                        {"file \"\"", file, "<> <>", nullptr},
                        {"file \"maps\\\\\"", file, "<> <>", "a folder stands where"},
                        {"file \"maps/\"", file, "<> <>", "a folder stands where"},
                        {"1", FromOne, "0 ", nullptr},
                        {"-2147483648", FromOne, "2147483647 ", nullptr}};
  for (const Case& c : cases) {
    Root root;
    auto* values = root.NewChild<Values>(c.declare);
    const auto notes = LoadText(root, std::string("section S { Key = ") + c.value + "; }");
    EXPECT_THAT(values->All(), HasSubstr(c.shown)) << c.value;
    EXPECT_EQ(notes.size(), c.note ? 1U : 0U) << c.value;
    EXPECT_THAT(notes, testing::Each(HasSubstr(c.note ? c.note : "")));
    EXPECT_THAT(Saved(root), HasSubstr(std::string("Key = ") + (c.note ? "" : c.value)));
  }
}

}  // namespace
}  // namespace tervane::key_exchange_test
