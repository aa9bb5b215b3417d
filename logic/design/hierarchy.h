// Lays out the modules of a file as one design: each instance of a module gets tables and nets of
// its own, nets that ports join become one. Throws ReadFault: no top or several, a module within
// itself, more than the items allowed. Cost: in step with the design that comes out.
#ifndef BOOLEQ_DESIGN_HIERARCHY_H
#define BOOLEQ_DESIGN_HIERARCHY_H

#include <string>

#include "module_content.h"

namespace booleq {

struct LayoutOptions {
    std::string top;         // empty: the module that says so, or that no other one uses
    bool isFirstTop = false; // else the first one, as BLIF has it
    bool hasKeys = false;
    uint64_t maxItems = 0; // tables, nets and instances
};

// The modules are used up.  Requires: no two have one name.
void LayOut(std::vector<ModuleContent>& modules, const LayoutOptions& options, Design& design);

} // namespace booleq

#endif
