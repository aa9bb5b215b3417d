#include "yosys_process.h"

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <ctime>
#include <vector>

#include <fcntl.h>
#if defined(__linux__)
#include <sys/prctl.h>
#endif
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include "read_fault.h"
#include "text.h"
#include "watch.h"

namespace booleq {

namespace {

constexpr char kNotThere[] =
    "Verilog is read by the program yosys, which is not installed; install it "
    "(Debian: apt-get install yosys), or write the netlist as JSON, BLIF or EDIF";

// The descriptors of the child's files.
enum Place { kTextPlace = 3, kJsonPlace = 4 };
constexpr char kTextName[] = "/dev/fd/3:";
constexpr int kFreePlace = 5;
constexpr int kCannotStart = 126; // statuses of the child, as in shells
constexpr int kNotFound = 127;
constexpr char kScript[] = "read_verilog /dev/fd/3; write_json /dev/fd/4";

// A file without a name: nothing is left of it, however this process ends.
class NamelessFile {
  public:
    NamelessFile()
    {
        const char* place = std::getenv("TMPDIR");
        std::string path =
            std::string(place != nullptr && *place != 0 ? place : "/tmp") + "/booleq.XXXXXX";
        m_descriptor = mkostemp(path.data(), O_CLOEXEC);
        if (m_descriptor < 0)
            throw ReadFault{"cannot make a file for yosys: " + path + ": " + std::strerror(errno)};
        unlink(path.c_str());
    }
    ~NamelessFile() { close(m_descriptor); }
    NamelessFile(const NamelessFile&) = delete;
    NamelessFile& operator=(const NamelessFile&) = delete;

    int Descriptor() const { return m_descriptor; }

    void Write(std::string_view text)
    {
        while (!text.empty()) {
            const ssize_t numWritten = write(m_descriptor, text.data(), text.size());
            if (numWritten < 0 && errno == EINTR)
                continue;
            if (numWritten <= 0)
                throw ReadFault{std::string("cannot write a file for yosys: ") +
                                std::strerror(errno)};
            text.remove_prefix(static_cast<size_t>(numWritten));
        }
    }

    uint64_t Size() const
    {
        struct stat status;
        return fstat(m_descriptor, &status) == 0 ? static_cast<uint64_t>(status.st_size) : 0;
    }

    void ReadInto(SourceText& text) const
    {
        lseek(m_descriptor, 0, SEEK_SET);
        text.ReadStream(m_descriptor);
    }

  private:
    int m_descriptor;
};

struct WorkFiles {
    NamelessFile text;
    NamelessFile json;
    NamelessFile messages;
};

// Runs in the child, between fork and exec: it must not allocate or lock.
[[noreturn]] void RunYosys(const WorkFiles& files, pid_t parent, char* const* arguments)
{
    setpgid(0, 0); // its own process group, so that all of it can be killed
#if defined(__linux__)
    prctl(PR_SET_PDEATHSIG, SIGKILL); // it is killed when we are
    if (getppid() != parent)
        _exit(kCannotStart);
#else
    static_cast<void>(parent);
#endif
    // First copies to descriptors above all places, so that none is overwritten before it is
    // copied.
    const int text = fcntl(files.text.Descriptor(), F_DUPFD, kFreePlace);
    const int json = fcntl(files.json.Descriptor(), F_DUPFD, kFreePlace);
    const int messages = fcntl(files.messages.Descriptor(), F_DUPFD, kFreePlace);
    const int nothing = open("/dev/null", O_RDONLY);
    const bool isReady = dup2(nothing, STDIN_FILENO) >= 0 && dup2(messages, STDOUT_FILENO) >= 0 &&
                         dup2(messages, STDERR_FILENO) >= 0 && dup2(text, kTextPlace) >= 0 &&
                         dup2(json, kJsonPlace) >= 0 && chdir("/") == 0;
    if (isReady)
        execvp(arguments[0], arguments);
    _exit(errno == ENOENT ? kNotFound : kCannotStart);
}

// A running program with all that it starts; it does not outlive this object.
class Child {
  public:
    explicit Child(const WorkFiles& files)
    {
        std::vector<std::string> words = {"yosys", "-q", "-p", kScript};
        std::vector<char*> arguments(words.size() + 1); // the last one is null
        std::transform(words.begin(), words.end(), arguments.begin(),
                       [](std::string& word) { return word.data(); });
        const pid_t parent = getpid();
        m_process = fork();
        if (m_process < 0)
            throw ReadFault{std::string("cannot start yosys: ") + std::strerror(errno)};
        if (m_process == 0)
            RunYosys(files, parent, arguments.data());
        setpgid(m_process, m_process); // parent and child both do this: either may be first
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

// Why yosys refused the text: its line "/dev/fd/3:7: ERROR: ..." without our name for the file.
std::string ErrorIn(const NamelessFile& file)
{
    SourceText messages;
    file.ReadInto(messages);
    const std::string_view text = messages.Text();
    size_t start = 0;
    while (start < text.size()) {
        const size_t end = std::min(text.find('\n', start), text.size());
        const std::string_view line = text.substr(start, end - start);
        start = end + 1;
        const size_t sign = line.find("ERROR: ");
        if (sign == std::string_view::npos)
            continue;
        std::string reason;
        const size_t length = sizeof kTextName - 1;
        if (line.substr(0, length) == kTextName && sign > length + 2)
            reason.append("line ").append(line.substr(length, sign - length - 2)).append(": ");
        return reason.append(line.substr(sign + 7));
    }
    return "it gave no reason";
}

void RefuseTooLong(const WorkFiles& files)
{
    if (std::max(files.json.Size(), files.messages.Size()) > kMaxSourceBytes)
        throw ReadFault{"yosys wrote more than 4,294,967,000 bytes"};
}

void Await(Child& child, double seconds, const WorkFiles& files)
{
    const auto start = std::chrono::steady_clock::now();
    int status = 0;
    while (!child.HasEnded(status)) {
        Watch();
        const std::chrono::duration<double> passed = std::chrono::steady_clock::now() - start;
        if (passed.count() > seconds)
            throw ReadFault{"yosys did not read the Verilog text within " +
                            Count(static_cast<uint64_t>(seconds), "second")};
        RefuseTooLong(files);
        const timespec pause = {0, 10000000}; // a hundredth of a second
        nanosleep(&pause, nullptr);
    }
    RefuseTooLong(files);
    if (WIFSIGNALED(status))
        throw ReadFault{std::string("yosys was ended by a signal: ") + strsignal(WTERMSIG(status))};
    if (WEXITSTATUS(status) == kNotFound)
        throw ReadFault{kNotThere};
    if (WEXITSTATUS(status) == kCannotStart)
        throw ReadFault{"yosys cannot be started"};
    if (WEXITSTATUS(status) != 0)
        throw ReadFault{"yosys does not read it: " + ErrorIn(files.messages)};
}

} // namespace

void ConvertVerilog(SourceText& verilog, double seconds, SourceText& json)
{
    WorkFiles files;
    files.text.Write(verilog.Text());
    verilog.Release();
    Child child(files);
    Await(child, seconds, files);
    if (files.json.Size() == 0)
        throw ReadFault{"yosys wrote no netlist"};
    files.json.ReadInto(json);
}

} // namespace booleq
