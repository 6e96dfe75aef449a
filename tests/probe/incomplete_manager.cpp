// A memory manager that lacks two entry points ("MMExpand" and "MMSmallFree"), for the client's
// missing-entry-point error. The four it has are enough to get that far.
#include <cstddef>
#include <cstdlib>

extern "C" {
int MMHeapCreate(size_t, size_t) { return 0; }
void MMHeapSelect(int) {}
void *MMAllocate(size_t _size, int) { return malloc(_size); }
void MMDeallocate(void *_p) { free(_p); }
}
