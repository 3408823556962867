#ifndef SCRATCHLOC_RESOURCEFOLDER_H
#define SCRATCHLOC_RESOURCEFOLDER_H

#include <string>

// The steps behind PathFactory's resource folder, separate so that each can be checked alone.
namespace scratchloc {

// The file of the executable or shared library that holds this code; empty when unknown.
std::string containingBinary();

// The installed resource folder that belongs to a binary at binaryPath: <prefix>/share/plotaid/
// where the binary sits in <prefix>/bin or <prefix>/lib (or a multiarch folder beneath lib).
// Empty when no such folder exists.
std::string installedResourceFolder(const std::string& binaryPath);

// The folder text with exactly one trailing '/'; empty stays empty.
std::string withTrailingSlash(std::string folder);

} // namespace scratchloc

#endif
