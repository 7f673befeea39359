#include "registry_names.hpp"

#include <gtest/gtest.h>

namespace tidewater::test {

using detail::folded;
using detail::letters_apart;
using detail::Match;
using detail::match_of;
using detail::name_key;
using detail::split_words;

TEST(FoldedNames, HaveNeitherCaseNorAccentsNorPunctuation) {
  EXPECT_EQ(folded("RGF93 v1 / Lambert-93"), "rgf93 v1 lambert 93");
  EXPECT_EQ(folded("  NAD83(2011)  "), "nad83 2011");
  EXPECT_EQ(folded("Réseau Géodésique Français"), "reseau geodesique francais");
  EXPECT_EQ(folded("ÅÄÖ åäö ŁÓDŹ Þór Straße Œuvre"), "aao aao lodz thor strasse oeuvre");
  EXPECT_EQ(folded("e\u0301te\u0301"), "ete");  // accents behind their letters
  EXPECT_EQ(folded("Clarke's foot"), "clarkes foot");
  EXPECT_EQ(folded("Clarke\u2019s foot"), "clarkes foot");
  EXPECT_EQ(folded("Lambert\u201393"), "lambert 93");  // a dash
  EXPECT_EQ(folded("75°35'W"), "75 35w");
  EXPECT_EQ(folded("\u041a\u0430"), "\u041a\u0430");  // other scripts stand
  EXPECT_EQ(folded(""), "");
  EXPECT_EQ(folded(" -/_ "), "");
}

TEST(FoldedNames, TakeAnyBytes) {
  for (int first = 0; first < 256; ++first) {
    const char bytes[] = {static_cast<char>(first)};
    folded({bytes, 1});  // a character cut short
    for (int second = 0; second < 256; ++second) {
      const char two[] = {static_cast<char>(first), static_cast<char>(second)};
      EXPECT_LE(folded({two, 2}).size(), 4U);
    }
  }
}

TEST(FoldedNames, AreSplitAtTheirBlanks) {
  EXPECT_EQ(split_words("  utm  31n "), (std::vector<std::string_view>{"utm", "31n"}));
  EXPECT_TRUE(split_words("  ").empty());
}

TEST(FoldedNames, KeysHaveNoBlanks) {
  EXPECT_EQ(name_key("WGS 84"), "wgs84");
  EXPECT_EQ(name_key("WGS_84"), name_key("wgs84"));
}

TEST(MatchingNames, FromWholeToAnywhere) {
  const auto match = [](std::string_view name, std::string_view query) {
    return match_of(name, split_words(query), query);
  };
  EXPECT_EQ(match("lambert 93", "lambert 93"), Match::whole_name);
  EXPECT_EQ(match("rgf93 v1 lambert 93", "lambert 93"), Match::whole_words);
  EXPECT_EQ(match("rgf93 v1 lambert 93", "93 lambert"), Match::whole_words);
  EXPECT_EQ(match("rgf93 v1 lambert 93", "lamb 93"), Match::beginnings);
  EXPECT_EQ(match("rgf93 v1 lambert 93", "bert"), Match::anywhere);
  EXPECT_EQ(match("rgf93 v1 lambert 93", "lambert 94"), Match::none);
  // A whole word behind a word that only holds it
  EXPECT_EQ(match("rgf93 lambert 93", "93"), Match::whole_words);
}

TEST(NearNames, CountLetters) {
  EXPECT_EQ(letters_apart("", "", 3), 0U);
  EXPECT_EQ(letters_apart("abc", "abc", 3), 0U);
  EXPECT_EQ(letters_apart("abc", "abd", 3), 1U);
  EXPECT_EQ(letters_apart("abc", "ab", 3), 1U);
  EXPECT_EQ(letters_apart("ab", "abc", 3), 1U);
  EXPECT_EQ(letters_apart("abc", "acb", 3), 1U);  // neighbours change places
  EXPECT_EQ(letters_apart("kitten", "sitting", 3), 3U);
  EXPECT_EQ(letters_apart("kitten", "sitting", 2), 3U);  // more than the limit
  EXPECT_EQ(letters_apart("abcdef", "a", 2), 3U);
  EXPECT_EQ(letters_apart(std::string(500, 'a'), std::string(500, 'b'), 2), 3U);
  EXPECT_EQ(letters_apart(std::string(500, 'a'), std::string(500, 'a'), 2), 3U);  // too long
}

}  // namespace tidewater::test
