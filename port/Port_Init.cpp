// Start-up objects of the default host. Its services set themselves up on first use and are never
// torn down, so there is nothing to start; another host does its work in these constructors.
#include <port/Port_Init.h>

Port::FileInit::FileInit() {}
Port::FileInit::~FileInit() {}

Port::PathListInit::PathListInit() {}
Port::PathListInit::~PathListInit() {}

Port_MsgManInit::Port_MsgManInit() {}
Port_MsgManInit::~Port_MsgManInit() {}

InstanceTableInit::InstanceTableInit() {}
InstanceTableInit::~InstanceTableInit() {}

FactoryInit::FactoryInit() {}
FactoryInit::~FactoryInit() {}
