// Messages of four attributes: posted and delivered on one thread, and from two producers to a pulse.
//
// For the two producers the figure is the time from posting to receipt, the median over all messages of two seconds,
// beside that of plain records behind a lock which the same pulse collects. The producers post every 1.1 and 1.3 ms,
// so that their posts fall evenly over the pulse.

#include "foundation/message/fmessage.h"
#include "foundation/message/fmessenger.h"
#include "foundation/object/iptr.h"

#include <benchmark/benchmark.h>

#include <QtCore/QCoreApplication>
#include <QtCore/QEvent>
#include <QtCore/QObject>
#include <QtCore/QVariantMap>
#include <algorithm>
#include <atomic>
#include <chrono>
#include <mutex>
#include <thread>
#include <vector>

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

FMessage* makeMessage(int64 value)
{
    auto* message = new FMessage("upload progress");
    message->addData("value", value);
    message->addData("total", kBatch);
    message->addFloat("part", 0.5);
    message->addString("name", ConstString("evening walk"));
    return message;
}

void postOurs(benchmark::State& state)
{
    FMessenger& messenger = *FMessenger::instance();
    const auto receiver = adopt(new Receiver);
    for (auto _ : state)
    {
        for (int i = 0; i < kBatch; ++i)
            messenger.postMessage(receiver, makeMessage(i));
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

// Two producers

using Clock = std::chrono::steady_clock;

int64 now()
{
    return Clock::now().time_since_epoch().count();
}

/// Takes the time of posting out of each message.
class Stopwatch : public CmObject
{
public:
    int notify(FMessage* message) override
    {
        latencies.push_back(now() - message->getData("value"));
        return 1;
    }
    std::vector<int64> latencies;
};

/// Messages through the messenger.
class OurChannel
{
public:
    void post() { FMessenger::instance()->postMessage(watch, makeMessage(now())); }
    void deliver() { FMessenger::instance()->deliverMessages(); }
    std::vector<int64> takeLatencies() { return std::move(watch->latencies); }

private:
    IPtr<Stopwatch> watch = adopt(new Stopwatch);
};

/// The pulse alone: no message, only the time of posting.
class BareChannel
{
public:
    void post()
    {
        const std::lock_guard<std::mutex> guard(lock);
        posted.push_back(now());
    }
    void deliver()
    {
        std::vector<int64> due;
        {
            const std::lock_guard<std::mutex> guard(lock);
            due.swap(posted);
        }
        for (const int64 time : due)
            latencies.push_back(now() - time);
    }
    std::vector<int64> takeLatencies() { return std::move(latencies); }

private:
    std::mutex lock;
    std::vector<int64> posted;
    std::vector<int64> latencies;
};

template <class Channel>
std::vector<int64> runPulses(Channel& channel)
{
    constexpr int kPulses = 125;
    std::atomic<bool> isRunning = true;
    const auto produce = [&](std::chrono::microseconds step)
    {
        for (auto due = Clock::now(); isRunning; std::this_thread::sleep_until(due += step))
            channel.post();
    };
    std::thread first(produce, std::chrono::microseconds(1100));
    std::thread second(produce, std::chrono::microseconds(1300));
    auto due = Clock::now();
    for (int i = 0; i < kPulses; i++)
    {
        std::this_thread::sleep_until(due += std::chrono::milliseconds(16));
        channel.deliver();
    }
    isRunning = false;
    first.join();
    second.join();
    channel.deliver();
    return channel.takeLatencies();
}

template <class Channel>
void postFromTwo(benchmark::State& state)
{
    Channel channel;
    std::vector<int64> latencies;
    for (auto _ : state)
        latencies = runPulses(channel);
    const auto middle = latencies.begin() + static_cast<ptrdiff_t>(latencies.size() / 2);
    std::nth_element(latencies.begin(), middle, latencies.end());
    state.counters["latency"] = static_cast<double>(*middle) / 1e6;
}
} // namespace

BENCHMARK(postOurs)->Name("post and deliver/ours");
BENCHMARK(postQt)->Name("post and deliver/Qt postEvent");
BENCHMARK(postFromTwo<OurChannel>)->Name("two producers, latency/ours")->Iterations(1);
BENCHMARK(postFromTwo<BareChannel>)->Name("two producers, latency/pulse")->Iterations(1);
