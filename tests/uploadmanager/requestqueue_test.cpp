#include "tests/uploadmanager/applicationfixture.h"

#include "foundation/object/iptr.h"

namespace
{
class RequestQueue : public ApplicationTest
{
protected:
    UploadRequest* add()
    {
        IPtr<UploadRequest> request = adopt(new UploadRequest);
        app->addRequest(request);
        return request;
    }
    int waiting() { return ApplicationProbe::waiting(*app); }
    int finished() { return ApplicationProbe::finished(*app); }
    int failed() { return ApplicationProbe::failed(*app); }
};
} // namespace

TEST_F(RequestQueue, HandsRequestsOutInOrderAndKeepsWhatIsDone)
{
    UploadRequest* first = add();
    UploadRequest* second = add();
    EXPECT_EQ(app->getNextRequest(), first);
    EXPECT_EQ(app->getNextRequest(), second);
    EXPECT_EQ(finished(), 1);
    EXPECT_EQ(app->getNextRequest(), nullptr);
    EXPECT_EQ(finished(), 2);
    EXPECT_EQ(first->getRefCount(), 1u) << "only the queue holds it";
}

TEST_F(RequestQueue, CountsAFailedRequestOnceAndNotAsFinished)
{
    UploadRequest* first = add();
    app->getNextRequest();
    app->requestFailed(first);
    app->requestFailed(first);
    EXPECT_EQ(failed(), 1);
    EXPECT_EQ(app->getNextRequest(), nullptr);
    EXPECT_EQ(finished(), 0);

    UploadRequest* waitingOne = add();
    app->requestFailed(waitingOne);
    EXPECT_EQ(waiting(), 0);
    EXPECT_EQ(failed(), 2);
    app->requestFailed(nullptr);
    EXPECT_EQ(ApplicationProbe::fatalError(*app), "");
}

TEST_F(RequestQueue, PutsTheInterruptedRequestBackAtTheEndWhenCancelled)
{
    UploadRequest* first = add();
    add();
    app->getNextRequest();
    ApplicationProbe::cancel(*app);
    EXPECT_EQ(app->getNextRequest(), nullptr);
    EXPECT_EQ(waiting(), 2);
    EXPECT_EQ(finished(), 0);
    EXPECT_EQ(first->getRefCount(), 1u);
}

TEST_F(RequestQueue, KeepsTheFirstFatalErrorOnly)
{
    EXPECT_FALSE(app->fatalError(7));
    EXPECT_TRUE(app->fatalError(u"later"));
    EXPECT_EQ(ApplicationProbe::fatalError(*app), "Internal program error.\nError Code: 7");
    app->addUploadError(nullptr);
    app->addGeneralError(nullptr);
    EXPECT_TRUE(ApplicationProbe::uploadErrors(*app).empty());
    EXPECT_TRUE(ApplicationProbe::generalErrors(*app).empty());
}
