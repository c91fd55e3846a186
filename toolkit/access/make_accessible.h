#pragma once
// Which components speak for themselves to accessibility clients.

namespace toolkit {

class ComponentAccessible;
class cXComponent;

// A new accessible object (one reference, the caller's) for a self-drawn
// component: a table, a label, a button or an edit. Null for every other
// component: containers are read through their child windows and native
// controls through the platform, both by the platform's standard objects.
ComponentAccessible* makeAccessible(cXComponent& component);

}  // namespace toolkit
