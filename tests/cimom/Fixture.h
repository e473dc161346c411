/// What the tests of the object manager share: classes, the fixture provider, and both brokers.
#ifndef TESTS_CIMOM_FIXTURE_H
#define TESTS_CIMOM_FIXTURE_H

#include "BothBrokers.h"
#include "Folder.h"

extern "C" {
CMPIInstanceMI* Fixture_Create_InstanceMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
CMPIAssociationMI* Fixture_Create_AssociationMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
CMPIMethodMI* Fixture_Create_MethodMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
CMPIIndicationMI* Fixture_Create_IndicationMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
CMPIPropertyMI* Fixture_Create_PropertyMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
}

namespace fixture {

constexpr const char* kMof = R"(
Qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride);
Qualifier Association : boolean = false, Scope(association), Flavor(DisableOverride);
Qualifier Indication : boolean = false, Scope(class, indication), Flavor(DisableOverride);
Qualifier EmbeddedInstance : string = null, Scope(property, parameter, method);
Qualifier In : boolean = true, Scope(parameter);
Qualifier Out : boolean = false, Scope(parameter);
Qualifier Units : string = null, Scope(property);
class Fix_Base {
    [Key] string Name;
};
class Fix_Thing : Fix_Base {
    [Units("Bytes")] uint32 Size;
    uint16 State = 5;
    datetime Since;
    string Tags[];
    [EmbeddedInstance("Fix_Base")] string Part;
    uint32 Echo([In] uint16 Number, [In] string Names[], [In] Fix_Base REF Thing,
                [In, EmbeddedInstance("Fix_Thing")] string Parts[]);
    uint32 Context();
    uint32 Relay([In] uint16 Number);
    uint32 Fire([In] uint16 Severity);
};
[Association] class Fix_Link {
    [Key] Fix_Base REF Antecedent;
    [Key] Fix_Base REF Dependent;
};
[Association] class Fix_Tie : Fix_Link {
};
[Association] class Fix_Foreign {
    [Key] Fix_Event REF One;
    [Key] Fix_Event REF Other;
};
[Indication] class Fix_Event {
    uint16 Severity;
};
[Indication] class Fix_Alarm : Fix_Event {
};
)";

inline std::shared_ptr<const cimom::ClassRepository> classes() {
    static const auto repository =
        cimom::ClassRepository::load("fixture.mof", [](const std::string&) { return kMof; });
    return repository;
}

inline cimom::Factories factories() {
    return {Fixture_Create_InstanceMI, Fixture_Create_AssociationMI, Fixture_Create_MethodMI,
            Fixture_Create_IndicationMI, Fixture_Create_PropertyMI};
}

inline cimom::ObjectPath thing(const std::string& name) {
    return {"root/cimv2", "Fix_Thing", {{"Name", name}}};
}

inline std::string textOf(const CMPIString* string) {
    const char* text = string ? string->ft->getCharPtr(string, nullptr) : nullptr;
    return text ? text : "(null)";
}

}  // namespace fixture

#endif
