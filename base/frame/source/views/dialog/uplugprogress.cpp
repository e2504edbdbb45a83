#include "views/dialog/uplugprogress.h"

#include "views/dialog/uconsole.h"

#include <algorithm>

DEFINE_INTERFACE_ID(IProgress, 0x6B0D94E7, 0x3F8A4C12, 0x95E1B76D, 0x2C48F0A3)

namespace
{
constexpr int32 kNotShown = -1;
} // namespace

// Made by name, and by the identifier of the interface that it is wanted for.
MetaClass UPlugProgress::__fClass("UPlugProgress", &UPlugProgress::__fCreate, IProgress_iid.data,
                                  &CmObject::__fClass, 0);

FUnknown* UPlugProgress::__fCreate()
{
    return static_cast<CmObject*>(new UPlugProgress);
}

int32 UPlugProgress::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, IProgress::iid))
        return offerInterface<IProgress>(this, object);
    return CmObject::queryInterface(interfaceID, object);
}

// The flag stays as it is: nothing on a console can be pressed.
int32 UPlugProgress::initialize(int, const char16* dialogTitle, bool*)
{
    title = dialogTitle;
    info.assign(u"");
    shownLine.assign(u"");
    minimum = 0;
    maximum = 100;
    current = 0;
    stepCount = 1;
    step = 1;
    state = State::kInitialized;
    return kResultOk;
}

int32 UPlugProgress::setMinValue(int value)
{
    minimum = value;
    return kResultOk;
}

int32 UPlugProgress::setMaxValue(int value)
{
    maximum = value;
    return kResultOk;
}

int32 UPlugProgress::setProgressValue(int value)
{
    current = value;
    return reopen();
}

int32 UPlugProgress::setProgressInfo(const char16* text)
{
    info = text;
    if (reopen() != kResultOk)
        return kNotShown;
    if (state == State::kOpen)
        showLine();
    return kResultOk;
}

int32 UPlugProgress::setNumSteps(int count)
{
    stepCount = std::max(count, 1);
    step = 1;
    return kResultOk;
}

int32 UPlugProgress::nextStep(int number)
{
    if (number < 1 || number > stepCount)
        return kNotShown;
    step = number;
    current = minimum;
    return reopen();
}

int32 UPlugProgress::setStepInfo(const char16* text)
{
    return setProgressInfo(text);
}

int32 UPlugProgress::startProcessing()
{
    if (state == State::kNew)
        return kNotShown;
    if (state != State::kOpen)
        UConsole::instance().print(title);
    state = State::kOpen;
    return kResultOk;
}

int32 UPlugProgress::endProcessing()
{
    if (state == State::kNew)
        return kNotShown;
    if (state == State::kOpen)
        state = State::kEnded;
    return kResultOk;
}

int32 UPlugProgress::reopen()
{
    if (state == State::kInitialized)
        return kResultOk;
    return startProcessing();
}

void UPlugProgress::showLine()
{
    FString line(info);
    FString number;
    line.append(u" ").append(number.printInt64(percent())).append(u"%");
    if (line.compare(shownLine) == 0)
        return;
    shownLine = line;
    UConsole::instance().print(line);
}

int UPlugProgress::percent() const
{
    if (maximum <= minimum)
        return 0;
    const int64 done = std::clamp(current, minimum, maximum) - static_cast<int64>(minimum);
    return static_cast<int>(100 * done / (static_cast<int64>(maximum) - minimum));
}
