/// The tools that one program is, by the names by which it is called.
#ifndef APPLIANCE_TOOLS_H
#define APPLIANCE_TOOLS_H

namespace appliance {

/// The tools of the program, as bits, so that an option can name those that have it.
enum Tool : unsigned {
    kQyplat = 1,
    kQyalloc = 2,
    kQymove = 4,
    kQyusage = 8,
    kQyfault = 16,
    kQylink = 32,
    kQylwh = 64,
    kQydyn = 128,
    kXbrgcli = 256,
    kEdalloc = 512,
    kEdplat = 1024,
    kNwplat = 2048,
    kDlplat = 4096,
    kEdpower = 8192,
    kEdsusp = 16384,
    kDomove = 32768,
};

struct ToolName {
    Tool tool;
    const char* name;
    const char* purpose;
};

inline constexpr ToolName kToolNames[] = {
    {kQyplat, "qyplat", "lists managed systems, partitions and profiles"},
    {kQyalloc, "qyalloc", "lists the resources of managed systems and who has them"},
    {kQymove, "qymove", "lists what can move between managed systems, and what moves"},
    {kQyusage, "qyusage", "lists utilisation samples"},
    {kQyfault, "qyfault", "lists reference codes"},
    {kQylink, "qylink", "lists the connections to managed systems"},
    {kQylwh, "qylwh", "names the host that this appliance alone manages, and its partition"},
    {kQydyn, "qydyn", "lists what partitions can change while they run"},
    {kXbrgcli, "xbrgcli", "has a running I/O server carry out a command"},
    {kEdalloc, "edalloc", "changes the resources that a partition has now"},
    {kEdplat, "edplat", "changes managed systems, partitions and profiles"},
    {kNwplat, "nwplat", "makes a partition"},
    {kDlplat, "dlplat", "deletes a partition"},
    {kEdpower, "edpower", "starts and stops managed systems and partitions"},
    {kEdsusp, "edsusp", "suspends and resumes partitions"},
    {kDomove, "domove", "moves a partition to another managed system"},
};

}  // namespace appliance

#endif
