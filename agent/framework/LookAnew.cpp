#include <agent/framework/LookAnew.h>
#include <agent/framework/TreeStore.h>

// What goes wrong in a re-reading is logged by the store.
void oruLookAnew(void) {
  agent::TreeStore::instance().lookAnew();
}
