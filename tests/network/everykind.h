#pragma once

#include "containers/sequence/cmlinkedlist.h"
#include "foundation/message/fmessage.h"
#include "foundation/object/iptr.h"
#include "foundation/text/cmstring.h"
#include "storage/attribute/fattributes.h"
#include "tests/storage/wordcomponent.h"

#include <limits>
#include <string>

/// A message with a value of every kind that can be sent; there must be WordComponents where it is read.
inline IPtr<FMessage> makeEveryKind(const char* type)
{
    auto message = adopt(new FMessage(type));
    message->addInt("integer", std::numeric_limits<int64>::min());
    message->addFloat1("float", -0.1);
    message->addString8("narrow", "plain text");
    message->addString16("wide", u"w\u00efde \u65e5");
    message->addString("empty", u"");
    message->add("text object", adopt(new CmString(u"object")), true);

    const auto tree = adopt(new FAttributes);
    tree->set("number", 42);
    tree->setString("text", u"leaf", true);
    tree->queueFloat("queue", 1.5);
    tree->queueFloat("queue", 2.5);
    message->add("tree", tree, true);

    const auto list = adopt(new CmLinkedList);
    list->retainElements();
    const auto twice = adopt(new CmString("twice"));
    list->add(twice);
    list->add(twice);
    message->add("list", list, true);

    const auto inner = adopt(new FMessage("inner"));
    inner->addInt("depth", 2);
    message->add("message", inner, true);

    const auto component = adopt(new WordComponent);
    component->word.assign("spoken");
    message->addUnknown("component", static_cast<FObject*>(component.get()));
    return message;
}

/// What differs from `makeEveryKind`; empty if nothing does.
inline std::string differenceFromEveryKind(FMessage& message, const char* type)
{
    std::string wrong;
    const auto check = [&wrong](bool isRight, const char* what)
    {
        if (!isRight)
            wrong += std::string(wrong.empty() ? "" : ", ") + what;
    };
    int64 integer = 0;
    double number = 0;
    check(message.isType(type), "type");
    check(message.getInt("integer", &integer) == 0 && integer == std::numeric_limits<int64>::min(),
          "integer");
    check(message.getFloat("float", &number) == 0 && number == -0.1, "float");
    check(message.getString("narrow") == ConstString("plain text"), "narrow");
    check(message.getString("wide") == ConstString(u"w\u00efde \u65e5"), "wide");
    check(message.contains("empty") && message.getString("empty").isEmpty(), "empty");
    const auto* text = FCast(CmString, message.get("text object"));
    check(text && *text == ConstString(u"object"), "text object");

    auto* tree = FCast(FAttributes, message.get("tree"));
    String leaf;
    double first = 0, second = 0;
    if (tree)
        tree->resetQueue("queue");
    check(tree && tree->get("number", integer) && integer == 42 && tree->get("text", leaf) &&
              leaf == ConstString(u"leaf") && tree->unqueueFloat("queue", first) &&
              tree->unqueueFloat("queue", second) && first == 1.5 && second == 2.5,
          "tree");
    const auto* list = FCast(CmLinkedList, message.get("list"));
    check(list && list->total() == 2 && list->at(0) == list->at(1), "list");
    auto* inner = FCast(FMessage, message.get("message"));
    check(inner && inner->isType("inner") && inner->getData("depth") == 2, "message");
    const auto* component = static_cast<WordComponent*>(toFObject(message.getUnknown("component")));
    check(component && component->word == ConstString("spoken"), "component");
    return wrong;
}
