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
    const char* english;  ///< what the tool is for
    const char* german;
};

inline constexpr ToolName kToolNames[] = {
    {kQyplat, "qyplat", "lists managed systems, partitions and profiles",
     "listet verwaltete Systeme, Partitionen und Profile auf"},
    {kQyalloc, "qyalloc", "lists the resources of managed systems and who has them",
     "listet die Ressourcen verwalteter Systeme auf, und wer sie hat"},
    {kQymove, "qymove", "lists what can move between managed systems, and what moves",
     "listet auf, was zwischen verwalteten Systemen umziehen kann und was umzieht"},
    {kQyusage, "qyusage", "lists utilisation samples", "listet Messungen der Auslastung auf"},
    {kQyfault, "qyfault", "lists reference codes", "listet Referenzcodes auf"},
    {kQylink, "qylink", "lists the connections to managed systems",
     "listet die Verbindungen zu verwalteten Systemen auf"},
    {kQylwh, "qylwh", "names the host that this appliance alone manages, and its partition",
     "nennt den Host, den allein diese Appliance verwaltet, und ihre Partition darauf"},
    {kQydyn, "qydyn", "lists what partitions can change while they run",
     "listet auf, was Partitionen im laufenden Betrieb ändern können"},
    {kXbrgcli, "xbrgcli", "has a running I/O server carry out a command",
     "lässt einen laufenden I/O-Server einen Befehl ausführen"},
    {kEdalloc, "edalloc", "changes the resources that a partition has now",
     "ändert die Ressourcen, die eine Partition jetzt hat"},
    {kEdplat, "edplat", "changes managed systems, partitions and profiles",
     "ändert verwaltete Systeme, Partitionen und Profile"},
    {kNwplat, "nwplat", "makes a partition", "legt eine Partition an"},
    {kDlplat, "dlplat", "deletes a partition", "löscht eine Partition"},
    {kEdpower, "edpower", "starts and stops managed systems and partitions",
     "startet und beendet verwaltete Systeme und Partitionen"},
    {kEdsusp, "edsusp", "suspends and resumes partitions",
     "hält Partitionen an und setzt sie fort"},
    {kDomove, "domove", "moves a partition to another managed system",
     "zieht eine Partition auf ein anderes verwaltetes System um"},
};

}  // namespace appliance

#endif
