// booleq: shows Boolean equations on a terminal or in a pipe.
// Command line or lines of standard input in; answers on standard output, complaints on standard
// error, one of the statuses of status.h out.
#include <csignal>
#include <new>
#include <type_traits>

#include <port/Port_MsgManData.h>

#include "lines.h"
#include "options.h"
#include "output.h"
#include "show.h"
#include "status.h"
#include "text.h"

namespace booleq {

namespace {

// The library dumps the node that broke a tree; whoever types an equation gets a reason instead.
// A host whose message manager cannot be redirected keeps its own way.
template <class Manager, class = void>
struct Diagnostics {
    static void Drop() {}
};
template <class Manager>
struct Diagnostics<Manager, std::void_t<decltype(Manager::setSink(typename Manager::Sink()))>> {
    static void Drop()
    {
        Manager::setSink([](const char*, const char*, int, const char*, const char*) {});
    }
};

void WarnAboutInputs(const Reading& reading, Output& output)
{
    const InputCheck check = CheckInputs(reading.inputs);
    for (const std::string& name : check.illegal)
        Complain(output, "warning: --inputs: '" + Excerpt(name) + "' is no name: skipped");
    for (const std::string& name : check.repeated)
        Complain(output, "warning: --inputs: " + Excerpt(name) + " is listed again: counts once");
}

bool ShowLines(const Options& options, Output& output)
{
    LineReader reader(stdin);
    std::string line;
    size_t lineNumber = 0;
    size_t numTexts = 0;
    bool allAccepted = true;
    while (reader.Next(line)) {
        ++lineNumber;
        if (IsBlank(line))
            continue;
        ++numTexts;
        allAccepted = ShowText(line, lineNumber, options, output) && allAccepted;
    }
    if (numTexts == 0)
        Complain(output, "warning: no equation on standard input");
    return allAccepted;
}

int Run(const std::vector<std::string>& arguments, Output& output)
{
    const Options options = ParseOptions(arguments);
    if (!options.answer.empty()) {
        output.Put(options.answer);
        return kDone;
    }
    if (!options.debug)
        Diagnostics<Port_MsgManData>::Drop();
    WarnAboutInputs(options.reading, output);
    const bool accepted = options.equation == "-" ? ShowLines(options, output)
                                                  : ShowText(options.equation, 0, options, output);
    return accepted ? kDone : kRefused;
}

int Fail(int status, const char* message, const char* more = "")
{
    std::fprintf(stderr, "booleq: %s%s\n", message, more);
    return status;
}

} // namespace

} // namespace booleq

int main(int argc, char** argv)
{
    using namespace booleq;
    // A reader that has gone is an error like a full disk, with a message and a status.
    std::signal(SIGPIPE, SIG_IGN);
    try {
        Output output(stdout);
        const std::vector<std::string> arguments(argv + (argc > 0 ? 1 : 0), argv + argc);
        const int status = Run(arguments, output);
        output.Flush();
        return status;
    } catch (const UsageError& error) {
        return Fail(kWrongUsage, error.what(), "\nTry 'booleq --help'.");
    } catch (const std::bad_alloc&) {
        return Fail(kUnfinished, "out of memory");
    } catch (const std::exception& error) {
        return Fail(kUnfinished, error.what());
    }
}
