#include "tools/service/standinservice.h"

#include "tools/service/bodyreader.h"

#include <algorithm>
#include <condition_variable>
#include <deque>
#include <map>
#include <mutex>
#include <thread>

#include <netinet/in.h>
#include <sys/socket.h>

#include <httplib.h>

namespace
{

constexpr const char* kXml = "application/xml; charset=utf-8";
constexpr const char* kRefused = "<errors><error>401 - Unauthorized</error></errors>";

std::string escaped(const std::string& text)
{
    std::string result;
    for (const char character : text)
    {
        if (character == '&')
            result += "&amp;";
        else if (character == '<')
            result += "&lt;";
        else
            result.push_back(character);
    }
    return result;
}

void answer(httplib::Response& response, int status, const std::string& body, const char* type = kXml)
{
    response.status = status;
    response.set_content(body, type);
}

void answerInHalves(httplib::Response& response, int status, const std::string& body)
{
    response.status = status;
    response.set_chunked_content_provider(kXml,
                                          [body](std::size_t, httplib::DataSink& sink)
                                          {
                                              const std::size_t half = body.size() / 2;
                                              sink.write(body.data(), half);
                                              // Far enough apart that the two are two reads on the other side.
                                              std::this_thread::sleep_for(std::chrono::milliseconds(50));
                                              sink.write(body.data() + half, body.size() - half);
                                              sink.done();
                                              return true;
                                          });
}

void answerFlood(httplib::Response& response, std::int64_t bytes)
{
    response.status = 200;
    response.set_content_provider(static_cast<std::size_t>(bytes), "application/octet-stream",
                                  [](std::size_t, std::size_t length, httplib::DataSink& sink)
                                  {
                                      const std::string block(std::min<std::size_t>(length, 16384), '\x07');
                                      return sink.write(block.data(), block.size());
                                  });
}

/// What a behaviour answers in place of the service's own reply. False if it has no answer of its own.
bool answerInstead(const Behaviour& behaviour, httplib::Response& response)
{
    std::string errors;
    switch (behaviour.kind)
    {
    case Behaviour::Kind::reply:
        answer(response, 200, behaviour.text);
        return true;
    case Behaviour::Kind::error:
        answer(response, 422, "<error>" + escaped(behaviour.text) + "</error>");
        return true;
    case Behaviour::Kind::errors:
        for (const std::string& text : behaviour.texts())
            errors += "  <error>" + escaped(text) + "</error>\n";
        answer(response, 422, "<errors>\n" + errors + "</errors>");
        return true;
    case Behaviour::Kind::status:
        answer(response, static_cast<int>(behaviour.number), behaviour.text, "text/plain");
        return true;
    case Behaviour::Kind::flood:
        answerFlood(response, behaviour.number);
        return true;
    default:
        return false;
    }
}

/// The socket of the connection from `port` on this machine, or -1. The server library keeps it to itself.
int connectionFrom(int port)
{
    for (int socket = 0; socket < 1024; ++socket)
    {
        sockaddr_in peer{};
        socklen_t size = sizeof peer;
        if (getpeername(socket, reinterpret_cast<sockaddr*>(&peer), &size) == 0 &&
            peer.sin_family == AF_INET && ntohs(peer.sin_port) == port)
            return socket;
    }
    return -1;
}

void cutConnection(int port, bool reset)
{
    const int socket = connectionFrom(port);
    if (reset)
    {
        sockaddr nobody{};
        nobody.sa_family = AF_UNSPEC;
        connect(socket, &nobody, sizeof nobody); // sends a reset
    }
    shutdown(socket, SHUT_RDWR);
}

} // namespace

/// What all connections share: the plans, the record, and who stalls.
class StandInService::State
{
public:
    Options options;

    void plan(const std::string& path, const Behaviour& behaviour)
    {
        const std::lock_guard guard(mutex);
        plans[path].push_back(behaviour);
    }

    /// Notes that a request has come, and tells what to do with it. Returns its number, counted from 1.
    int begin(const httplib::Request& request, Behaviour& behaviour)
    {
        const std::lock_guard guard(mutex);
        std::deque<Behaviour>& planned = plans[request.path];
        if (!planned.empty())
        {
            behaviour = planned.front();
            planned.pop_front();
        }
        ReceivedRequest entry;
        entry.number = static_cast<int>(requests.size()) + 1;
        entry.method = request.method;
        entry.target = request.target;
        entry.behaviour = nameOf(behaviour.kind);
        requests.push_back(std::move(entry));
        changed.notify_all();
        return static_cast<int>(requests.size());
    }

    void finishBody(int number, std::vector<ReceivedField> fields, bool complete)
    {
        const std::lock_guard guard(mutex);
        ReceivedRequest& request = requests[static_cast<std::size_t>(number) - 1];
        request.fields = std::move(fields);
        request.complete = complete;
    }

    void finish(int number, int status)
    {
        const std::lock_guard guard(mutex);
        requests[static_cast<std::size_t>(number) - 1].status = status;
        changed.notify_all();
    }

    std::vector<ReceivedRequest> copy() const
    {
        const std::lock_guard guard(mutex);
        return requests;
    }

    void stall()
    {
        std::unique_lock guard(mutex);
        const int own = releases;
        ++stalledCount;
        changed.notify_all();
        changed.wait(guard, [&] { return releases != own || stopping; });
        --stalledCount;
        changed.notify_all();
    }

    void release(bool forGood = false)
    {
        const std::lock_guard guard(mutex);
        ++releases;
        stopping = stopping || forGood;
        changed.notify_all();
    }

    int stalled() const
    {
        const std::lock_guard guard(mutex);
        return stalledCount;
    }

    bool waitForStalled(int count, std::chrono::milliseconds time) const
    {
        std::unique_lock guard(mutex);
        return changed.wait_for(guard, time, [&] { return stalledCount >= count; });
    }

    bool waitForRequests(const std::string& path, int count, std::chrono::milliseconds time) const
    {
        std::unique_lock guard(mutex);
        return changed.wait_for(guard, time,
                                [&]
                                {
                                    return std::count_if(requests.begin(), requests.end(),
                                                         [&](const ReceivedRequest& each)
                                                         { return each.path() == path; }) >= count;
                                });
    }

private:
    mutable std::mutex mutex;
    mutable std::condition_variable changed;
    std::map<std::string, std::deque<Behaviour>> plans;
    std::vector<ReceivedRequest> requests;
    int stalledCount = 0;
    int releases = 0;
    bool stopping = false;
};

/// The HTTPS server and what it answers. Its handlers run on the server's own threads.
class StandInService::Listener
{
public:
    Listener(State& shared, const ServerIdentity& identity)
        : state(shared),
          server(identity.certificate.get(), identity.key.get())
    {
        server.set_read_timeout(600);
        server.set_write_timeout(600);
        serve("/me", &Listener::answerMe);
        serve("/connect", &Listener::answerConnect);
        serve(R"(/stand-in/track-\d+/edit)", &Listener::answerEditPage);
        serve(R"(/.*)", &Listener::answerUnknown);
        server.Post("/tracks",
                    [this](const httplib::Request& request, httplib::Response& response,
                           const httplib::ContentReader& reader) { takeTrack(request, response, reader); });
    }

    ~Listener() { stop(); }

    bool start()
    {
        const int wanted = state.options.port;
        port = wanted ? wanted : server.bind_to_any_port("127.0.0.1");
        if (port <= 0 || (wanted && !server.bind_to_port("127.0.0.1", wanted)))
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
        state.release(true);
        server.stop();
        thread.join();
    }

    std::string host() const { return "127.0.0.1:" + std::to_string(port); }

private:
    using Answer = void (Listener::*)(const httplib::Request&, httplib::Response&, const Behaviour&);

    /// Serves a page that is got, with the behaviours that need no body.
    void serve(const char* pattern, Answer answerPage)
    {
        server.Get(pattern,
                   [this, answerPage](const httplib::Request& request, httplib::Response& response)
                   {
                       Behaviour behaviour;
                       const int number = state.begin(request, behaviour);
                       state.finishBody(number, {}, true);
                       if (!survives(behaviour, request))
                           return;
                       if (!answerInstead(behaviour, response))
                           (this->*answerPage)(request, response, behaviour);
                       state.finish(number, response.status);
                   });
    }

    /// Lets a request without body meet its behaviour; false if the connection is gone.
    bool survives(const Behaviour& behaviour, const httplib::Request& request)
    {
        if (behaviour.kind == Behaviour::Kind::stall)
            state.stall();
        if (behaviour.kind == Behaviour::Kind::slow)
            std::this_thread::sleep_for(std::chrono::milliseconds(behaviour.number));
        const bool reset = behaviour.kind == Behaviour::Kind::reset;
        if (!reset && behaviour.kind != Behaviour::Kind::close)
            return true;
        cutConnection(request.remote_port, reset);
        return false;
    }

    void answerMe(const httplib::Request& request, httplib::Response& response, const Behaviour& behaviour)
    {
        if (request.get_param_value("oauth_token") != state.options.token)
            return answer(response, 401, kRefused);
        const std::string body =
            "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<user>\n  <id type=\"integer\">1</id>\n"
            "  <username>Stand-in user</username>\n</user>\n";
        answerGood(response, behaviour, 200, body);
    }

    /// The page where the user logs in; this user says yes at once, unless planned otherwise.
    void answerConnect(const httplib::Request& request, httplib::Response& response,
                       const Behaviour& behaviour)
    {
        const std::string target = request.get_param_value("redirect_uri");
        if (request.get_param_value("response_type") != "code_and_token" ||
            request.get_param_value("client_id").size() != 32 || target.compare(0, 7, "vlmr://") != 0)
            return answer(response, 400, "This is no login of a known product.\n", "text/plain");

        if (behaviour.kind == Behaviour::Kind::deny)
            return response.set_redirect(
                target + "?error=access_denied&error_description=The+end-user+denied+the+request");
        response.set_redirect(target + "?code=9f1c4d#access_token=" + state.options.token +
                              "&scope=non-expiring");
    }

    void answerEditPage(const httplib::Request&, httplib::Response& response, const Behaviour&)
    {
        answer(response, 200, "<html><body>Edit this track.</body></html>\n", "text/html");
    }

    void answerUnknown(const httplib::Request&, httplib::Response& response, const Behaviour&)
    {
        answer(response, 404, "<errors><error>404 - Not Found</error></errors>");
    }

    void takeTrack(const httplib::Request& request, httplib::Response& response,
                   const httplib::ContentReader& reader)
    {
        Behaviour behaviour;
        const int number = state.begin(request, behaviour);
        if (!request.is_multipart_form_data())
            return answer(response, 400, "<errors><error>400 - No form</error></errors>");

        BodyReader body(
            behaviour, [this] { state.stall(); },
            [&request](bool reset) { cutConnection(request.remote_port, reset); });
        const bool complete = body.read(reader);
        std::vector<ReceivedField> fields = body.takeFields();
        const bool known = hasToken(fields);
        state.finishBody(number, std::move(fields), complete);
        if (!complete)
            return;
        if (!known)
            answer(response, 401, kRefused);
        else if (!answerInstead(behaviour, response))
            answerGood(response, behaviour, 201, trackDocument(number));
        state.finish(number, response.status);
    }

    bool hasToken(const std::vector<ReceivedField>& fields) const
    {
        return std::any_of(fields.begin(), fields.end(),
                           [this](const ReceivedField& field)
                           { return field.name == "oauth_token" && field.text == state.options.token; });
    }

    std::string trackDocument(int number) const
    {
        const std::string id = std::to_string(number);
        return "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<track>\n  <id type=\"integer\">" + id +
               "</id>\n  <state>processing</state>\n  <permalink-url>https://" + host() + "/stand-in/track-" +
               id + "</permalink-url>\n</track>\n";
    }

    static void answerGood(httplib::Response& response, const Behaviour& behaviour, int status,
                           const std::string& body)
    {
        if (behaviour.kind == Behaviour::Kind::split)
            answerInHalves(response, status, body);
        else
            answer(response, status, body);
    }

    State& state;
    httplib::SSLServer server;
    std::thread thread;
    int port = 0;
};

StandInService::StandInService(const CertificateAuthority& authority, Options options)
    : state(std::make_unique<State>())
{
    const Identity identity = options.identity;
    state->options = std::move(options);
    switch (identity)
    {
    case Identity::honest:
        listener = std::make_unique<Listener>(*state, authority.issue());
        break;
    case Identity::otherHost:
        listener = std::make_unique<Listener>(*state, authority.issueForOtherHost());
        break;
    case Identity::expired:
        listener = std::make_unique<Listener>(*state, authority.issueExpired());
        break;
    case Identity::otherAuthority:
        listener = std::make_unique<Listener>(*state, CertificateAuthority("Authority of nobody").issue());
        break;
    }
}

StandInService::~StandInService() = default;

bool StandInService::start()
{
    return listener->start();
}

void StandInService::stop()
{
    listener->stop();
}

std::string StandInService::host() const
{
    return listener->host();
}

const std::string& StandInService::token() const
{
    return state->options.token;
}

void StandInService::plan(const std::string& path, const Behaviour& behaviour)
{
    state->plan(path, behaviour);
}

bool StandInService::plan(const std::string& line)
{
    const std::size_t blank = line.find(' ');
    if (line.empty() || line[0] != '/' || blank == std::string::npos)
        return false;
    const std::optional<Behaviour> behaviour = Behaviour::parse(line.substr(blank + 1));
    if (behaviour)
        plan(line.substr(0, blank), *behaviour);
    return behaviour.has_value();
}

void StandInService::release()
{
    state->release();
}

std::vector<ReceivedRequest> StandInService::received() const
{
    return state->copy();
}

bool StandInService::waitForStalled(int count, std::chrono::milliseconds time) const
{
    return state->waitForStalled(count, time);
}

bool StandInService::waitForRequests(const std::string& path, int count, std::chrono::milliseconds time) const
{
    return state->waitForRequests(path, count, time);
}

int StandInService::stalled() const
{
    return state->stalled();
}
