// Values and nodes for the printers of the debugger to show: it stops in Stop.
#include "torvane/torvane.h"

using namespace _torvane_;

void Stop() { asm volatile(""); }

int main()
{
  const String text("hello");
  const Filename file("/a/b.c");
  const GeData number(Long{7}), words(String("ab")), place(Vector(1, 2.5, -3));
  BaseContainer entries;
  entries.SetLong(5, 6);
  entries.SetString(7, String("x"));
  BaseObject camera(kObjectNull);
  camera.SetName(String("Cam"));
  camera.GetDataInstance().SetReal(500, 36.0);
  Stop();
  return 0;
}
