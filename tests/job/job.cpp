#include "tests/job/job.h"

#include "tools/browser/browserhome.h"
#include "tools/samples/tone.h"

#include <cstdlib>
#include <fstream>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <openssl/evp.h>

namespace fs = std::filesystem;

namespace
{

const CertificateAuthority& authority()
{
    static const CertificateAuthority instance;
    return instance;
}

fs::path makeRoot()
{
    std::string path = fs::temp_directory_path() / "job-XXXXXX";
    if (!mkdtemp(path.data()))
        throw fs::filesystem_error("no temporary folder", path,
                                   std::error_code(errno, std::generic_category()));
    return fs::canonical(path);
}

void writeTo(const fs::path& path, const std::string& bytes)
{
    std::ofstream file(path, std::ios::binary);
    file << bytes;
    ASSERT_TRUE(file.flush().good()) << path;
}

/// A link where the folders share a file system, else a copy: the program finds its bundle by its own path.
void linkOrCopy(const fs::path& from, const fs::path& to)
{
    std::error_code error;
    fs::create_hard_link(from, to, error);
    if (error)
        fs::copy_file(from, to);
}

/// What sanitizers are told from outside goes on to the program.
constexpr const char* kPassedOn[] = {"PATH", "ASAN_OPTIONS", "UBSAN_OPTIONS", "LSAN_OPTIONS", "TSAN_OPTIONS"};

} // namespace

bool holds(const std::string& text, const std::string& part)
{
    return text.find(part) != std::string::npos;
}

bool lacks(const std::string& text, const std::string& part)
{
    return !holds(text, part);
}

std::string sha256Of(const std::string& path)
{
    const std::string bytes = contentsOf(path);
    unsigned char digest[EVP_MAX_MD_SIZE];
    unsigned size = 0;
    EVP_Digest(bytes.data(), bytes.size(), digest, &size, EVP_sha256(), nullptr);
    std::string result;
    for (unsigned i = 0; i < size; ++i)
    {
        char digits[3];
        std::snprintf(digits, sizeof digits, "%02x", digest[i]);
        result += digits;
    }
    return result;
}

void expectFields(const ReceivedRequest& request, const std::vector<Text>& fields)
{
    EXPECT_TRUE(request.complete);
    std::vector<std::string> expected, actual;
    for (const Text& field : fields)
        expected.push_back(field.name + " = [" + field.text + "]");
    for (const ReceivedField& field : request.fields)
        actual.push_back(field.name + " = [" + (field.isFile ? field.fileName : field.text) + "]");
    EXPECT_EQ(actual, expected);
}

std::string Job::Run::finish()
{
    const std::optional<int> code = process->wait(kHangs);
    EXPECT_TRUE(code.has_value()) << "the program hangs";
    EXPECT_EQ(code.value_or(-1), 0);
    return process->output();
}

Job::Job() : root(makeRoot())
{
    exports = root / "exports";
    configHome = root / "config";
    userFolder = configHome / "Vellamoor Upload Manager";
    for (const char* name : {"exports", "config", "data", "none", "temporary", "runtime", "output"})
        fs::create_directory(root / name);
    fs::permissions(root / "runtime", fs::perms::owner_all);

    writeTone(tone(), 0.2);
    stageBundle();
    useService({});
    EXPECT_TRUE(registerBrowser(JOB_BROWSER, root / "data", configHome));
    startBus();
}

Job::~Job()
{
    service.reset();
    close(busInput); // the bus ends with its last reader
    if (bus)
        bus->wait(kHangs);
    std::error_code error;
    fs::remove_all(root, error);
}

void Job::TearDown()
{
    for (const fs::directory_entry& file : fs::directory_iterator(root / "output"))
        expectNoToken(file.path());
}

void Job::expectNoToken(const Path& file) const
{
    const std::string text = contentsOf(file);
    EXPECT_LACKS(text, token());
    EXPECT_LACKS(text, base64(token()));
}

/// A bus that lives as long as this process holds the other end of its standard input.
void Job::startBus()
{
    const Path input = root / "runtime" / "bus-input", addressFile = root / "runtime" / "bus-address";
    ASSERT_EQ(mkfifo(input.c_str(), 0600), 0);
    busInput = open(input.c_str(), O_RDWR | O_CLOEXEC);
    const std::string script = "printf '%s\\n' \"$DBUS_SESSION_BUS_ADDRESS\" >" + addressFile.string() +
                               "; exec cat <" + input.string();
    Process::Setup setup;
    setup.arguments = {"dbus-run-session", "--", "sh", "-c", script};
    setup.environment = environment();
    setup.output = root / "runtime" / "bus-output"; // the bus complains here of limits that it may not raise
    bus = std::make_unique<Process>(setup);
    std::string address;
    ASSERT_TRUE(waitUntil(
        [&]
        {
            address = contentsOf(addressFile);
            return address.ends_with('\n') || !bus->isRunning();
        }));
    ASSERT_TRUE(address.ends_with('\n')) << bus->output();
    address.pop_back();
    setVariable("DBUS_SESSION_BUS_ADDRESS", address);
}

void Job::stageBundle()
{
    bundle = root / "bundle";
    const Path contents = bundle / "Contents";
    fs::create_directories(contents / "Linux");
    fs::create_directories(contents / "Resources");
    linkOrCopy(JOB_PROGRAM, contents / "Linux" / "vellamoor-upload-manager");
    for (const fs::directory_entry& resource : fs::directory_iterator(JOB_RESOURCES))
        linkOrCopy(resource.path(), contents / resource.path().filename());
    writeTo(contents / "Resources" / "cacert.pem", authority().pem());
    writeTo(root / "authority.pem", authority().pem());
}

void Job::useService(StandInService::Options options)
{
    service = std::make_unique<StandInService>(authority(), std::move(options));
    ASSERT_TRUE(service->start());
    useHost(service->host());
}

void Job::useHost(const std::string& host)
{
    writeTo(bundle / "Contents" / "service.xml",
            attributeFile("service", {{"API Host", host}, {"Web Host", host}}));
}

std::vector<ReceivedRequest> Job::received(const std::string& path) const
{
    std::vector<ReceivedRequest> result;
    for (ReceivedRequest& request : service->received())
    {
        if (request.path() == path)
            result.push_back(std::move(request));
    }
    return result;
}

std::string Job::writeFile(const std::string& name, const std::string& bytes)
{
    writeTo(exports / name, bytes);
    return exports / name;
}

std::string Job::writeDescription(const SampleDescription& description, const std::string& name)
{
    return writeFile(name, description.text());
}

std::string Job::userFile(const std::string& name) const
{
    return userFolder / (name + ".xml");
}

void Job::writeUserFile(const std::string& name, const std::string& bytes)
{
    fs::create_directories(userFolder);
    writeTo(userFile(name), bytes);
}

void Job::logIn(const std::string& product)
{
    logIn(product, token());
}

void Job::logIn(const std::string& product, const std::string& clearToken)
{
    writeUserFile("scat", attributeFile("scat", {{product, base64(clearToken)}}));
}

SampleDescription Job::minimal(const std::string& product)
{
    SampleDescription description(product);
    description.track({{"Path", tone()}});
    return description;
}

Job::Run Job::start(const Arguments& arguments)
{
    Arguments command = launcher;
    command.push_back(program());
    command.insert(command.end(), arguments.begin(), arguments.end());
    return startWith(std::move(command));
}

std::string Job::runWithoutDisk(const Arguments& arguments)
{
    // What it prints goes through a pipe, for which the limit does not count.
    Arguments command = {"bash", "-c",
                         "set -o pipefail; (trap '' XFSZ; ulimit -f 0; exec \"$0\" \"$@\") 2>&1 | cat",
                         program()};
    command.insert(command.end(), arguments.begin(), arguments.end());
    return startWith(std::move(command)).finish();
}

void Job::runUnheard(const Arguments& arguments)
{
    // The pipe's reader is gone before the program begins.
    Arguments command = {"bash", "-c", "exec 4> >(exec true); wait $!; exec \"$0\" \"$@\" >&4 2>&4",
                         program()};
    command.insert(command.end(), arguments.begin(), arguments.end());
    startWith(std::move(command)).finish();
}

Job::Run Job::startWith(Arguments command)
{
    Process::Setup setup;
    setup.arguments = std::move(command);
    setup.environment = environment();
    setup.folder = exports;
    setup.output = root / "output" / std::to_string(++starts);
    return {std::make_unique<Process>(setup)};
}

std::vector<std::string> Job::environment() const
{
    std::vector<std::string> result = {
        "HOME=" + root.string(),
        "XDG_CONFIG_HOME=" + configHome.string(),
        "XDG_DATA_HOME=" + (root / "data").string(),
        "XDG_DATA_DIRS=" + (root / "none").string(),
        "XDG_CONFIG_DIRS=" + (root / "none").string(),
        "XDG_RUNTIME_DIR=" + (root / "runtime").string(),
        "TMPDIR=" + (root / "temporary").string(),
        "VELLAMOOR_UI=console",
        "STANDIN_BROWSER_LOG=" + (root / "browser").string(),
        "STANDIN_BROWSER_TRUST=" + (root / "authority.pem").string(),
        "STANDIN_BROWSER_PROGRAM=" + program(),
    };
    for (const char* name : kPassedOn)
    {
        if (const char* value = std::getenv(name))
            result.push_back(std::string(name) + "=" + value);
    }
    result.push_back("LANG=en_US.UTF-8");
    // What is set later counts: of two values of a variable a program takes the first.
    for (const auto& [name, value] : variables)
    {
        const std::string beginning = name + "=";
        std::erase_if(result, [&](const std::string& entry) { return entry.starts_with(beginning); });
        result.push_back(beginning + value);
    }
    return result;
}

std::vector<std::string> Job::browserLines() const
{
    std::vector<std::string> result;
    std::ifstream file(root / "browser");
    for (std::string line; std::getline(file, line);)
        result.push_back(line);
    return result;
}

std::vector<std::string> Job::openedUrls() const
{
    std::vector<std::string> result;
    for (const std::string& line : browserLines())
    {
        if (line.starts_with("open "))
            result.push_back(line.substr(5));
    }
    return result;
}

bool Job::waitForBrowser(const std::string& beginning) const
{
    return waitUntil(
        [&]
        {
            for (const std::string& line : browserLines())
            {
                if (line.starts_with(beginning))
                    return true;
            }
            return false;
        });
}

std::string Job::connectUrl(const std::string& clientId, const std::string& word) const
{
    return "https://" + service->host() + "/connect?response_type=code_and_token&client_id=" + clientId +
           "&redirect_uri=vlmr://" + word + "/successfullLogin";
}

std::string Job::attributeFile(const std::string& rootTag,
                               const std::vector<std::pair<std::string, std::string>>& values, bool wide)
{
    std::string text = "<?xml version=\"1.0\" encoding=\"utf-8\"?>\r<" + rootTag + ">\r";
    for (const auto& [name, value] : values)
        text +=
            "   <string name=\"" + name + "\" value=\"" + value + (wide ? "\" wide=\"true\"/>\r" : "\"/>\r");
    return text + "</" + rootTag + ">\r";
}

std::string Job::base64(const std::string& bytes)
{
    std::string result(4 * ((bytes.size() + 2) / 3) + 1, '\0');
    const int size =
        EVP_EncodeBlock(reinterpret_cast<unsigned char*>(result.data()),
                        reinterpret_cast<const unsigned char*>(bytes.data()), static_cast<int>(bytes.size()));
    result.resize(static_cast<std::size_t>(size));
    return result;
}
