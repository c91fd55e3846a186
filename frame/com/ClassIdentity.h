// What the frame needs to know about an automation class: its GUIDs and its name.
#pragma once

#include <windows.h>

namespace br::com {

struct ClassIdentity {
  const CLSID* clsid;
  const IID* dual;      // the class's dual interface (described in the type library)
  const IID* events;    // its default source dispinterface, or nullptr when it has none
  const wchar_t* name;  // class name; "BR_Info." + name is its programmatic identifier
};

}  // namespace br::com
