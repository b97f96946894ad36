// A host may replace the default memory resource of the process, and take its own away again while
// a manager is there.

#include <gtest/gtest.h>

#include <memory_resource>
#include <optional>

#include "Installation.h"

using namespace support;

namespace {

class DefaultResource {
 public:
  explicit DefaultResource(std::pmr::memory_resource* resource)
      : m_before(std::pmr::set_default_resource(resource)) {}
  ~DefaultResource() { std::pmr::set_default_resource(m_before); }
  DefaultResource(const DefaultResource&) = delete;
  DefaultResource& operator=(const DefaultResource&) = delete;

 private:
  std::pmr::memory_resource* m_before;
};

TEST(HostMemory, ManagerTakesNothingFromTheDefaultResource) {
  const DefaultResource nothing(std::pmr::null_memory_resource());
  const std::string long1 = "1.3.6.1.4.1.32473.1.1.1";
  const std::string long2 = "1.3.6.1.4.1.32473.1.1.2";
  Installation source{{"V3.user.at", attributeType(long1, "aNameOfSomeLength") +
                                         vendorExtension(long1) + objectClass(long2, "b")}};
  Installation target{{"V3.user.at", attributeType(long1, "aNameOfSomeLength", "other")}};
  Installation reference;
  EXPECT_TRUE(source->compSchemas(reference.manager()));
  EXPECT_TRUE(reference->mergeSchemas(source.manager()));
  EXPECT_TRUE(target->checkCollisions(reference.manager()));
  EXPECT_EQ(tablesOf(target.manager()), "attributes: anameofsomelength=" + long1 + "(other)\n");
  EXPECT_EQ(stateOf(reference.manager()),
            "attributes: anameofsomelength=" + long1 + "(text)\nclasses: b=" + long2 +
                "(text)\nextensions: " + long1 + "(normal)\nV3.user.at: " + long1 + " " + long2 +
                "\n");
}

}  // namespace
