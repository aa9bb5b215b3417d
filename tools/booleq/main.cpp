// booleq: explains and compares Boolean equations on a terminal or in a pipe.
// Reads the command line, a file or standard input; writes answers to standard output and
// complaints to standard error; returns one of the statuses of status.h.
#include <csignal>
#include <cstdio>
#include <new>
#include <optional>

#ifdef _WIN32
#include <fcntl.h>
#include <io.h>

extern "C" int _dowildcard;
int _dowildcard = 0; // an argument is an equation: a * in it is not a wildcard
#else
#include <clocale>
#include <cstring>
#include <cwctype>

#include <langinfo.h>
#endif

#include "messages.h"
#include "options.h"
#include "output.h"
#include "progress.h"
#include "status.h"
#include "text.h"

namespace booleq {

namespace {

void WarnAboutInputs(const Reading& reading, Output& output)
{
    const InputCheck check = CheckInputs(reading.inputs);
    for (const std::string& name : check.illegal)
        Complain(output, "warning: --inputs: '" + Excerpt(name) + "' is not a name and is skipped");
    for (const std::string& name : check.repeated)
        Complain(output,
                 "warning: --inputs: " + Excerpt(name) + " is listed twice and counts once");
}

int Run(const std::vector<std::string>& arguments, Output& output)
{
    const CommandLine line = ParseCommandLine(arguments);
    if (!line.answer.empty()) {
        output.Put(line.answer);
        return kDone;
    }
    if (!line.note.empty())
        Complain(output, line.note);
    std::optional<NoMessages> silence; // the user gets a reason instead
    if (!line.request.debug)
        silence.emplace();
    WarnAboutInputs(line.request.reading, output);
    return line.request.command->run(line.request, output);
}

int Fail(const char* message, const char* more = "")
{
    std::fprintf(stderr, "booleq: %s%s\n", message, more);
    return kWrongUsage;
}

void PrepareProcess()
{
#ifdef _WIN32
    // The same bytes as on other systems: a line feed stays one byte, and a control-Z ends nothing.
    for (std::FILE* stream : {stdin, stdout, stderr})
        _setmode(_fileno(stream), _O_BINARY);
#else
    std::signal(SIGPIPE, SIG_IGN); // writing fails instead, and the process ends in order
    std::setlocale(LC_CTYPE, "");
    if (std::strcmp(nl_langinfo(CODESET), "UTF-8") == 0)
        ShowUtf8([](uint32_t character) {
            return std::iswprint(static_cast<std::wint_t>(character)) != 0;
        });
#endif
    HandleInterrupts();
}

} // namespace

} // namespace booleq

int main(int argc, char** argv)
{
    using namespace booleq;
    PrepareProcess();
    try {
        Output output(stdout);
        const std::vector<std::string> arguments(argv + (argc > 0 ? 1 : 0), argv + argc);
        const int status = Run(arguments, output);
        output.Flush();
        return status;
    } catch (const ReaderGone&) {
        return kDone; // the reader has what it wanted
    } catch (const UsageError& error) {
        return Fail(error.what(), "\nTry 'booleq --help'.");
    } catch (const std::bad_alloc&) {
        return Fail("out of memory");
    } catch (const std::exception& error) {
        return Fail(error.what());
    }
}
