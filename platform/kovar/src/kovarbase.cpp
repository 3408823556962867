#include <kovar/kovarbase.h>

namespace kovar {

namespace {
double threshold = 0.0001;
}

double GETGFORMATSMALL() {
    return threshold;
}
void setGFormatSmall(double value) {
    threshold = value;
}

} // namespace kovar
