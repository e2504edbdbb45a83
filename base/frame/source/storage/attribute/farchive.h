#pragma once

#include "foundation/object/iptr.h"
#include "foundation/object/types.h"
#include "storage/attribute/iarchiveerrorhook.h"

#include <vector>

class CmObject;
class FStream;

/// The older way of storing: objects write themselves into a stream through `externalize` and read themselves
/// back through `internalize`.
///
/// The archive holds a reference on its stream; the error hook is not owned. Reading trusts nothing: counts, sizes
/// and references are checked, and nesting has a limit. One thread at a time.
class FArchive
{
public:
    enum Error : int32
    {
        kBadValueKind = -97,
        /// The object can't be read, or is of another class than asked for.
        kBadObject = -99,
        /// The stream no longer vouches for what went through it. Stays the last error.
        kBadStream = -100
    };

    /// How deep objects and trees may hold one another, in each of the file forms. Beyond it, writing and reading
    /// fail: deeper ones would exhaust the stack.
    static constexpr int kMaxDepth = 1000;

    /// `hook` may be null.
    FArchive(FStream* archiveStream, bool writing, IArchiveErrorHook* hook = nullptr);
    FArchive(const FArchive&) = delete;
    FArchive& operator=(const FArchive&) = delete;
    virtual ~FArchive();

    FStream& getStream() const { return *stream; }
    bool isWritingArchive() const { return isWriting; }

    /// Reads an object that is a `className`. The caller gets a reference; null where that fails.
    CmObject* load(const char* className);
    /// Runs the functions of `registerPreSaveFunction`, then writes the object.
    bool save(CmObject* object);

    /// Reads an object that is a `className` (any, where that is null). The caller gets a reference, also on an
    /// object that was read before; null for a stored null and, with an error, for what can't be read. `shared` as
    /// in writing.
    virtual CmObject* readObject(const char* className, bool shared) = 0;
    /// Null is stored as such. With `shared` an object is stored once and referred to thereafter.
    virtual bool writeObject(const CmObject* object, bool shared) = 0;
    /// The version of this class's stored form: in the file, while reading, else of this program. 0 if unknown.
    virtual int16 getVersion(const char* className) const = 0;

    /// A number of things that follow. A negative one read is an error.
    bool writeCount(int count);
    bool readCount(int& count);

    /// Asks the stream first. 0 where there was no error.
    int32 getLastError();
    /// Stores the error and tells the hook.
    void setError(int32 error);
    /// The errors that occurred, each once.
    const std::vector<int32>& getErrors() const { return errors; }

    /// Takes over the caller's reference and gives it back at the end of the archive.
    void forgetLater(CmObject* object);

    /// Functions that bring objects up to date before they are stored. Registered at start-up, main thread.
    static void registerPreSaveFunction(void (*function)());
    /// Calls the functions in order of registration.
    static void beforeSave();

protected:
    IPtr<FStream> stream;
    const bool isWriting;
    IArchiveErrorHook* errorHook;
    int32 lastError = 0;
    std::vector<int32> errors;

private:
    std::vector<IPtr<CmObject>> forgotten;
};
