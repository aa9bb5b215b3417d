// Start-up objects that do something: each counts itself, and the one for messages opens their
// file, so a message that comes earlier ends the program.
#ifndef TINY_INIT_H
#define TINY_INIT_H

// How many services are up.
int tiny_services();

namespace Port {

struct FileInit {
    FileInit();
    ~FileInit();
};

struct PathListInit {
    PathListInit();
    ~PathListInit();
};

} // namespace Port

struct Port_MsgManInit {
    Port_MsgManInit();
    ~Port_MsgManInit();
};

struct InstanceTableInit {
    InstanceTableInit();
    ~InstanceTableInit();
};

struct FactoryInit {
    FactoryInit();
    ~FactoryInit();
};

#endif
