#include "expert/CQVComObject.h"

#include <gtest/gtest.h>

#include <stdexcept>

#include "expert/CQVComMultiThreadModelNoCS.h"
#include "expert/CQVComObjectRootEx.h"
#include "tests/expert/HostObjectsTestSupport.h"
#include "tests/support/FailingAllocation.h"

using namespace qvtest;

namespace {

// An object whose construction fails as the expert's does when its mutex cannot be made.
class CThrowingProbe : public IUnknown,
                       public virtual CQVComObjectRootEx<CQVComMultiThreadModelNoCS> {
  public:
    static std::span<const QVInterfaceEntry> InterfaceTable() { return {}; }

  protected:
    CThrowingProbe() { throw std::runtime_error("no mutex"); }
    virtual ~CThrowingProbe() = default;
};

}  // namespace

TEST(CQVComObjectTest, FailedAllocationOrConstructionGivesOutOfMemory) {
    CQVComObject<CThrowingProbe>* probe = nullptr;
    EXPECT_EQ(CQVComObject<CThrowingProbe>::CreateInstance(&probe), E_OUTOFMEMORY);
    CQVComObject<CkxDynamicPropertyBag>* bag = nullptr;
    ScopedAllocationFailure failure(1);
    EXPECT_EQ(CQVComObject<CkxDynamicPropertyBag>::CreateInstance(&bag), E_OUTOFMEMORY);
    EXPECT_EQ(bag, nullptr);
}

TEST(CQVComObjectTest, BagAnswersItsIdentifiersWithOnePointerAndOneMoreReference) {
    BagPtr bag = newBag();
    void* answered = nullptr;
    for (const IID* iid : {&IID_IUnknown, &IID_IkxSysPropertyBag, &IID_IkxSysPropertyBag2}) {
        ASSERT_EQ(bag->QueryInterface(*iid, &answered), S_OK);
        EXPECT_EQ(answered, bag.get());
        EXPECT_EQ(bag->Release(), 1U);
    }
    EXPECT_EQ(bag->QueryInterface(IID_IkxSysEnumPropertyTag, &answered), E_NOINTERFACE);
    EXPECT_EQ(answered, nullptr);
}
