// A beach: bright sand, white huts and boats, sea, a cliff and a headland far off.
#declare FogDistance = 260;
#include "common.inc"

camera { perspective location <0, 5, 0> right x * 4 / 3 up y angle 56 look_at <-14, 6, 60> }
Sun(<0.6, 0.75, -0.5>, <0.96, 0.92, 0.84>)
SkyLight(<0.20, 0.23, 0.28>)
Sky(<0.75, 0.85, 0.92>, <0.22, 0.50, 0.86>, <0.97, 0.97, 0.98>)

plane { y, 0
  texture {
    pigment { bozo turbulence 0.6 colour_map { [0 rgb <0.72, 0.63, 0.47>] [1 rgb <0.86, 0.78, 0.62>] } scale 3 }
    finish { Matt } normal { bumps 0.9 scale 0.4 }
  }
}
// The sea, on the left; foam along its edge.
#macro Sea(Edge, Y, Colour0, Colour1, Size)
  prism { linear_spline Y - 0.1, Y, 7, <-3000, -50>, <-14 + Edge, -50>, <-10 + Edge, 30>, <-22 + Edge, 120>, <-70 + Edge, 400>, <-3000, 3000>, <-3000, -50>
    texture { pigment { bozo turbulence 0.8 colour_map { [0 rgb Colour0] [1 rgb Colour1] } scale Size } finish { Matt } normal { bumps 0.6 scale <3, 1, 1> } } }
#end
Sea(0, 0.05, <0.85, 0.87, 0.86>, <0.45, 0.58, 0.58>, 1)
Sea(-3, 0.08, <0.10, 0.36, 0.44>, <0.25, 0.52, 0.56>, <9, 1, 3>)

#declare R = seed(77);
#declare Paints = array[6] { <0.90, 0.90, 0.88>, <0.75, 0.20, 0.16>, <0.16, 0.42, 0.62>, <0.90, 0.78, 0.30>, <0.88, 0.88, 0.85>, <0.30, 0.60, 0.52> }
#macro Hut(X, Z, Colour)
  union {
    box { <-1.2, 0, -1.2>, <1.2, 2.2, 1.2> Rough(Colour, 2) }
    prism { linear_spline -1.4, 1.4, 4, <-1.45, 2.1>, <1.45, 2.1>, <0, 3.3>, <-1.45, 2.1> rotate x * -90 Rough(<0.45, 0.43, 0.42>, 0.4) }
    box { <-0.5, 0, -1.25>, <0.5, 1.8, 0> Rough(Colour * 0.4, 1) }
    rotate y * (-12) translate <X, 0, Z>
  }
#end
#declare I = 0;
#while (I < 22)
  Hut(11 + I * 0.7 + 0.6 * rand(R), 16 + I * 5, Paints[floor(rand(R) * 5.999)])
  #declare I = I + 1;
#end
#macro Boat(X, Z, S, Colour, Turn)
  union {
    intersection {
      sphere { 0, 1 scale <3.2, 0.9, 0.9> }
      box { <-4, -1, -2>, <4, 0.25, 2> }
      Rough(Colour, 1)
    }
    cylinder { <0.4, 0, 0>, <0.4, 5.5, 0>, 0.06 Rough(<0.5, 0.4, 0.3>, 1) }
    triangle { <0.3, 0.6, 0.01>, <0.3, 5.3, 0.01>, <-2.4, 0.8, 0.01> Rough(<0.90, 0.88, 0.82>, 2) }
    scale S rotate y * Turn translate <X, 0.35, Z>
  }
#end
Boat(-4, 22, 0.9, <0.70, 0.18, 0.14>, 40)
Boat(-30, 60, 1.6, <0.15, 0.30, 0.55>, 10)
Boat(-75, 130, 2, <0.88, 0.88, 0.86>, -25)
Boat(-60, 230, 2.4, <0.20, 0.20, 0.24>, 15)
// Sunshades and people, as coloured posts.
#declare I = 0;
#while (I < 40)
  #declare Z = 14 + 120 * pow(rand(R), 1.5);
  #declare X = -7 - Z * 0.06 + (9 + Z * 0.12) * rand(R);
  #if (mod(I, 2) = 0)
    cylinder { <X, 0, Z>, <X, 2, Z>, 0.04 Rough(<0.8, 0.8, 0.8>, 1) }
    cone { <X, 1.7, Z>, 1.3, <X, 2.4, Z>, 0.05 Rough(Paints[floor(rand(R) * 5.999)], 1) }
  #else
    cone { <X, 0, Z>, 0.22, <X, 1.4, Z>, 0.16 Rough(<rand(R), rand(R), rand(R)> * 0.7, 1) }
    sphere { <X, 1.6, Z>, 0.16 Rough(<0.70, 0.50, 0.38>, 1) }
  #end
  #declare I = I + 1;
#end
// Grass on the dunes, the cliff, the headland.
#declare I = 0;
#while (I < 260)
  #declare Z = 8 + 150 * rand(R);
  #declare X = 17 + Z * 0.22 + 30 * rand(R);
  sphere { <X, 0, Z>, 0.5 + rand(R) Rough(<0.35, 0.42, 0.18>, 0.4) scale <1, 0.8, 1> }
  #declare I = I + 1;
#end
#declare I = 0;
#while (I < 30)
  sphere { 0, 1 scale <16 + 14 * rand(R), 14 + 16 * rand(R), 22> translate <72 + I * 2 - 40 * rand(R) * (I / 30), 0, 90 + I * 17>
    texture { pigment { bozo turbulence 1 colour_map { [0 rgb <0.30, 0.34, 0.16>] [0.5 rgb <0.46, 0.44, 0.26>] [0.5 rgb <0.62, 0.52, 0.40>] [1 rgb <0.74, 0.64, 0.50>] } scale <8, 3, 8> } finish { Matt } normal { bumps 1 scale 3 } } }
  #declare I = I + 1;
#end
#declare I = 0;
#while (I < 8)
  sphere { 0, 1 scale <90, 30 + 30 * rand(R), 60> translate <-420 + 70 * I, -4, 720 + 60 * rand(R)>
    Rough(<0.30, 0.36, 0.22>, 12) }
  #declare I = I + 1;
#end
