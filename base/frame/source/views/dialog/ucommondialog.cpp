#include "views/dialog/ucommondialog.h"

#include "foundation/text/conststring.h"
#include "views/dialog/uconsole.h"

bool UCommonDialog::getNameAndPassword(const char16* title, FString&, FString&)
{
    UConsole::instance().print(title);
    return false;
}
