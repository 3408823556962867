#ifndef SCRATCHLOC_PATHFACTORY_H
#define SCRATCHLOC_PATHFACTORY_H

#include <string>

// The host's path service. Kind 3 names the resource folder (schemas, message dictionaries):
// PLOTAID_RESOURCE_DIR when set, else the installed share/plotaid/ beside the library, else the
// source tree's resources/. Folder texts always end with '/'.
namespace scratchloc {

class PathFinder {
public:
    virtual ~PathFinder() = default;
    // Host multibyte text of the folder, ending with '/'.
    virtual std::string getPath() const = 0;
};

class PathFactory {
public:
    enum Kind { ResourceFolder = 3 };
    // The finder of the given kind (owned by the factory, lives for the process), or null for a
    // kind the stand-in does not serve.
    static const PathFinder* getPathInstance(int kind);
};

} // namespace scratchloc

#endif
