#pragma once

#include "containers/match/fstringmatchlist.h"
#include "foundation/text/string.h"

/// Looks for a search text in candidates, without regard to case, and tells how it was found.
///
/// | search text | candidate      | kind  | distance | matched characters |
/// |-------------|----------------|-------|----------|--------------------|
/// | "tune"      | "Tune"         | whole | 0        | all                |
/// | "tune"      | "My Tune Copy" | part  | 0        | "Tune"             |
/// | "tune"      | "tone"         | similar | 1      | "t", "ne"          |
/// | "tune"      | "song"         | none  |          |                    |
///
/// The empty search text is a part of every candidate; an empty candidate never matches. One thread at a time.
class FStringMatcher : public FObject, public IStringMatcher
{
    DECLARE_TYPE(FStringMatcher, FObject)
    FORWARD_FUNKNOWN(FObject)

    /// Longer search texts are found whole or as a part only: nobody types them, and similarity takes room and time
    /// with the square of the length.
    static constexpr unsigned kMaxSimilarLength = 1000;

    explicit FStringMatcher(const ConstString& searchText);

    bool isMatch(const char16* candidate, StringMatchInfos* infos) override;
    FStringMatchList* filterCandidates(IObjectDescriptionList* candidates) override;

    int32 queryInterface(const char* interfaceID, void** object) override;

private:
    bool isPartialMatch(const ConstString& candidate, StringMatchInfos* infos) const;

    String pattern;
};
