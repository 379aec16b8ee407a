// A harbour from above: water, quays with stacked containers, cranes, ships, sheds, hills behind.
#declare FogDistance = 450;
#include "common.inc"

camera { perspective location <-60, 62, -40> right x * 4 / 3 up y angle 54 look_at <40, 8, 150> }
Sun(<-0.3, 0.75, -0.6>, <0.92, 0.88, 0.80>)
SkyLight(<0.20, 0.23, 0.27>)
Sky(<0.78, 0.84, 0.88>, <0.35, 0.57, 0.84>, <0.96, 0.96, 0.96>)

plane { y, 0
  texture {
    pigment { bozo turbulence 0.7 colour_map { [0 rgb <0.10, 0.24, 0.28>] [1 rgb <0.22, 0.38, 0.40>] } scale <40, 1, 14> }
    finish { ambient 0.25 diffuse 0.7 }
    normal { waves 0.5 scale 2.5 turbulence 0.4 }
  }
}
#macro Quay(X0, Z0, X1, Z1)
  box { <X0, -3, Z0>, <X1, 2.5, Z1> Rough(<0.52, 0.50, 0.47>, 8) }
  box { <X0 - 0.5, 1.6, Z0 - 0.5>, <X1 + 0.5, 2.3, Z1 + 0.5> Rough(<0.25, 0.23, 0.21>, 2) }
#end
Quay(-20, 20, 60, 120)
Quay(90, 60, 320, 130)
Quay(-200, 190, 240, 330)

#declare Paints = array[8] {
  <0.62, 0.16, 0.12>, <0.13, 0.28, 0.52>, <0.75, 0.45, 0.12>, <0.16, 0.42, 0.26>,
  <0.72, 0.70, 0.66>, <0.42, 0.20, 0.14>, <0.10, 0.45, 0.52>, <0.80, 0.66, 0.18>
}
#declare R = seed(11);
#macro Stack(X, Z, Layers)
  #local L = 0;
  #while (L < Layers)
    box {
      <-3, 0, -1.2>, <3, 2.5, 1.2>
      texture {
        pigment { gradient x colour_map { [0.5 rgb Paints[floor(rand(R) * 7.999)]] [0.5 rgb Paints[floor(rand(R) * 7.999)] * 0.9] } scale 6 translate x * 3 }
        finish { Matt }
        normal { gradient x 0.6 scale 0.35 }
      }
      translate <X, 2.5 + L * 2.55, Z>
    }
    #local L = L + 1;
  #end
#end
#declare X = -14;
#while (X < 56)
  #declare Z = 26;
  #while (Z < 116)
    #if (mod(Z, 18) > 3 & rand(R) > 0.2) Stack(X, Z, 1 + floor(rand(R) * 4)) #end
    #declare Z = Z + 3;
  #end
  #declare X = X + 9;
#end
#declare X = 98;
#while (X < 310)
  #declare Z = 80;
  #while (Z < 125)
    #if (rand(R) > 0.35) Stack(X, Z, 1 + floor(rand(R) * 4)) #end
    #declare Z = Z + 3;
  #end
  #declare X = X + 8;
#end

#macro Crane(Where, Colour, Turn)
  union {
    #local I = 0;
    #while (I < 4)
      cylinder { <-6 + 12 * mod(I, 2), 0, -5 + 10 * floor(I / 2)>, <-4 + 8 * mod(I, 2), 34, -3 + 6 * floor(I / 2)>, 0.6 }
      #local I = I + 1;
    #end
    box { <-5, 32, -4>, <5, 36, 4> }
    box { <-1, 36, -30>, <1, 38, 34> }
    cylinder { <0, 52, 0>, <0, 38, 32>, 0.25 }
    cylinder { <0, 52, 0>, <0, 38, -28>, 0.25 }
    cone { <0, 36, 0>, 1.6, <0, 53, 0>, 0.5 }
    Rough(Colour, 4)
    rotate y * Turn translate Where
  }
#end
Crane(<66, 2, 50>, <0.75, 0.22, 0.14>, 90)
Crane(<66, 2, 95>, <0.75, 0.22, 0.14>, 90)
Crane(<130, 2, 66>, <0.18, 0.34, 0.58>, 10)
Crane(<190, 2, 66>, <0.18, 0.34, 0.58>, -5)
Crane(<40, 2, 196>, <0.78, 0.60, 0.16>, 0)
Crane(<-90, 2, 196>, <0.78, 0.60, 0.16>, 0)

#macro Ship(Where, Length, Hull, Turn)
  union {
    intersection {
      cylinder { <0, -2, 0.62>, <0, 0.09 * 10, 0.62>, 0.75 }
      cylinder { <0, -2, -0.62>, <0, 0.09 * 10, -0.62>, 0.75 }
      box { <-0.42, -0.05, -0.2>, <0.45, 0.09, 0.2> }
      Rough(Hull, 0.1)
    }
    box { <-0.40, 0.07, -0.09>, <-0.28, 0.24, 0.09> Rough(<0.85, 0.85, 0.83>, 0.05) }
    box { <-0.37, 0.24, -0.03>, <-0.33, 0.30, 0.03> Rough(<0.70, 0.30, 0.12>, 0.05) }
    cylinder { <0.1, 0.05, 0>, <0.1, 0.28, 0>, 0.006 pigment { rgb <0.8, 0.75, 0.6> } finish { Matt } }
    scale Length rotate y * Turn translate Where
  }
#end
Ship(<78, 0, 30>, 70, <0.14, 0.18, 0.26>, 70)
Ship(<150, 0, 165>, 110, <0.50, 0.13, 0.11>, 4)
Ship(<-70, 0, 95>, 60, <0.10, 0.30, 0.22>, 35)
Ship(<-20, 0, 168>, 40, <0.70, 0.68, 0.62>, -15)

#macro Shed(X, Z, W, D, H, Colour)
  box { <X, 2, Z>, <X + W, H, Z + D> Rough(Colour, 6) }
  box { <X - 0.5, H, Z - 0.5>, <X + W + 0.5, H + 1, Z + D + 0.5> Rough(Colour * 0.7, 3) }
#end
#declare I = 0;
#while (I < 16)
  Shed(-190 + I * 26, 235 + 60 * rand(R), 14 + 8 * rand(R), 20, 9 + 22 * rand(R), <0.4 + 0.45 * rand(R), 0.38 + 0.3 * rand(R), 0.34 + 0.2 * rand(R)>)
  #declare I = I + 1;
#end
#declare I = 0;
#while (I < 9)
  sphere { 0, 1 scale <160 + 80 * rand(R), 50 + 60 * rand(R), 120> translate <-700 + 190 * I, -10, 650 + 250 * rand(R)>
    texture { pigment { bozo colour_map { [0 rgb <0.16, 0.24, 0.12>] [1 rgb <0.34, 0.38, 0.22>] } scale 9 } finish { Matt } normal { bumps 1 scale 8 } } }
  #declare I = I + 1;
#end
