// A process that makes the UI library allocate once and exits: the memory client's load errors
// end the process, so tests run them here, in a child.
#include "qor_memory.h"

#include <cstdio>

int main() {
    void *p = qorui::qor_malloc(16);
    std::printf("allocated %s\n", p ? "yes" : "no");
    qorui::qor_free(p);
    return 0;
}
