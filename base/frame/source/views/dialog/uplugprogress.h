#pragma once

#include "foundation/object/cmobject.h"
#include "foundation/text/fstring.h"
#include "views/dialog/iprogress.h"

/// The progress that the class factory makes. *Main thread*.
///
/// A value or text that comes after `endProcessing` opens it anew: a job that was interrupted by a question goes on
/// with the same object.
class UPlugProgress : public CmObject, public IProgress
{
    DECLARE_CLASS(UPlugProgress, CmObject)

    int32 queryInterface(const char* interfaceID, void** object) override;
    FORWARD_FUNKNOWN(CmObject)

    int32 initialize(int dialogMode, const char16* dialogTitle, bool* flag) override;
    int32 setMinValue(int value) override;
    int32 setMaxValue(int value) override;
    int32 setProgressValue(int value) override;
    int32 setProgressInfo(const char16* text) override;
    int32 setNumSteps(int count) override;
    int32 nextStep(int number) override;
    int32 setStepInfo(const char16* text) override;
    int32 startProcessing() override;
    int32 endProcessing() override;

private:
    enum class State
    {
        kNew,
        kInitialized,
        kOpen,
        kEnded
    };

    int32 reopen();
    void showLine();
    int percent() const;

    State state = State::kNew;
    int minimum = 0;
    int maximum = 100;
    int current = 0;
    int stepCount = 1;
    int step = 1;
    FString title;
    FString info;
    FString shownLine;
};
