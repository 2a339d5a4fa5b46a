#!/usr/bin/env python3
"""Lays out an installation of generated targets, the same bytes for the same arguments on every machine.

    bench/MakeInstallation.py FOLDER [--megabytes 20] [--targets 200]

A target is a mix of what real descriptions hold: plain resources, instances of prototypes, `names` ranges, ordered
lists, localised texts, parameters, links, reservations and an include. One megabyte has about 27,000 elements, which
grow to about 60,000 entries in the tree. Device specifications and small menu folders are there, so that a
run of the tool on the installation ends with 0.
"""

import argparse
import pathlib
import random
import shutil

HEAD = '<?xml version="1.0" encoding="utf-8"?>\n'
FAMILIES = ["virtex5", "virtex6", "spartan6", "kintex7"]
STANDARDS = ["LVCMOS33", "LVCMOS25", "LVCMOS18", "LVDS_25", "SSTL18_II"]
SIGNALS = ["IIC_Main_SerialClock", "LCD_DB", "PS2_Keyboard_SerialData", "UART_TX", "DVI_D", "Ethernet_RX", "SRAM_A"]

COMMON_CLOCKS = HEAD + """<CommonClocks>
 <ClockList>
  <Clock names="Clock[i=0..7]"><Index>#{i}</Index><Label>#{name} on #{Board}</Label><Hertz>40000000</Hertz></Clock>
 </ClockList>
</CommonClocks>
"""

HOSTS = HEAD + """<FPGAHostSet>
 <HostA><DisplayName localize="true">eng=Local host,jpn=\u30ed\u30fc\u30ab\u30eb</DisplayName></HostA>
 <HostB>1</HostB>
</FPGAHostSet>
"""

SPECS = HEAD + """<FpgaDeviceSpecs>
 <Virtex5><XIPINMenusPath>menus/virtex5</XIPINMenusPath></Virtex5>
 <Virtex6><XIPINMenusPath>menus/virtex6</XIPINMenusPath></Virtex6>
 <spartan6><XIPINMenusPath>menus/spartan6</XIPINMenusPath></spartan6>
</FpgaDeviceSpecs>
"""


def head_of_target(name, family):
    return f"""{HEAD}<Target name="{name}" Board="{name}">
 <DeviceCategory>Development board</DeviceCategory>
 <SupportedFPGAHostList>HostA,HostB</SupportedFPGAHostList>
 <DeviceIDs>0x{name[-4:]},0x1{name[-4:]}</DeviceIDs>
 <DisplayName localize="true">eng=Board {name},jpn=\u30dc\u30fc\u30c9 {name}</DisplayName>
 <FPGACompilation><DeviceFamily>{family}</DeviceFamily><Part>XC5VLX50T-1FF1136</Part></FPGACompilation>
 <:Include what="children">Targets/QN/FPGA/common/clocks.xml</:Include>
 <:Link name="DefaultClock">ClockList/Clock3</:Link>
 <Prototypes ordered="false">
  <Line name="DigitalLine"><Kind>digital</Kind><Pin>#{{Pin}}</Pin><Standard>#{{Standard}}</Standard>\
<Label>Line on pin #{{Pin}} of #{{Board}}</Label><HelpPath>help/lines/digital.html</HelpPath>\
<Options><Pull>none</Pull><Slew>slow</Slew><Drive>12</Drive></Options></Line>
  <Line name="AnalogLine"><Kind>analog</Kind><Pin>#{{Pin}}</Pin><Range>10</Range><Label>Analog #{{Pin}}</Label>\
<Modes><Differential>1</Differential><Single>0</Single></Modes></Line>
 </Prototypes>
 <Resources ordered="true">
"""


def resource(number, rng):
    """A resource with everything spelled out: 9 elements, 9 entries."""
    signal = rng.choice(SIGNALS)
    bank = rng.randrange(32)
    return (
        f'  <IOResource name="{signal}_{number}">\n'
        f"   <Kind>digital</Kind>\n   <Pin>{rng.choice('ABCDEFGH')}{rng.randrange(1, 35)}</Pin>\n"
        f"   <Bank>{bank}</Bank>\n   <Standard>{rng.choice(STANDARDS)}</Standard>\n"
        f'   <Label localize="true">eng=Line {number},jpn=\u7dda {number}</Label>\n'
        f"   <HelpPath>help/lines/{signal}.html</HelpPath>\n"
        f"   <Reserves>/Board/Bank{bank},../Clock</Reserves>\n"
        f"   <Drive>{rng.choice([4, 8, 12])}</Drive>\n  </IOResource>\n")


def instance(number, rng):
    """An instance of a prototype that overrides one value: 2 elements, 10 or 8 entries."""
    digital = rng.random() < 0.7
    prototype = "DigitalLine" if digital else "AnalogLine"
    standard = f' Standard="{rng.choice(STANDARDS)}"' if digital else ""
    return (
        f'  <Line name="L{number}" prototype="#{{document-root}}/Prototypes/{prototype}" '
        f'Pin="{rng.choice("ABCDEFGH")}{rng.randrange(1, 35)}"{standard}>'
        f"<Label>L{number} &lt;{rng.choice(SIGNALS)}&gt;</Label></Line>\n")


def port(number, rng):
    """A port whose lines are replicated by `names`: 6 elements, 2 + 4 * copies entries."""
    copies = rng.choice([4, 8])
    return (
        f'  <Port name="Port{number}">\n   <Width>{copies}</Width>\n'
        f'   <Bit names="Bit[i=0..{copies - 1}]"><Index>#{{i}}</Index><Label>#{{name}} of port {number}</Label>'
        f"<Pull>up</Pull></Bit>\n  </Port>\n")


def link_and_lists(number, rng):
    """What is neither of these: an ordered list of texts, and a link to a clock: 8 elements, 8 entries."""
    return (
        f'  <Group name="Group{number}">\n   <SignalList ordered="true"><Signal>{rng.choice(SIGNALS)}</Signal>'
        f"<Signal>{rng.choice(SIGNALS)}</Signal><Signal>{rng.choice(SIGNALS)}</Signal></SignalList>\n"
        f'   <:Link name="Clock">#{{document-root}}/ClockList/Clock{rng.randrange(8)}</:Link>\n'
        f"   <Protocols>a,b</Protocols><Note>{rng.randrange(10**6)}</Note>\n  </Group>\n")


def target(name, size, rng):
    """The text of a target of about `size` bytes."""
    parts = [head_of_target(name, FAMILIES[rng.randrange(len(FAMILIES))])]
    length = len(parts[0].encode())
    number = 0
    while length < size:
        make = rng.choices([resource, instance, port, link_and_lists], [38, 30, 26, 6])[0]
        text = make(number, rng)
        parts.append(text)
        length += len(text.encode())
        number += 1
    parts.append(" </Resources>\n</Target>\n")
    return "".join(parts)


def main():
    parser = argparse.ArgumentParser(description=__doc__, formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("folder", type=pathlib.Path)
    parser.add_argument("--megabytes", type=float, default=20)
    parser.add_argument("--targets", type=int, default=200)
    options = parser.parse_args()

    shutil.rmtree(options.folder, ignore_errors=True)
    working = options.folder / "Targets" / "QN" / "FPGA"
    (working / "Utilities").mkdir(parents=True)
    (working / "common").mkdir()
    (options.folder / "Zarvik.exe").write_bytes(b"")
    (working / "common" / "clocks.xml").write_text(COMMON_CLOCKS, encoding="utf-8")
    (working / "hosts_resource.xml").write_text(HOSTS, encoding="utf-8")
    (working / "specs_resource.xml").write_text(SPECS, encoding="utf-8")
    for family in FAMILIES[:3]:
        folder = options.folder / "menus" / family
        folder.mkdir(parents=True)
        for menu in ("dir.mnu", "io.mnu"):
            (folder / menu).write_text(f"menu {menu} of {family}\n" * 20, encoding="utf-8")

    size = int(options.megabytes * 1_000_000 / options.targets)
    for index in range(options.targets):
        name = f"Board{index:04}"
        folder = working / name
        folder.mkdir()
        text = target(name, size, random.Random(index))
        (folder / f"{name}_resource.xml").write_text(text, encoding="utf-8")


main()
