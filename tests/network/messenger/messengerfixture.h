#pragma once

#include "foundation/message/fmessenger.h"
#include "foundation/object/iptr.h"
#include "network/messenger/imicrosecondstimer.h"
#include "network/messenger/nmessage.h"
#include "network/messenger/nmessenger.h"

#include <gtest/gtest.h>

#include <string>
#include <thread>
#include <vector>

/// Puts this process into a network of its own, in which there is only the loopback interface, so that what the
/// tests say to everyone reaches nobody. False where that isn't permitted.
bool isInPrivateNetwork();

/// Keeps what it is notified of.
class Inbox : public CmObject
{
    DECLARE_TYPE(Inbox, CmObject)

    ~Inbox() override { gMessenger->killMessages(this, nullptr); }

    int notify(FMessage* message) override
    {
        received.push_back(message);
        return 1;
    }
    std::vector<std::string> types() const
    {
        std::vector<std::string> result;
        for (const auto& message : received)
            result.push_back(message->getMessageID());
        return result;
    }

    std::vector<IPtr<FMessage>> received;
};

/// Counts on by one at each question.
class CountingTimer : public IMicrosecondsTimer
{
public:
    int64 getMicroseconds() override { return ++count; }

private:
    std::atomic<int64> count{1000};
};

class MessengerTest : public testing::Test
{
protected:
    MessengerTest()
    {
        isolated = isInPrivateNetwork();
        gMessenger = FMessenger::instance();
        gMessenger->registerName("inbox", &inbox);
    }
    ~MessengerTest() override { gMessenger->unregisterName("inbox"); }

    void SetUp() override
    {
        if (!isolated)
            GTEST_SKIP()
                << "needs a network namespace of its own, which this system doesn't permit: run it as root";
    }

    /// Delivers messages until `condition()`.
    template <class Condition>
    static void deliverUntil(Condition condition)
    {
        while (!condition())
        {
            gMessenger->deliverMessages();
            std::this_thread::sleep_for(std::chrono::milliseconds(1));
        }
    }

    bool isolated;
    Inbox inbox;
};
