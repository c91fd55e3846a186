' The tide road from VBScript: open the world station set, count the stations in a box,
' find Brest, calculate today's tides and read the extremes, sun times and every point.
'   cscript //nologo tides.vbs [station folder]
Set fso = CreateObject("Scripting.FileSystemObject")
folder = fso.BuildPath(fso.GetParentFolderName(fso.GetParentFolderName(WScript.ScriptFullName)), "data\world")
If WScript.Arguments.Count > 0 Then folder = WScript.Arguments(0)
Set db = CreateObject("BR_Info.TidesDatabase")
db.Initialize folder
WScript.Echo db.NumPorts & " stations in " & folder

' GetPorts gives an array of TidesPort objects, or Empty for an empty box. VBScript can
' count it but index only arrays of Variants.
ports = db.GetPorts(47.5, -6, 49.5, -3)
If IsEmpty(ports) Then n = 0 Else n = UBound(ports) + 1
WScript.Echo "47.5N 6W to 49.5N 3W: " & n & " stations"

For i = 0 To db.NumPorts - 1
  Set port = db.GetPort(i)
  If port.PortName = "Brest" Then Exit For
Next
If port.PortName <> "Brest" Then WScript.Quit 1
Function Clock(days) ' days after midnight as hh:mm
  m = Round(days * 1440)
  Clock = Right("0" & (m \ 60), 2) & ":" & Right("0" & (m Mod 60), 2)
End Function
port.Calculate 1, CDbl(Date) ' today: one point an hour, 00:00 to 24:00 local standard time
d = port.PredictionDate
WScript.Echo port.PortName & ", zone " & port.TimeZone & ": sunrise " & Clock(port.SunRise - d) & _
  ", sunset " & Clock(port.SunSet - d) & ", twilight " & Clock(port.BeginTwilight - d) & " to " & Clock(port.EndTwilight - d)
WScript.Echo "highest " & FormatNumber(port.MaxValue, 3) & " m at " & Clock(port.MaxValueIndex * port.Step / 24) & _
  ", lowest " & FormatNumber(port.MinValue, 3) & " m at " & Clock(port.MinValueIndex * port.Step / 24)
For k = 0 To port.NumPoints - 1
  WScript.Echo "  " & Clock(k * port.Step / 24) & "  " & FormatNumber(port.WavePoint(k), 3)
Next
