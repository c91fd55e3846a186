' TidesDatabase as a VBScript client uses it, on the embedded world station set: refusals
' as errors, and the ports as an array of objects. (Wine's VBScript cannot call the ports.)
Option Explicit
Dim fso, root, db, n, r, failures
failures = 0
Sub Check(condition, what)
  If Not condition Then WScript.Echo "FAILED: " & what : failures = failures + 1
End Sub

Set fso = CreateObject("Scripting.FileSystemObject")
root = fso.GetParentFolderName(WScript.ScriptFullName)
root = fso.GetParentFolderName(fso.GetParentFolderName(fso.GetParentFolderName(fso.GetParentFolderName(root))))
Set db = CreateObject("BR_Info.TidesDatabase")
On Error Resume Next
n = db.NumPorts
Check Err.Number = 70, "NumPorts before Initialize is refused, got error " & Err.Number
Err.Clear
db.Initialize fso.BuildPath(root, "data\world")
Check Err.Number = 0, "Initialize: error " & Err.Number & " " & Err.Description
On Error GoTo 0

n = db.NumPorts
Check n > 100, "the world set has its stations: " & n
r = db.GetPorts(-90, -180, 90, 180)
Check VarType(r) = (vbArray + vbObject) Or VarType(r) = (vbArray + 13), "an array of object references: " & VarType(r)
r = Empty
Set db = Nothing
WScript.Echo "script completed"
WScript.Quit failures
