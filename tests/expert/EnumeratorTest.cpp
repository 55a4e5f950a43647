#include <gtest/gtest.h>

#include <list>
#include <memory>
#include <new>
#include <set>
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

template <class Enumerator, class Interface, class Container>
CQVComPtr<Interface> owning(Container elements) {
    Interface* created = nullptr;
    EXPECT_EQ(QVCreateOwningEnumerator<Enumerator>(
                  std::make_unique<const Container>(std::move(elements)), &created),
              S_OK);
    return CQVComPtr<Interface>::Adopt(created);
}

// One Next of up to three names; the delivered names, or "failed" on an error.
Names next(IkxSysEnumStringList& names) {
    BSTR delivered[3] = {};
    ULONG fetched = 99;
    const HRESULT result = names.Next(3, delivered, &fetched);
    Names out = FAILED(result) ? Names{u"failed"} : Names();
    for (ULONG i = 0; SUCCEEDED(result) && i < fetched; ++i) {
        out.push_back(qv::dsc::OleText::toLibrary(delivered[i]));
    }
    for (BSTR name : delivered) {
        qv::dsc::BStr::release(name);
    }
    return out;
}

}  // namespace

TEST(EnumeratorTest, NextSkipAndResetWalkTheTags) {
    const std::tuple<char, ULONG, HRESULT, Tags> steps[] = {
        // operation (Next, Skip, Reset), count, result, tags delivered
        {'n', 1, S_OK, {1}}, {'n', 3, S_FALSE, {2, 3}}, {'n', 3, S_FALSE, {}},
        {'r', 0, S_OK, {}},  {'s', 2, S_OK, {}},        {'n', 2, S_FALSE, {3}},
        {'r', 0, S_OK, {}},  {'s', 0, S_OK, {}},        {'s', 5, S_FALSE, {}},
    };
    using TagSet = std::set<kxSysAttributeTagID>;
    auto tags = owning<CkxSysEnumPropertyTagsSTL<TagSet>, IkxSysEnumPropertyTag>(TagSet{1, 2, 3});
    for (const auto& [operation, count, result, expected] : steps) {
        Tags delivered(count);
        ULONG fetched = 0;
        EXPECT_EQ(operation == 'n'   ? tags->Next(count, delivered.data(), &fetched)
                  : operation == 's' ? tags->Skip(count)
                                     : tags->Reset(),
                  result);
        delivered.resize(fetched);
        EXPECT_EQ(delivered, expected);
    }
}

// Each clone starts where its source stood and outlives it; the list lives as long as any.
TEST(EnumeratorTest, ClonesOutliveTheirSourceAndNextOutOfMemoryGivesBackItsNames) {
    auto source = owning<CkxSysEnumItemNamesSTL, IkxSysEnumStringList>(NameList{u"a", u"b", u"c"});
    CQVComPtr<IkxSysEnumStringList> first;
    CQVComPtr<IkxSysEnumStringList> second;
    ASSERT_EQ(source->Skip(1), S_OK);
    ASSERT_EQ(source->Clone(first.Receive()), S_OK);
    source.reset();
    ASSERT_EQ(first->Skip(1), S_OK);
    ASSERT_EQ(first->Clone(second.Receive()), S_OK);
    first.reset();
    EXPECT_EQ(next(*second), Names{u"c"});

    auto names = owning<CFailingNames, IkxSysEnumStringList>(NameList{u"a", u"b", u"c"});
    FailingNamePolicy::copiesLeft = 2;
    EXPECT_EQ(next(*names), Names{u"failed"});
    FailingNamePolicy::copiesLeft = 3;
    EXPECT_EQ(next(*names), (Names{u"a", u"b", u"c"}));
}
