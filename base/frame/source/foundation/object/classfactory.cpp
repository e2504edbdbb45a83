#include "foundation/object/classfactory.h"

#include "foundation/object/ipersistent.h"
#include "foundation/object/iptr.h"
#include "foundation/object/metaclass.h"
#include "foundation/object/metaclasstables.h"
#include "foundation/object/singleton.h"

using MetaClasses::SorterByCID;
using MetaClasses::SorterByName;

namespace
{
FObject* theFactory = nullptr;

// By the descriptor itself: another one of the same name or identifier stays.
template <class Entry>
void removeEntryOf(THashTable<Entry>& table, const MetaClass* meta)
{
    for (THashTableIterator<Entry> it(table); !it.done(); it.next())
        if (it.current().meta == meta)
        {
            table.remove(it);
            return;
        }
}
} // namespace

ClassFactory::ClassFactory() : tables(std::make_unique<MetaClasses::Tables>()) {}

ClassFactory::~ClassFactory() = default;

ClassFactory* ClassFactory::instance(bool create)
{
    if (!theFactory && create && !Singleton::isTerminated())
    {
        theFactory = new ClassFactory;
        Singleton::registerInstance(&theFactory);
    }
    return static_cast<ClassFactory*>(theFactory);
}

void ClassFactory::registerMetaClass(MetaClass* meta)
{
    if (meta->className)
        tables->byName.add({meta->className, meta});
    if (meta->classID.isValid())
        tables->byID.add({meta->classID, meta});
}

void ClassFactory::unregisterMetaClass(MetaClass* meta)
{
    if (meta->className)
        removeEntryOf(tables->byName, meta);
    if (meta->classID.isValid())
        removeEntryOf(tables->byID, meta);
}

MetaClass* ClassFactory::getMetaClassByName(const char* name) const
{
    return name ? tables->byName.lookup({name, nullptr}).meta : nullptr;
}

MetaClass* ClassFactory::getMetaClassByID(const char* uid) const
{
    return uid ? tables->byID.lookup({FUID(uid), nullptr}).meta : nullptr;
}

FUnknown* ClassFactory::createObjectByName(const char* text) const
{
    const MetaClass* meta = getMetaClassByName(text);
    FUID uid;
    if (!meta && uid.fromString(text) && uid.isValid())
        meta = getMetaClassByID(uid);
    return meta && meta->createFunction ? meta->createFunction() : nullptr;
}

FUnknown* ClassFactory::createObjectByID(const char* uid) const
{
    const MetaClass* meta = getMetaClassByID(uid);
    return meta && meta->createFunction ? meta->createFunction() : nullptr;
}

bool ClassFactory::getStorageID(FUnknown* object, IString& result, bool mustBeRegistered) const
{
    if (const FObject* known = toFObject(object))
    {
        const MetaClass* meta = mustBeRegistered ? getMetaClassByName(known->isA()) : nullptr;
        if (!mustBeRegistered || meta)
        {
            result.setText8(meta ? meta->persistentName : known->isA());
            return true;
        }
    }

    const IPtr<IPersistent> persistent = adopt(askInterface<IPersistent>(object));
    char uid[16] = {};
    if (!persistent || persistent->getClassID(uid) != kResultOk)
        return false;
    if (mustBeRegistered && !getMetaClassByID(uid))
        return false;
    char digits[33];
    FUID(static_cast<const char*>(uid)).toString(digits);
    result.setText8(digits);
    return true;
}

void ClassFactory::listClasses(TArray<const MetaClass*>& result) const
{
    for (THashTableIterator<SorterByName> it(tables->byName); !it.done();)
        result.add(it.next().meta);
    for (THashTableIterator<SorterByCID> it(tables->byID); !it.done(); it.next())
        if (!it.current().meta->className)
            result.add(it.current().meta);
}
