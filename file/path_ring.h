// The ring of result buffers that the getters of all path classes share.
#ifndef KESTREL_FILE_PATH_RING_H
#define KESTREL_FILE_PATH_RING_H

#include "file/path_text.h"

/// Takes so many of the 100 slots and returns the text, in external form, in the last of them. It
/// stays there until 100 more have been taken. A text that does not fit takes none and gives null.
const char* la_in_ring(const la_path_text& text, int slots);

#endif
