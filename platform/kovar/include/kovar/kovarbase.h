#ifndef KOVAR_KOVARBASE_H
#define KOVAR_KOVARBASE_H

// The host's general small-number threshold: numbers of smaller magnitude print in scientific
// notation under the host's general format.
namespace kovar {

double GETGFORMATSMALL(); // default 0.0001
void setGFormatSmall(double threshold);

} // namespace kovar

#endif
