#ifndef SCRATCHLOC_PATHFACTORY_H
#define SCRATCHLOC_PATHFACTORY_H

#include <string>

// The host's path service. Kind 3 names the resource folder (schemas, message dictionaries):
// PLOTAID_RESOURCE_DIR when set, else the installed share/plotaid/ beside the library, else the
// source tree's resources/. Folder texts always end with '/'. Its base path is the messages folder,
// and its full path the host language's folder in it (<base><language>/): a view, the tables
// themselves are the files messages/<procedure>.<language>.txt.
namespace scratchloc {

class PathFinder {
public:
    virtual ~PathFinder() = default;
    // Host multibyte text of the folder, ending with '/'.
    virtual std::string getPath() const = 0;
    // The folder whose sub-folders are the languages, and this host language's folder in it; both
    // the folder itself for finders without languages.
    virtual std::string getBasePath() const { return getPath(); }
    virtual std::string getFullPath() const { return getPath(); }
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
