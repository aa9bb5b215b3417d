// Messages to the host: which module a message names, the one way to issue it, and the debug
// switch. The arguments after KQ_EMIT's line are a printf format and its values; no line end is
// added.
#ifndef KQ_MESSAGES_H
#define KQ_MESSAGES_H

#include <atomic>

#include <port/Port_MsgManData.h>

// Where messages say they come from. The paths and revisions are part of the output, so they are
// fixed texts: __FILE__ would vary with the build.
struct KqModule {
    const char* path;
    const char* revision;
};

constexpr KqModule kKqFacadeModule = {"../s/Kq_BoolEquation.cpp", "$Revision: 1.10 $"};
constexpr KqModule kKqEngineModule = {"../s/Kq_BoolEquationImp.cpp", "$Revision: 1.35 $"};
constexpr KqModule kKqNodeModule = {"../s/Kq_BoolEquationImpNode.cpp", "$Revision: 1.10 $"};

// Issues one message; a macro, so that the compiler checks each format against its arguments.
#define KQ_EMIT(module, line, ...)                                                                 \
    Port_MsgManData::createObject("Kq", (module).path, (line), (module).revision)                  \
        .issueStatus(__VA_ARGS__)

// The debug switch. It is defined with the other statics in the engine's main source. It is read
// before each message, because a receiver or another thread may turn it off at any time.
struct KqDebugMode {
    static std::atomic<bool> s_isOn;
    static bool IsOn() { return s_isOn.load(std::memory_order_relaxed); }
};

#endif
