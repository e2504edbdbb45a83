#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

/// What the stand-in service does with one request.
///
/// Written as a word and what it needs; `parse` reads that form, which the options and the control endpoint use:
///
///     accept                answers as the service does
///     reply TEXT            answers 200 with this body, XML or not
///     error TEXT            answers with an "error" document
///     errors TEXT|TEXT...   answers with an "errors" document
///     status CODE [TEXT]    answers with this status and body
///     split                 answers well, but the reply comes in two halves
///     flood BYTES           answers 200 with so many bytes that are no XML
///     close BYTES           closes the connection once so many bytes of the body have come
///     reset BYTES           the same, with a reset
///     stall BYTES           stops there until released, then goes on as `accept`
///     slow MILLISECONDS     pauses at every block of the body
///     deny                  login page: the user refuses
struct Behaviour
{
    enum class Kind
    {
        accept,
        reply,
        error,
        errors,
        status,
        split,
        flood,
        close,
        reset,
        stall,
        slow,
        deny
    };

    Kind kind = Kind::accept;
    /// The status, a count of bytes, or milliseconds.
    std::int64_t number = 0;
    std::string text;

    /// Nothing for a word that is unknown or lacks its number.
    static std::optional<Behaviour> parse(const std::string& words);

    /// The texts of `errors`.
    std::vector<std::string> texts() const;
};

/// The word of the written form.
const char* nameOf(Behaviour::Kind kind);
