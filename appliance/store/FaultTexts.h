/// What can go wrong: the name of each failure in this program, its code, and its sentence in
/// English and in German. %1 and %2 stand for the failure's words.
///
/// Codes from 1001 are of the command line, from 2001 of the state, others of what was asked for.
#ifndef APPLIANCE_FAULTTEXTS_H
#define APPLIANCE_FAULTTEXTS_H

/// @param FAULT  (name, code, english, german)
// clang-format off
#define APPLIANCE_FAULTS(FAULT) \
    FAULT(UnknownOption, 1001, "The option %1 is not known.",                                      \
      "Die Option %1 ist nicht bekannt.")                                                          \
    FAULT(MissingValue, 1002, "The option %1 needs a value.",                                      \
      "Die Option %1 braucht einen Wert.")                                                         \
    FAULT(MissingOption, 1003, "The option %1 is missing.", "Die Option %1 fehlt.")                \
    FAULT(BadOptionValue, 1004, "The option %1 cannot have the value \"%2\".",                     \
      "Die Option %1 kann den Wert \"%2\" nicht haben.")                                           \
    FAULT(RepeatedOption, 1005, "The option %1 is given more than once.",                          \
      "Die Option %1 ist mehrfach angegeben.")                                                     \
    FAULT(UnexpectedArgument, 1006, "The argument \"%1\" belongs to no option.",                   \
      "Das Argument \"%1\" gehört zu keiner Option.")                                              \
    FAULT(UnknownAttribute, 1007, "The attribute \"%1\" is not known.",                            \
      "Das Attribut \"%1\" ist nicht bekannt.")                                                    \
    FAULT(UnknownFilter, 1008, "The filter \"%1\" is not known.",                                  \
      "Der Filter \"%1\" ist nicht bekannt.")                                                      \
    FAULT(BadFilter, 1009, "The filter \"%1\" is not of the form name=value.",                     \
      "Der Filter \"%1\" hat nicht die Form name=wert.")                                           \
    FAULT(UnknownTool, 1010, "There is no tool with the name \"%1\".",                             \
      "Es gibt kein Werkzeug mit dem Namen \"%1\".")                                               \
    FAULT(BadValue, 1011, "The attribute %1 cannot have the value \"%2\".",                        \
      "Das Attribut %1 kann den Wert \"%2\" nicht haben.")                                         \
    FAULT(BadSetting, 1012, "The item \"%1\" is not of the form name=value.",                      \
      "Die Angabe \"%1\" hat nicht die Form name=wert.")                                           \
    FAULT(RepeatedSetting, 1013, "The attribute %1 is given more than once.",                      \
      "Das Attribut %1 ist mehrfach angegeben.")                                                   \
    FAULT(MissingSetting, 1014, "The attribute %1 is missing.", "Das Attribut %1 fehlt.")          \
    FAULT(NotAList, 1015, "The attribute %1 is no list: it can only be set.",                      \
      "Das Attribut %1 ist keine Liste: es kann nur gesetzt werden.")                              \
    FAULT(NoHome, 2001,                                                                            \
      "The environment variable APPLIANCE_HOME does not name the appliance's folder.",             \
      "Die Umgebungsvariable APPLIANCE_HOME nennt den Ordner der Appliance nicht.")                \
    FAULT(NoState, 2002,                                                                           \
      "There is no appliance in %1: make one with \"appliance init\" or \"appliance generate\".",  \
      "In %1 ist keine Appliance: \"appliance init\" oder \"appliance generate\" legt eine an.")   \
    FAULT(StateVersion, 2003,                                                                      \
      "The appliance's state has version %1; this program reads version %2.",                      \
      "Der Zustand der Appliance hat Version %1; dieses Programm liest Version %2.")               \
    FAULT(StateExists, 2004, "There is an appliance in %1 already; --force replaces it.",          \
      "In %1 ist schon eine Appliance; --force ersetzt sie.")                                      \
    FAULT(StateUnusable, 2005, "The appliance's state %1 cannot be used: %2.",                     \
      "Der Zustand %1 der Appliance ist nicht zu benutzen: %2.")                                   \
    FAULT(StateBusy, 2006, "Other changes kept the appliance's state %1 busy for too long.",       \
      "Andere Änderungen haben den Zustand %1 der Appliance zu lange belegt.")                     \
    FAULT(Output, 2007, "The output cannot be written: %1.",                                       \
      "Die Ausgabe ist nicht zu schreiben: %1.")                                                   \
    FAULT(NoSingleHostManager, 3001, "This appliance is not the manager of a single host.",        \
      "Diese Appliance ist nicht der Verwalter eines einzelnen Hosts.")                            \
    FAULT(LparNameNotFound, 8010, "The partition with the name \"%1\" was not found.",             \
      "Die Partition mit dem Namen \"%1\" wurde nicht gefunden.")                                  \
    FAULT(LparIdNotFound, 8011, "The partition with the ID %1 was not found.",                     \
      "Die Partition mit der ID %1 wurde nicht gefunden.")                                         \
    FAULT(HostNotFound, 8018, "The managed system \"%1\" was not found.",                          \
      "Das verwaltete System \"%1\" wurde nicht gefunden.")                                        \
    FAULT(NotIoServer, 8019, "The partition with the ID %1 is no I/O server.",                     \
      "Die Partition mit der ID %1 ist kein I/O-Server.")                                          \
    FAULT(LparNotRunning, 8020, "The partition with the ID %1 is not running.",                    \
      "Die Partition mit der ID %1 läuft nicht.")                                                  \
    FAULT(Unsound, 8030, "The managed system refuses the change: %1.",                             \
      "Das verwaltete System lehnt die Änderung ab: %1.")                                          \
    FAULT(ProfileNotFound, 8031, "The partition has no profile with the name \"%1\".",             \
      "Die Partition hat kein Profil mit dem Namen \"%1\".")                                       \
    FAULT(NameTaken, 8032, "The name \"%1\" is taken.", "Der Name \"%1\" ist vergeben.")           \
    FAULT(IdTaken, 8033, "The partition ID %1 is taken.", "Die Partitions-ID %1 ist vergeben.")    \
    FAULT(TooManyLpars, 8034, "The managed system can have no more than %1 partitions.",           \
      "Das verwaltete System kann höchstens %1 Partitionen haben.")                                \
    FAULT(NotCapable, 8035, "The managed system cannot do what the attribute %1 asks for.",        \
      "Das verwaltete System kann nicht, was das Attribut %1 verlangt.")                           \
    FAULT(OutsideLimits, 8036, "The attribute %1 would be outside its limits.",                    \
      "Das Attribut %1 läge außerhalb seiner Grenzen.")                                            \
    FAULT(Disagree, 8037, "The attributes %1 and %2 do not go together.",                          \
      "Die Attribute %1 und %2 passen nicht zusammen.")                                            \
    FAULT(NotEnough, 8038, "The managed system has not enough left: %1 is %2.",                    \
      "Das verwaltete System hat nicht genug übrig: %1 ist %2.")                                   \
    FAULT(ElementThere, 8039, "The list %1 has \"%2\" already.",                                   \
      "Die Liste %1 hat \"%2\" schon.")                                                            \
    FAULT(ElementMissing, 8040, "The list %1 does not have \"%2\".",                               \
      "Die Liste %1 hat \"%2\" nicht.")                                                            \
    FAULT(SlotNotFound, 8041, "The managed system has no physical slot %1.",                       \
      "Das verwaltete System hat keinen physischen Steckplatz %1.")                                \
    FAULT(SlotNotFree, 8042, "The physical slot %1 belongs to the partition with the ID %2.",      \
      "Der physische Steckplatz %1 gehört der Partition mit der ID %2.")                           \
    FAULT(SlotNotHeld, 8043, "The partition does not have the physical slot %1.",                  \
      "Die Partition hat den physischen Steckplatz %1 nicht.")                                     \
    FAULT(VirtualSlotNotFree, 8044,                                                                \
      "The virtual slot %1 is taken, or not one that the partition can use.",                      \
      "Der virtuelle Steckplatz %1 ist belegt oder für die Partition nicht benutzbar.")            \
    FAULT(AdapterNotFound, 8045, "The partition has no such adapter in its virtual slot %1.",      \
      "Die Partition hat keinen solchen Adapter in ihrem virtuellen Steckplatz %1.")               \
    FAULT(Required, 8046, "What is in slot %1 is required and cannot be removed.",                 \
      "Was in Steckplatz %1 ist, wird gebraucht und kann nicht entfernt werden.")                  \
    FAULT(InUse, 8047, "This is in use by the partition with the ID %1.",                          \
      "Dies wird von der Partition mit der ID %1 benutzt.")                                        \
    FAULT(HostState, 8048, "The managed system \"%1\" cannot do this in the state \"%2\".",        \
      "Das verwaltete System \"%1\" kann dies im Zustand \"%2\" nicht.")                           \
    FAULT(LparState, 8049, "The partition with the ID %1 cannot do this in the state \"%2\".",     \
      "Die Partition mit der ID %1 kann dies im Zustand \"%2\" nicht.")                            \
    FAULT(LparMoving, 8050, "The partition with the ID %1 is moving to another managed system.",   \
      "Die Partition mit der ID %1 zieht auf ein anderes verwaltetes System um.")                  \
    FAULT(NoResources, 8051,                                                                       \
      "The partition with the ID %1 has no resources before it is activated.",                     \
      "Die Partition mit der ID %1 hat keine Ressourcen, bevor sie aktiviert wird.")               \
    FAULT(NoSuchSystemProfile, 8060,                                                               \
      "The managed system has no system profile with the name \"%1\".",                            \
      "Das verwaltete System hat kein Systemprofil mit dem Namen \"%1\".")                         \
    FAULT(NoPool, 8061,                                                                            \
      "The managed system does not have the pool that the attribute %1 asks for.",                 \
      "Das verwaltete System hat den Pool nicht, den das Attribut %1 verlangt.")                   \
    FAULT(NoServerAdapter, 8062,                                                                   \
      "No server adapter is free for the client adapter in the virtual slot %1.",                  \
      "Für den Client-Adapter im virtuellen Steckplatz %1 ist kein Server-Adapter frei.")          \
    FAULT(LparsActive, 8063, "Partitions are active on the managed system; --immed ends them.",    \
      "Auf dem verwalteten System sind Partitionen aktiv; --immed beendet sie.")                   \
    FAULT(NotSuspendable, 8064,                                                                    \
      "The partition with the ID %1, or its managed system, cannot suspend.",                      \
      "Die Partition mit der ID %1 oder ihr verwaltetes System kann nicht anhalten.")              \
    FAULT(NoSuspension, 8065,                                                                      \
      "No suspension of the partition with the ID %1 is under way or has failed.",                 \
      "Ein Anhalten der Partition mit der ID %1 ist weder im Gang noch misslungen.")               \
    FAULT(LparStays, 8066,                                                                         \
      "The partition with the ID %1 is an I/O server or the service partition.",                   \
      "Die Partition mit der ID %1 ist ein I/O-Server oder die Service-Partition.")                \
    FAULT(PhysicalAdapters, 8067, "The partition with the ID %1 has physical adapters.",           \
      "Die Partition mit der ID %1 hat physische Adapter.")                                        \
    FAULT(JoinedAdapters, 8068,                                                                    \
      "The adapter in the virtual slot %1 joins the partition to one that stays.",                 \
      "Der Adapter im virtuellen Steckplatz %1 verbindet die Partition mit einer, die bleibt.")    \
    FAULT(NotMovable, 8069, "The managed system \"%1\" takes no part in such a move.",             \
      "Das verwaltete System \"%1\" nimmt an einem solchen Umzug nicht teil.")                     \
    FAULT(TooManyMoves, 8070,                                                                      \
      "The managed system \"%1\" has as many moves under way as it supports.",                     \
      "Auf dem verwalteten System \"%1\" sind so viele Umzüge im Gang, wie es unterstützt.")       \
    FAULT(NoMover, 8071, "No I/O server runs on the managed system \"%1\".",                       \
      "Auf dem verwalteten System \"%1\" läuft kein I/O-Server.")                                  \
    FAULT(NoServerSlot, 8072,                                                                      \
      "No I/O server of the managed system \"%1\" has a virtual slot left.",                       \
      "Kein I/O-Server des verwalteten Systems \"%1\" hat noch einen virtuellen Steckplatz.")      \
    FAULT(NotMoving, 8073,                                                                         \
      "The partition with the ID %1 is not moving away from this managed system.",                 \
      "Die Partition mit der ID %1 zieht nicht von diesem verwalteten System weg.")                \
    FAULT(MoveStopped, 8074, "The move of the partition with the ID %1 was stopped.",              \
      "Der Umzug der Partition mit der ID %1 wurde angehalten.")                                   \
    FAULT(OtherManager, 8075,                                                                      \
      "The manager \"%1\" cannot be reached: moves stay within this appliance.",                   \
      "Der Verwalter \"%1\" ist nicht erreichbar: Umzüge bleiben innerhalb dieser Appliance.")
// clang-format on

#endif
