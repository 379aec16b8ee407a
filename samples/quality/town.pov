// Roofs, streets and gardens of a town seen steeply from above: no sky in the picture.
#declare FogDistance = 220;
#include "common.inc"

camera { perspective location <0, 120, -60> right x * 4 / 3 up y angle 52 look_at <10, 0, 62> }
Sun(<0.55, 0.7, -0.3>, <0.95, 0.90, 0.80>)
SkyLight(<0.18, 0.21, 0.26>)

plane { y, 0 Rough(<0.36, 0.36, 0.37>, 5) }

#declare R = seed(23);
#declare Roofs = array[5] { <0.58, 0.25, 0.17>, <0.48, 0.21, 0.16>, <0.34, 0.33, 0.35>, <0.62, 0.36, 0.24>, <0.25, 0.26, 0.29> }
#declare Walls = array[5] { <0.84, 0.80, 0.70>, <0.75, 0.60, 0.42>, <0.88, 0.86, 0.82>, <0.60, 0.33, 0.25>, <0.66, 0.68, 0.66> }

#macro House(X, Z, W, D, H)
  union {
    box { <-W / 2, 0, -D / 2>, <W / 2, H, D / 2> Rough(Walls[floor(rand(R) * 4.999)], 3) }
    prism { linear_spline -D / 2 - 0.5, D / 2 + 0.5, 4, <-W / 2 - 0.6, H>, <W / 2 + 0.6, H>, <0, H + W * 0.35>, <-W / 2 - 0.6, H>
      rotate x * -90 Rough(Roofs[floor(rand(R) * 4.999)], 0.9) }
    box { <W * 0.18, H, 1>, <W * 0.26, H + W * 0.42, 2.2> Rough(<0.45, 0.30, 0.24>, 0.5) }
    #local I = 0;
    #while (I < floor(D / 3))
      box { <-W / 2 - 0.05, H * 0.4, -D / 2 + 1 + 3 * I>, <W / 2 + 0.05, H * 0.75, -D / 2 + 2.2 + 3 * I> pigment { rgb <0.12, 0.14, 0.17> } finish { Matt } }
      #local I = I + 1;
    #end
    rotate y * (floor(rand(R) * 2) * 90 + 4 * rand(R))
    translate <X, 0, Z>
  }
#end
#macro Bush(X, Z, S)
  sphere { <X, S * 0.7, Z>, S
    texture { pigment { bozo colour_map { [0 rgb <0.09, 0.17, 0.06>] [0.5 rgb <0.22, 0.36, 0.12>] [1 rgb <0.38, 0.48, 0.18>] } scale 0.8 } finish { Matt } normal { bumps 1.3 scale 0.7 } } }
#end
#declare BX = -7;
#while (BX < 8)
  #declare BZ = -2;
  #while (BZ < 9)
    #declare X0 = BX * 42;
    #declare Z0 = BZ * 48;
    // A block: pavement, lawn, houses around.
    box { <X0 + 4, 0, Z0 + 4>, <X0 + 38, 0.15, Z0 + 44> Rough(<0.60, 0.58, 0.55>, 4) }
    box { <X0 + 5.5, 0, Z0 + 5.5>, <X0 + 36.5, 0.2, Z0 + 42.5> Rough(<0.32, 0.44, 0.18>, 3) }
    #if (rand(R) > 0.12)
      #declare I = 0;
      #while (I < 3)
        #declare H = 6 + 8 * rand(R);
        House(X0 + 11, Z0 + 11 + 13 * I, 9 + 2 * rand(R), 9 + 3 * rand(R), H)
        House(X0 + 31, Z0 + 11 + 13 * I, 9 + 2 * rand(R), 9 + 3 * rand(R), H)
        #declare I = I + 1;
      #end
    #end
    #declare I = 0;
    #while (I < 9)
      Bush(X0 + 6 + 30 * rand(R), Z0 + 6 + 36 * rand(R), 1 + 1.8 * rand(R))
      #declare I = I + 1;
    #end
    #declare I = 0;
    #while (I < 5)
      box { <-2.1, 0.2, -0.9>, <2.1, 1.4, 0.9> Rough(<rand(R), rand(R), rand(R)> * 0.7 + 0.08, 5) rotate y * 90 translate <X0 + 2.6, 0, Z0 + 5 + 40 * rand(R)> }
      #declare I = I + 1;
    #end
    // Line in the middle of the street.
    #declare I = 0;
    #while (I < 8)
      box { <X0 - 0.1, 0, Z0 + I * 6>, <X0 + 0.1, 0.02, Z0 + I * 6 + 3> pigment { rgb 0.85 } finish { Matt } }
      #declare I = I + 1;
    #end
    #declare BZ = BZ + 1;
  #end
  #declare BX = BX + 1;
#end
