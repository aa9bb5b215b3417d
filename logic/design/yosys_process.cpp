#include "yosys_process.h"

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <ctime>
#include <vector>

#include <fcntl.h>
#include <spawn.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include "read_fault.h"
#include "text.h"
#include "watch.h"

extern char** environ;

namespace booleq {

namespace {

constexpr char kNotThere[] =
    "Verilog is read by the program yosys, which is not installed; install it "
    "(Debian: apt-get install yosys), or write the netlist as JSON, BLIF or EDIF";
constexpr char kScript[] = "read_verilog design.v; write_json design.json";

// A folder of our own, removed with the files that may be in it.
class WorkFolder {
  public:
    WorkFolder()
    {
        const char* place = std::getenv("TMPDIR");
        m_path = std::string(place != nullptr && *place != 0 ? place : "/tmp") + "/booleq.XXXXXX";
        if (mkdtemp(m_path.data()) == nullptr)
            throw ReadFault{"cannot make a folder for yosys: " + m_path + ": " +
                            std::strerror(errno)};
    }
    ~WorkFolder()
    {
        for (const char* file : {"design.v", "design.json", "messages"})
            unlink(File(file).c_str());
        rmdir(m_path.c_str());
    }
    WorkFolder(const WorkFolder&) = delete;
    WorkFolder& operator=(const WorkFolder&) = delete;

    const std::string& Path() const { return m_path; }
    std::string File(const char* name) const { return m_path + "/" + name; }

  private:
    std::string m_path;
};

void WriteFile(const std::string& file, std::string_view text)
{
    std::FILE* stream = std::fopen(file.c_str(), "wb");
    bool isWritten = stream != nullptr;
    if (isWritten && !text.empty())
        isWritten = std::fwrite(text.data(), 1, text.size(), stream) == text.size();
    if (stream != nullptr && std::fclose(stream) != 0)
        isWritten = false;
    if (!isWritten)
        throw ReadFault{"cannot write " + file + ": " + std::strerror(errno)};
}

// A running program with all that it starts; it does not outlive this.
class Child {
  public:
    explicit Child(const std::string& folder)
    {
        posix_spawn_file_actions_t actions;
        posix_spawnattr_t attributes;
        posix_spawn_file_actions_init(&actions);
        posix_spawnattr_init(&attributes);
        posix_spawn_file_actions_addchdir_np(&actions, folder.c_str());
        posix_spawn_file_actions_addopen(&actions, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
        posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, "messages",
                                         O_WRONLY | O_CREAT | O_TRUNC, 0600);
        posix_spawn_file_actions_adddup2(&actions, STDOUT_FILENO, STDERR_FILENO);
        // A group of its own, so that all of it can be ended.
        posix_spawnattr_setflags(&attributes, POSIX_SPAWN_SETPGROUP);
        posix_spawnattr_setpgroup(&attributes, 0);
        std::vector<std::string> words = {"yosys", "-q", "-p", kScript};
        std::vector<char*> arguments;
        for (std::string& word : words)
            arguments.push_back(word.data());
        arguments.push_back(nullptr);
        const int error =
            posix_spawnp(&m_process, "yosys", &actions, &attributes, arguments.data(), environ);
        posix_spawnattr_destroy(&attributes);
        posix_spawn_file_actions_destroy(&actions);
        if (error == ENOENT)
            throw ReadFault{kNotThere};
        if (error != 0)
            throw ReadFault{std::string("cannot start yosys: ") + std::strerror(error)};
    }
    ~Child()
    {
        if (m_has_ended)
            return;
        kill(-m_process, SIGKILL);
        while (waitpid(m_process, nullptr, 0) < 0 && errno == EINTR) {
        }
    }
    Child(const Child&) = delete;
    Child& operator=(const Child&) = delete;

    bool HasEnded(int& status)
    {
        m_has_ended = waitpid(m_process, &status, WNOHANG) == m_process;
        return m_has_ended;
    }

  private:
    pid_t m_process = 0;
    bool m_has_ended = false;
};

// 0 for a file that is not there.
uint64_t SizeOf(const std::string& file)
{
    struct stat status;
    return stat(file.c_str(), &status) == 0 ? static_cast<uint64_t>(status.st_size) : 0;
}

// Why yosys refused the text: its line "design.v:3: ERROR: ..." without our name for the file.
std::string ErrorIn(const std::string& file)
{
    SourceText messages;
    messages.ReadFile(file);
    const std::string_view text = messages.Text();
    size_t start = 0;
    while (start < text.size()) {
        const size_t end = std::min(text.find('\n', start), text.size());
        const std::string_view line = text.substr(start, end - start);
        start = end + 1;
        const size_t sign = line.find("ERROR: ");
        if (sign == std::string_view::npos)
            continue;
        std::string reason(line.substr(sign + 7));
        if (line.substr(0, 9) == "design.v:" && sign > 11)
            reason = "line " + std::string(line.substr(9, sign - 11)) + ": " + reason;
        return reason;
    }
    return "it gave no reason";
}

void Await(Child& child, double seconds, const WorkFolder& folder)
{
    const auto start = std::chrono::steady_clock::now();
    int status = 0;
    while (!child.HasEnded(status)) {
        Watch();
        const std::chrono::duration<double> passed = std::chrono::steady_clock::now() - start;
        if (passed.count() > seconds)
            throw ReadFault{"yosys did not read the Verilog text within " +
                            Count(static_cast<uint64_t>(seconds), "second")};
        for (const char* file : {"design.json", "messages"})
            if (SizeOf(folder.File(file)) > kMaxSourceBytes)
                throw ReadFault{"yosys wrote more than 4,294,967,000 bytes"};
        const timespec pause = {0, 10000000}; // a hundredth of a second
        nanosleep(&pause, nullptr);
    }
    if (WIFEXITED(status) && WEXITSTATUS(status) == 127)
        throw ReadFault{kNotThere};
    if (WIFSIGNALED(status))
        throw ReadFault{std::string("yosys was ended by a signal: ") + strsignal(WTERMSIG(status))};
    if (!WIFEXITED(status) || WEXITSTATUS(status) != 0)
        throw ReadFault{"yosys does not read it: " + ErrorIn(folder.File("messages"))};
}

} // namespace

void ConvertVerilog(SourceText& verilog, double seconds, SourceText& json)
{
    const WorkFolder folder;
    WriteFile(folder.File("design.v"), verilog.Text());
    verilog.Release();
    Child child(folder.Path());
    Await(child, seconds, folder);
    if (SizeOf(folder.File("design.json")) == 0)
        throw ReadFault{"yosys wrote no netlist"};
    json.ReadFile(folder.File("design.json"));
}

} // namespace booleq
