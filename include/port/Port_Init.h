// The host tool chain's start-up objects. A library that holds one of each at file scope, before
// its other statics, finds the host's services set up when its own code runs.
#ifndef PORT_INIT_H
#define PORT_INIT_H

namespace Port {

class FileInit {
  public:
    FileInit();
    ~FileInit();
};

class PathListInit {
  public:
    PathListInit();
    ~PathListInit();
};

} // namespace Port

class Port_MsgManInit {
  public:
    Port_MsgManInit();
    ~Port_MsgManInit();
};

class InstanceTableInit {
  public:
    InstanceTableInit();
    ~InstanceTableInit();
};

class FactoryInit {
  public:
    FactoryInit();
    ~FactoryInit();
};

#endif
