#include "TestConstants.h"

#include "system/MTMS.h"

namespace QuorvexTest {

Quorvex::System::Partition examplePartition(std::string const& partitionID) {
    return Quorvex::System::Partition(Quorvex::System::MTMS(gc_ExampleTypeModel, gc_ExampleSerial),
                                      partitionID, "p" + partitionID + ".example");
}

std::string sourceRoot() {
    return QUORVEX_SOURCE_ROOT;
}

std::string expectedOutputFile(std::string const& relativePath) {
    return sourceRoot() + "/tests/expected/" + relativePath;
}

} // namespace QuorvexTest
