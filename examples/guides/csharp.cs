// TALUtil from C#, bound late. Build for the width of the DLL: csc /platform:x86 csharp.cs (or x64).
using System;
using System.Runtime.InteropServices;

internal static class Example
{
    [STAThread]
    private static void Main()
    {
        Type type = Type.GetTypeFromProgID("TALUtil.ORVUtils", throwOnError: true);
        dynamic u = Activator.CreateInstance(type);
        Console.WriteLine(u.VerifyTextData(20, 1, "  Smith & Sons, Pty  "));

        // ref passes a variable that the call changes.
        object list = null;
        int count = u.ReadCommaDelimStrToList("red,green,blue,", ref list);
        Console.WriteLine(count + " elements, the second is " + ((Array)list).GetValue(1));

        try
        {
            u.GetWeekNumber("tomorrow");
        }
        catch (COMException error)
        {
            Console.WriteLine("error " + (error.ErrorCode & 0xFFFF) + ": " + error.Message);
        }
        u.Terminate();
        Marshal.FinalReleaseComObject(u);
    }
}
