#pragma once

#include "containers/sequence/cmlinkedlist.h"
#include "services/defaults/fdefaults.h"
#include "services/defaults/idefaultpool.h"

/// The user settings of the whole program: named groups, loaded from "Defaults.xml" at start and saved at the end.
///
/// A class that keeps state reads and writes groups, or registers objects as auto savers, which are stored under
/// their class names; those that register later than the file is loaded are served by `postInit`. Until then nothing
/// is saved, so that a program that starts only by halves can't overwrite the file. Main thread.
class FDefaultPool : public CmObject, public IDefaultPool3
{
    DECLARE_CLASS(FDefaultPool, CmObject)

    FDefaultPool();
    ~FDefaultPool() override;

    /// The group, borrowed. One of another version is discarded with its values. Null for an empty name, without
    /// `create` where there is none, and after `terminate`.
    FDefaults* getDefaults(const char* group, int version, bool create);
    bool removeDefaults(const char* group, int version);
    void removeAll();

    /// A missing or damaged file leaves the pool as it was.
    void load();
    /// False before `postInit`. The result tells nothing of the file: a failed write leaves the earlier one.
    bool save(bool callPreSavers);
    /// Once all classes have registered.
    void postInit();
    /// Nothing is found or made any more.
    void terminate();

    /// Adds a reference.
    void addGlobalAutoSaver(CmObject* saver);
    // Functions that run before the settings are saved, and after they were loaded, in order of registration.
    static void addPreSaveFunc(void (*function)());
    static void addPostLoadFunc(void (*function)());

    bool setObj(const char* group, const char* key, CmObject* object, int version);
    CmObject* getObj(const char* group, const char* key, const char* className, int version);

    bool setLong(const char* group, const char* key, int32 value) override;
    bool getLong(const char* group, const char* key, int32& value) const override;
    bool setLongLong(const char* group, const char* key, int64 value) override;
    bool getLongLong(const char* group, const char* key, int64& value) const override;
    bool setDouble(const char* group, const char* key, double value) override;
    bool getDouble(const char* group, const char* key, double& value) const override;
    bool setString8(const char* group, const char* key, const char* text) override;
    const char* getString8(const char* group, const char* key) const override;
    bool setString16(const char* group, const char* key, const char16* text) override;
    const char16* getString16(const char* group, const char* key) const override;
    bool setTString(const char* group, const char* key, const ConstString& text) override;
    bool getTString(const char* group, const char* key, String& text) const override;
    bool setObject(const char* group, const char* key, FUnknown* object) override;
    FUnknown* getObject(const char* group, const char* key) const override;

    int32 queryInterface(const char* interfaceID, void** object) override;
    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;
    FORWARD_FUNKNOWN(CmObject)

private:
    FDefaults* findGroup(const char* group) const;
    const FDefaults* findDefaults(const char* group) const;
    void restoreAutoSavers();

    CmLinkedList defaults;
    CmLinkedList autoSavers;
    IPtr<FAttributes> pendingAutoSavers;
    bool saveEnabled = false;
    bool terminated = false;
    bool isFileUnreadable = false;
};

/// The one pool; null before the program's start made it and after its end.
extern FDefaultPool* gDefaultPool;
