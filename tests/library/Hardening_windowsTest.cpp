// What ships is hard to exploit: the tool and the library, as the linker made them.

#include <windows.h>

#include <algorithm>
#include <cstddef>
#include <cstring>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include <gtest/gtest.h>

namespace {

constexpr int relocations = IMAGE_DIRECTORY_ENTRY_BASERELOC;
constexpr int imports = IMAGE_DIRECTORY_ENTRY_IMPORT;

// The parameter is the path of the file.
class ShippedFile : public testing::TestWithParam<const char*> {
  protected:
    void SetUp() override {
        std::ifstream stream(GetParam(), std::ios::binary);
        bytes.assign(std::istreambuf_iterator<char>(stream), std::istreambuf_iterator<char>());
        const auto dos = At<IMAGE_DOS_HEADER>(0);
        ASSERT_EQ(dos.e_magic, IMAGE_DOS_SIGNATURE);
        const auto start = static_cast<size_t>(dos.e_lfanew);
        headers = At<IMAGE_NT_HEADERS64>(start);
        ASSERT_EQ(headers.Signature, static_cast<DWORD>(IMAGE_NT_SIGNATURE));
        ASSERT_EQ(headers.OptionalHeader.Magic, IMAGE_NT_OPTIONAL_HDR64_MAGIC);
        const size_t table =
            start + offsetof(IMAGE_NT_HEADERS64, OptionalHeader) + headers.FileHeader.SizeOfOptionalHeader;
        for (size_t i = 0; i < headers.FileHeader.NumberOfSections; ++i) {
            sections.push_back(At<IMAGE_SECTION_HEADER>(table + i * sizeof(IMAGE_SECTION_HEADER)));
        }
    }

    // What stands at an offset of the file; zeros beyond its end.
    template <typename Type>
    Type At(size_t offset) const {
        Type value{};
        if (offset <= bytes.size() && bytes.size() - offset >= sizeof(value)) {
            std::memcpy(&value, bytes.data() + offset, sizeof(value));
        }
        return value;
    }

    bool Allows(WORD characteristic) const { return (headers.OptionalHeader.DllCharacteristics & characteristic) != 0; }
    bool HasCharacteristic(WORD characteristic) const {
        return (headers.FileHeader.Characteristics & characteristic) != 0;
    }
    const IMAGE_DATA_DIRECTORY& Directory(int number) const { return headers.OptionalHeader.DataDirectory[number]; }

    // The offset in the file of an address in the loaded image; the end of the file if none of it is loaded there.
    size_t OffsetOf(DWORD address) const {
        for (const IMAGE_SECTION_HEADER& section : sections) {
            if (address >= section.VirtualAddress && address - section.VirtualAddress < section.SizeOfRawData) {
                return section.PointerToRawData + (address - section.VirtualAddress);
            }
        }
        return bytes.size();
    }

    // The libraries that the file names, sorted.
    std::vector<std::string> ImportedLibraries() const {
        std::vector<std::string> names;
        for (size_t offset = OffsetOf(Directory(imports).VirtualAddress);; offset += sizeof(IMAGE_IMPORT_DESCRIPTOR)) {
            const DWORD name = At<IMAGE_IMPORT_DESCRIPTOR>(offset).Name;
            if (name == 0) {
                break;
            }
            names.emplace_back(bytes.c_str() + OffsetOf(name));
        }
        std::sort(names.begin(), names.end());
        return names;
    }

    std::string bytes;
    IMAGE_NT_HEADERS64 headers{};
    std::vector<IMAGE_SECTION_HEADER> sections;
};

INSTANTIATE_TEST_SUITE_P(Files, ShippedFile, testing::Values(ZKFPGA_TOOL, SHIPPED_LIBRARY),
                         [](const auto& file) { return std::string(file.param) == ZKFPGA_TOOL ? "Tool" : "Library"; });

TEST_P(ShippedFile, IsLoadedAtAnyAddress) {
    EXPECT_TRUE(Allows(IMAGE_DLLCHARACTERISTICS_DYNAMIC_BASE));
    // Without its relocations it would have to stay where it was linked to.
    EXPECT_FALSE(HasCharacteristic(IMAGE_FILE_RELOCS_STRIPPED));
    EXPECT_GT(Directory(relocations).Size, sizeof(IMAGE_BASE_RELOCATION));
    const auto first = At<IMAGE_BASE_RELOCATION>(OffsetOf(Directory(relocations).VirtualAddress));
    EXPECT_GT(first.SizeOfBlock, sizeof(IMAGE_BASE_RELOCATION));
}

TEST_P(ShippedFile, MayLieAnywhereInTheWholeAddressSpace) {
    EXPECT_TRUE(Allows(IMAGE_DLLCHARACTERISTICS_HIGH_ENTROPY_VA));
    EXPECT_TRUE(HasCharacteristic(IMAGE_FILE_LARGE_ADDRESS_AWARE));
}

TEST_P(ShippedFile, HasNoCodeInDataOrOnTheStack) {
    EXPECT_TRUE(Allows(IMAGE_DLLCHARACTERISTICS_NX_COMPAT));
}

TEST_P(ShippedFile, HasNoCodeThatCanBeWritten) {
    ASSERT_FALSE(sections.empty());
    for (const IMAGE_SECTION_HEADER& section : sections) {
        const DWORD both = IMAGE_SCN_MEM_EXECUTE | IMAGE_SCN_MEM_WRITE;
        EXPECT_NE(section.Characteristics & both, both) << section.Name;
    }
}

// What the check prints when it finds one; it is in the file only if functions call it.
TEST_P(ShippedFile, NoticesOverrunsOfTheStack) {
    EXPECT_NE(bytes.find("*** stack smashing detected ***"), std::string::npos);
}

// Not the compiler's run-time libraries, which someone could put beside a program.
TEST_P(ShippedFile, NeedsOnlyLibrariesOfTheSystem) {
    EXPECT_EQ(ImportedLibraries(), (std::vector<std::string>{"ADVAPI32.dll", "KERNEL32.dll", "OLEAUT32.dll",
                                                             "USER32.dll", "msvcrt.dll", "ole32.dll"}));
}

}  // namespace
