// A message of four attributes, posted and delivered on one thread.

#include "foundation/message/fmessage.h"
#include "foundation/message/fmessenger.h"
#include "foundation/object/iptr.h"

#include <benchmark/benchmark.h>

#include <QtCore/QCoreApplication>
#include <QtCore/QEvent>
#include <QtCore/QObject>
#include <QtCore/QVariantMap>

namespace
{
constexpr int kBatch = 1000;

class Receiver : public CmObject
{
public:
    int notify(FMessage* message) override
    {
        sum += message->getData("value");
        return 1;
    }
    int64 sum = 0;
};

class AttributeEvent : public QEvent
{
public:
    AttributeEvent() : QEvent(QEvent::User) {}
    QVariantMap attributes;
};

class QtReceiver : public QObject
{
public:
    bool event(QEvent* event) override
    {
        sum += static_cast<AttributeEvent*>(event)->attributes["value"].toLongLong();
        return true;
    }
    int64 sum = 0;
};

void postOurs(benchmark::State& state)
{
    FMessenger& messenger = *FMessenger::instance();
    const auto receiver = adopt(new Receiver);
    for (auto _ : state)
    {
        for (int i = 0; i < kBatch; ++i)
        {
            auto* message = new FMessage("upload progress");
            message->addData("value", i);
            message->addData("total", kBatch);
            message->addFloat("part", 0.5);
            message->addString("name", ConstString("evening walk"));
            messenger.postMessage(receiver, message);
        }
        messenger.deliverMessages();
    }
    benchmark::DoNotOptimize(receiver->sum);
    state.SetItemsProcessed(state.iterations() * kBatch);
}

void postQt(benchmark::State& state)
{
    int count = 1;
    char name[] = "bench";
    char* arguments[] = {name, nullptr};
    QCoreApplication application(count, arguments);
    QtReceiver receiver;
    for (auto _ : state)
    {
        for (int i = 0; i < kBatch; ++i)
        {
            auto* event = new AttributeEvent;
            event->attributes = {{"value", i}, {"total", kBatch}, {"part", 0.5}, {"name", "evening walk"}};
            QCoreApplication::postEvent(&receiver, event);
        }
        QCoreApplication::sendPostedEvents();
    }
    benchmark::DoNotOptimize(receiver.sum);
    state.SetItemsProcessed(state.iterations() * kBatch);
}
} // namespace

BENCHMARK(postOurs)->Name("post and deliver/ours");
BENCHMARK(postQt)->Name("post and deliver/Qt postEvent");
