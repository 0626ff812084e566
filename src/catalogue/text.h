// Small text helpers shared by the readers. Text is 8-bit, never decoded.
#pragma once

#include <string>
#include <string_view>

// Letters lowered as the system lowers 8-bit text for the ASCII texts the program looks for.
std::string LowerCopy(std::string_view text);
bool StartsWith(std::string_view text, std::string_view prefix);
bool Contains(std::string_view text, std::string_view part);
// "(" + the number + ")", the way number lines and object lists write an object's number.
std::string NumberInParentheses(long long number);
