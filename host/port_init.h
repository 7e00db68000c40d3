// The static initialisers of the portability layer. Each of the sources of the exported
// classes holds one object of each, in this order, from before its first use of a service to the
// end of the process. The services here need no setting up: they come into being at their first
// use.
#ifndef KESTREL_HOST_PORT_INIT_H
#define KESTREL_HOST_PORT_INIT_H

namespace Port {
struct FileInit {
  FileInit() {}
};
struct PathListInit {
  PathListInit() {}
};
}  // namespace Port

namespace CitP {
struct InstanceTableInit {
  InstanceTableInit() {}
};
struct FactoryInit {
  FactoryInit() {}
};
}  // namespace CitP

struct Port_MsgManInit {
  Port_MsgManInit() {}
};

#endif
