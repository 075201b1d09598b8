#include "transform/Utility__XML_Element_2_OStream.h"

namespace Transform {

bool Utility__XML_Element_2_OStream::_u_usingEmptyElementTag(XML::Element const& element) {
    if (element.get_Tag() == XML::Tag::Type_EmptyElementTag) {
        return true;
    }
    return element.get_NumberOfContent() == 0 && element.get_Tag() == XML::Tag::Type_BeginTag;
}

} // namespace Transform
