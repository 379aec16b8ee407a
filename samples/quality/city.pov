// A canyon of grey concrete above grey asphalt: colourless things near and far, dark windows and cars.
#declare FogDistance = 250;
#include "common.inc"

camera { perspective location <0, 2, 0> right x * 4 / 3 up y angle 64 look_at <1, 9, 50> }
Sun(<0.4, 0.8, -0.6>, <0.92, 0.90, 0.84>)
SkyLight(<0.22, 0.24, 0.28>)
Sky(<0.82, 0.86, 0.90>, <0.45, 0.62, 0.85>, <0.95, 0.95, 0.96>)

plane { y, 0
  texture {
    pigment { bozo turbulence 0.8 colour_map { [0 rgb <0.46, 0.46, 0.47>] [1 rgb <0.60, 0.60, 0.60>] } scale 3 }
    finish { Matt } normal { bumps 0.4 scale 0.2 }
  }
}

// Houses on both sides in turn, with rows of windows.
#declare R = seed(91);
#declare I = 0;
#while (I < 30)
  #declare Side = 2 * mod(I, 2) - 1;
  #declare Z = 8 + I * 13;
  #declare H = 14 + 26 * rand(R);
  #declare C = <0.62, 0.61, 0.59> * (0.75 + 0.5 * rand(R));
  #declare X0 = Side * 12;
  #declare X1 = Side * 30;
  box { <min(X0, X1), 0, Z>, <max(X0, X1), H, Z + 22> Rough(C, 2) }
  #declare Y = 2;
  #while (Y < H - 2)
    #declare K = 0;
    #while (K < 6)
      box { <X0 - Side * 0.1, Y, Z + 1.5 + 3.4 * K>, <X0 + Side * 0.2, Y + 1.6, Z + 3.3 + 3.4 * K>
        Rough(<0.18, 0.22, 0.27> * (0.7 + 0.8 * rand(R)), 1) }
      #declare K = K + 1;
    #end
    #declare Y = Y + 3;
  #end
  #declare I = I + 1;
#end

// Cars in four lanes.
#declare I = 0;
#while (I < 40)
  #declare Z = 9 + 160 * rand(R);
  #declare X = (floor(rand(R) * 3.99) - 1.5) * 4.5;
  #declare C = array[5] { <0.85, 0.85, 0.85>, <0.10, 0.10, 0.12>, <0.60, 0.10, 0.08>, <0.55, 0.57, 0.60>,
    <0.12, 0.22, 0.45> }
  union {
    box { <-0.9, 0.3, -2.1>, <0.9, 0.95, 2.1> Rough(C[floor(rand(R) * 4.99)], 3) }
    box { <-0.8, 0.95, -1.1>, <0.8, 1.5, 1.3> Rough(<0.15, 0.17, 0.2>, 1) }
    translate <X, 0, Z>
  }
  #declare I = I + 1;
#end
