// A tiny host program built against the installed package.
#include <plotaid/plotaid.h>

#include <cstdio>
#include <cstring>

int main() {
    ChartException e("host ok", "host", 1);
    if (std::strcmp(e.what(), "host ok") != 0 || e.line() != 1)
        return 1;
    std::puts(e.what());
    return 0;
}
