#include "foundation/object/iattributes.h"
#include "foundation/object/icloneable.h"
#include "foundation/object/idependent.h"
#include "foundation/object/ipersistent.h"
#include "foundation/object/istring.h"
#include "foundation/object/iupdatehandler.h"

DEFINE_INTERFACE_ID(IString, 0xF99DB7A3, 0x0FC14821, 0x800B0CF9, 0x8E348EDF)
DEFINE_INTERFACE_ID(IStringResult, 0x550798BC, 0x872049DB, 0x84920A15, 0x3B50B7A8)
DEFINE_INTERFACE_ID(IDependent, 0xF52B7AAE, 0xDE72416D, 0x8AF18ACE, 0x9DD7BD5E)
DEFINE_INTERFACE_ID(IUpdateHandler, 0xF5246D56, 0x86544D60, 0xB026AFB5, 0x7B697B37)
DEFINE_INTERFACE_ID(IPersistent, 0xBA1A4637, 0x3C9F46D0, 0xA65DBA0E, 0xB85DA829)
DEFINE_INTERFACE_ID(IAttributes, 0xFA1E32F9, 0xCA6D46F5, 0xA982F956, 0xB1191B58)
DEFINE_INTERFACE_ID(ICloneable, 0xD45406B9, 0x3A2D4443, 0x9DAD9BA9, 0x85A1454B)
