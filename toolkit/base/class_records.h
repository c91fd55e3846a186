#pragma once
// The records of every toolkit class, widgets and panels built on the toolkit
// included. They are constant data, ready before any code of the library runs.
// A class answers its record from getClassRecord:
//   const ClassRecord* getClassRecord() const override { return &records::Choice; }

#include "toolkit/base/ClassRecord.h"

namespace toolkit::records {

extern const ClassRecord Object;
extern const ClassRecord cXComponent;
extern const ClassRecord Layout;
extern const ClassRecord FlowLayout;
extern const ClassRecord BorderLayout;
extern const ClassRecord GridLayout;
extern const ClassRecord TabLayout;
extern const ClassRecord SplitterLayout;
extern const ClassRecord ContainedWindow;
extern const ClassRecord Container;
extern const ClassRecord Panel;
extern const ClassRecord TabContainer;
extern const ClassRecord cXEdit;
extern const ClassRecord Button;
extern const ClassRecord Label;
extern const ClassRecord AXComponent;
extern const ClassRecord Display;
extern const ClassRecord TextProgressBar;
extern const ClassRecord cXEdit2;
extern const ClassRecord RadioButton;
extern const ClassRecord CheckButton;
extern const ClassRecord Check;
extern const ClassRecord Choice;
extern const ClassRecord ProgressBar;
extern const ClassRecord cXDateTime;
extern const ClassRecord cXEditW;
extern const ClassRecord cXTextDescr;
extern const ClassRecord cP_SHPanel;
extern const ClassRecord cLightsViewPanel;
extern const ClassRecord cHierarchyPanel;
extern const ClassRecord cXPictDescr;
extern const ClassRecord cAttrViewPanel_Tbl;
extern const ClassRecord cXPictDescr_AXPictDescr;  // cXPictDescr::AXPictDescr

}  // namespace toolkit::records
