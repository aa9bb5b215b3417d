// Converts between the functions of the public headers and those of the rooms.
#ifndef BOOLEQ_API_FUNCTION_ACCESS_H
#define BOOLEQ_API_FUNCTION_ACCESS_H

#include <utility>

#include <kq_logic/function.h>

#include "function.h"

namespace kq_logic {

// It never changes, so copies share it.
struct Function::Imp {
    booleq::Function function;
};

struct FunctionAccess {
    static const booleq::Function& Of(const Function& function) { return function.m_imp->function; }

    static Function Make(booleq::Function function)
    {
        Function made;
        Set(std::move(function), made);
        return made;
    }

    static void Set(booleq::Function from, Function& function)
    {
        function.m_imp = std::make_shared<Function::Imp>(Function::Imp{std::move(from)});
    }
};

} // namespace kq_logic

#endif
