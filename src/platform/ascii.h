// Text compared without regard to the case of ASCII letters.
#pragma once

namespace tendril {

// Upper case for an ASCII letter; any other character unchanged.
template <typename Character>
constexpr Character AsciiUpper(Character character) {
  return character >= 'a' && character <= 'z' ? static_cast<Character>(character - 'a' + 'A') : character;
}

}  // namespace tendril
