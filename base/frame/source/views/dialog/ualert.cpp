#include "views/dialog/ualert.h"

#include "foundation/text/iuseralert.h"
#include "views/dialog/uconsole.h"

namespace
{
class AlertForLowerRooms final : public IUserAlert
{
public:
    int run(const char16* text, int style, const char16* button1, const char16* button2,
            const char16* button3) override
    {
        return UAlert::run(text, static_cast<UAlert::Style>(style), button1, button2, button3, nullptr);
    }
};
} // namespace

int UAlert::run(const char16* text, Style style, const char16*, const char16* button2, const char16* button3,
                bool*)
{
    if (permission && !permission())
        return 0;
    const int buttonCount = 1 + (button2 ? 1 : 0) + (button3 ? 1 : 0);
    return UConsole::instance().alert(text, style == kQuestion, buttonCount);
}

void UAlert::serveLowerRooms()
{
    static AlertForLowerRooms alert;
    IUserAlert::set(&alert);
}
