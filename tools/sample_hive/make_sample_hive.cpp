// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
// make_sample_hive FILE [KEYS]: writes a small hive in the manner of a machine's SYSTEM hive, with a value of every
// type, and so many keys more.

#include "sample_layout.h"

#include <cstdio>
#include <cstdlib>
#include <utility>

namespace {

constexpr std::uint32_t expand_text = 2;

std::vector<std::uint8_t> pattern(std::size_t size) {
    std::vector<std::uint8_t> bytes(size);
    for (std::size_t i = 0; i < size; ++i) {
        bytes[i] = static_cast<std::uint8_t>(i * 7 + i / 251);
    }
    return bytes;
}

struct Service {
    const char16_t* name;
    const char16_t* title;
    const char16_t* image;
    std::uint32_t type;
    std::uint32_t start;
};

// Start: 0 boot, 1 system, 2 automatic, 3 by hand, 4 never. Type: 1 driver, 2 file system, 0x10 and 0x20
// processes.
constexpr Service services[] = {
    {u"Beep", u"Beep", u"system32\\drivers\\beep.sys", 1, 1},
    {u"cdrom", u"CD-ROM Driver", u"system32\\drivers\\cdrom.sys", 1, 1},
    {u"Dhcp", u"DHCP Client", u"%SystemRoot%\\system32\\svchost.exe -k NetworkService", 0x20, 2},
    {u"disk", u"Disk Driver", u"system32\\drivers\\disk.sys", 1, 0},
    {u"Dnscache", u"DNS Client", u"%SystemRoot%\\system32\\svchost.exe -k NetworkService", 0x20, 2},
    {u"EventLog", u"Event Log", u"%SystemRoot%\\system32\\services.exe", 0x20, 2},
    {u"Ntfs", u"Ntfs", u"system32\\drivers\\ntfs.sys", 2, 0},
    {u"Print_Spooler", u"Print Spooler", u"%SystemRoot%\\system32\\spoolsv.exe", 0x10, 2},
    {u"RemoteRegistry", u"Remote Registry", u"%SystemRoot%\\system32\\svchost.exe -k LocalService", 0x20, 4},
    {u"Tcpip", u"TCP/IP Protocol Driver", u"system32\\drivers\\tcpip.sys", 1, 1},
    {u"Themes", u"Themes", u"%SystemRoot%\\system32\\svchost.exe -k netsvcs", 0x20, 3},
    {u"usbhub", u"USB Hub Driver", u"system32\\drivers\\usbhub.sys", 1, 3},
};

void add_services(SampleKey& control_set) {
    SampleKey& all = control_set.add(u"Services");
    for (const Service& service : services) {
        SampleKey& key = all.add(service.name);
        key.set_text("DisplayName", service.title).set_text("ImagePath", service.image, expand_text);
        key.set_dword("Type", service.type).set_dword("Start", service.start).set_dword("ErrorControl", 1);
        if (key.name == u"Tcpip") {
            key.set_texts("DependOnService", {u"disk"});
            SampleKey& parameters = key.add(u"Parameters");
            parameters.set_text("Hostname", u"sample-pc").set_text("Domain", u"");
            parameters.add(u"Interfaces")
                .add(u"{00000000-1111-2222-3333-444444444444}")
                .set_dword("EnableDHCP", 1)
                .set_texts("NameServer", {u"192.0.2.1", u"192.0.2.2"});
        }
    }
}

// One value of every type, and what is odd about each.
void add_value_types(SampleKey& control) {
    SampleKey& key = control.add(u"Value Types");
    key.set_text("", u"the default value");
    key.set("Nothing", 0, {}).set("Nothing with bytes", 0, {0xDE, 0xAD, 0xBE, 0xEF});
    key.set_text("Text", u"plain text").set_text("Text, empty", u"");
    key.set_text("Text, many scripts",
                 u"Gr\u00FC\u00DFe \u041F\u0440\u0438\u0432\u0435\u0442 \u65E5\u672C\u8A9E \U0001F5C2");
    key.set_text("Text, markup", u"<b>not bold</b> & \"quoted\"");
    key.set_text("Expandable", u"%SystemRoot%\\system32", expand_text);
    key.set("Binary", 3, {0x01, 0xAB, 0x00, 0xFF, 0x7F}).set("Binary, empty", 3, {});
    key.set("Binary, in segments", 3, pattern(40000));
    key.set_dword("DWORD", 42).set_dword("DWORD, largest", 0xFFFFFFFF);
    key.set("DWORD, big-endian", 5, {0x00, 0x00, 0x01, 0x00});
    key.set("Link", 6, {'\\', 0, 'L', 0, 'i', 0, 'n', 0, 'k', 0});
    key.set_texts("List", {u"first", u"second", u"third"}).set_texts("List, empty", {});
    key.set("Resource list", 8, pattern(24)).set("Resource descriptor", 9, pattern(32));
    key.set("Resource requirements", 10, pattern(40));
    key.set_qword("QWORD", 0x1122334455667788);
    key.set("Type 1234567", 1234567, {1, 2, 3, 4, 5, 6, 7, 8, 9});
}

void add_control(SampleKey& control_set, bool complete) {
    SampleKey& control = control_set.add(u"Control");
    control.set_text("SystemBootDevice", u"multi(0)disk(0)rdisk(0)partition(1)");
    control.set_text("WaitToKillServiceTimeout", u"5000").set_dword("BootDriverFlags", 0);
    control.add(u"ComputerName").add(u"ComputerName").set_text("ComputerName", u"SAMPLE-PC");
    SampleKey& manager = control.add(u"Session Manager");
    manager.set_texts("BootExecute", {u"autocheck autochk *", u"second command"});
    manager.set_dword("ProtectionMode", 1);
    manager.add(u"Environment")
        .set_text("Path", u"%SystemRoot%\\system32;%SystemRoot%", expand_text)
        .set_text("TEMP", u"%SystemRoot%\\TEMP", expand_text)
        .set_text("OS", u"Windows_NT");
    manager.add(u"Memory Management").set_texts("PagingFiles", {u"C:\\pagefile.sys 768 1536"});
    control.add(u"TimeZoneInformation")
        .set_dword("Bias", 0xFFFFFFC4)
        .set_text("StandardName", u"W. Europe Standard Time");
    if (complete) {
        add_value_types(control);
        control.add(u"Lsa").set_dword("restrictanonymous", 0).add(u"JD").class_name = u"1a2b3c4d";
        control.add(u"Gr\u00FC\u00DFe").set_text("Kept in", u"eight bits a character");
        control.add(u"\u041A\u041B\u042E\u0427").set_text("Kept in", u"UTF-16");
    }
}

void add_many(SampleKey& root, unsigned long count) {
    constexpr unsigned long group_size = 1000;
    SampleKey& many = root.add(u"Many");
    many.subkeys.reserve(count / group_size + 1);
    for (unsigned long i = 0; i < count; ++i) {
        const auto digits = [](unsigned long number) {
            const std::string text = std::to_string(group_size * group_size + number);
            return std::u16string(text.begin(), text.end());
        };
        if (i % group_size == 0) {
            many.add(u"Group " + digits(i / group_size)).subkeys.reserve(group_size);
        }
        many.subkeys.back().add(u"Key " + digits(i)).set_dword("Number", static_cast<std::uint32_t>(i));
    }
}

SampleKey sample_tree() {
    SampleKey root{u"SampleSystem", {}, {}, {}};
    for (const bool complete : {true, false}) {
        SampleKey& control_set = root.add(complete ? u"ControlSet001" : u"ControlSet002");
        add_control(control_set, complete);
        add_services(control_set);
        control_set.add(u"Enum").add(u"Root").add(u"LEGACY_BEEP").add(u"0000").set_text("Service", u"Beep");
        control_set.add(u"Hardware Profiles").add(u"0001");
    }
    root.add(u"MountedDevices").set("\\DosDevices\\C:", 3, {0x12, 0x34, 0x56, 0x78, 0, 0x7E, 0, 0, 0, 0, 0, 0});
    root.add(u"Select")
        .set_dword("Current", 1)
        .set_dword("Default", 1)
        .set_dword("Failed", 0)
        .set_dword("LastKnownGood", 2);
    root.add(u"Setup").set_dword("SetupType", 0).set_text("CmdLine", u"");
    return root;
}

bool write_file(const char* path, const std::vector<std::uint8_t>& bytes) {
    std::FILE* file = std::fopen(path, "wb");
    if (file == nullptr) {
        return false;
    }
    const bool written = std::fwrite(bytes.data(), 1, bytes.size(), file) == bytes.size();
    return std::fclose(file) == 0 && written;
}

}  // namespace

int main(int argc, char** argv) {
    if (argc != 2 && argc != 3) {
        std::fputs("usage: make_sample_hive FILE [KEYS]\n", stderr);
        return 1;
    }
    SampleKey root = sample_tree();
    if (argc == 3) {
        add_many(root, std::strtoul(argv[2], nullptr, 10));
    }
    if (!write_file(argv[1], lay_out_hive(std::move(root), u"SYSTEM"))) {
        std::perror(argv[1]);
        return 1;
    }
    return 0;
}
