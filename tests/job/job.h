#pragma once

#include "tests/job/process.h"
#include "tools/samples/description.h"
#include "tools/service/standinservice.h"

#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include <gtest/gtest.h>

/// A test of the finished program: a private home, a session bus, the stand-in service, a stand-in browser, and a
/// bundle of the program that trusts the service.
///
/// At its end each test checks that no token stands in anything that was printed.
class Job : public testing::Test
{
protected:
    using Path = std::filesystem::path;
    using Arguments = std::vector<std::string>;

    /// One start of the program and how it went.
    struct Run
    {
        std::unique_ptr<Process> process;

        /// Waits for its end and expects that it is a good one: exit code 0. Gives all that it printed.
        std::string finish();
    };

    Job();
    ~Job() override;
    void TearDown() override;

    // The service
    /// Replaces the service by one with these options.
    void useService(StandInService::Options options);
    /// The requests for this path, oldest first.
    std::vector<ReceivedRequest> received(const std::string& path) const;
    /// Points the program at a host that answers nothing.
    void useHost(const std::string& host);
    int servicePort() const { return std::stoi(service->host().substr(service->host().find(':') + 1)); }
    const std::string& token() const { return service->token(); }

    // The user's files
    /// A file with `bytes` in the folder of exports. Gives its path.
    std::string writeFile(const std::string& name, const std::string& bytes);
    std::string writeDescription(const SampleDescription& description,
                                 const std::string& name = "description.xml");
    /// The path of an attribute file in the user folder, by its name without extension.
    std::string userFile(const std::string& name) const;
    void writeUserFile(const std::string& name, const std::string& bytes);
    /// Lets the product have a token already; by default the one that the service accepts.
    void logIn(const std::string& product = "Loomrit");
    void logIn(const std::string& product, const std::string& clearToken);

    /// A track of a tone with only the element that it needs, for a product that is logged in.
    SampleDescription minimal(const std::string& product = "Loomrit");
    std::string tone() { return exports / "tone.wav"; }

    // The program
    Run start(const Arguments& arguments);
    /// A start to its end. Gives all that it printed.
    std::string run(const Arguments& arguments) { return start(arguments).finish(); }
    /// A start to its end that can make files but not write a single byte to them. Gives all that it printed.
    std::string runWithoutDisk(const Arguments& arguments);
    /// A start to its end that nobody listens to.
    void runUnheard(const Arguments& arguments);
    /// Sets a variable of the environment of all further starts; replaces its former value.
    void setVariable(const std::string& name, const std::string& value)
    {
        variables.emplace_back(name, value);
    }
    /// The answers to the questions of all further starts, such as "1,2".
    void setAnswers(const std::string& answers) { setVariable("VELLAMOOR_ANSWERS", answers); }
    /// What stands before the program in the command of all further starts by `start`, such as a launcher.
    Arguments launcher;

    // The browser
    /// The lines that the browser wrote, in their order.
    std::vector<std::string> browserLines() const;
    /// The URLs that the browser was given.
    std::vector<std::string> openedUrls() const;
    /// Waits for a line of the browser that begins so.
    bool waitForBrowser(const std::string& beginning) const;
    std::string connectUrl(const std::string& clientId, const std::string& word) const;

    /// The bytes of an attribute file with text values, as the program writes it.
    static std::string attributeFile(const std::string& rootTag,
                                     const std::vector<std::pair<std::string, std::string>>& values,
                                     bool wide = false);
    static std::string base64(const std::string& bytes);
    static bool exists(const std::string& path) { return std::filesystem::exists(path); }

    Path root;
    Path exports;
    Path configHome;
    Path userFolder;
    Path bundle;
    std::unique_ptr<StandInService> service;
    std::vector<std::pair<std::string, std::string>> variables;

private:
    Run startWith(Arguments command);
    std::string program() const { return bundle / "Contents" / "Linux" / "vellamoor-upload-manager"; }
    void startBus();
    void stageBundle();
    std::vector<std::string> environment() const;
    void expectNoToken(const Path& file) const;

    std::unique_ptr<Process> bus;
    int busInput = -1;
    int starts = 0;
};

/// What stands on the wire as a text field.
struct Text
{
    std::string name;
    std::string text;
};

/// Expects that the request came whole and has exactly these fields in this order; a file's text is its name.
void expectFields(const ReceivedRequest& request, const std::vector<Text>& fields);

/// Expects that `text` holds `part`, and says both if not.
#define EXPECT_HOLDS(text, part) EXPECT_PRED2(holds, text, part)
#define EXPECT_LACKS(text, part) EXPECT_PRED2(lacks, text, part)

/// 64 lower-case hexadecimal digits.
std::string sha256Of(const std::string& path);

bool holds(const std::string& text, const std::string& part);
bool lacks(const std::string& text, const std::string& part);
