#include "transform/VPD_2_OStream.h"

#include "transform/VPD_ResourceSet_2_XML_Element.h"
#include "transform/VPD_Resource_2_XML_Element.h"

namespace Transform {

namespace {

constexpr unsigned int gc_TopLevel = 0;
constexpr char gc_DocumentVersion[] = "1.0";

} // namespace

VPD_2_OStream::VPD_2_OStream(std::ostream& out) : _Writer(out, gc_TopLevel) {}

std::ostream& VPD_2_OStream::operator()(Quorvex::VPD::ResourceSet const& set) {
    XML::Element resourceSet;
    VPD_ResourceSet_2_XML_Element{resourceSet}(set);

    XML::Element declaration("xml", XML::Tag::Type_Declaration);
    declaration.insert_Attribute("version", gc_DocumentVersion);
    declaration.insert_Attribute("encoding", "UTF-8");

    XML::Element inventory("com.zor.inventory", XML::Tag::Type_BeginTag);
    inventory.insert_Content(resourceSet);
    inventory.insert_Attribute("version", gc_DocumentVersion);

    // Both at depth 0: one first line, no line end after the last.
    // Kept for the inventory importers: see docs/compatibility.md#document-layout
    _Writer(declaration, true, gc_TopLevel);
    return _Writer(inventory, true, gc_TopLevel);
}

std::ostream& VPD_2_OStream::operator()(Quorvex::VPD::Resource const& resource) {
    XML::Element element;
    VPD_Resource_2_XML_Element{element}(resource);
    return _Writer(element, true, gc_TopLevel);
}

} // namespace Transform
