#include <gtest/gtest.h>

#include <list>
#include <memory>
#include <new>
#include <set>
#include <stdexcept>
#include <string>
#include <vector>

#include "expert/CQVComMultiThreadModelNoCS.h"
#include "expert/CQVComObjectRootEx.h"
#include "expert/CQVComPtr.h"
#include "expert/CkxSysEnumItemNamesSTL.h"
#include "expert/CkxSysEnumPropertyTagsSTL.h"
#include "expert/QVCreateEnumerator.h"
#include "platform/BStr.h"

using NameList = std::list<std::u16string>;
using Names = std::vector<std::u16string>;
using Tags = std::vector<kxSysAttributeTagID>;

namespace {

// Name copies that run out of memory once `copiesLeft` have been made.
struct FailingNamePolicy : QVCopyNamePolicy {
    static inline int copiesLeft = 0;
    static void copy(BSTR* to, const std::u16string& from) {
        if (copiesLeft-- == 0) {
            throw std::bad_alloc();
        }
        QVCopyNamePolicy::copy(to, from);
    }
};

class CFailingNames : public IQVEnumOnSTLImpl<IkxSysEnumStringList, &IID_IkxSysEnumStringList, BSTR,
                                              FailingNamePolicy, NameList>,
                      public virtual CQVComObjectRootEx<CQVComMultiThreadModelNoCS> {
  public:
    static std::span<const QVInterfaceEntry> InterfaceTable() {
        static constexpr QVInterfaceEntry kTable[] = {
            QVInterface<CFailingNames, IkxSysEnumStringList>(IID_IkxSysEnumStringList)};
        return kTable;
    }
    using IQVEnumOnSTLImpl::Adopt;
};

// An object whose construction fails as the expert's does when its mutex cannot be made.
class CThrowingProbe : public IUnknown,
                       public virtual CQVComObjectRootEx<CQVComMultiThreadModelNoCS> {
  public:
    static std::span<const QVInterfaceEntry> InterfaceTable() { return {}; }

  protected:
    CThrowingProbe() { throw std::runtime_error("no mutex"); }
    virtual ~CThrowingProbe() = default;
};

template <class Enumerator, class Interface, class Container>
CQVComPtr<Interface> owning(Container elements) {
    Interface* created = nullptr;
    EXPECT_EQ(QVCreateOwningEnumerator<Enumerator>(
                  std::make_unique<const Container>(std::move(elements)), &created),
              S_OK);
    return CQVComPtr<Interface>::Adopt(created);
}

// One Next of up to `count` names; the delivered names, or "failed" on an error.
Names next(IkxSysEnumStringList& names, ULONG count) {
    std::vector<BSTR> delivered(count, nullptr);
    ULONG fetched = 99;
    const HRESULT result = names.Next(count, delivered.data(), &fetched);
    const Names out =
        FAILED(result) ? Names{u"failed"} : Names(delivered.begin(), delivered.begin() + fetched);
    for (BSTR name : delivered) {
        qv::dsc::BStr::release(name);
    }
    return out;
}

}  // namespace

TEST(EnumeratorTest, NextSkipAndResetWalkTheTags) {
    enum Operation { kNext, kSkip, kReset };
    struct Step {
        Operation operation;
        ULONG count;
        HRESULT result;
        Tags delivered;
    };
    const Step steps[] = {
        {kNext, 1, S_OK, {1}}, {kNext, 3, S_FALSE, {2, 3}}, {kNext, 3, S_FALSE, {}},
        {kReset, 0, S_OK, {}}, {kSkip, 2, S_OK, {}},        {kNext, 2, S_FALSE, {3}},
        {kReset, 0, S_OK, {}}, {kSkip, 0, S_OK, {}},        {kSkip, 5, S_FALSE, {}},
    };
    using TagSet = std::set<kxSysAttributeTagID>;
    auto tags = owning<CkxSysEnumPropertyTagsSTL<TagSet>, IkxSysEnumPropertyTag>(TagSet{1, 2, 3});
    for (const Step& step : steps) {
        Tags delivered(step.count);
        ULONG fetched = 0;
        const HRESULT result = step.operation == kNext
                                   ? tags->Next(step.count, delivered.data(), &fetched)
                               : step.operation == kSkip ? tags->Skip(step.count)
                                                         : tags->Reset();
        delivered.resize(fetched);
        EXPECT_EQ(result, step.result) << &step - steps;
        EXPECT_EQ(delivered, step.delivered) << &step - steps;
    }
    kxSysAttributeTagID tag = 0;
    EXPECT_EQ(tags->Next(2, &tag, nullptr), E_POINTER);
    EXPECT_EQ(tags->Next(1, &tag, nullptr), S_FALSE);  // at the end
}

// Each clone outlives the enumerator it came from; the name list lives as long as any.
TEST(EnumeratorTest, ClonesStartWhereTheSourceStoodAndOutliveIt) {
    auto source = owning<CkxSysEnumItemNamesSTL, IkxSysEnumStringList>(NameList{u"a", u"b", u"c"});
    ASSERT_EQ(next(*source, 1), Names{u"a"});
    CQVComPtr<IkxSysEnumStringList> first;
    CQVComPtr<IkxSysEnumStringList> second;
    ASSERT_EQ(source->Clone(first.Receive()), S_OK);
    source.reset();
    ASSERT_EQ(next(*first, 1), Names{u"b"});
    ASSERT_EQ(first->Clone(second.Receive()), S_OK);
    first.reset();
    EXPECT_EQ(next(*second, 2), Names{u"c"});
}

TEST(EnumeratorTest, NextOutOfMemoryGivesBackItsNamesAndKeepsThePosition) {
    auto names = owning<CFailingNames, IkxSysEnumStringList>(NameList{u"a", u"b", u"c"});
    FailingNamePolicy::copiesLeft = 2;
    EXPECT_EQ(next(*names, 3), Names{u"failed"});
    FailingNamePolicy::copiesLeft = 3;
    EXPECT_EQ(next(*names, 3), (Names{u"a", u"b", u"c"}));
}

TEST(CQVComObjectTest, ThrowingConstructionGivesOutOfMemory) {
    CQVComObject<CThrowingProbe>* probe = nullptr;
    EXPECT_EQ(CQVComObject<CThrowingProbe>::CreateInstance(&probe), E_OUTOFMEMORY);
}
