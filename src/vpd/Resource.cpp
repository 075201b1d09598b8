#include "vpd/Resource.h"

#include "vpd/ResourceList.h"

namespace Quorvex::VPD {

Resource::Resource() = default;

Resource::Resource(std::string const& displayName, std::string const& uniqueID)
    : Base(displayName), Resource_ContainerInterface_Attributes(uniqueID, std::string()) {}

Resource::Resource(Resource const& other) = default;

// The lists go last: other may live inside them, and their assignment copies
// other's lists before it lets the old ones go.
Resource& Resource::operator=(Resource const& other) {
    Base::operator=(other);
    Resource_ContainerInterface_ListOf_Properties::operator=(other);
    Resource_ContainerInterface_ListOf_PropertyGroups::operator=(other);
    Resource_ContainerInterface_Attributes::operator=(other);
    Resource_ContainerInterface_ListOf_ResourceLists::operator=(other);
    return *this;
}

Resource::~Resource() = default;

// Another unique ID: nothing changes, silently. Kept for the class's callers: see
// docs/compatibility.md#unrelated-merge
Resource& Resource::operator+=(Resource const& other) {
    if (other.get_UniqueID() != get_UniqueID()) {
        return *this;
    }
    if (other.get_NumberOf_Properties() != 0) {
        get_ListOf_Properties() += other.get_ListOf_Properties();
    }
    if (other.get_NumberOf_PropertyGroups() != 0) {
        get_ListOf_PropertyGroups() += other.get_ListOf_PropertyGroups();
    }
    if (other.get_NumberOf_ResourceLists() != 0) {
        get_ListOf_ResourceLists() += other.get_ListOf_ResourceLists();
    }
    return *this;
}

bool Resource::insert_Resource(std::string const& listName, Resource const& resource) {
    if (listName.empty()) {
        return false;
    }
    ResourceList& list = get_ListOf_ResourceLists().find_orCreate(listName);
    if (list.get_DisplayName().empty()) {
        list.set_DisplayName(listName);
    }
    list.insert(resource);
    return true;
}

std::string const& Resource::__StringValue() const {
    return get_UniqueID();
}

} // namespace Quorvex::VPD
