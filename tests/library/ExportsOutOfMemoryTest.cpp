// The exported functions on a tree that is there, without memory.

#include <new>

#include "library/PlainHostTest.h"
#include "support/AllocationFaultScope.h"

namespace {

using support::AllocationCounter;
using support::AllocationFaultScope;

class ExportsWithoutMemory : public PlainHostTest {
  protected:
    // Calls with each allocation failing in turn, and before and behind that with none.
    template <typename Call>
    static void FailEachInTurn(Call call) {
        ASSERT_EQ(call(), 0);
        uint64_t total = 0;
        {
            const AllocationCounter counter;
            ASSERT_EQ(call(), 0);
            total = counter.Count();
        }
        uint64_t failures = 0;
        for (uint64_t nth = 1; nth <= total; ++nth) {
            try {
                const AllocationFaultScope fault(nth);
                const HRESULT result = call();
                EXPECT_TRUE(result == S_OK || result == E_OUTOFMEMORY) << "allocation " << nth;
                failures += result == S_OK ? 0U : 1U;
            } catch (const std::bad_alloc&) {
                ++failures;
            }
        }
        // A text that can't grow to twice of what it needs grows to that, and nobody hears of it.
        EXPECT_GT(failures, 0U);
        EXPECT_EQ(call(), 0);
    }
};

TEST_F(ExportsWithoutMemory, PropertyEndsInOrder) {
    const HostText value;
    unsigned char found = 0;
    FailEachInTurn([&] { return FPGAResTree_GetProperty("a", "s/d", "x", value.Get(), &found); });
    EXPECT_EQ(value.Bytes(), "deep");
}

TEST_F(ExportsWithoutMemory, NamesEndInOrder) {
    HostTexts list;
    unsigned char found = 0;
    FailEachInTurn(
        [&] { return FPGAResTree_GetDescendantNames("", "", "recurse=true,protocol=Board", &list.array, &found); });
    EXPECT_EQ(list.Texts(), (std::vector<std::string>{"/a", "/c"}));
}

TEST_F(ExportsWithoutMemory, ClustersEndInOrder) {
    HostTexts list;
    unsigned char found = 0;
    FailEachInTurn(
        [&] { return FPGAResTree_GetDescendantNames("a", "", "includeDisplayNames=true", &list.array, &found); });
    EXPECT_EQ(list.Texts(),
              (std::vector<std::string>{
                  "<Cluster><Name></Name><NumElts>3</NumElts><String><Name>resource</Name><Val>s</Val></String>"
                  "<String><Name>alias</Name><Val></Val></String>"
                  "<String><Name>display name</Name><Val>/a/s</Val></String></Cluster>"}));
}

TEST_F(ExportsWithoutMemory, PropertiesEndInOrder) {
    HostTexts list;
    unsigned char found = 0;
    FailEachInTurn([&] { return FPGAResTree_GetMultipleProperties("a", "s", "", &list.array, &found); });
    EXPECT_EQ(list.Texts(),
              (std::vector<std::string>{
                  "<Cluster><Name></Name><NumElts>2</NumElts><String><Name>name</Name><Val>s/d</Val></String>"
                  "<String><Name>value</Name><Val>deep</Val></String></Cluster>"}));
}

TEST_F(ExportsWithoutMemory, DumpEndsInOrder) {
    const HostText text;
    FailEachInTurn([&] { return FPGAResTree_Dump("a", "s", "", text.Get()); });
    EXPECT_EQ(text.Bytes(), "\n<Sub name=\"s\">\n   <d>deep</d>\n</Sub>");
}

TEST_F(ExportsWithoutMemory, ConversionsEndInOrder) {
    using Conversion = int32_t (*)(ZkStringHandle, ZkStringHandle);
    for (const Conversion convert : {&FPGA_mbstowcs, &FPGA_wcstombs, &FPGA_MbsToUtf8, &FPGA_Utf8ToMbs}) {
        const HostText source("ab\xE2\x82\xAC");
        const HostText destination;
        FailEachInTurn([&] { return convert(source.Get(), destination.Get()); });
    }
}

}  // namespace
