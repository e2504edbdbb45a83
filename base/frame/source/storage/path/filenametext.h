#pragma once

#include "foundation/text/string.h"

#include <string>

/// Names on disk as text and back. Any bytes without a zero make a text that gives the same bytes again.
///
/// | bytes       | text                      |
/// |-------------|---------------------------|
/// | "a"         | "a"                       |
/// | C3 A4       | U+00E4                    |
/// | E4 (Latin)  | DC80 + 64 = DCE4          |
/// | ED A0 80    | DCED DCA0 DC80            |
namespace FileNameText
{
/// `text` becomes wide; nothing is normalised.
void fromBytes(const char* bytes, String& text);
/// A lone surrogate that stands for no byte becomes the three bytes of its number.
std::string toBytes(const ConstString& text);
/// The bytes of the decomposed form.
std::string toDecomposedBytes(const ConstString& text);
} // namespace FileNameText
