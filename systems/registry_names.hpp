// Names as people type them: compared, searched, and guessed.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace tidewater::detail {

// A text without case, accents and punctuation: small letters and digits, words apart by one blank.
std::string folded(std::string_view text);

// The same without blanks: what two spellings of one name have in common.
std::string name_key(std::string_view text);

// How well a folded name answers folded words.
enum class Match { whole_name, whole_words, beginnings, anywhere, none };
Match match_of(std::string_view name, const std::vector<std::string_view>& words,
               std::string_view query);

std::vector<std::string_view> split_words(std::string_view folded_text);

// The number of letters to put in, leave out, change or swap with a neighbour to make one text of
// the other; limit + 1 where it is more than the limit.
std::size_t letters_apart(std::string_view a, std::string_view b, std::size_t limit);

}  // namespace tidewater::detail
