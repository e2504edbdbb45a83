#pragma once

class FAttributes;
class FString;

/// Texts that attributes hold only where there is one. One thread at a time.
namespace OptionalText
{
/// Sets nothing for an empty text.
void store(FAttributes& attributes, const char* key, const FString& text);
/// A text that isn't there is empty.
void restore(const FAttributes& attributes, const char* key, FString& text);
} // namespace OptionalText
