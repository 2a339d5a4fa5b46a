#include "misuse/MisuseTest.h"

#include <cctype>
#include <ostream>
#include <sstream>

#include "library/HostInstallation.h"
#include "support/ProcessEnd.h"

const std::string slotA = "A{Width=1;Q{Speed=9;}}";
const std::string slotB = "B{Width=2;}";
const std::string shelfS = "S{Height=7,Label=Name;" + slotA + slotB + "}";
const std::string shelfT = "T{;" + slotA + "}";

Expectation Answers(const std::string& name, const std::string& answer) {
    return {name, answer + (answer.empty() ? "" : "\n") + "answers\n"};
}

Expectation Traps(const std::string& name, const std::string& answer) {
    return {name, answer + (answer.empty() ? "" : "\n"), true};
}

std::string Now(const std::string& shelves) {
    return "\nnow " + shelves;
}

std::string TestName(const testing::TestParamInfo<Expectation>& info) {
    std::string name;
    bool startsWord = true;
    const std::string answer = info.param.output.substr(0, info.param.output.find_first_of("\n "));
    for (const char each : info.param.name + (info.param.traps ? " traps" : " gives " + answer)) {
        const bool isWord = std::isalnum(static_cast<unsigned char>(each)) != 0;
        if (isWord) {
            name += startsWord ? static_cast<char>(std::toupper(static_cast<unsigned char>(each))) : each;
        }
        startsWord = !isWord;
    }
    return name;
}

// For the list of parameters.
void PrintTo(const Expectation& expectation, std::ostream* stream) {
    *stream << expectation.name;
}

namespace {

// One does for all: no case writes to it, or could.
class MisuseInstallation : public HostInstallation {
  public:
    MisuseInstallation() {
        Write("kept_resource.xml", "<Kept><Sign>still here</Sign></Kept>");
        Write("rack_resource.xml",
              "<Rack><Shelf name=\"S\"><Height>7</Height><Label localize=\"true\">eng=Name,jpn=Namae</Label>"
              "<Slot name=\"A\"><Width>1</Width><Pin name=\"Q\"><Speed>9</Speed></Pin></Slot>"
              "<Slot name=\"B\"><Width>2</Width></Slot></Shelf>"
              "<Shelf name=\"T\"><:Link name=\"L\">../S/A</:Link></Shelf></Rack>");
    }
};

const HostInstallation& Installation() {
    static const MisuseInstallation installation;
    return installation;
}

}  // namespace

TEST_P(Misuse, HasItsAnswer) {
    const HostInstallation& installation = Installation();
    const std::string special = installation.Special();
    const qn::dsc::osdep::ProgramResult result = installation.RunAsHost(
        MISUSE_HOST, {ZKFPGA_LIBRARY, STAND_IN_RUNTIME, special.substr(special.find('|') + 1), GetParam().name}, "/");
    EXPECT_EQ(result.end, GetParam().traps ? qn::dsc::osdep::endByTrap : "exit 0");
    EXPECT_EQ(result.output, GetParam().output);
    EXPECT_EQ(result.errors, "");
}

std::vector<std::string> NamesOfCases() {
    std::istringstream output(Installation().RunAsHost(MISUSE_HOST, {"list"}, "/").output);
    std::vector<std::string> names;
    for (std::string name; std::getline(output, name);) {
        names.push_back(name);
    }
    return names;
}
