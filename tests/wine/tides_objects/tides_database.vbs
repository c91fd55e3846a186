' TidesDatabase as a VBScript client uses it: created by programmatic identifier, opened
' on the embedded world station set. Wine's VBScript cannot call methods on the ports
' (they come back as IUnknown) nor pass ByRef arguments, so this stays with the database.
' (A later folder being ignored: the tides_database suite.)
Option Explicit
Dim fso, root, folder, db, port, n, r, x, failures
failures = 0

Sub Check(condition, what)
  If Not condition Then
    WScript.Echo "FAILED: " & what
    failures = failures + 1
  End If
End Sub

Set fso = CreateObject("Scripting.FileSystemObject")
root = fso.GetParentFolderName(WScript.ScriptFullName)
root = fso.GetParentFolderName(fso.GetParentFolderName(fso.GetParentFolderName(root)))
folder = fso.BuildPath(root, "data\world")

Set db = CreateObject("BR_Info.TidesDatabase")
On Error Resume Next
n = db.NumPorts
Check Err.Number = 70, "NumPorts before Initialize is refused, got error " & Err.Number
Err.Clear
db.Initialize fso.BuildPath(root, "no such folder")
Check Err.Number = &H80070057, "a folder without station files is refused (E_INVALIDARG), got error " & Err.Number
Err.Clear
db.Initialize folder
Check Err.Number = 0, "Initialize " & folder & ": error " & Err.Number & " " & Err.Description
Err.Clear
Set port = CreateObject("BR_Info.TidesPort")
x = port.PortName
Check Err.Number = 70, "a port created directly is refused, got error " & Err.Number
Err.Clear
On Error GoTo 0

n = db.NumPorts
Check n > 100, "the world set has its stations: " & n

r = db.GetPorts(-90, -180, 90, 180)
' (Wine's VBScript cannot look inside an array of objects: UBound ends the script.)
Check VarType(r) = (vbArray + vbObject) Or VarType(r) = (vbArray + 13), "an array of object references: " & VarType(r)
r = Empty
Set db = Nothing

If failures = 0 Then WScript.Echo "ok: " & n & " stations"
WScript.Echo "script completed"
WScript.Quit failures
