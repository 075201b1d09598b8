#include "vpd/ResourceSet.h"

namespace Quorvex::VPD {

ResourceSet::ResourceSet() = default;

ResourceSet::ResourceSet(std::string const& classText, std::string const& type,
                         std::string const& version, std::string const& timeStamp)
    : ResourceSet_ContainerInterface_Attributes(classText, type, version, timeStamp) {}

// Another class: nothing changes, silently. Kept for the class's callers: see
// docs/compatibility.md#unrelated-merge
ResourceSet& ResourceSet::operator+=(ResourceSet const& other) {
    if (other.get_Class() != get_Class()) {
        return *this;
    }
    get_Resource() += other.get_Resource();
    if (other.get_NumberOf_ResourceLists() != 0) {
        get_ListOf_ResourceLists() += other.get_ListOf_ResourceLists();
    }
    return *this;
}

std::string const& ResourceSet::__StringValue() const {
    return get_Class();
}

} // namespace Quorvex::VPD
