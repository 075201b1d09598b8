#pragma once

#include "transform/XML_Element_2_OStream.h"
#include "vpd/Resource.h"
#include "vpd/ResourceSet.h"

#include <ostream>

namespace Transform {

// Writes VPD as the VPD XML document that other programs read. The
// declaration and the outer begin tag share the first line, and no line
// feed follows the last end tag. The caller flushes and closes the stream.
class VPD_2_OStream {
public:
    explicit VPD_2_OStream(std::ostream& out);

    // The whole document.
    std::ostream& operator()(Quorvex::VPD::ResourceSet const& set);
    // Only the "Resource" element, starting at column 0.
    std::ostream& operator()(Quorvex::VPD::Resource const& resource);

private:
    XML_Element_2_OStream _Writer;
};

} // namespace Transform
