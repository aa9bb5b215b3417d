// The host tool chain's start-up objects. A library that holds one of each at file scope, before
// its other statics, finds the host's services set up when its own code runs.
#ifndef PORT_INIT_H
#define PORT_INIT_H

namespace Port {

class FileInit { // start-up object of files
  public:
    // The service is set up while an object exists; the default host has nothing to set up.
    FileInit();
    ~FileInit();
};

class PathListInit { // start-up object of lists of paths
  public:
    // The service is set up while an object exists; the default host has nothing to set up.
    PathListInit();
    ~PathListInit();
};

} // namespace Port

class Port_MsgManInit { // start-up object of the message manager
  public:
    // The service is set up while an object exists; the default host has nothing to set up.
    Port_MsgManInit();
    ~Port_MsgManInit();
};

class InstanceTableInit { // start-up object of the table of instances
  public:
    // The service is set up while an object exists; the default host has nothing to set up.
    InstanceTableInit();
    ~InstanceTableInit();
};

class FactoryInit { // start-up object of factories
  public:
    // The service is set up while an object exists; the default host has nothing to set up.
    FactoryInit();
    ~FactoryInit();
};

#endif
