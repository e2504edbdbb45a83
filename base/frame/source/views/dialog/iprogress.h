#pragma once

#include "foundation/object/funknown.h"

/// Shows how far a long job has come. Made by the class factory under this interface's identifier.
///
/// Each operation gives 0, or -1 where there is nothing to show it in. *Main thread*.
class IProgress : public FUnknown
{
public:
    /// Mode 1 is a dialog with a cancel button, which writes true to `cancelFlag`. The flag is borrowed, and may be
    /// null.
    virtual int32 initialize(int mode, const char16* title, bool* cancelFlag) = 0;
    virtual int32 setMinValue(int value) = 0;
    virtual int32 setMaxValue(int value) = 0;
    virtual int32 setProgressValue(int value) = 0;
    virtual int32 setProgressInfo(const char16* text) = 0;
    virtual int32 setNumSteps(int count) = 0;
    /// Goes on to the step with this number, from 1.
    virtual int32 nextStep(int number) = 0;
    virtual int32 setStepInfo(const char16* text) = 0;
    virtual int32 startProcessing() = 0;
    /// Takes the dialog away; the object can go on, and then shows it again.
    virtual int32 endProcessing() = 0;

    DECLARE_INTERFACE_ID
};
