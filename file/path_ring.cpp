#include "file/path_ring.h"

#include "host/ut_path.h"

static constexpr int RING_SIZE = 100;
static char la_path_ring[RING_SIZE][LA_MAX_PATH];
static int la_path_ring_next = 0;

const char* la_in_ring(const la_path_text& text, int slots) {
  if (!text.fits()) return nullptr;
  char* slot = nullptr;
  for (; slots > 0; --slots) {
    slot = la_path_ring[la_path_ring_next];
    slot[0] = '\0';
    la_path_ring_next = (la_path_ring_next + 1) % RING_SIZE;
  }
  UT_STR::Copy(slot, text.chars());
  return UT_PATH::ExternalPath(slot);
}
