' The part of examples/tides.vbs that Wine's VBScript can run, with checks. Wine's engine
' stops where Windows' goes on; these steps of the example are left out here:
'   - UBound on the port array (VT_ARRAY|VT_UNKNOWN) fails, so the box is only told empty
'     or not empty;
'   - a port held as IUnknown (GetPort's result) cannot be called: no name, no day.
' The day itself is checked through JScript in tides_example_check.js.
' Wine's cscript exits 0 after a script error: every step runs under On Error Resume Next,
' results go into variables first, and the exit status comes from the checks.
On Error Resume Next
failures = 0
Sub Check(ok, what)
  If Err.Number <> 0 Then
    WScript.Echo "FAILED: " & what & " (error " & Hex(Err.Number) & " " & Err.Description & ")"
    failures = failures + 1
    Err.Clear
  ElseIf Not ok Then
    WScript.Echo "FAILED: " & what
    failures = failures + 1
  End If
End Sub

Set fso = CreateObject("Scripting.FileSystemObject")
root = fso.GetParentFolderName(fso.GetParentFolderName(fso.GetParentFolderName(fso.GetParentFolderName(WScript.ScriptFullName))))
folder = fso.BuildPath(root, "data\world")
' The set's own list has a header and one line per station. No loops here: under
' On Error Resume Next a failing loop condition would never end.
text = fso.OpenTextFile(fso.BuildPath(folder, "stations.tsv"), 1).ReadAll
If Right(text, 1) = vbLf Then text = Left(text, Len(text) - 1)
expected = UBound(Split(text, vbLf))
Check expected > 1000, "stations.tsv lists the world set's stations"

Set db = CreateObject("BR_Info.TidesDatabase")
Check IsObject(db), "BR_Info.TidesDatabase is created by its programmatic identifier"
db.Initialize folder
Check True, "Initialize opens " & folder
count = db.NumPorts
Check count = expected, "NumPorts " & count & " against " & expected & " lines of stations.tsv"

box = db.GetPorts(47.5, -6, 49.5, -3)
Check IsArray(box), "western Brittany holds stations"
ocean = db.GetPorts(40, -40, 41, -39)
Check IsEmpty(ocean), "an open-ocean box is Empty"

WScript.Echo "script completed"
WScript.Quit failures
