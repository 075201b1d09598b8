#pragma once
// One-line texts of model objects, so that tests can compare whole objects at
// a glance.

#include "pylon/ListOf_Machines.h"
#include "pylon/ListOf_Partitions.h"
#include "vpd/ListOf_Properties.h"
#include "vpd/Resource.h"
#include "xml/Element.h"

#include <string>
#include <vector>

namespace QuorvexTest {

// The text the document writer makes of an element standing alone at the top
// level.
std::string elementText(XML::Element const& element);

// "{name=value;...}" in list order.
std::string propertiesText(Quorvex::VPD::ListOf_Properties const& properties);

// A whole resource tree: (name|id|references), {properties}, <groups>,
// [lists of member trees].
std::string resourceText(Quorvex::VPD::Resource const& resource);

// "objectType|typeModel|serial" for every machine, in list order.
std::vector<std::string> describe(Quorvex::PYLON::ListOf_Machines const& machines);

// "MTMS|PartitionID|IP|ActiveStatus|HostName|OS name|OS version" for every
// record, in list order.
std::vector<std::string> describe(Quorvex::PYLON::ListOf_Partitions const& partitions);

} // namespace QuorvexTest
