#include "tools/service/controlserver.h"

#include "tools/service/standinservice.h"

#include <thread>

#include <httplib.h>

namespace
{

std::string receivedText(const StandInService& service)
{
    std::string text;
    for (const ReceivedRequest& request : service.received())
        text += toText(request);
    return text;
}

/// Plans every line of `text`; returns the first that is no plan, or nothing.
std::string planLines(StandInService& service, const std::string& text)
{
    std::size_t at = 0;
    while (at < text.size())
    {
        const std::size_t end = std::min(text.find('\n', at), text.size());
        const std::string line = text.substr(at, end - at);
        if (!line.empty() && !service.plan(line))
            return line;
        at = end + 1;
    }
    return "";
}

} // namespace

class ControlServer::Listener
{
public:
    explicit Listener(StandInService& service)
    {
        using httplib::Request, httplib::Response;
        server.Get("/received", [&service](const Request&, Response& response)
                   { response.set_content(receivedText(service), "text/plain; charset=utf-8"); });
        server.Get("/stalled", [&service](const Request&, Response& response)
                   { response.set_content(std::to_string(service.stalled()) + "\n", "text/plain"); });
        server.Post("/plan",
                    [&service](const Request& request, Response& response)
                    {
                        const std::string wrong = planLines(service, request.body);
                        response.status = wrong.empty() ? 200 : 400;
                        response.set_content(wrong.empty() ? "planned\n" : "no plan: " + wrong + "\n",
                                             "text/plain");
                    });
        server.Post("/release",
                    [&service](const Request&, Response& response)
                    {
                        service.release();
                        response.set_content("released\n", "text/plain");
                    });
    }

    bool start()
    {
        port = server.bind_to_any_port("127.0.0.1");
        if (port <= 0)
            return false;
        thread = std::thread([this] { server.listen_after_bind(); });
        while (!server.is_running())
            std::this_thread::sleep_for(std::chrono::milliseconds(1));
        return true;
    }

    void stop()
    {
        if (!thread.joinable())
            return;
        server.stop();
        thread.join();
    }

    int port = 0;

private:
    httplib::Server server;
    std::thread thread;
};

ControlServer::ControlServer(StandInService& service) : listener(std::make_unique<Listener>(service)) {}

ControlServer::~ControlServer()
{
    stop();
}

bool ControlServer::start()
{
    return listener->start();
}

void ControlServer::stop()
{
    listener->stop();
}

std::string ControlServer::address() const
{
    return "http://127.0.0.1:" + std::to_string(listener->port);
}
