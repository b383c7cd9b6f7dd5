#include "frame/frame.h"

int VLUnloadFile(void *block) {
  vl::release(block);
  return 0;
}
