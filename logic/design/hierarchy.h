// Lays out the modules of a file as one design: each instance of a module gets its own tables and
// nets, and nets that ports join become one.
// Fails: ReadFault for no top or several, a module that contains itself, or more items than
// allowed.  Cost: linear in the resulting design.
#ifndef BOOLEQ_DESIGN_HIERARCHY_H
#define BOOLEQ_DESIGN_HIERARCHY_H

#include <string>

#include "module_content.h"

namespace booleq {

struct LayoutOptions {
    std::string top;         // empty: the module marked as top, or the one that no other uses
    bool isFirstTop = false; // if 'top' is empty, the first module, as in BLIF
    bool hasKeys = false;
    uint64_t maxItems = 0; // tables, nets and instances
};

// Consumes the modules.  Requires: no two have the same name.
void LayOut(std::vector<ModuleContent>& modules, const LayoutOptions& options, Design& design);

} // namespace booleq

#endif
