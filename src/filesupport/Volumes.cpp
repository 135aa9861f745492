#include <algorithm>
#include <map>

#include <kelcore/filesupport/Dir.h>

#include "filesupport/DirIterators.h"
#include "filesupport/MountTable.h"
#include "filesupport/PathEncoding.h"

namespace kelcore::filesupport {

Dir::DirIterator Dir::BeginVolumes(const NameFilter& filter) {
  auto listing = boost::shared_ptr<detail::DirListing<Dir>>(new detail::DirListing<Dir>);
  // A mount point mounted over shows the file system mounted last, the one visible.
  std::map<std::string, std::string> typeOfMountPoint;
  for (const detail::MountEntry& mount : detail::ReadMountTable()) {
    typeOfMountPoint[mount.mountPoint] = mount.fileSystemType;
  }
  for (const auto& [mountPoint, fileSystemType] : typeOfMountPoint) {
    Dir volume(detail::DecodePath(mountPoint));
    const bool keep =
        !filter || !*filter || (*filter)(detail::DecodePath(fileSystemType), volume.FullPath());
    if (keep) listing->entries.push_back(std::move(volume));
  }
  std::sort(listing->entries.begin(), listing->entries.end());
  return DirIterator(listing);
}

}  // namespace kelcore::filesupport
