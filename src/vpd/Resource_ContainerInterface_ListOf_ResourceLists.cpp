#include "vpd/Resource_ContainerInterface_ListOf_ResourceLists.h"

#include "vpd/ResourceList.h"

namespace Quorvex::VPD {

Resource_ContainerInterface_ListOf_ResourceLists::Resource_ContainerInterface_ListOf_ResourceLists()
    : _ContentPtr(new ListOf_<ResourceList>()) {}

Resource_ContainerInterface_ListOf_ResourceLists::Resource_ContainerInterface_ListOf_ResourceLists(
    Resource_ContainerInterface_ListOf_ResourceLists const& other)
    : _ContentPtr(new ListOf_<ResourceList>(other.get_ListOf_ResourceLists())) {}

// The copy is made before the old lists go: the source may live inside them.
Resource_ContainerInterface_ListOf_ResourceLists&
Resource_ContainerInterface_ListOf_ResourceLists::operator=(
    Resource_ContainerInterface_ListOf_ResourceLists const& other) {
    if (this != &other) {
        auto* const copy = new ListOf_<ResourceList>(other.get_ListOf_ResourceLists());
        delete _ContentPtr;
        _ContentPtr = copy;
    }
    return *this;
}

Resource_ContainerInterface_ListOf_ResourceLists::
    ~Resource_ContainerInterface_ListOf_ResourceLists() {
    delete _ContentPtr;
    _ContentPtr = nullptr;
}

bool Resource_ContainerInterface_ListOf_ResourceLists::has_ResourceList(
    std::string const& name) const {
    return _ContentPtr != nullptr && _ContentPtr->contains(name);
}

std::size_t Resource_ContainerInterface_ListOf_ResourceLists::get_NumberOf_ResourceLists() const {
    return get_ListOf_ResourceLists().size();
}

ListOf_<ResourceList> const&
Resource_ContainerInterface_ListOf_ResourceLists::get_ListOf_ResourceLists() const {
    _verify_ContentPtr();
    return *_ContentPtr;
}

ListOf_<ResourceList>&
Resource_ContainerInterface_ListOf_ResourceLists::get_ListOf_ResourceLists() {
    _verify_ContentPtr();
    return *_ContentPtr;
}

void Resource_ContainerInterface_ListOf_ResourceLists::insert_ResourceList(
    ResourceList const& list) {
    get_ListOf_ResourceLists().insert(list);
}

void Resource_ContainerInterface_ListOf_ResourceLists::_verify_ContentPtr() const {
    if (_ContentPtr == nullptr) {
        throw Error_ContentPtrIs_NULL();
    }
}

} // namespace Quorvex::VPD
