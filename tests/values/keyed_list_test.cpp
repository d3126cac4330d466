#include "values/keyed_list.h"

#include <gtest/gtest.h>

#include <string>

#include "support/error_of.h"

namespace partnerkit {
namespace {

// Each item under the key that it is.
using Letters = KeyedList<char>;

void Add(Letters& list, std::string_view letters) {
  for (const char& letter : letters) list.Add(std::make_shared<char>(letter), std::string_view(&letter, 1));
}

std::string Walk(const Letters& list) {
  std::string walked;
  for (const auto& letter : list) walked += *letter;
  return walked;
}

TEST(KeyedList, FindsByPositionByKeyedTextAndByKey) {
  Letters list;
  Add(list, "ab");
  list.Add(std::make_shared<char>('='), "ID=a");
  EXPECT_EQ(*list.Item(1), 'a');
  EXPECT_EQ(*list.Item(3), '=');
  EXPECT_EQ(*list.Item("ID=a"), 'a');
  EXPECT_EQ(*list.Item("ID=ID=a"), '=');
  EXPECT_EQ(*list.Find("ID=a"), '=');
  for (const std::size_t position : {std::size_t{0}, std::size_t{4}}) EXPECT_FALSE(list.Item(position));
  for (const char* text : {"ID=c", "b", ""}) EXPECT_FALSE(list.Item(text)) << text;
  EXPECT_FALSE(list.Find("A"));
  EXPECT_EQ(testing::ErrorOf([&] { Add(list, "a"); }),
            "457 This key is already associated with an element of this collection");
  EXPECT_EQ(list.Count(), 3u);
  EXPECT_EQ(Walk(list), "ab=");
}

TEST(KeyedList, RemovesWithoutDisturbingTheOrder) {
  Letters from;
  Add(from, "abcd");
  EXPECT_TRUE(from.Remove("a"));
  EXPECT_TRUE(from.Remove("c"));
  EXPECT_FALSE(from.Remove("c"));
  EXPECT_EQ(from.Count(), 2u);
  EXPECT_EQ(Walk(from), "bd");
  EXPECT_FALSE(from.Find("c"));

  Letters list = std::move(from);
  Add(list, "c");
  EXPECT_EQ(*list.Item(1), 'b');
  EXPECT_EQ(*list.Item(3), 'c');
  EXPECT_FALSE(list.Item(4));
  EXPECT_EQ(*list.Find("d"), 'd');
  EXPECT_TRUE(list.Remove("d"));
  EXPECT_EQ(Walk(list), "bc");
}

TEST(KeyedList, IsWalkedWhileItsItemsGoAndCome) {
  Letters list;
  Add(list, "abc");
  std::string seen;
  for (const auto& letter : list) {
    if (*letter == 'a') {
      list.Remove("a");
      list.Remove("b");
      Add(list, "defghijklmnop");
    }
    seen += *letter;
  }
  EXPECT_EQ(seen, "acdefghijklmnop");
}

}  // namespace
}  // namespace partnerkit
