#include "fuzz/fuzztext.h"
#include "services/localisation/itranslationreceiver.h"
#include "services/localisation/utranslationparser.h"
#include "services/localisation/utranslator.h"

// Translation files in both formats.

namespace
{
class Receiver : public ITranslationReceiver
{
public:
    void addLanguage(const char* code, const char16* name) override { require(*code != 0 && *name != 0); }
    int addTranslation(const char16* key, const char* language, const char16* text) override
    {
        require(key && language && text);
        return ++rows % 1000 == 0 ? kStop : kTaken;
    }

private:
    int rows = 0;
};
} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    const auto* text = reinterpret_cast<const char*>(data);
    Receiver receiver;
    UTranslationParser parser(text, static_cast<int>(size), receiver);
    const bool isDone = parser.go(false);
    require(isDone || size == 0 || parser.getLine() >= 0);
    FString message;
    int line = 0;
    UTranslator::verifySyntax(text, static_cast<int>(size), message, line);
    return 0;
}
