#include "network/http/furltlsstream.h"

#include "storage/path/istandardfolders.h"

namespace
{
// In the folder of the application.
constexpr const char16* kCertificates = u"/Resources/cacert.pem";

FString certificateFile()
{
    IStandardFolders* folders = IStandardFolders::instance();
    FString path(folders ? folders->getAppPath() : u"");
    if (!path.isEmpty())
        path.append(kCertificates);
    return path;
}
} // namespace

FUrlTlsStream::~FUrlTlsStream()
{
    FUrlTlsStream::close();
}

bool FUrlTlsStream::encrypt(const FString& host)
{
    resetReading();
    session = TlsSession::start(*this, host, certificateFile());
    return session != nullptr;
}

bool FUrlTlsStream::close()
{
    if (session)
    {
        // The goodbye must not wait for a server that reads nothing: no cancel reaches a stream that is being closed.
        socket->setNonBlockingMode(true);
        session->end();
        socket->setNonBlockingMode(false);
    }
    session.reset();
    return FUrlStream::close();
}

int FUrlTlsStream::receiveSome(char* data, int size)
{
    return session ? session->read(data, size) : FUrlStream::receiveSome(data, size);
}

int FUrlTlsStream::sendSome(const char* data, int size)
{
    return session ? session->write(data, size) : FUrlStream::sendSome(data, size);
}

int FUrlTlsStream::receive(char* data, int size)
{
    return FUrlStream::receiveSome(data, size);
}

int FUrlTlsStream::send(const char* data, int size)
{
    return FUrlStream::sendSome(data, size);
}
